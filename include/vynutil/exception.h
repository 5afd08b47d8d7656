#pragma once
// The SDK's exception types. They signal misuse of SDK objects (an index out of range, a null
// buffer dereferenced, a conversion that cannot be done) and are independent of std::exception:
// a handler for std::exception does not catch them. Exhausted memory is std::bad_alloc instead.
//
// Each carries one optional message, an owned copy on the shared heap. Copying (and moving, which
// copies as well) gives the new object its own copy of the message.

#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util {

class VYN_API Exception : public VynHeapOperators {
 public:
  // A null message gives an exception without message; otherwise the text is copied. Throws
  // std::bad_alloc when the copy cannot be allocated.
  Exception(const MCHAR* message);
  Exception(const Exception& other);
  virtual ~Exception();
  // Self-assignment does nothing. When other has no message this object keeps its own;
  // otherwise its message is replaced by a copy of other's.
  Exception& operator=(const Exception& other);
  // The message, or "Unknown Exception" when there is none.
  virtual const MCHAR* What() const;

 protected:
  Exception() noexcept;

  // The owned, zero-terminated message, or null.
  MCHAR* message;

 private:
  // Frees the message and clears it.
  void cleanup() noexcept;
  // Replaces the message by a copy of text; a null text changes nothing.
  void copy(const MCHAR* text);
};

// A null buffer or pointer was dereferenced.
class VYN_API NullDereferenceException : public Exception {
 public:
  NullDereferenceException(const MCHAR* message);
  NullDereferenceException(const NullDereferenceException& other);
  NullDereferenceException(NullDereferenceException&& other);
  ~NullDereferenceException() override;
  NullDereferenceException& operator=(const NullDereferenceException& other);
  NullDereferenceException& operator=(NullDereferenceException&& other);
  // The message, or "VynSDK::Util::NullDereferenceException" when there is none.
  const MCHAR* What() const override;
};

// An index or argument lies outside the valid range.
class VYN_API OutOfRangeException : public Exception {
 public:
  OutOfRangeException(const MCHAR* message);
  OutOfRangeException(const OutOfRangeException& other);
  OutOfRangeException(OutOfRangeException&& other);
  ~OutOfRangeException() override;
  OutOfRangeException& operator=(const OutOfRangeException& other);
  OutOfRangeException& operator=(OutOfRangeException&& other);
  // The message, or "VynSDK::Util::OutOfRangeException" when there is none.
  const MCHAR* What() const override;
};

// An operation that cannot be carried out at run time (for example an impossible conversion).
class VYN_API RunTimeException : public Exception {
 public:
  RunTimeException(const MCHAR* message);
  RunTimeException(const RunTimeException& other);
  RunTimeException(RunTimeException&& other);
  ~RunTimeException() override;
  RunTimeException& operator=(const RunTimeException& other);
  RunTimeException& operator=(RunTimeException&& other);
  // The message, or "VynSDK::Util::RunTimeException" when there is none.
  const MCHAR* What() const override;
};

}  // namespace VynSDK::Util
