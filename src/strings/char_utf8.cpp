// The UTF-8 checks the text reader uses to detect an encoding: sequence length from a lead byte,
// and a well-formedness test that tolerates a sequence cut off by the end of the data.

#include "vynutil/char.h"

namespace VynSDK::Util {

namespace {

bool IsContinuationByte(unsigned char b) { return (b & 0xC0) == 0x80; }

// Length of the sequence that b starts, 1 for ASCII, 0 for a byte that cannot start one
// (a continuation byte, 0xFE, 0xFF).
unsigned SequenceLength(unsigned char b) {
  if (b < 0x80) return 1;
  if ((b & 0xE0) == 0xC0) return 2;
  if ((b & 0xF0) == 0xE0) return 3;
  if ((b & 0xF8) == 0xF0) return 4;
  if ((b & 0xFC) == 0xF8) return 5;
  if ((b & 0xFE) == 0xFC) return 6;
  return 0;
}

}  // namespace

unsigned int Char::UTF8CharLength(unsigned char lead) noexcept {
  const unsigned len = SequenceLength(lead);
  return len == 0 ? 1 : len;
}

bool Char::IsValidUTF8(const void* data, std::size_t byteCount, bool* hasMultiByte,
                       std::size_t* missingBytes) noexcept {
  const auto* bytes = static_cast<const unsigned char*>(data);
  if (bytes == nullptr) byteCount = 0;
  bool multiByte = false;
  std::size_t missing = 0;
  bool valid = true;
  for (std::size_t i = 0; i < byteCount && valid && missing == 0;) {
    const unsigned len = SequenceLength(bytes[i]);
    if (len == 0) {
      valid = false;
      break;
    }
    const std::size_t present = len < byteCount - i ? len : byteCount - i;
    for (std::size_t k = 1; k < present; ++k) {
      if (!IsContinuationByte(bytes[i + k])) {
        valid = false;
        break;
      }
    }
    if (!valid) break;
    if (present < len) {
      missing = len - present;
    } else if (len > 1) {
      multiByte = true;
    }
    i += present;
  }
  if (hasMultiByte) *hasMultiByte = multiByte;
  if (missingBytes) *missingBytes = valid ? missing : 0;
  return valid;
}

}  // namespace VynSDK::Util
