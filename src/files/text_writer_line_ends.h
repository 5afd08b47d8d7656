#pragma once
// Line-end translation of text on its way out, for every unit type (bytes, UTF-16 units, code
// points). One rule for all: CR LF, LF CR, a lone CR and a lone LF are each one line end.

#include <cstddef>

#include "vynutil/text_file.h"

namespace VynSDK::Util::TextFile::LineEnds {

inline constexpr unsigned kCR = 0x0D;
inline constexpr unsigned kLF = 0x0A;

// Calls emit(unit) for the text with its line ends translated: LineEndCRLF writes each line end
// as CR LF, LineEndLF as LF; any other mode copies the text. pending carries a line end split
// between two pieces of text: on entry the CR or LF that ended the previous piece unpaired (0
// for none), whose partner at the start of this piece is then part of that line end and not
// written again; on return the same for this piece.
template <class Unit, class Emit>
void Translate(const Unit* text, std::size_t count, LineEndMode mode, unsigned& pending,
               Emit&& emit) {
  if (mode != LineEndCRLF && mode != LineEndLF) {
    for (std::size_t i = 0; i < count; ++i) emit(text[i]);
    pending = 0;
    return;
  }
  std::size_t i = 0;
  if (pending != 0 && count != 0) {
    const unsigned partner = pending == kCR ? kLF : kCR;
    if (static_cast<unsigned>(text[0]) == partner) i = 1;
  }
  if (count != 0) pending = 0;
  while (i < count) {
    const unsigned unit = static_cast<unsigned>(text[i]);
    if (unit != kCR && unit != kLF) {
      emit(text[i++]);
      continue;
    }
    if (mode == LineEndCRLF) emit(static_cast<Unit>(kCR));
    emit(static_cast<Unit>(kLF));
    const unsigned partner = unit == kCR ? kLF : kCR;
    if (i + 1 < count && static_cast<unsigned>(text[i + 1]) == partner) {
      i += 2;
    } else if (++i == count) {
      pending = unit;
    }
  }
}

// The most units Translate emits for count units.
inline std::size_t MaxTranslated(std::size_t count, LineEndMode mode) {
  return mode == LineEndCRLF ? 2 * count : count;
}

}  // namespace VynSDK::Util::TextFile::LineEnds
