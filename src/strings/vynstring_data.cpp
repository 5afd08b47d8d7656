// Blocks and forms of VynString: allocation, reference counting, the per-block spin lock and the
// find-or-make procedure that converts each encoding at most once per block.

#include "strings/vynstring_data.h"

#include <cstdlib>
#include <cstring>
#include <new>

#include "strings/string_errors.h"
#include "vynutil/char_convert.h"
#include "win32/codepage.h"
#include "win32/crt_string.h"
#include "win32/process.h"

namespace VynSDK::Util::StringBlocks {

namespace {

// Blocks and forms come from the library's one heap (the runtime's malloc, as every
// VynHeapOperators allocation): a plain malloc first, and on failure the throwing allocation,
// which gives the new handler its chance and raises std::bad_alloc.
void* AllocateBytes(std::size_t bytes) {
  if (void* p = std::malloc(bytes)) return p;
  return VynHeapOperators::operator new(bytes);
}

void FreeBytes(void* p) noexcept { std::free(p); }

// header + characters + spare, refusing sizes that wrap around.
std::size_t BlockSize(std::size_t header, std::size_t charBytes) {
  if (charBytes > SIZE_MAX - header - kFormSpareBytes) throw std::bad_array_new_length();
  return header + charBytes + kFormSpareBytes;
}

std::size_t UnitsToBytes(std::size_t units, std::size_t unitSize) {
  if (units > SIZE_MAX / unitSize) throw std::bad_array_new_length();
  return units * unitSize;
}

// Zeroes the first 8 bytes of a character area of charBytes bytes and its 8 spare bytes.
void ClearEdges(char* chars, std::size_t charBytes) noexcept {
  std::memset(chars, 0, kFormSpareBytes);
  std::memset(chars + charBytes, 0, kFormSpareBytes);
}

// The spin lock of one block. Held only around the walk and extension of the form chain. A
// block with a single reference is reachable from the calling thread alone and needs no lock.
class BlockLock {
 public:
  explicit BlockLock(VynStringData* data) noexcept
      : m_data(data->refs.load(std::memory_order_acquire) == 1 ? nullptr : data) {
    if (!m_data) return;
    while (m_data->lock.exchange(kStringLockHeld, std::memory_order_acquire) != 0) {
      win32::SwitchToThread();
    }
  }
  ~BlockLock() {
    if (m_data) m_data->lock.store(0, std::memory_order_release);
  }
  BlockLock(const BlockLock&) = delete;
  BlockLock& operator=(const BlockLock&) = delete;

