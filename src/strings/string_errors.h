#pragma once
// The string core's failures. They are thrown as heap-allocated exceptions (the catcher owns the
// object and deletes it), as plug-ins built against the SDK expect of VynString.

namespace VynSDK::Util {

// No form of the block can be converted from (RunTimeException*).
[[noreturn]] void ThrowNoConvertibleForm();
// AllocBufferCP was asked for a UTF-16 or UTF-32 buffer (RunTimeException*).
[[noreturn]] void ThrowAllocBufferUtfTag();
// operator+= could not get a form of one of the strings (NullDereferenceException*).
[[noreturn]] void ThrowConcatenationOfNull();

}  // namespace VynSDK::Util
