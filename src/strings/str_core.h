#pragma once
// The one implementation behind CStr, WStr and UTF8Str.
//
// The three classes differ only in their code unit, the encoding of the form their `buf` points
// to, and a few details collected in a text description (WideText, NarrowText, Utf8Text).
// StrCore<Text> works on a holder's `buf` field for one of them; the exported classes are thin
// faces that pass their field in. A `buf` is null or points to the characters of one form of a
// VynString block and carries one counted reference to that block.

#include <algorithm>
#include <climits>
#include <cstddef>
#include <new>
#include <string>
#include <type_traits>
#include <utility>

#include "strings/narrow_codepage.h"
#include "strings/str_characters.h"
#include "strings/vynstring_data.h"
#include "vynutil/exception.h"
#include "vynutil/vynstring.h"

namespace VynSDK::Util::StrClass {

// WStr: UTF-16 units.
struct WideText {
  using Unit = MCHAR;
  static UINT Encoding() noexcept { return CP_UTF16; }
  static Utf16Characters Characters() noexcept { return {}; }
  static constexpr const MCHAR* kNullIndexMessage =
      u"Attempting to dereference null WStr::buf variable in WStr::operator[]";
  // Resize works in place on any non-null text, the empty one included.
  static constexpr bool kResizeKeepsEmptyText = true;
};

// CStr: bytes in the narrow code page of the application's language.
struct NarrowText {
  using Unit = char;
  static UINT Encoding() { return VynString::NormalizeCP(CStrCodePage()); }
  // The lead bytes of the narrow code page as it is now.
  static NarrowCharacters Characters() { return NarrowCharacters(Encoding()); }
  static constexpr const MCHAR* kNullIndexMessage =
      u"Attempting to dereference null CStr::buf variable in CStr::operator[]";
  // Resize replaces an empty text by a new block.
  static constexpr bool kResizeKeepsEmptyText = false;
};

// UTF8Str: UTF-8 bytes.
struct Utf8Text {
  using Unit = char;
  static UINT Encoding() noexcept { return CP_UTF8; }
  static Utf8Characters Characters() noexcept { return {}; }
  static constexpr bool kResizeKeepsEmptyText = false;
};

template <class Text>
struct StrCore {
  using Unit = typename Text::Unit;
  static constexpr std::size_t kToTerminator = VYN_STRING_TO_TERMINATOR;
  // dataForWrite's room for a null string asked for "the current capacity".
  static constexpr std::size_t kDefaultWriteRoom = 256;

  // ---- references ------------------------------------------------------------------------

  // ref with one more reference of its block (null stays null).
  static Unit* Share(Unit* ref) noexcept {
    VynStringInternal::IncRef(ref);
    return ref;
  }

  // Makes counted, a reference the caller hands over, the holder's text and releases the old
  // one afterwards (so counted may point into the old block).
  static void Replace(Unit*& buf, Unit* counted) noexcept {
    VynStringInternal::DecRef(std::exchange(buf, counted));
  }

  static void Release(Unit*& buf) noexcept { Replace(buf, nullptr); }

  // The class's form of s's block, with one added reference; null for a null s.
  static Unit* FormOf(const VynString& s) {
    return static_cast<Unit*>(const_cast<void*>(VynStringInternal::ToRef(s, Text::Encoding())));
  }

  // The class's form of the block behind ref (any form's characters), with one added
  // reference; null for a null ref.
  static Unit* FormOfBlock(const void* ref) {
    if (!ref) return nullptr;
    VynStringData* data = StringBlocks::OwnerOf(ref);
    EncodedForm* form = StringBlocks::FindOrMakeForm(data, Text::Encoding());
    StringBlocks::AddRef(data);
    return reinterpret_cast<Unit*>(form->Chars());
  }

  // The characters of a new block in the class's encoding, whose one reference the caller gets.
  static Unit* Chars(VynStringData* fresh) noexcept { return reinterpret_cast<Unit*>(fresh->primary.Chars()); }

  // A new block holding len units of s (kToTerminator: up to its terminator); null for null s.
  static Unit* NewText(const Unit* s, std::size_t len = kToTerminator) {
    if (!s) return nullptr;
    return Chars(StringBlocks::FromUnits(Text::Encoding(), s, len));
  }

