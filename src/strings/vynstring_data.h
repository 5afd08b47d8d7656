#pragma once
// The memory layout of a VynString block and its cached forms, and the operations on them.
//
// A block is one heap allocation: {reference count, lock word, buffer byte count, primary form}.
// Every form, the primary included, is {next form, encoding tag, owner block, characters...}, so
// the owner pointer always stands immediately before the characters and a raw character pointer
// of any form leads back to its block. Each form has 8 spare bytes after its characters; the
// first 8 bytes of the character area and the spare bytes are zeroed when a form is made, so a
// form always reads as terminated text in any encoding.

#include <atomic>
#include <cstddef>
#include <cstdint>

#include "vynutil/vynstring.h"

namespace VynSDK::Util {

// The lock word's value while a thread holds a block's spin lock.
inline constexpr std::uint32_t kStringLockHeld = 4302;
// Spare zeroed bytes after the characters of every form.
inline constexpr std::size_t kFormSpareBytes = 8;

struct EncodedForm {
  std::atomic<EncodedForm*> next;  // the following cached form, null at the tail
  UINT encoding;                   // encoding tag (only the low 28 bits name the encoding)
  VynStringData* owner;            // the block this form belongs to

  char* Chars() noexcept { return reinterpret_cast<char*>(this + 1); }
  const char* Chars() const noexcept { return reinterpret_cast<const char*>(this + 1); }
  UINT Encoding() const noexcept { return encoding & CP_ENCODING_MASK; }
};

struct VynStringData {
  std::atomic<std::uint32_t> refs;  // changed only by atomic increment and decrement
  std::atomic<std::uint32_t> lock;  // 0 when free, kStringLockHeld while taken
  std::uint64_t bufferBytes;        // bytes asked for the primary characters
  EncodedForm primary;
};

static_assert(offsetof(EncodedForm, owner) + sizeof(void*) == sizeof(EncodedForm),
              "the owner pointer must stand immediately before the characters");
static_assert(offsetof(VynStringData, primary) + sizeof(EncodedForm) == sizeof(VynStringData),
              "the primary characters must follow the primary form header");

namespace StringBlocks {

// Bytes per unit of an encoding tag: 2 for UTF-16, 4 for UTF-32, else 1.
std::size_t UnitSize(UINT encoding) noexcept;

// Units before the first zero unit of text in an encoding with the given unit size.
std::size_t UnitLength(const void* chars, std::size_t unitSize) noexcept;

// A new block (count 1) with room for bufferBytes bytes of characters in the encoding; the first
// 8 bytes of its characters and its spare bytes are zero. Throws std::bad_alloc on exhaustion.
VynStringData* Allocate(UINT encoding, std::size_t bufferBytes);

// A new block holding len units of s and one zero unit.
VynStringData* FromUnits(UINT encoding, const void* s, std::size_t len);

// A new block whose primary form is the UTF-16 text of the len bytes of well-formed UTF-8 at s;
// null (nothing allocated) when the bytes are not well-formed UTF-8. units receives the UTF-16
// length. Readers that know their text is UTF-8 and will be used as UTF-16 convert once here.
VynStringData* FromWellFormedUTF8(const char* s, std::size_t len, std::size_t& units);

void AddRef(VynStringData* data) noexcept;
// Releases one reference; frees the block and its forms with the last one. Returns the new count.
std::uint32_t Release(VynStringData* data) noexcept;

// The form of the block in the (already normalised) encoding, made if missing.
EncodedForm* FindOrMakeForm(VynStringData* data, UINT encoding);

// The block behind the characters of one of its forms.
inline VynStringData* OwnerOf(const void* chars) noexcept {
  return reinterpret_cast<const EncodedForm*>(chars)[-1].owner;
}

}  // namespace StringBlocks

}  // namespace VynSDK::Util
