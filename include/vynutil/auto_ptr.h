#pragma once
// An owning pointer for SDK objects: deletes what it holds through its destructor policy.

#include <utility>

#include "vynutil/heap.h"

namespace VynSDK::Util {

// Deletes one object (not an array).
template <class T>
class SinglePointerDestructor {
 public:
  static void Delete(T* p) { delete p; }
};

// Holds one object and deletes it with the holder. Move-only.
template <class T, class Destructor = SinglePointerDestructor<T>>
class AutoPtr : public VynHeapOperators {
 public:
  explicit AutoPtr(T* p = nullptr) noexcept : p_(p) {}
  AutoPtr(AutoPtr&& other) noexcept : p_(std::exchange(other.p_, nullptr)) {}
  AutoPtr& operator=(AutoPtr&& other) noexcept {
    Reset(other.Release());
    return *this;
  }
  AutoPtr(const AutoPtr&) = delete;
  AutoPtr& operator=(const AutoPtr&) = delete;
  ~AutoPtr() { Reset(); }

  T* Get() const noexcept { return p_; }
  T* operator->() const noexcept { return p_; }
  T& operator*() const noexcept { return *p_; }
  explicit operator bool() const noexcept { return p_ != nullptr; }
  // Gives up ownership without deleting.
  T* Release() noexcept { return std::exchange(p_, nullptr); }
  // Deletes the held object and holds p instead.
  void Reset(T* p = nullptr) {
    T* old = std::exchange(p_, p);
    if (old && old != p) Destructor::Delete(old);
  }

 private:
  T* p_;
};

}  // namespace VynSDK::Util