  // A new block with room for units units, terminator included; its text is empty.
  static Unit* NewBuffer(std::size_t units) {
    if (units > SIZE_MAX / sizeof(Unit)) throw std::bad_array_new_length();
    return Chars(StringBlocks::Allocate(Text::Encoding(), units * sizeof(Unit)));
  }

  // A string sharing the block (adds a reference); the null string for a null buf.
  static VynString Block(const Unit* buf) { return VynStringInternal::FromRef(buf); }

  // ---- reading ---------------------------------------------------------------------------

  // The characters, or a static empty text for the null string.
  static const Unit* Data(const Unit* buf) noexcept {
    static constexpr Unit kEmpty[1] = {};
    return buf ? buf : kEmpty;
  }

  static std::size_t Length(const Unit* buf) noexcept {
    return buf ? std::char_traits<Unit>::length(buf) : 0;
  }

  // Length as the int the interface reports (texts beyond INT_MAX units report INT_MAX).
  static int IntLength(const Unit* buf) noexcept {
    return static_cast<int>(std::min<std::size_t>(Length(buf), INT_MAX));
  }

  static bool IsEmpty(const Unit* buf) noexcept { return !buf || *buf == 0; }

  // An index as the int the interface reports: -1 ("none") when it does not fit.
  static int IntIndex(std::size_t i) noexcept { return i <= INT_MAX ? static_cast<int>(i) : -1; }

  // The room of the block's primary form, in the units of its own encoding.
  static std::size_t AllocatedChars(const Unit* buf) noexcept {
    if (!buf) return 0;
    const VynStringData* data = StringBlocks::OwnerOf(buf);
    return data->bufferBytes / StringBlocks::UnitSize(data->primary.encoding);
  }

  // Texts compared unit by unit as unsigned values, a terminator being the smallest unit:
  // negative, zero or positive. A null text reads as empty.
  static int CompareText(const Unit* a, const Unit* b) noexcept {
    using Unsigned = std::make_unsigned_t<Unit>;
    a = Data(a);
    b = Data(b);
    for (;; ++a, ++b) {
      const auto ua = static_cast<Unsigned>(*a);
      const auto ub = static_cast<Unsigned>(*b);
      if (ua != ub) return ua < ub ? -1 : 1;
      if (ua == 0) return 0;
    }
  }

  static const Unit& At(const Unit* buf, int i) {
    if (!buf) throw NullDereferenceException(Text::kNullIndexMessage);
    return buf[i];
  }

  static Unit& WritableAt(Unit*& buf, int i) {
    if (!buf) throw NullDereferenceException(Text::kNullIndexMessage);
    return DataForWrite(buf, kToTerminator)[i];
  }

  // ---- writing ---------------------------------------------------------------------------

  // True when buf's holder is the only reference of a block that holds no other form: then no
  // one else can see a change of its characters.
  static bool OwnsAlone(const Unit* buf) noexcept {
    const LONG count = VynStringInternal::IncRef(buf);
    VynStringInternal::DecRef(buf);
    if (count != 2) return false;
    return StringBlocks::OwnerOf(buf)->primary.next.load(std::memory_order_acquire) == nullptr;
  }

  // Writable characters with room for n units and a terminator (see WStr::dataForWrite).
  static Unit* DataForWrite(Unit*& buf, std::size_t n) {
    const std::size_t capacity = AllocatedChars(buf);
    std::size_t wanted = n;
    if (n == kToTerminator) wanted = capacity != 0 ? capacity - 1 : kDefaultWriteRoom;
    if (wanted < capacity && OwnsAlone(buf)) return buf;
    if (wanted >= SIZE_MAX / sizeof(Unit)) throw std::bad_array_new_length();
    Unit* fresh = NewBuffer(std::max(wanted + 1, capacity));
    std::size_t kept = 0;
    if (buf) {
      while (kept < wanted && buf[kept] != 0) ++kept;
      std::char_traits<Unit>::copy(fresh, buf, kept);
    }
    std::char_traits<Unit>::assign(fresh + kept, wanted + 1 - kept, Unit(0));
    Replace(buf, fresh);
    return fresh;
  }
};

using WideCore = StrCore<WideText>;
using NarrowCore = StrCore<NarrowText>;
using Utf8Core = StrCore<Utf8Text>;

}  // namespace VynSDK::Util::StrClass
