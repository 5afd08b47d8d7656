#pragma once
// The live HANDLE values of the layer and the objects behind them. Every handle the layer gives
// out (files, searches, enumerations) is registered here, and every call that takes one looks it
// up first, so a closed, made-up or wrong-kind handle is an error, never a crash.

#include <memory>

#include "vynutil/wintypes.h"

namespace win32::detail {

// An object a handle stands for. Its destructor releases what it holds; it runs when the handle
// is closed and no call that looked it up is still using it.
class HandleObject {
 public:
  virtual ~HandleObject() = default;
};

// The objects CloseHandle closes (open files and the like); search and enumeration handles have
// their own closing functions.
class KernelObject : public HandleObject {};

// Registers object under a new handle value. Values are multiples of 4 above 0x10000, never
// reused during the process, so they never equal null or INVALID_HANDLE_VALUE.
HANDLE RegisterHandle(std::shared_ptr<HandleObject> object);

// The object of a live handle, or null.
std::shared_ptr<HandleObject> FindHandle(HANDLE handle);

// Unregisters the handle when accept says yes to its object, and returns the object (which the
// caller then lets go); null when the handle is not live or not accepted.
std::shared_ptr<HandleObject> TakeHandle(HANDLE handle, bool (*accept)(const HandleObject&));

// The object of a live handle of kind T, or null.
template <typename T>
std::shared_ptr<T> FindHandleOf(HANDLE handle) {
  return std::dynamic_pointer_cast<T>(FindHandle(handle));
}

// Unregisters a live handle of kind T and returns its object; null for anything else.
template <typename T>
std::shared_ptr<T> TakeHandleOf(HANDLE handle) {
  return std::static_pointer_cast<T>(TakeHandle(
      handle, [](const HandleObject& object) { return dynamic_cast<const T*>(&object) != nullptr; }));
}

}  // namespace win32::detail
