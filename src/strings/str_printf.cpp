// CStr, WStr and UTF8Str: formatted printing with the Windows runtime's printf rules.
//
// The output is formatted into a new block of exactly its size, which becomes the string's text
// only when the formatting succeeds; on a null or invalid format the
// string keeps its text and the negative result is returned.
//
// Narrow output is text of the narrow code page, and the block is tagged so: without a locale of
// the caller's, narrow printing uses the narrow language's locale when there is one (Chinese,
// Japanese, Korean), so that wide arguments (%S, %C) are converted into that code page and not
// into the active one.

#include <cstdarg>
#include <cstring>

#include "strings/str_core.h"
#include "vynutil/strclass.h"
#include "win32/crt_format.h"

using namespace VynSDK::Util::StrClass;

namespace {

// The runtime's measuring and truncating formatters for one unit type, with or without locale.
struct WideFormatter {
  static int Measure(const MCHAR* format, _locale_t locale, va_list args) {
    return locale ? win32::_vscwprintf_l(format, locale, args) : win32::_vscwprintf(format, args);
  }
  static int Format(MCHAR* out, std::size_t size, const MCHAR* format, _locale_t locale, va_list args) {
    return locale ? win32::_vsnwprintf_s_l(out, size, win32::_TRUNCATE, format, locale, args)
                  : win32::_vsnwprintf_s(out, size, win32::_TRUNCATE, format, args);
  }
};

struct NarrowFormatter {
  static int Measure(const char* format, _locale_t locale, va_list args) {
    return locale ? win32::_vscprintf_l(format, locale, args) : win32::_vscprintf(format, args);
  }
  static int Format(char* out, std::size_t size, const char* format, _locale_t locale, va_list args) {
    return locale ? win32::_vsnprintf_s_l(out, size, win32::_TRUNCATE, format, locale, args)
                  : win32::_vsnprintf_s(out, size, win32::_TRUNCATE, format, args);
  }
};

template <class Text>
struct FormatterOf;
template <>
struct FormatterOf<WideText> {
  using Type = WideFormatter;
};
template <>
struct FormatterOf<NarrowText> {
  using Type = NarrowFormatter;
};

// Units formatted on the stack before a block is made.
constexpr std::size_t kStackUnits = 256;

// Formats into a new block of Text's encoding; on success buf holds it. Returns the formatter's
// result (the units written, or negative).
template <class Text>
int Print(typename Text::Unit*& buf, const typename Text::Unit* format, _locale_t locale, va_list args) {
  using Core = StrCore<Text>;
  using Formatter = typename FormatterOf<Text>::Type;
  if (!format) return -1;
  // Most output is short: format once on the stack and copy the result into a block of its exact
  // size. Output that does not fit (or an invalid format) takes the measuring path below, which
  // gives the same text and result.
  typename Text::Unit stack[kStackUnits];
  va_list stackArgs;
  va_copy(stackArgs, args);
  const int quick = Formatter::Format(stack, kStackUnits, format, locale, stackArgs);
  va_end(stackArgs);
  if (quick >= 0) {
    typename Text::Unit* fresh = Core::NewBuffer(static_cast<std::size_t>(quick) + 1);
    std::memcpy(fresh, stack, (static_cast<std::size_t>(quick) + 1) * sizeof(stack[0]));
    Core::Replace(buf, fresh);
    return quick;
  }
  va_list measureArgs;
  va_copy(measureArgs, args);
  const int count = Formatter::Measure(format, locale, measureArgs);
  va_end(measureArgs);
  if (count < 0) return count;
  const std::size_t size = static_cast<std::size_t>(count) + 1;
  typename Text::Unit* fresh = Core::NewBuffer(size);
  const int written = Formatter::Format(fresh, size, format, locale, args);
  if (written < 0) {
    Core::Release(fresh);
    return written;
  }
  Core::Replace(buf, fresh);
  return written;
}

// UTF8Str: narrow formatting of narrow code-page text; the string then holds the UTF-8 form of
// the formatted block.
int PrintUtf8(char*& buf, const char* format, _locale_t locale, va_list args) {
  char* narrow = nullptr;
  const int written = Print<NarrowText>(narrow, format, locale, args);
  if (written >= 0) {
    Utf8Core::Replace(buf, Utf8Core::FormOfBlock(narrow));
    NarrowCore::Release(narrow);
  }
  return written;
}

}  // namespace

// ---- WStr -----------------------------------------------------------------------------------

int WStr::vprintf(const MCHAR* format, va_list args) { return Print<WideText>(buf, format, nullptr, args); }
int WStr::vprintf_l(const MCHAR* format, _locale_t locale, va_list args) {
  return Print<WideText>(buf, format, locale, args);
}
int WStr::printf(const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  const int result = vprintf(format, args);
  va_end(args);
  return result;
}
int WStr::printf(WStr format, ...) {
  va_list args;
  va_start(args, format);
  const int result = vprintf(format.buf, args);
  va_end(args);
  return result;
}
int WStr::printf_l(const MCHAR* format, _locale_t locale, ...) {
  va_list args;
  va_start(args, locale);
  const int result = vprintf_l(format, locale, args);
  va_end(args);
  return result;
}

// ---- CStr -----------------------------------------------------------------------------------

int CStr::vprintf(const char* format, va_list args) {
  return Print<NarrowText>(buf, format, VynSDK::Util::CStrLocale(), args);
}
int CStr::vprintf_l(const char* format, _locale_t locale, va_list args) {
  return Print<NarrowText>(buf, format, locale, args);
}
int CStr::printf(const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int result = vprintf(format, args);
  va_end(args);
  return result;
}
int CStr::printf(CStr format, ...) {
  va_list args;
  va_start(args, format);
  const int result = vprintf(format.buf, args);
  va_end(args);
  return result;
}
int CStr::printf_l(const char* format, _locale_t locale, ...) {
  va_list args;
  va_start(args, locale);
  const int result = vprintf_l(format, locale, args);
  va_end(args);
  return result;
}

// ---- UTF8Str --------------------------------------------------------------------------------

int UTF8Str::vprintf(const char* format, va_list args) {
  return PrintUtf8(buf, format, VynSDK::Util::CStrLocale(), args);
}
int UTF8Str::vprintf_l(const char* format, _locale_t locale, va_list args) {
  return PrintUtf8(buf, format, locale, args);
}
int UTF8Str::printf(const char* format, ...) {
  va_list args;
  va_start(args, format);
  const int result = vprintf(format, args);
  va_end(args);
  return result;
}
int UTF8Str::printf(UTF8Str format, ...) {
  va_list args;
  va_start(args, format);
  const int result = vprintf(format.buf, args);
  va_end(args);
  return result;
}
int UTF8Str::printf_l(const char* format, _locale_t locale, ...) {
  va_list args;
  va_start(args, locale);
  const int result = vprintf_l(format, locale, args);
  va_end(args);
  return result;
}
