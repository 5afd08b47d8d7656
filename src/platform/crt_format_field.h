#pragma once
// How the formatting engine lays out one field: padding to the width with spaces or zeros,
// left or right, around a text or a number made of pieces (sign, prefix, zeros, digits,
// exponent).

#include <cstdint>
#include <string_view>

#include "crt_format_conversion.h"

namespace win32::detail::engine {

// Pads a field of `length` units around what body() writes: spaces before it, or '0's when the
// conversion has '0' and zeros are allowed, or spaces after it with '-'. The runtime pads strings and
// characters with '0' too.
template <typename Sink, typename Body>
void WritePadded(Sink& sink, const Conversion& conversion, std::uint64_t length, Body&& body) {
  const std::uint64_t width = static_cast<std::uint64_t>(conversion.width);
  const std::uint64_t pad = width > length ? width - length : 0;
  if (!conversion.left) sink.Fill(conversion.zero ? '0' : ' ', pad);
  body();
  if (conversion.left) sink.Fill(' ', pad);
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
void WriteNumber(Sink& sink, const Conversion& conversion, const NumberPieces& n) {
  const std::uint64_t length = n.sign.size() + n.prefix.size() + n.leadingZeros + n.body.size() +
                               n.trailingZeros + n.exponent.size();
  const std::uint64_t width = static_cast<std::uint64_t>(conversion.width);
  const std::uint64_t pad = width > length ? width - length : 0;
  const bool zeroPad = n.zeroPad && !conversion.left;
  if (pad != 0 && !conversion.left && !zeroPad) sink.Fill(' ', pad);
  if (!n.sign.empty()) sink.Put(static_cast<unsigned char>(n.sign[0]));
  if (!n.prefix.empty()) sink.AppendAscii(n.prefix.data(), n.prefix.size());
  if (pad != 0 && zeroPad) sink.Fill('0', pad);
  if (n.leadingZeros != 0) sink.Fill('0', n.leadingZeros);
  sink.AppendAscii(n.body.data(), n.body.size());
  if (n.trailingZeros != 0) sink.Fill('0', n.trailingZeros);
  if (!n.exponent.empty()) sink.AppendAscii(n.exponent.data(), n.exponent.size());
  if (pad != 0 && conversion.left) sink.Fill(' ', pad);
}

}  // namespace win32::detail::engine
