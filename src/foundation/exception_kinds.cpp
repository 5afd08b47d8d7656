// The SDK's exception kinds. Each adds no data: it names the kind of misuse, and its What() falls
// back to the class's full name when the exception has no message. Moving copies the message,
// exactly as copying does.

#include "vynutil/exception.h"

namespace VynSDK::Util {

NullDereferenceException::NullDereferenceException(const MCHAR* text) : Exception(text) {}
NullDereferenceException::NullDereferenceException(const NullDereferenceException& other)
    : Exception(other) {}
NullDereferenceException::NullDereferenceException(NullDereferenceException&& other)
    : Exception(other) {}
NullDereferenceException::~NullDereferenceException() = default;
NullDereferenceException& NullDereferenceException::operator=(
    const NullDereferenceException& other) {
  Exception::operator=(other);
  return *this;
}
NullDereferenceException& NullDereferenceException::operator=(NullDereferenceException&& other) {
  Exception::operator=(other);
  return *this;
}
const MCHAR* NullDereferenceException::What() const {
  return message != nullptr ? message : u"VynSDK::Util::NullDereferenceException";
}

OutOfRangeException::OutOfRangeException(const MCHAR* text) : Exception(text) {}
OutOfRangeException::OutOfRangeException(const OutOfRangeException& other) : Exception(other) {}
OutOfRangeException::OutOfRangeException(OutOfRangeException&& other) : Exception(other) {}
OutOfRangeException::~OutOfRangeException() = default;
OutOfRangeException& OutOfRangeException::operator=(const OutOfRangeException& other) {
  Exception::operator=(other);
  return *this;
}
OutOfRangeException& OutOfRangeException::operator=(OutOfRangeException&& other) {
  Exception::operator=(other);
  return *this;
}
const MCHAR* OutOfRangeException::What() const {
  return message != nullptr ? message : u"VynSDK::Util::OutOfRangeException";
}

RunTimeException::RunTimeException(const MCHAR* text) : Exception(text) {}
RunTimeException::RunTimeException(const RunTimeException& other) : Exception(other) {}
RunTimeException::RunTimeException(RunTimeException&& other) : Exception(other) {}
RunTimeException::~RunTimeException() = default;
RunTimeException& RunTimeException::operator=(const RunTimeException& other) {
  Exception::operator=(other);
  return *this;
}
RunTimeException& RunTimeException::operator=(RunTimeException&& other) {
  Exception::operator=(other);
  return *this;
}
const MCHAR* RunTimeException::What() const {
  return message != nullptr ? message : u"VynSDK::Util::RunTimeException";
}

}  // namespace VynSDK::Util
