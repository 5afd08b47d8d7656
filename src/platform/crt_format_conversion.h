#pragma once
// One conversion of a printf format, %[flags][width][.precision][size]type, with
// the Windows runtime's size prefixes (hh h l ll L I I32 I64 j z t w). Widths and precisions
// given as '*' are read from the arguments here, in the order the runtime reads them.

#include <climits>
#include <cstdint>

namespace win32::detail {

// The outcome of formatting.
enum class FormatStatus {
  kOk,
  kInvalidFormat,   // unknown conversion, %n, a number out of range, or the end inside a conversion
  kUnconvertible,   // a string argument the locale's code page cannot convert
};

enum class SizePrefix : std::uint8_t { kNone, kHH, kH, kL, kLL, kBigL, kI, kI32, kI64, kJ, kZ, kT, kW };

struct Conversion {
  bool left = false;   // '-'
  bool plus = false;   // '+'
  bool space = false;  // ' '
  bool alt = false;    // '#'
  bool zero = false;   // '0'
  int width = 0;
  int precision = -1;  // -1: none
  SizePrefix size = SizePrefix::kNone;
  char type = 0;  // the conversion character; 0 for a unit outside ASCII
};

// Reads a decimal number of the format into *value; false when it exceeds INT_MAX.
template <typename Char>
bool ParseFormatNumber(const Char*& p, int* value) noexcept {
  long long n = 0;
  while (*p >= '0' && *p <= '9') {
    n = n * 10 + (*p - '0');
    if (n > INT_MAX) return false;
    ++p;
  }
  *value = static_cast<int>(n);
  return true;
}

// Parses the conversion after a '%' and leaves p after its type character. False for a
// number out of range or a format that ends inside the conversion; the type character
// itself is checked by the engine.
template <typename Char, typename Arguments>
bool ParseConversion(const Char*& p, Arguments& args, Conversion* conversion) noexcept {
  for (;; ++p) {
    switch (*p) {
      case '-': conversion->left = true; continue;
      case '+': conversion->plus = true; continue;
      case ' ': conversion->space = true; continue;
      case '#': conversion->alt = true; continue;
      case '0': conversion->zero = true; continue;
      default: break;
    }
    break;
  }

  if (*p == '*') {
    ++p;
    const int width = args.Int();
    if (width < 0) {  // a negative width argument means '-' and its magnitude
      conversion->left = true;
      conversion->width = width == INT_MIN ? INT_MAX : -width;
    } else {
      conversion->width = width;
    }
  } else if (!ParseFormatNumber(p, &conversion->width)) {
    return false;
  }

  if (*p == '.') {
    ++p;
    if (*p == '*') {
      ++p;
      const int precision = args.Int();
      conversion->precision = precision < 0 ? -1 : precision;  // a negative one counts as none
    } else if (!ParseFormatNumber(p, &conversion->precision)) {
      return false;
    }
  }

  switch (*p) {
    case 'h':
      ++p;
      conversion->size = *p == 'h' ? (++p, SizePrefix::kHH) : SizePrefix::kH;
      break;
    case 'l':
      ++p;
      conversion->size = *p == 'l' ? (++p, SizePrefix::kLL) : SizePrefix::kL;
      break;
    case 'I':
      ++p;
      if (p[0] == '6' && p[1] == '4') {
        p += 2;
        conversion->size = SizePrefix::kI64;
      } else if (p[0] == '3' && p[1] == '2') {
        p += 2;
        conversion->size = SizePrefix::kI32;
      } else {
        conversion->size = SizePrefix::kI;
      }
      break;
    case 'L': ++p; conversion->size = SizePrefix::kBigL; break;
    case 'j': ++p; conversion->size = SizePrefix::kJ; break;
    case 'z': ++p; conversion->size = SizePrefix::kZ; break;
    case 't': ++p; conversion->size = SizePrefix::kT; break;
    case 'w': ++p; conversion->size = SizePrefix::kW; break;
    default: break;
  }

  const Char type = *p;
  if (type == 0) return false;
  ++p;
  conversion->type = static_cast<std::uint32_t>(type) < 0x80 ? static_cast<char>(type) : 0;
  return true;
}

}  // namespace win32::detail
