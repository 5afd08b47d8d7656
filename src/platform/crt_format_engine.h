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
#include "crt_format_spec.h"
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
void WriteFloat(Sink& sink, const ConversionSpec& spec, const FormatLocale& locale, Arguments& args) {
  const double value =
      spec.size == SizePrefix::kBigL ? static_cast<double>(args.LongDouble()) : args.Double();
  char scratch[kFloatScratchSize];
  FloatText text;
  FormatFloat(value, spec.type, spec.precision, {spec.plus, spec.space, spec.alt},
              locale.DecimalPoint(), scratch, &text);
  NumberPieces n;
  n.sign = text.sign;
  n.prefix = text.prefix;
  n.body = text.body;
  n.trailingZeros = text.zeros;
  n.exponent = text.exponent;
  n.zeroPad = spec.zero && text.finite;  // infinities and NaNs are padded with spaces
  WriteNumber(sink, spec, n);
}

// One conversion, by its type character.
template <typename Char, typename Sink, typename Arguments>
FormatStatus WriteConversion(Sink& sink, ConversionSpec& spec, const FormatLocale& locale,
                             Arguments& args) {
  switch (spec.type) {
    case 'd':
    case 'i':
    case 'u':
    case 'o':
    case 'x':
    case 'X': {
      const bool isSigned = spec.type == 'd' || spec.type == 'i';
      std::uint64_t magnitude;
      bool negative;
      if (!ReadInteger(args, spec.size, isSigned, &magnitude, &negative)) {
        return FormatStatus::kInvalidFormat;
      }
      WriteInteger(sink, spec, magnitude, negative, isSigned, spec.type);
      return FormatStatus::kOk;
    }
    case 'p': {
      // All the digits of a 64-bit address in upper case, no prefix (0X with '#').
      const auto address = reinterpret_cast<std::uintptr_t>(args.Pointer());
      spec.precision = 2 * sizeof(void*);
      WriteInteger(sink, spec, address, false, false, 'X');
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
      WriteFloat(sink, spec, locale, args);
      return FormatStatus::kOk;
    case 'c':
    case 'C':
      WriteCharacter<Char>(sink, spec, IsWideArgument<Char>(spec), locale, args);
      return FormatStatus::kOk;
    case 's':
    case 'S':
      return WriteString<Char>(sink, spec, IsWideArgument<Char>(spec), locale, args);
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
    ConversionSpec spec;
    if (!ParseConversionSpec(p, args, &spec)) return FormatStatus::kInvalidFormat;
    const FormatStatus status = engine::WriteConversion<Char>(sink, spec, locale, args);
    if (status != FormatStatus::kOk) return status;
  }
}

}  // namespace win32::detail
