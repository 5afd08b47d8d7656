// Floating-point conversions with the Windows runtime's forms. The digits come from the C++
// library's std::to_chars, which rounds exactly as glibc's printf does (correctly, ties to even)
// and, unlike snprintf, never looks at the process locale; this file adds what the runtime
// prints differently or what to_chars leaves to the caller: the sign and '#' handling, the
// "0x" prefix and 13-digit default of %a, and the names of infinities and NaNs.

#include "crt_format_float.h"

#include <algorithm>
#include <bit>
#include <charconv>
#include <cmath>
#include <cstring>

namespace win32::detail {

namespace {

// A double has at most 1074 digits after the decimal point and fewer than 800 significant
// digits, so digits asked for beyond this many are always zeros.
constexpr int kMaxDecimalDigits = 1100;
// A double's significand has 13 hex digits after the point.
constexpr int kMaxHexDigits = 13;

constexpr std::uint64_t kMantissaMask = (std::uint64_t{1} << 52) - 1;
constexpr std::uint64_t kQuietBit = std::uint64_t{1} << 51;

char Upper(char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c; }

// The runtime's names: "inf", "nan" (quiet), "nan(snan)" (signalling) and "nan(ind)" for the
// indefinite value, the negative quiet NaN without payload that invalid operations produce.
std::string_view NonFiniteName(std::uint64_t bits, bool upper) {
  const std::uint64_t mantissa = bits & kMantissaMask;
  const bool negative = (bits >> 63) != 0;
  if (mantissa == 0) return upper ? "INF" : "inf";
  if (negative && mantissa == kQuietBit) return upper ? "NAN(IND)" : "nan(ind)";
  if ((mantissa & kQuietBit) != 0) return upper ? "NAN" : "nan";
  return upper ? "NAN(SNAN)" : "nan(snan)";
}

struct Digits {
  char* begin;
  char* end;
};

Digits ToChars(char* scratch, double magnitude, std::chars_format format, int precision) {
  // Leave one byte free for a '.' that '#' may add.
  const auto result = std::to_chars(scratch, scratch + kFloatScratchSize - 1, magnitude, format, precision);
  return {scratch, result.ptr};
}

// Moves an exponent ("e+05", "p-3") out of the digits into the text's own storage.
void SplitExponent(Digits* digits, char marker, bool upper, FloatText* text, char* storage) {
  char* at = std::find(digits->begin, digits->end, marker);
  const std::size_t length = static_cast<std::size_t>(digits->end - at);
  for (std::size_t i = 0; i < length; ++i) storage[i] = upper ? Upper(at[i]) : at[i];
  text->exponent = std::string_view(storage, length);
  digits->end = at;
}

// The exponent of a to_chars scientific text ("1.5e-07" -> -7).
int ExponentOf(const Digits& digits) {
  const char* e = std::find(digits.begin, digits.end, 'e');
  int exponent = 0;
  std::from_chars(e + (e[1] == '+' ? 2 : 1), digits.end, exponent);
  return exponent;
}

// Formats with at most `cap` digits where `wanted` were asked for; the rest become zeros.
Digits Capped(char* scratch, double magnitude, std::chars_format format, int wanted, int cap,
              FloatText* text) {
  const int used = std::min(wanted, cap);
  text->zeros = static_cast<std::uint64_t>(wanted - used);
  return ToChars(scratch, magnitude, format, used);
}

// %f with a precision of at most 9 for values below 2^53, the common case, without the general
// conversion: value * 10^precision is computed exactly in 128 bits and rounded to nearest, ties
// to even. Returns the end of the digits, or null when the value is out of this path's range.
char* ShortFixed(double magnitude, int precision, char* out) {
  static constexpr std::uint64_t kPowers[] = {1,      10,      100,      1000,      10000,
                                              100000, 1000000, 10000000, 100000000, 1000000000};
  if (precision > 9) return nullptr;
  const std::uint64_t bits = std::bit_cast<std::uint64_t>(magnitude);
  std::uint64_t q = 0;  // magnitude * 10^precision, rounded
  if (bits != 0) {
    const int biased = static_cast<int>(bits >> 52);
    const int shift = 1075 - biased;  // magnitude = significand * 2^-shift
    if (biased == 0 || shift <= 0 || shift >= 128) return nullptr;  // subnormal, >= 2^53, tiny
    const std::uint64_t significand = (bits & kMantissaMask) | (std::uint64_t{1} << 52);
    const unsigned __int128 scaled = static_cast<unsigned __int128>(significand) * kPowers[precision];
    unsigned __int128 rounded = scaled >> shift;
    const unsigned __int128 rest = scaled - (rounded << shift);
    const unsigned __int128 half = static_cast<unsigned __int128>(1) << (shift - 1);
    if (rest > half || (rest == half && (rounded & 1) != 0)) ++rounded;
    if ((rounded >> 64) != 0) return nullptr;
    q = static_cast<std::uint64_t>(rounded);
  }
  const std::uint64_t whole = q / kPowers[precision];
  std::uint64_t fraction = q % kPowers[precision];
  char* end = std::to_chars(out, out + 24, whole).ptr;
  if (precision == 0) return end;
  *end = '.';
  for (int i = precision; i > 0; --i) {
    end[i] = static_cast<char>('0' + fraction % 10);
    fraction /= 10;
  }
  return end + 1 + precision;
}

// %g with '#': the style %e would give at precision - 1 decides, and trailing zeros stay.
Digits AlternateGeneral(char* scratch, double magnitude, int precision, FloatText* text,
                        bool* addPoint) {
  const Digits scientific = ToChars(scratch, magnitude, std::chars_format::scientific,
                                    std::min(precision - 1, kMaxDecimalDigits));
  const int exponent = ExponentOf(scientific);
  if (exponent < precision && exponent >= -4) {
    const int decimals = precision - 1 - exponent;
    *addPoint = decimals == 0;
    return Capped(scratch, magnitude, std::chars_format::fixed, decimals, kMaxDecimalDigits, text);
  }
  *addPoint = precision == 1;
  return Capped(scratch, magnitude, std::chars_format::scientific, precision - 1, kMaxDecimalDigits, text);
}

}  // namespace

void FormatFloat(double value, char type, int precision, FloatFlags flags, char decimalPoint,
                 char* scratch, FloatText* text) noexcept {
  const std::uint64_t bits = std::bit_cast<std::uint64_t>(value);
  const bool negative = (bits >> 63) != 0;
  const bool upper = type >= 'A' && type <= 'Z';
  const char lower = static_cast<char>(upper ? type - 'A' + 'a' : type);

  text->sign = negative ? "-" : flags.plus ? "+" : flags.space ? " " : "";
  text->prefix = {};
  text->zeros = 0;
  text->exponent = {};

  if (!std::isfinite(value)) {
    text->body = NonFiniteName(bits, upper);
    text->finite = false;
    return;
  }
  text->finite = true;

  const double magnitude = std::fabs(value);
  Digits digits{};
  bool addPoint = false;  // '#' asks for a point the digits do not have
  switch (lower) {
    case 'f': {
      const int wanted = precision < 0 ? 6 : precision;
      if (char* end = ShortFixed(magnitude, wanted, scratch)) {
        digits = {scratch, end};
      } else {
        digits = Capped(scratch, magnitude, std::chars_format::fixed, wanted, kMaxDecimalDigits, text);
      }
      addPoint = flags.alt && wanted == 0;
      break;
    }
    case 'e': {
      const int wanted = precision < 0 ? 6 : precision;
      digits = Capped(scratch, magnitude, std::chars_format::scientific, wanted, kMaxDecimalDigits, text);
      SplitExponent(&digits, 'e', upper, text, text->exponentStorage);
      addPoint = flags.alt && wanted == 0;
      break;
    }
    case 'g': {
      const int wanted = precision < 0 ? 6 : precision == 0 ? 1 : precision;
      if (flags.alt) {
        digits = AlternateGeneral(scratch, magnitude, wanted, text, &addPoint);
      } else {
        // Trailing zeros are dropped, so digits beyond the cap never show.
        digits = ToChars(scratch, magnitude, std::chars_format::general,
                         std::min(wanted, kMaxDecimalDigits));
      }
      SplitExponent(&digits, 'e', upper, text, text->exponentStorage);
      break;
    }
    default: {  // 'a'
      const int wanted = precision < 0 ? kMaxHexDigits : precision;
      digits = Capped(scratch, magnitude, std::chars_format::hex, wanted, kMaxHexDigits, text);
      SplitExponent(&digits, 'p', upper, text, text->exponentStorage);
      if (upper) std::transform(digits.begin, digits.end, digits.begin, Upper);
      text->prefix = upper ? "0X" : "0x";
      addPoint = flags.alt && wanted == 0;
      break;
    }
  }
  if (addPoint) *digits.end++ = '.';
  if (decimalPoint != '.') std::replace(digits.begin, digits.end, '.', decimalPoint);
  text->body = std::string_view(digits.begin, static_cast<std::size_t>(digits.end - digits.begin));
}

}  // namespace win32::detail