 private:
  VynStringData* m_data;
};

bool Matches(const EncodedForm* form, UINT encoding) noexcept {
  UINT tag = form->Encoding();
  return tag == encoding || (tag == CP_NEUTRAL && encoding != CP_UTF16 && encoding != CP_UTF32);
}

EncodedForm* FindMatch(VynStringData* data, UINT encoding) noexcept {
  for (EncodedForm* form = &data->primary; form; form = form->next.load(std::memory_order_acquire)) {
    if (Matches(form, encoding)) return form;
  }
  return nullptr;
}

// What one walk of the chain found.
struct ChainScan {
  EncodedForm* match = nullptr;
  EncodedForm* tail = nullptr;
  EncodedForm* utf8 = nullptr;
  EncodedForm* utf16 = nullptr;
  EncodedForm* utf32 = nullptr;
  EncodedForm* other = nullptr;  // the first form in any other 8-bit encoding
};

ChainScan Scan(VynStringData* data, UINT encoding) noexcept {
  ChainScan scan;
  for (EncodedForm* form = &data->primary; form; form = form->next.load(std::memory_order_acquire)) {
    if (!scan.match && Matches(form, encoding)) scan.match = form;
    switch (form->Encoding()) {
      case CP_UTF8: if (!scan.utf8) scan.utf8 = form; break;
      case CP_UTF16: if (!scan.utf16) scan.utf16 = form; break;
      case CP_UTF32: if (!scan.utf32) scan.utf32 = form; break;
      default: if (!scan.other) scan.other = form; break;
    }
    scan.tail = form;
  }
  return scan;
}

// A new, unlinked form with room for charBytes bytes of characters.
EncodedForm* NewForm(UINT encoding, std::size_t charBytes) {
  auto* form = static_cast<EncodedForm*>(AllocateBytes(BlockSize(sizeof(EncodedForm), charBytes)));
  new (&form->next) std::atomic<EncodedForm*>(nullptr);
  form->encoding = encoding;
  form->owner = nullptr;
  ClearEdges(form->Chars(), charBytes);
  return form;
}

// Gives back the unused tail of a form that was made at its largest possible size.
EncodedForm* ShrinkForm(EncodedForm* form, std::size_t usedBytes, std::size_t allocatedBytes) noexcept {
  if (allocatedBytes - usedBytes < 32) {
    std::memset(form->Chars() + usedBytes, 0, kFormSpareBytes);
    return form;
  }
  std::size_t size = sizeof(EncodedForm) + usedBytes + kFormSpareBytes;
  // The same heap as every allocation of the library; shrinking in place never fails, and a
  // failed move keeps the larger block, which is as good.
  if (auto* smaller = static_cast<EncodedForm*>(std::realloc(form, size))) form = smaller;
  std::memset(form->Chars() + usedBytes, 0, kFormSpareBytes);
  return form;
}

// The 8-bit code page that a form's bytes are handed to the converter in. Neutral text is ASCII
// in every 8-bit encoding; the active code page reads it as such.
UINT SourceCodePage(const EncodedForm* form) noexcept {
  return form->Encoding() == CP_NEUTRAL ? CP_ACP : form->Encoding();
}

int ToWin32Length(std::size_t units) noexcept {
  return units >= static_cast<std::size_t>(INT32_MAX) ? -1 : static_cast<int>(units) + 1;
}

EncodedForm* MakeUtf16(const ChainScan& scan) {
  if (scan.utf8) {
    const char* src = scan.utf8->Chars();
    std::size_t n = std::strlen(src);
    std::size_t bytes = UnitsToBytes(n + 1, sizeof(MCHAR));
    EncodedForm* form = NewForm(CP_UTF16, bytes);
    auto* out = reinterpret_cast<MCHAR*>(form->Chars());
    std::size_t units = win32::text::Utf8ToUtf16(src, n, out);
    out[units] = 0;
    return ShrinkForm(form, (units + 1) * sizeof(MCHAR), bytes);
  }
  if (scan.utf32) {
    auto* src = reinterpret_cast<const unsigned int*>(scan.utf32->Chars());
    std::size_t units = UTF32ToWideChar(src, VYN_STRING_TO_TERMINATOR, nullptr, 0);
    std::size_t bytes = UnitsToBytes(units, sizeof(MCHAR));
    EncodedForm* form = NewForm(CP_UTF16, bytes);
    UTF32ToWideChar(src, VYN_STRING_TO_TERMINATOR, reinterpret_cast<MCHAR*>(form->Chars()), units);
    return form;
  }
  if (scan.other) {
    const char* src = scan.other->Chars();
    UINT cp = SourceCodePage(scan.other);
    int srcLen = ToWin32Length(std::strlen(src));
    int units = win32::MultiByteToWideChar(cp, 0, src, srcLen, nullptr, 0);
    std::size_t bytes = UnitsToBytes(units > 0 ? units : 0, sizeof(MCHAR));
    EncodedForm* form = NewForm(CP_UTF16, bytes);
    if (units > 0) {
      win32::MultiByteToWideChar(cp, 0, src, srcLen, reinterpret_cast<MCHAR*>(form->Chars()), units);
    }
    return form;
  }
  ThrowNoConvertibleForm();
}

// UTF-8 takes up to three bytes a unit. Short text is converted on the stack and copied into a
// form of its exact size; long text is measured first (with the converter's few bytes of room for
// its vector stores), so no form is ever made three times too big.
EncodedForm* MakeUtf8(const MCHAR* src, std::size_t n) {
  constexpr std::size_t kStackUnits = 512;
  if (n <= kStackUnits) {
    char buffer[3 * kStackUnits + 1];
    std::size_t written = win32::text::Utf16ToUtf8(src, n, buffer);
    EncodedForm* form = NewForm(CP_UTF8, written + 1);
    std::memcpy(form->Chars(), buffer, written);
    form->Chars()[written] = 0;
    return form;
  }
  std::size_t bytes = win32::text::Utf16ToUtf8Length(src, n);
  EncodedForm* form = NewForm(CP_UTF8, bytes + 1 + win32::text::kUtf8WriteSlack);
  win32::text::Utf16ToUtf8(src, n, form->Chars());
  form->Chars()[bytes] = 0;
  return form;
}

EncodedForm* MakeFromUtf16(const EncodedForm* utf16, UINT encoding) {
  auto* src = reinterpret_cast<const MCHAR*>(utf16->Chars());
  if (encoding == CP_UTF8) return MakeUtf8(src, UnitLength(src, sizeof(MCHAR)));
  if (encoding == CP_UTF32) {
    std::size_t units = WideCharToUTF32(src, VYN_STRING_TO_TERMINATOR, nullptr, 0);
    std::size_t bytes = UnitsToBytes(units, sizeof(unsigned int));
    EncodedForm* form = NewForm(CP_UTF32, bytes);
    WideCharToUTF32(src, VYN_STRING_TO_TERMINATOR, reinterpret_cast<unsigned int*>(form->Chars()), units);
    return form;
  }
  int srcLen = ToWin32Length(UnitLength(src, sizeof(MCHAR)));
  int count = win32::WideCharToMultiByte(encoding, 0, src, srcLen, nullptr, 0, nullptr, nullptr);
  EncodedForm* form = NewForm(encoding, count > 0 ? count : 0);
  if (count > 0) {
    win32::WideCharToMultiByte(encoding, 0, src, srcLen, form->Chars(), count, nullptr, nullptr);
  }
  return form;
}

void FreeForm(EncodedForm* form) noexcept {
  form->next.store(nullptr, std::memory_order_relaxed);
  form->encoding = 0;
  form->owner = nullptr;
  FreeBytes(form);
}

void FreeBlock(VynStringData* data) noexcept {
  EncodedForm* form = data->primary.next.load(std::memory_order_acquire);
  while (form) {
    EncodedForm* next = form->next.load(std::memory_order_relaxed);
    FreeForm(form);
    form = next;
  }
  data->primary.next.store(nullptr, std::memory_order_relaxed);
  data->primary.encoding = 0;
  data->primary.owner = nullptr;
  data->bufferBytes = 0;
  data->lock.store(0, std::memory_order_relaxed);
  FreeBytes(data);
}

}  // namespace

std::size_t UnitSize(UINT encoding) noexcept {
  switch (encoding & CP_ENCODING_MASK) {
    case CP_UTF16: return 2;
    case CP_UTF32: return 4;
    default: return 1;
  }
}

std::size_t UnitLength(const void* chars, std::size_t unitSize) noexcept {
  switch (unitSize) {
    case 2: return win32::wcslen(static_cast<const MCHAR*>(chars));
    case 4: {
      auto* p = static_cast<const unsigned int*>(chars);
      const unsigned int* q = p;
      while (*q) ++q;
      return static_cast<std::size_t>(q - p);
    }
    default: return std::strlen(static_cast<const char*>(chars));
  }
}

VynStringData* Allocate(UINT encoding, std::size_t bufferBytes) {
  auto* data = static_cast<VynStringData*>(AllocateBytes(BlockSize(sizeof(VynStringData), bufferBytes)));
  new (&data->refs) std::atomic<std::uint32_t>(1);
  new (&data->lock) std::atomic<std::uint32_t>(0);
  data->bufferBytes = bufferBytes;
  new (&data->primary.next) std::atomic<EncodedForm*>(nullptr);
  data->primary.encoding = encoding;
  data->primary.owner = data;
  ClearEdges(data->primary.Chars(), bufferBytes);
  return data;
}

VynStringData* FromUnits(UINT encoding, const void* s, std::size_t len) {
  std::size_t unit = UnitSize(encoding);
  if (len == VYN_STRING_TO_TERMINATOR) len = UnitLength(s, unit);
  if (len >= SIZE_MAX / unit) throw std::bad_array_new_length();
  std::size_t textBytes = len * unit;
  VynStringData* data = Allocate(encoding, textBytes + unit);
  char* chars = data->primary.Chars();
  std::memcpy(chars, s, textBytes);
  std::memset(chars + textBytes, 0, unit);
  return data;
}

// Always atomic: a string held once may still be copied by several threads at the same time
// (each reads the one holder), so a count of 1 does not mean the caller is alone.
void AddRef(VynStringData* data) noexcept { data->refs.fetch_add(1, std::memory_order_relaxed); }

std::uint32_t Release(VynStringData* data) noexcept {
  // The only holder needs no atomic read-modify-write: nobody else can add a reference.
  if (data->refs.load(std::memory_order_acquire) == 1) {
    FreeBlock(data);
    return 0;
  }
  std::uint32_t left = data->refs.fetch_sub(1, std::memory_order_acq_rel) - 1;
  if (left == 0) FreeBlock(data);
  return left;
}

EncodedForm* FindOrMakeForm(VynStringData* data, UINT encoding) {
  encoding &= CP_ENCODING_MASK;
  // A neutral form is ASCII valid in every 8-bit encoding; asked of other text, the request is
  // answered in UTF-8, so that no lossy "neutral" form can later stand in for the UTF-8 one.
  if (encoding == CP_NEUTRAL && data->primary.Encoding() != CP_NEUTRAL) encoding = CP_UTF8;
  // Forms are only appended, and published with release stores: a cached form is found without
  // taking the lock.
  if (EncodedForm* found = FindMatch(data, encoding)) return found;
  for (;;) {
    {
      BlockLock lock(data);
      ChainScan scan = Scan(data, encoding);
      if (scan.match) return scan.match;
      if (encoding == CP_UTF16 || scan.utf16) {
        EncodedForm* form = encoding == CP_UTF16 ? MakeUtf16(scan) : MakeFromUtf16(scan.utf16, encoding);
        form->encoding = encoding;
        form->owner = data;
        scan.tail->next.store(form, std::memory_order_release);
        return form;
      }
    }
    // Every other form is made from the UTF-16 one: make that first, without holding the lock,
    // then look again (another thread may have made the requested form meanwhile).
    FindOrMakeForm(data, CP_UTF16);
  }
}

}  // namespace VynSDK::Util::StringBlocks
