// The formatting entry points over a fixed argument array, for fuzzing and tests: the same
// engine and rules as the va_list entry points, with arguments that are safe for any format.

#include "crt_format_args.h"
#include "crt_format_entry.h"

namespace win32::detail {

int MeasureFromArray(const char* format, _locale_t locale, const ArgumentArray& args) {
  ArrayArguments arguments(args);
  return MeasureFormat(format, locale, arguments);
}

int MeasureFromArray(const MCHAR* format, _locale_t locale, const ArgumentArray& args) {
  ArrayArguments arguments(args);
  return MeasureFormat(format, locale, arguments);
}

int FormatFromArray(char* buffer, std::size_t size, std::size_t count, const char* format,
                    _locale_t locale, const ArgumentArray& args) {
  ArrayArguments arguments(args);
  return SecureFormat(buffer, size, count, format, locale, arguments);
}

int FormatFromArray(MCHAR* buffer, std::size_t size, std::size_t count, const MCHAR* format,
                    _locale_t locale, const ArgumentArray& args) {
  ArrayArguments arguments(args);
  return SecureFormat(buffer, size, count, format, locale, arguments);
}

}  // namespace win32::detail
