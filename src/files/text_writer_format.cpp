// TextFile::BaseTextWriter: formatted output. The text is measured with the runtime's counting
// formatters (_vscprintf and _vscwprintf, which count what vsprintf and vswprintf would write),
// formatted into a buffer of exactly that size and written with one Write.

#include "vynutil/text_writer.h"

#include <cstdlib>
#include <memory>

#include "win32/crt_format.h"

namespace VynSDK::Util::TextFile {

BaseTextWriter::~BaseTextWriter() = default;

void BaseTextWriter::FormatFailed() {}

namespace {

constexpr std::size_t kFailed = static_cast<std::size_t>(-1);

// The runtime's measuring and formatting calls for one unit type, with or without a locale.
int Measure(const MCHAR* format, _locale_t locale, bool withLocale, va_list args) {
  return withLocale ? win32::_vscwprintf_l(format, locale, args) : win32::_vscwprintf(format, args);
}
int Measure(const char* format, _locale_t locale, bool withLocale, va_list args) {
  return withLocale ? win32::_vscprintf_l(format, locale, args) : win32::_vscprintf(format, args);
}
int Format(MCHAR* buffer, std::size_t size, const MCHAR* format, _locale_t locale,
           bool withLocale, va_list args) {
  return withLocale
             ? win32::_vsnwprintf_s_l(buffer, size, win32::_TRUNCATE, format, locale, args)
             : win32::_vsnwprintf_s(buffer, size, win32::_TRUNCATE, format, args);
}
int Format(char* buffer, std::size_t size, const char* format, _locale_t locale, bool withLocale,
           va_list args) {
  return withLocale ? win32::_vsnprintf_s_l(buffer, size, win32::_TRUNCATE, format, locale, args)
                    : win32::_vsnprintf_s(buffer, size, win32::_TRUNCATE, format, args);
}

struct Free {
  void operator()(void* p) const { std::free(p); }
};

// Formats into a buffer of the measured length and writes it. The runtime's calls copy args, so
// the one list serves both.
template <class Unit>
std::size_t FormatAndWrite(BaseTextWriter& writer, void (BaseTextWriter::*failed)(),
                           const Unit* format, _locale_t locale, bool withLocale, va_list args) {
  const int length = Measure(format, locale, withLocale, args);
  if (length < 0) {
    (writer.*failed)();
    return kFailed;
  }
  const std::size_t size = static_cast<std::size_t>(length) + 1;
  std::unique_ptr<Unit, Free> buffer(static_cast<Unit*>(std::malloc(size * sizeof(Unit))));
  if (buffer == nullptr) return 0;
  const int written = Format(buffer.get(), size, format, locale, withLocale, args);
  if (written < 0) {
    (writer.*failed)();
    return kFailed;
  }
  return writer.Write(buffer.get(), static_cast<std::size_t>(written));
}

}  // namespace

// Each member hands its protected refusal hook to FormatAndWrite as a member pointer.
std::size_t BaseTextWriter::VprintfW(const MCHAR* format, va_list args) {
  return FormatAndWrite(*this, &BaseTextWriter::FormatFailed, format, nullptr, false, args);
}
std::size_t BaseTextWriter::VprintfW_l(const MCHAR* format, _locale_t locale, va_list args) {
  return FormatAndWrite(*this, &BaseTextWriter::FormatFailed, format, locale, true, args);
}
std::size_t BaseTextWriter::VprintfA(const char* format, va_list args) {
  return FormatAndWrite(*this, &BaseTextWriter::FormatFailed, format, nullptr, false, args);
}
std::size_t BaseTextWriter::VprintfA_l(const char* format, _locale_t locale, va_list args) {
  return FormatAndWrite(*this, &BaseTextWriter::FormatFailed, format, locale, true, args);
}

std::size_t BaseTextWriter::Vprintf(const MCHAR* format, va_list args) {
  return VprintfW(format, args);
}
std::size_t BaseTextWriter::Vprintf_l(const MCHAR* format, _locale_t locale, va_list args) {
  return VprintfW_l(format, locale, args);
}

std::size_t BaseTextWriter::Printf(const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  const std::size_t result = VprintfW(format, args);
  va_end(args);
  return result;
}
std::size_t BaseTextWriter::PrintfW(const MCHAR* format, ...) {
  va_list args;
  va_start(args, format);
  const std::size_t result = VprintfW(format, args);
  va_end(args);
  return result;
}
std::size_t BaseTextWriter::PrintfA(const char* format, ...) {
  va_list args;
  va_start(args, format);
  const std::size_t result = VprintfA(format, args);
  va_end(args);
  return result;
}
std::size_t BaseTextWriter::Printf_l(const MCHAR* format, _locale_t locale, ...) {
  va_list args;
  va_start(args, locale);
  const std::size_t result = VprintfW_l(format, locale, args);
  va_end(args);
  return result;
}
std::size_t BaseTextWriter::PrintfW_l(const MCHAR* format, _locale_t locale, ...) {
  va_list args;
  va_start(args, locale);
  const std::size_t result = VprintfW_l(format, locale, args);
  va_end(args);
  return result;
}
std::size_t BaseTextWriter::PrintfA_l(const char* format, _locale_t locale, ...) {
  va_list args;
  va_start(args, locale);
  const std::size_t result = VprintfA_l(format, locale, args);
  va_end(args);
  return result;
}

}  // namespace VynSDK::Util::TextFile
