#pragma once
// Where the formatting engine takes its arguments from. The engine asks for one argument at a
// time by the type the conversion names; a source answers every request:
//   int Int();                    an int (also %c characters, * widths, 32-bit integers)
//   long long LongLong();         a 64-bit integer
//   double Double();              a double (float arguments are promoted to it)
//   long double LongDouble();     a long double (%L)
//   const char* NarrowText();     a narrow string, may be null
//   const MCHAR* WideText();      a wide string, may be null
//   const void* Pointer();        a pointer for %p; only its value is printed
// VaListArguments reads a copy of the caller's va_list. ArgumentArray answers from a fixed
// array and gives safe values for any request, so harnesses can run any format string.

#include <bit>
#include <cstdarg>
#include <cstddef>
#include <cstdint>

#include "vynutil/crt_locale.h"
#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

// Reads a private copy of a va_list, so the caller's list is never advanced.
class VaListArguments {
 public:
  explicit VaListArguments(va_list args) noexcept { va_copy(args_, args); }
  ~VaListArguments() { va_end(args_); }
  VaListArguments(const VaListArguments&) = delete;
  VaListArguments& operator=(const VaListArguments&) = delete;

  int Int() noexcept { return va_arg(args_, int); }
  long long LongLong() noexcept { return va_arg(args_, long long); }
  double Double() noexcept { return va_arg(args_, double); }
  long double LongDouble() noexcept { return va_arg(args_, long double); }
  const char* NarrowText() noexcept { return va_arg(args_, const char*); }
  const MCHAR* WideText() noexcept { return va_arg(args_, const MCHAR*); }
  const void* Pointer() noexcept { return va_arg(args_, const void*); }

 private:
  va_list args_;
};

// A fixed argument list. Each request takes the next word (0 once they run out): integers take
// its low bits, floating requests its bits as a double, pointers its value. String requests
// take a word too: an odd word gives the text, an even one a null pointer.
struct ArgumentArray {
  const std::uint64_t* words = nullptr;
  std::size_t count = 0;
  const char* narrowText = "";
  const MCHAR* wideText = u"";
};

class ArrayArguments {
 public:
  explicit ArrayArguments(const ArgumentArray& array) noexcept : array_(array) {}

  int Int() noexcept { return static_cast<int>(Next()); }
  long long LongLong() noexcept { return static_cast<long long>(Next()); }
  double Double() noexcept { return std::bit_cast<double>(Next()); }
  long double LongDouble() noexcept { return Double(); }
  const char* NarrowText() noexcept { return (Next() & 1) != 0 ? array_.narrowText : nullptr; }
  const MCHAR* WideText() noexcept { return (Next() & 1) != 0 ? array_.wideText : nullptr; }
  const void* Pointer() noexcept {
    return reinterpret_cast<const void*>(static_cast<std::uintptr_t>(Next()));
  }

 private:
  std::uint64_t Next() noexcept { return next_ < array_.count ? array_.words[next_++] : 0; }

  const ArgumentArray& array_;
  std::size_t next_ = 0;
};

// The measuring and secure formatting entry points over an ArgumentArray, with exactly the
// rules of _vscprintf_l / _vscwprintf_l and _vsnprintf_s_l / _vsnwprintf_s_l. For the project's
// fuzz targets and tests.
VYN_API int MeasureFromArray(const char* format, _locale_t locale, const ArgumentArray& args);
VYN_API int MeasureFromArray(const MCHAR* format, _locale_t locale, const ArgumentArray& args);
VYN_API int FormatFromArray(char* buffer, std::size_t size, std::size_t count, const char* format,
                            _locale_t locale, const ArgumentArray& args);
VYN_API int FormatFromArray(MCHAR* buffer, std::size_t size, std::size_t count, const MCHAR* format,
                            _locale_t locale, const ArgumentArray& args);

}  // namespace win32::detail
