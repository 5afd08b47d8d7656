// The runtime's string length and case-insensitive comparisons for MCHAR and char text.

#include "win32/crt_string.h"

#include <emmintrin.h>
#include <unicode/uchar.h>

#include <cerrno>
#include <climits>
#include <cstdint>

namespace win32 {

namespace {

// The runtime's result for a comparison it cannot make (a null argument).
constexpr int kCompareError = INT_MAX;

int FoldAscii(unsigned char c) { return c >= 'A' && c <= 'Z' ? c + ('a' - 'A') : c; }

// The simple lower-case mapping of one UTF-16 unit. Surrogate units stand for no character of
// their own and stay as they are.
int FoldUnit(MCHAR unit) {
  if (unit < 0x80) return FoldAscii(static_cast<unsigned char>(unit));
  if (unit >= 0xD800 && unit <= 0xDFFF) return unit;
  const UChar32 lower = u_tolower(unit);
  return lower <= 0xFFFF ? lower : unit;
}

template <typename Char, typename Fold>
int CompareFolded(const Char* a, const Char* b, std::size_t n, Fold fold) {
  if (a == nullptr || b == nullptr) {
    errno = EINVAL;
    return kCompareError;
  }
  for (std::size_t i = 0; i < n; ++i) {
    const int fa = fold(a[i]);
    const int fb = fold(b[i]);
    if (fa != fb) return fa - fb;
    if (fa == 0) break;
  }
  return 0;
}

int FoldByte(char c) { return FoldAscii(static_cast<unsigned char>(c)); }

}  // namespace

// The aligned loads may read past the terminator (never past its page), which sanitizers would
// report as an access beyond the block.
__attribute__((no_sanitize("address", "thread"))) std::size_t wcslen(const MCHAR* s) noexcept {
  // Unit by unit up to a 16-byte boundary, then 8 units a step with aligned loads, which never
  // cross into a page the text does not reach.
  const MCHAR* p = s;
  while ((reinterpret_cast<std::uintptr_t>(p) & 15) != 0) {
    if (*p == 0) return static_cast<std::size_t>(p - s);
    ++p;
  }
  const __m128i zero = _mm_setzero_si128();
  for (;; p += 8) {
    const __m128i v = _mm_load_si128(reinterpret_cast<const __m128i*>(p));
    const unsigned mask = static_cast<unsigned>(_mm_movemask_epi8(_mm_cmpeq_epi16(v, zero)));
    if (mask != 0) return static_cast<std::size_t>(p - s) + static_cast<std::size_t>(__builtin_ctz(mask)) / 2;
  }
}

int _wcsicmp(const MCHAR* a, const MCHAR* b) noexcept {
  return CompareFolded(a, b, SIZE_MAX, FoldUnit);
}

int _wcsnicmp(const MCHAR* a, const MCHAR* b, std::size_t n) noexcept {
  if (n == 0) return 0;
  return CompareFolded(a, b, n, FoldUnit);
}

int _stricmp(const char* a, const char* b) noexcept {
  return CompareFolded(a, b, SIZE_MAX, FoldByte);
}

int _strnicmp(const char* a, const char* b, std::size_t n) noexcept {
  if (n == 0) return 0;
  return CompareFolded(a, b, n, FoldByte);
}

}  // namespace win32
