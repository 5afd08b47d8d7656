#pragma once
// Integer conversions (%d %i %u %o %x %X, and %p through them): reading the argument at the
// size its prefix names, and writing its digits. A measuring sink only counts the digits.

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

#include "crt_format_field.h"
#include "crt_format_conversion.h"

namespace win32::detail::engine {

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
void WriteInteger(Sink& sink, const Conversion& conversion, std::uint64_t magnitude, bool negative,
                  bool isSigned, char type) {
  char buffer[24];
  char* const end = buffer + sizeof(buffer);
  NumberPieces n;
  if (isSigned) n.sign = negative ? "-" : conversion.plus ? "+" : conversion.space ? " " : "";
  if (magnitude != 0 || conversion.precision != 0) {  // "%.0d" prints no digits for 0
    n.body = IntegerDigits<Sink>(magnitude, type, end);
  }
  if (conversion.width == 0 && conversion.precision < 0 && !conversion.alt) {  // the common plain case
    if (!n.sign.empty()) sink.Put(static_cast<unsigned char>(n.sign[0]));
    sink.AppendAscii(n.body.data(), n.body.size());
    return;
  }
  if (conversion.alt && magnitude != 0 && (type == 'x' || type == 'X')) n.prefix = type == 'x' ? "0x" : "0X";
  const auto digits = static_cast<std::uint64_t>(n.body.size());
  const auto precision = static_cast<std::uint64_t>(conversion.precision < 0 ? 1 : conversion.precision);
  n.leadingZeros = precision > digits ? precision - digits : 0;
  if (conversion.alt && type == 'o' && n.leadingZeros == 0 && (digits == 0 || magnitude != 0)) {
    n.leadingZeros = 1;  // '#' makes the first octal digit a 0
  }
  n.zeroPad = conversion.zero && conversion.precision < 0;  // a precision turns the '0' flag off
  WriteNumber(sink, conversion, n);
}

// Reads an integer argument of the conversion's size. False for sizes integers do not take.
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

}  // namespace win32::detail::engine
