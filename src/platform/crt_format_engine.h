#pragma once
// The formatting engine behind every printf-family entry point: walks a format of char or
// MCHAR units with the Windows runtime's rules, takes arguments from an argument source
// (crt_format_args.h) and writes to a sink (crt_format_sink.h). One pass, no allocation except
// for converting a long string argument into output that has no room left for it.

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <memory>
#include <new>
#include <string_view>

#include "crt_format_convert.h"
#include "crt_format_float.h"
#include "crt_format_locale.h"
#include "crt_format_spec.h"

namespace win32::detail {

enum class FormatStatus {
  kOk,
  kInvalidFormat,   // unknown conversion, %n, a number out of range, or the end inside a conversion
  kUnconvertible,   // a string argument the locale's code page cannot convert
};

namespace engine {

// --- text helpers ---------------------------------------------------------------------------

template <typename Char>
std::size_t TextLength(const Char* s, int precision) noexcept {
  if constexpr (sizeof(Char) == 1) {
    return precision < 0 ? std::strlen(s) : strnlen(s, static_cast<std::size_t>(precision));
  } else {
    const std::size_t limit = precision < 0 ? SIZE_MAX : static_cast<std::size_t>(precision);
    std::size_t n = 0;
    while (n < limit && s[n] != 0) ++n;
    return n;
  }
}

template <typename Char>
const Char* NextDirective(const Char* p) noexcept {
  if constexpr (sizeof(Char) == 1) {
    return strchrnul(p, '%');
  } else {
    while (*p != 0 && *p != '%') ++p;
    return p;
  }
}

// The text printed for a null string argument.
template <typename Char>
const Char* NullText() noexcept {
  if constexpr (sizeof(Char) == 1) {
    return "(null)";
  } else {
    return u"(null)";
  }
}

// --- fields ---------------------------------------------------------------------------------

// Pads a field of `length` units around what body() writes: spaces before it, or '0's when the
// spec has '0' and zeros are allowed, or spaces after it with '-'. The runtime pads strings and
// characters with '0' too.
template <typename Sink, typename Body>
void WritePadded(Sink& sink, const ConversionSpec& spec, std::uint64_t length, Body&& body) {
  const std::uint64_t width = static_cast<std::uint64_t>(spec.width);
  const std::uint64_t pad = width > length ? width - length : 0;
  if (!spec.left) sink.Fill(spec.zero ? '0' : ' ', pad);
  body();
  if (spec.left) sink.Fill(' ', pad);
}

// A number: [spaces] sign/prefix [zeros for '0'] leading zeros, body, trailing zeros,
// exponent [spaces for '-'].
struct NumberPieces {
  std::string_view sign;      // "-", "+", " " or empty
  std::string_view prefix;    // "0x", "0X" or empty
  std::uint64_t leadingZeros = 0;
  std::string_view body;
  std::uint64_t trailingZeros = 0;
  std::string_view exponent;
  bool zeroPad = false;  // the '0' flag applies
};

template <typename Sink>
void WriteNumber(Sink& sink, const ConversionSpec& spec, const NumberPieces& n) {
  const std::uint64_t length = n.sign.size() + n.prefix.size() + n.leadingZeros + n.body.size() +
                               n.trailingZeros + n.exponent.size();
  const std::uint64_t width = static_cast<std::uint64_t>(spec.width);
  const std::uint64_t pad = width > length ? width - length : 0;
  const bool zeroPad = n.zeroPad && !spec.left;
  if (pad != 0 && !spec.left && !zeroPad) sink.Fill(' ', pad);
  if (!n.sign.empty()) sink.Put(static_cast<unsigned char>(n.sign[0]));
  if (!n.prefix.empty()) sink.AppendAscii(n.prefix.data(), n.prefix.size());
  if (pad != 0 && zeroPad) sink.Fill('0', pad);
  if (n.leadingZeros != 0) sink.Fill('0', n.leadingZeros);
  sink.AppendAscii(n.body.data(), n.body.size());
  if (n.trailingZeros != 0) sink.Fill('0', n.trailingZeros);
  if (!n.exponent.empty()) sink.AppendAscii(n.exponent.data(), n.exponent.size());
  if (pad != 0 && spec.left) sink.Fill(' ', pad);
}

// --- integers -------------------------------------------------------------------------------

inline constexpr char kDigitPairs[] =
    "00010203040506070809101112131415161718192021222324252627282930313233343536373839"
    "40414243444546474849505152535455565758596061626364656667686970717273747576777879"
    "8081828384858687888990919293949596979899";

template <typename Unsigned>
char* DecimalDigits(Unsigned v, char* end) noexcept {
  while (v >= 100) {
    const unsigned pair = static_cast<unsigned>(v % 100);
    v /= 100;
    end -= 2;
    std::memcpy(end, kDigitPairs + 2 * pair, 2);
  }
  if (v >= 10) {
    end -= 2;
    std::memcpy(end, kDigitPairs + 2 * v, 2);
  } else {
    *--end = static_cast<char>('0' + v);
  }
  return end;
}

inline char* RadixDigits(std::uint64_t v, unsigned shift, bool upper, char* end) noexcept {
  const char* digits = upper ? "0123456789ABCDEF" : "0123456789abcdef";
  const unsigned mask = (1u << shift) - 1;
  do {
    *--end = digits[v & mask];
    v >>= shift;
  } while (v != 0);
  return end;
}

// The decimal digits of v (at least 1).
inline std::size_t DecimalDigitCount(std::uint64_t v) noexcept {
  static constexpr std::uint64_t kPowers[] = {
      0, 10, 100, 1000, 10000, 100000, 1000000, 10000000, 100000000, 1000000000, 10000000000ULL,
      100000000000ULL, 1000000000000ULL, 10000000000000ULL, 100000000000000ULL,
      1000000000000000ULL, 10000000000000000ULL, 100000000000000000ULL, 1000000000000000000ULL,
      10000000000000000000ULL};
  const int bits = 64 - __builtin_clzll(v | 1);
  const std::size_t guess = static_cast<std::size_t>((bits * 1233) >> 12);  // log10(2) ~ 1233/4096
  return guess + (v >= kPowers[guess] ? 1 : 0);
}

// The digits of magnitude in the conversion's radix, ending at end. A measuring sink only
// needs their number: the view then covers unwritten bytes that are never read.
template <typename Sink>
std::string_view IntegerDigits(std::uint64_t magnitude, char type, char* end) noexcept {
  const unsigned shift = type == 'o' ? 3 : (type == 'x' || type == 'X') ? 4 : 0;
  if constexpr (!Sink::kKeepsText) {
    const int bits = 64 - __builtin_clzll(magnitude | 1);
    const std::size_t n = shift == 0 ? DecimalDigitCount(magnitude) : (bits + shift - 1) / shift;
    return std::string_view(end - n, n);
  } else {
    char* begin;
    if (shift != 0) {
      begin = RadixDigits(magnitude, shift, type == 'X', end);
    } else if (magnitude <= UINT32_MAX) {
      begin = DecimalDigits(static_cast<std::uint32_t>(magnitude), end);
    } else {
      begin = DecimalDigits(magnitude, end);
    }
    return std::string_view(begin, static_cast<std::size_t>(end - begin));
  }
}

template <typename Sink>
void WriteInteger(Sink& sink, const ConversionSpec& spec, std::uint64_t magnitude, bool negative,
                  bool isSigned, char type) {
  char buffer[24];
  char* const end = buffer + sizeof(buffer);
  NumberPieces n;
  if (isSigned) n.sign = negative ? "-" : spec.plus ? "+" : spec.space ? " " : "";
  if (magnitude != 0 || spec.precision != 0) {  // "%.0d" prints no digits for 0
    n.body = IntegerDigits<Sink>(magnitude, type, end);
  }
  if (spec.width == 0 && spec.precision < 0 && !spec.alt) {  // the common plain case
    if (!n.sign.empty()) sink.Put(static_cast<unsigned char>(n.sign[0]));
    sink.AppendAscii(n.body.data(), n.body.size());
    return;
  }
  if (spec.alt && magnitude != 0 && (type == 'x' || type == 'X')) n.prefix = type == 'x' ? "0x" : "0X";
  const auto digits = static_cast<std::uint64_t>(n.body.size());
  const auto precision = static_cast<std::uint64_t>(spec.precision < 0 ? 1 : spec.precision);
  n.leadingZeros = precision > digits ? precision - digits : 0;
  if (spec.alt && type == 'o' && n.leadingZeros == 0 && (digits == 0 || magnitude != 0)) {
    n.leadingZeros = 1;  // '#' makes the first octal digit a 0
  }
  n.zeroPad = spec.zero && spec.precision < 0;  // a precision turns the '0' flag off
  WriteNumber(sink, spec, n);
}

// Reads an integer argument of the spec's size. False for sizes integers do not take.
template <typename Arguments>
bool ReadInteger(Arguments& args, SizePrefix size, bool isSigned, std::uint64_t* magnitude,
                 bool* negative) {
  std::int64_t value;
  switch (size) {
    case SizePrefix::kNone:
    case SizePrefix::kL:
    case SizePrefix::kI32: {
      const int v = args.Int();
      value = isSigned ? v : static_cast<std::int64_t>(static_cast<std::uint32_t>(v));
      break;
    }
    case SizePrefix::kHH: {
      const int v = args.Int();
      value = isSigned ? static_cast<signed char>(v) : static_cast<unsigned char>(v);
      break;
    }
    case SizePrefix::kH: {
      const int v = args.Int();
      value = isSigned ? static_cast<short>(v) : static_cast<unsigned short>(v);
      break;
    }
    case SizePrefix::kLL:
    case SizePrefix::kI:
    case SizePrefix::kI64:
    case SizePrefix::kJ:
    case SizePrefix::kZ:
    case SizePrefix::kT: {
      const long long v = args.LongLong();
      if (!isSigned) {
        *magnitude = static_cast<std::uint64_t>(v);
        *negative = false;
        return true;
      }
      value = v;
      break;
    }
    default:
      return false;  // L and w name no integer size
  }
  *negative = value < 0;
  *magnitude = *negative ? 0 - static_cast<std::uint64_t>(value) : static_cast<std::uint64_t>(value);
  return true;
}

// --- floating point -------------------------------------------------------------------------

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

// --- strings and characters -----------------------------------------------------------------

// Appends converted text of `units` output units: in place when the sink has room, else
// through a temporary buffer (the sink then keeps what fits).
template <typename OutChar, typename Sink, typename Convert>
void AppendConverted(Sink& sink, std::size_t units, Convert&& convert) {
  if constexpr (!Sink::kKeepsText) {
    sink.Fill(OutChar{}, units);
  } else {
    if (OutChar* direct = sink.Reserve(units)) {
      convert(direct);
      sink.Commit(units);
      return;
    }
    OutChar local[256];
    std::unique_ptr<OutChar[]> heap;
    OutChar* temporary = local;
    if (units > std::size(local)) {
      heap.reset(new (std::nothrow) OutChar[units]);
      if (!heap) {  // no memory for text that is being cut anyway: keep its length only
        sink.Fill(OutChar{'?'}, units);
        return;
      }
      temporary = heap.get();
    }
    convert(temporary);
    sink.Append(temporary, units);
  }
}

// %s/%S: text of the format's own kind, or of the other kind converted with the code page.
template <typename Char, typename Sink, typename Arguments>
FormatStatus WriteString(Sink& sink, const ConversionSpec& spec, bool wideArgument,
                         const FormatLocale& locale, Arguments& args) {
  constexpr bool kWideFormat = sizeof(Char) == 2;
  if (wideArgument == kWideFormat) {
    const Char* text;
    if constexpr (kWideFormat) text = args.WideText(); else text = args.NarrowText();
    if (text == nullptr) text = NullText<Char>();
    const std::size_t n = TextLength(text, spec.precision);
    WritePadded(sink, spec, n, [&] { sink.Append(text, n); });
    return FormatStatus::kOk;
  }
  if constexpr (kWideFormat) {  // narrow text into MCHAR output
    const char* text = args.NarrowText();
    if (text == nullptr) text = NullText<char>();
    std::size_t n = TextLength(text, spec.precision);
    if (spec.precision >= 0 && text[n] != 0) n = WholeCharacterBytes(locale, text, n);
    const long long units = WideLengthOfNarrow(locale, text, n);
    if (units < 0) return FormatStatus::kUnconvertible;
    WritePadded(sink, spec, static_cast<std::uint64_t>(units), [&] {
      AppendConverted<MCHAR>(sink, static_cast<std::size_t>(units), [&](MCHAR* out) {
        NarrowToWide(locale, text, n, out, static_cast<std::size_t>(units));
      });
    });
  } else {  // MCHAR text into narrow output
    const MCHAR* text = args.WideText();
    if (text == nullptr) text = NullText<MCHAR>();
    std::size_t n = TextLength(text, spec.precision);
    if (spec.precision >= 0 && text[n] != 0) n = WholeCharacterUnits(text, n);
    const long long bytes = NarrowLengthOfWide(locale, text, n);
    if (bytes < 0) return FormatStatus::kUnconvertible;
    WritePadded(sink, spec, static_cast<std::uint64_t>(bytes), [&] {
      AppendConverted<char>(sink, static_cast<std::size_t>(bytes), [&](char* out) {
        WideToNarrow(locale, text, n, out, static_cast<std::size_t>(bytes));
      });
    });
  }
  return FormatStatus::kOk;
}

// %c/%C. A character the code page cannot convert is left out, padding and all, as the
// runtime does.
template <typename Char, typename Sink, typename Arguments>
void WriteCharacter(Sink& sink, const ConversionSpec& spec, bool wideArgument,
                    const FormatLocale& locale, Arguments& args) {
  constexpr bool kWideFormat = sizeof(Char) == 2;
  const int value = args.Int();
  Char out[4];
  std::size_t n = 1;
  if (wideArgument == kWideFormat) {
    out[0] = static_cast<Char>(value);
  } else if constexpr (kWideFormat) {
    if (!NarrowCharToWide(locale, static_cast<char>(value), &out[0])) return;
  } else {
    n = static_cast<std::size_t>(WideCharToNarrow(locale, static_cast<MCHAR>(value), out));
    if (n == 0) return;
  }
  WritePadded(sink, spec, n, [&] { sink.Append(out, n); });
}

// Whether a %c/%s/%C/%S argument is wide: h narrow, l and w wide, otherwise by the letter and
// the format's kind (lower case: the format's own kind).
template <typename Char>
bool IsWideArgument(const ConversionSpec& spec) {
  if (spec.size == SizePrefix::kH) return false;
  if (spec.size == SizePrefix::kL || spec.size == SizePrefix::kW) return true;
  const bool ownKind = spec.type == 'c' || spec.type == 's';
  return ownKind == (sizeof(Char) == 2);
}

// --- one conversion -------------------------------------------------------------------------

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
