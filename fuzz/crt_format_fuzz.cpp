// Fuzzes the runtime formatting engine with any format string, narrow or wide, against a fixed
// argument array (every argument request is answered safely, so any format may run). Checks:
// measuring and formatting agree, a cut output is a prefix of the whole one, the buffer rules
// of the secure formatter hold, and nothing is written past the buffer's size.
//
// Input: byte 0 options (bit 0 wide format, bits 1-2 locale), byte 1 buffer size, 64 bytes of
// argument words, then the format (pairs of bytes as MCHAR units for a wide format).

#include <cerrno>
#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <vector>

#include "crt_format_args.h"
#include "win32/crt_format.h"

namespace {

using win32::_TRUNCATE;
using win32::detail::ArgumentArray;

constexpr std::size_t kWords = 8;
constexpr std::size_t kHeader = 2 + kWords * 8;
constexpr std::uint64_t kLargestCompared = 1 << 20;  // longer outputs are only measured and cut
constexpr std::size_t kGuard = 16;

void Require(bool condition) {
  if (!condition) std::abort();
}

_locale_t PickLocale(unsigned choice) {
  static _locale_t const locales[] = {
      nullptr,
      win32::_create_locale(win32::LC_ALL_CRT, "C"),
      win32::_create_locale(win32::LC_ALL_CRT, "Japanese"),
      win32::_create_locale(win32::LC_ALL_CRT, "German_Germany.utf8"),
  };
  return locales[choice & 3];
}

template <typename Char>
void Check(const std::vector<Char>& format, std::size_t size, _locale_t locale, const ArgumentArray& args) {
  errno = 0;
  const int measured = win32::detail::MeasureFromArray(format.data(), locale, args);
  Require(measured >= -1);
  const bool tooLong = measured < 0 && errno == EOVERFLOW;  // else a refused format or argument

  // The whole output, when it is of a size worth keeping.
  std::vector<Char> whole;
  if (measured >= 0 && static_cast<std::uint64_t>(measured) <= kLargestCompared) {
    whole.assign(static_cast<std::size_t>(measured) + 1 + kGuard, Char{0x55});
    const int written = win32::detail::FormatFromArray(whole.data(), static_cast<std::size_t>(measured) + 1,
                                                        _TRUNCATE, format.data(), locale, args);
    Require(written == measured);
    Require(whole[static_cast<std::size_t>(measured)] == 0);
    for (std::size_t i = static_cast<std::size_t>(measured) + 1; i < whole.size(); ++i) {
      Require(whole[i] == Char{0x55});
    }
  }

  // The same into a small buffer: truncating, then with a count that makes overflow an error.
  std::vector<Char> small(size + kGuard, Char{0x55});
  const int cut = win32::detail::FormatFromArray(small.data(), size, _TRUNCATE, format.data(), locale, args);
  for (std::size_t i = size; i < small.size(); ++i) Require(small[i] == Char{0x55});
  if (size == 0) {
    Require(cut == -1);
    return;
  }
  if (measured < 0) {
    Require(cut == -1);
    if (!tooLong) Require(small[0] == 0);
  } else if (static_cast<std::size_t>(measured) < size) {
    Require(cut == measured && small[static_cast<std::size_t>(measured)] == 0);
  } else {
    Require(cut == -1 && small[size - 1] == 0);
    if (!whole.empty()) Require(std::memcmp(small.data(), whole.data(), (size - 1) * sizeof(Char)) == 0);
  }

  const int strict = win32::detail::FormatFromArray(small.data(), size, size, format.data(), locale, args);
  for (std::size_t i = size; i < small.size(); ++i) Require(small[i] == Char{0x55});
  if (measured >= 0 && static_cast<std::size_t>(measured) < size) {
    Require(strict == measured);
  } else {
    Require(strict == -1 && small[0] == 0);
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size < kHeader) return 0;
  const unsigned options = data[0];
  const std::size_t bufferSize = data[1];
  std::uint64_t words[kWords];
  std::memcpy(words, data + 2, sizeof(words));
  const ArgumentArray args{words, kWords, "n\xC3\xA9\x93\xFA", u"w\u00E9\u65E5\U0001F600"};
  const _locale_t locale = PickLocale(options >> 1);
  const std::uint8_t* text = data + kHeader;
  const std::size_t length = size - kHeader;

  if ((options & 1) == 0) {
    std::vector<char> format(text, text + length);
    format.push_back(0);
    Check(format, bufferSize, locale, args);
  } else {
    std::vector<MCHAR> format(length / 2 + 1, 0);
    std::memcpy(format.data(), text, length / 2 * 2);
    Check(format, bufferSize, locale, args);
  }
  return 0;
}
