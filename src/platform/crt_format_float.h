#pragma once
// The text of one floating-point conversion (%e %E %f %F %g %G %a %A) as the Windows runtime
// prints it, in pieces the engine pads: sign, prefix ("0x"), body, zeros, exponent. The '0'
// flag's zeros go between prefix and body; `zeros` are the digits a large precision asks for
// beyond the ones that can be non-zero.

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace win32::detail {

// Room the caller gives FormatFloat for the digits (precisions are capped below this and the
// rest given as `zeros`).
inline constexpr std::size_t kFloatScratchSize = 1536;

// The pieces of one conversion. exponent points into the text's own storage: use the object
// where FormatFloat filled it.
struct FloatText {
  std::string_view sign;      // "-", "+", " " or empty
  std::string_view prefix;    // "0x" / "0X" for %a and %A, else empty
  std::string_view body;      // digits and decimal point, or "inf", "nan", "nan(ind)" ...
  std::uint64_t zeros = 0;    // zeros after the body
  std::string_view exponent;  // "e+05", "P-3" or empty
  bool finite = true;         // false for infinities and NaNs, which the '0' flag leaves alone
  char exponentStorage[8] = {};
};

struct FloatFlags {
  bool plus;
  bool space;
  bool alt;
};

// Formats value for the conversion character type ('e', 'E', 'f', 'F', 'g', 'G', 'a', 'A') with
// precision (-1 for the default: 6, or 13 for %a). The pieces point into scratch, which must
// hold kFloatScratchSize bytes.
void FormatFloat(double value, char type, int precision, FloatFlags flags, char decimalPoint,
                 char* scratch, FloatText* text) noexcept;

}  // namespace win32::detail
