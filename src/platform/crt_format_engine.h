#pragma once
// The formatting engine behind every printf-family entry point: walks a format of char or
// MCHAR units with the Windows runtime's rules, takes arguments from an argument source
// (crt_format_args.h) and writes to a sink (crt_format_sink.h). One pass, no allocation except
// for converting a long string argument into output that has no room left for it.

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "crt_format_field.h"
#include "crt_format_float.h"
#include "crt_format_integer.h"
#include "crt_format_locale.h"
#include "crt_format_conversion.h"
#include "crt_format_text.h"

namespace win32::detail {

namespace engine {

// The next '%' or the terminator.
template <typename Char>
const Char* NextDirective(const Char* p) noexcept {
  if constexpr (sizeof(Char) == 1) {
    return strchrnul(p, '%');
  } else {
    while (*p != 0 && *p != '%') ++p;
    return p;
  }
}

// %e %E %f %F %g %G %a %A: a double, or a long double with L (printed as a double).
template <typename Sink, typename Arguments>
void WriteFloat(Sink& sink, const Conversion& conversion, const FormatLocale& locale, Arguments& args) {
  const double value =
      conversion.size == SizePrefix::kBigL ? static_cast<double>(args.LongDouble()) : args.Double();
  char scratch[kFloatScratchSize];
  FloatText text;
  const FloatFlags flags{conversion.plus, conversion.space, conversion.alt};
  FormatFloat(value, conversion.type, conversion.precision, flags,
              locale.DecimalPoint(), scratch, &text);
  NumberPieces n;
  n.sign = text.sign;
  n.prefix = text.prefix;
  n.body = text.body;
  n.trailingZeros = text.zeros;
  n.exponent = text.exponent;
  n.zeroPad = conversion.zero && text.finite;  // infinities and NaNs are padded with spaces
  WriteNumber(sink, conversion, n);
}

// One conversion, by its type character.
template <typename Char, typename Sink, typename Arguments>
FormatStatus WriteConversion(Sink& sink, Conversion& conversion, const FormatLocale& locale,
                             Arguments& args) {
  switch (conversion.type) {
    case 'd':
    case 'i':
    case 'u':
    case 'o':
    case 'x':
    case 'X': {
      const bool isSigned = conversion.type == 'd' || conversion.type == 'i';
      std::uint64_t magnitude;
      bool negative;
      if (!ReadInteger(args, conversion.size, isSigned, &magnitude, &negative)) {
        return FormatStatus::kInvalidFormat;
      }
      WriteInteger(sink, conversion, magnitude, negative, isSigned, conversion.type);
      return FormatStatus::kOk;
    }
    case 'p': {
      // All the digits of a 64-bit address in upper case, no prefix (0X with '#').
      const auto address = reinterpret_cast<std::uintptr_t>(args.Pointer());
      conversion.precision = 2 * sizeof(void*);
      WriteInteger(sink, conversion, address, false, false, 'X');
      return FormatStatus::kOk;
    }
    case 'e':
    case 'E':
    case 'f':
    case 'F':
    case 'g':
    case 'G':
    case 'a':
    case 'A':
      WriteFloat(sink, conversion, locale, args);
      return FormatStatus::kOk;
    case 'c':
    case 'C':
      WriteCharacter<Char>(sink, conversion, IsWideArgument<Char>(conversion), locale, args);
      return FormatStatus::kOk;
    case 's':
    case 'S':
      return WriteString<Char>(sink, conversion, IsWideArgument<Char>(conversion), locale, args);
    default:
      return FormatStatus::kInvalidFormat;  // %n, %Z and anything unknown
  }
}

}  // namespace engine

// Formats `format` into sink. Arguments are read only as far as the format gets; the sink's
// count is the length of the whole output when the result is kOk.
template <typename Char, typename Sink, typename Arguments>
FormatStatus FormatToSink(const Char* format, const FormatLocale& locale, Arguments& args, Sink& sink) {
  const Char* p = format;
  for (;;) {
    const Char* directive = engine::NextDirective(p);
    if (directive != p) sink.Append(p, static_cast<std::size_t>(directive - p));
    if (*directive == 0) return FormatStatus::kOk;
    p = directive + 1;
    if (*p == '%') {
      sink.Put('%');
      ++p;
      continue;
    }
    Conversion conversion;
    if (!ParseConversion(p, args, &conversion)) return FormatStatus::kInvalidFormat;
    const FormatStatus status = engine::WriteConversion<Char>(sink, conversion, locale, args);
    if (status != FormatStatus::kOk) return status;
  }
}

}  // namespace win32::detail
