#pragma once
// The code points a read-write text file holds: decoding UTF-16 without loss, and the line ends
// of the file's text and of written text.

#include <cstddef>
#include <vector>

#include "vynutil/text_file.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util::TextFile::CodePoints {

// Decodes count UTF-16 units: a lead surrogate followed by a trail surrogate is one code point;
// every other unit, a lone surrogate included, is the code point of its value, so that encoding
// the result again gives the units back. Writes to out (null: only counts) and returns the code
// points.
std::size_t FromUTF16(const MCHAR* text, std::size_t count, unsigned int* out);
std::vector<unsigned int> FromUTF16(const MCHAR* text, std::size_t count);

// The file's text as the mode holds it, changed in place; returns the new length. LineEndCRLF
// makes each line end (CR LF, LF CR, lone CR, lone LF) one LF; LineEndLF removes every CR;
// LineEndNone changes nothing.
std::size_t HoldLineEnds(unsigned int* text, std::size_t count, LineEndMode mode);

// Written text as the mode stores it: LineEndCRLF turns an LF that does not follow a CR into
// CR LF (before is the code point in front of where the text goes, 0 for none); LineEndLF
// removes every CR; LineEndNone changes nothing.
void StoreLineEnds(std::vector<unsigned int>& text, LineEndMode mode, unsigned int before);

}  // namespace VynSDK::Util::TextFile::CodePoints
