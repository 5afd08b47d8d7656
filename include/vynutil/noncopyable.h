#pragma once
// A base for SDK classes whose objects must not be copied.

#include "vynutil/export.h"
#include "vynutil/heap.h"

namespace VynSDK::Util {

class Noncopyable : public VynHeapOperators {
 protected:
  Noncopyable() = default;
  ~Noncopyable() = default;

 public:
  Noncopyable(const Noncopyable&) = delete;
  Noncopyable& operator=(const Noncopyable&) = delete;
};

}  // namespace VynSDK::Util
