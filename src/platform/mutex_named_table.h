#pragma once
// The named mutexes this process has open, by name: every handle to one name shares one mapping
// of its shared-memory object, so opening a name that is open already is a look-up.

#include <memory>

#include "mutex_names.h"
#include "mutex_shared_object.h"
#include "mutex_state.h"

namespace win32::detail {

// One open name. Lives while handles to it are open.
struct NamedMutex;

MutexState* StateOf(const NamedMutex& named);

// Counts one more handle to the mutex called name, joining its shared object when this process
// has no handle to it yet. *existed: the object was in use before (ERROR_ALREADY_EXISTS for
// CreateMutexW); with initialOwner the calling thread owns a mutex that did not exist. Returns
// ERROR_SUCCESS or the error of SharedMutexObject::Join.
DWORD AddNamedMutexHandle(const MutexName& name, SharedMutexObject::Mode mode, bool initialOwner,
                          NamedMutex** named, bool* existed);

// Counts one handle less; the last one leaves the shared object, once no live thread of this
// process owns the mutex (see mutex_lingering.h).
void RemoveNamedMutexHandle(NamedMutex* named);

}  // namespace win32::detail
