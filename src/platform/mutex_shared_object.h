#pragma once
// One process's use of the shared-memory object that holds a named mutex, and the protocol that
// lets processes create, share and remove the object without races.
//
// The object is a file in the shared-memory folder holding one MutexState. Two byte-range locks
// of the file (open-file-description locks, which the kernel drops when a process ends) keep the
// protocol:
//   byte 0, shared: held by every process that uses the object, for as long as it does;
//   byte 1, exclusive: held while a process sets up, joins or removes the object.
// Joining: open (creating the file if asked), lock byte 1, and check the file is still linked
// (else it was removed meanwhile: start again). If no other process holds byte 0, nobody uses the
// object (it is new, or a process died leaving it), so it is set up afresh; otherwise it is
// joined as it is. Then lock byte 0 and unlock byte 1.
// Leaving: unmap, lock byte 1; if the file is still linked and no other process holds byte 0,
// remove it; close (which drops both locks). A process that opened the file before the removal
// finds it unlinked once it gets byte 1, and starts again with a new object.

#include <sys/types.h>

#include <memory>
#include <string>

#include "mutex_state.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

class SharedMutexObject {
 public:
  enum class Mode { kOpenOrCreate, kOpenExisting };

  // Joins the object of fileName (see mutex_names.h), creating it with kOpenOrCreate. *created
  // tells whether the object was set up afresh (no process was using it); with lockIfCreated the
  // calling thread then owns the new mutex before any other process can see it. Returns
  // ERROR_SUCCESS, ERROR_FILE_NOT_FOUND (kOpenExisting and no process uses it), or the error of
  // a failed system call.
  static DWORD Join(const std::string& fileName, Mode mode, bool lockIfCreated,
                    std::unique_ptr<SharedMutexObject>* joined, bool* created);

  // Leaves the object (see above).
  ~SharedMutexObject();
  // Removes the object's file when no other process uses it, leaving the mapping in place: at
  // exit, for the mutexes still open, so their files do not outlive the process.
  void RemoveIfUnused();
  SharedMutexObject(const SharedMutexObject&) = delete;
  SharedMutexObject& operator=(const SharedMutexObject&) = delete;

  MutexState* state() const { return state_; }

 private:
  SharedMutexObject(std::string path, int fd, MutexState* state, pid_t joinedBy)
      : path_(std::move(path)), fd_(fd), state_(state), joinedBy_(joinedBy) {}

  std::string path_;
  int fd_;
  MutexState* state_;
  // A child made by fork() shares its parent's descriptor and lock, so it cannot tell whether
  // the parent still uses the object: only the process that joined may remove it.
  pid_t joinedBy_;
};

}  // namespace win32::detail
