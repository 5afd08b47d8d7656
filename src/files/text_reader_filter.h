#pragma once
// The text reader's filters on each newly read block of text, in the buffer's own units (bytes
// for 8-bit text, 16-bit units for UTF-16): end-of-file characters first, then line ends.

#include <cstdint>
#include <vector>

#include "vynutil/text_file.h"

namespace VynSDK::Util::TextFile::detail {

// Line ends held back between blocks (line-end mode 1): a CR or LF that was the last unit of a
// block, put in front of the next block so that a pair split by the block boundary stays one
// line end.
struct PendingLineEnd {
  bool cr = false;
  bool lf = false;
  bool Any() const { return cr || lf; }
};

// End-of-file characters (26, Ctrl-Z). handling 1 cuts the block at the first one and returns
// true; 2 removes every one; any other value leaves the block alone.
template <class Unit>
bool FilterEndOfFileCharacters(std::vector<Unit>& block, int handling);

// Line ends. Mode 2 removes every CR. Mode 1 turns every LF, CR, CR LF and LF CR into CR LF; a CR
// or LF that ends the block is held back in pending unless final says no more text follows (then
// it is translated). pending is put in front of the block first. Other modes change nothing.
template <class Unit>
void TranslateLineEnds(std::vector<Unit>& block, LineEndMode mode, PendingLineEnd& pending,
                       bool final);

extern template bool FilterEndOfFileCharacters(std::vector<std::uint8_t>&, int);
extern template bool FilterEndOfFileCharacters(std::vector<std::uint16_t>&, int);
extern template void TranslateLineEnds(std::vector<std::uint8_t>&, LineEndMode, PendingLineEnd&,
                                       bool);
extern template void TranslateLineEnds(std::vector<std::uint16_t>&, LineEndMode,
                                       PendingLineEnd&, bool);

}  // namespace VynSDK::Util::TextFile::detail
