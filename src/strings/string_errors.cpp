#include "strings/string_errors.h"

#include "vynutil/exception.h"

namespace VynSDK::Util {

void ThrowNoConvertibleForm() {
  throw new RunTimeException(u"Unable to find UTF8 or active code page encoding for string.");
}

void ThrowAllocBufferUtfTag() {
  throw new RunTimeException(u"Use AllocBufferUTF16 for UTF16 encoding or AllocBufferUTF32 for UTF32");
}

void ThrowConcatenationOfNull() {
  throw new NullDereferenceException(u"Failure in VynString::operator +=, where one of the strings is NULL");
}

}  // namespace VynSDK::Util
