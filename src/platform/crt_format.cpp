// The runtime's va_list formatting entry points: measuring (_vsc*printf*) and the secure,
// truncating formatters (_vsn*printf_s*), narrow and wide, with and without a locale.

#include "win32/crt_format.h"

#include "crt_format_args.h"
#include "crt_format_entry.h"

namespace win32 {

using detail::MeasureFormat;
using detail::SecureFormat;
using detail::VaListArguments;

int _vscprintf(const char* format, va_list args) { return _vscprintf_l(format, nullptr, args); }

int _vscprintf_l(const char* format, _locale_t locale, va_list args) {
  VaListArguments arguments(args);
  return MeasureFormat(format, locale, arguments);
}

int _vscwprintf(const MCHAR* format, va_list args) { return _vscwprintf_l(format, nullptr, args); }

int _vscwprintf_l(const MCHAR* format, _locale_t locale, va_list args) {
  VaListArguments arguments(args);
  return MeasureFormat(format, locale, arguments);
}

int _vsnprintf_s(char* buffer, std::size_t size, std::size_t count, const char* format, va_list args) {
  return _vsnprintf_s_l(buffer, size, count, format, nullptr, args);
}

int _vsnprintf_s_l(char* buffer, std::size_t size, std::size_t count, const char* format,
                   _locale_t locale, va_list args) {
  VaListArguments arguments(args);
  return SecureFormat(buffer, size, count, format, locale, arguments);
}

int _vsnwprintf_s(MCHAR* buffer, std::size_t size, std::size_t count, const MCHAR* format, va_list args) {
  return _vsnwprintf_s_l(buffer, size, count, format, nullptr, args);
}

int _vsnwprintf_s_l(MCHAR* buffer, std::size_t size, std::size_t count, const MCHAR* format,
                    _locale_t locale, va_list args) {
  VaListArguments arguments(args);
  return SecureFormat(buffer, size, count, format, locale, arguments);
}

}  // namespace win32
