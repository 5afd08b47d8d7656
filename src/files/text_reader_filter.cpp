// End-of-file character and line-end filters of the text reader.

#include "files/text_reader_filter.h"

#include <algorithm>

namespace VynSDK::Util::TextFile::detail {

namespace {

constexpr unsigned kCR = 13;
constexpr unsigned kLF = 10;
constexpr unsigned kEndOfFile = 26;

bool IsLineEndUnit(unsigned unit) { return unit == kCR || unit == kLF; }

}  // namespace

template <class Unit>
bool FilterEndOfFileCharacters(std::vector<Unit>& block, int handling) {
  if (handling == 1) {
    const auto first = std::find(block.begin(), block.end(), Unit(kEndOfFile));
    if (first == block.end()) return false;
    block.erase(first, block.end());
    return true;
  }
  if (handling == 2) std::erase(block, Unit(kEndOfFile));
  return false;
}

template <class Unit>
void TranslateLineEnds(std::vector<Unit>& block, LineEndMode mode, PendingLineEnd& pending,
                       bool final) {
  if (mode == LineEndLF) {
    std::erase(block, Unit(kCR));
    return;
  }
  if (mode != LineEndCRLF) return;

  std::vector<Unit> in;
  in.reserve(block.size() + 1);
  if (pending.cr) in.push_back(Unit(kCR));
  if (pending.lf) in.push_back(Unit(kLF));
  pending = PendingLineEnd();
  in.insert(in.end(), block.begin(), block.end());

  block.clear();
  for (std::size_t i = 0; i < in.size(); ++i) {
    const Unit unit = in[i];
    if (!IsLineEndUnit(unit)) {
      block.push_back(unit);
      continue;
    }
    if (i + 1 == in.size() && !final) {
      (unit == kCR ? pending.cr : pending.lf) = true;
      break;
    }
    // A CR LF or LF CR pair is one line end; so is a lone CR or LF.
    if (i + 1 < in.size() && IsLineEndUnit(in[i + 1]) && in[i + 1] != unit) ++i;
    block.push_back(Unit(kCR));
    block.push_back(Unit(kLF));
  }
}

template bool FilterEndOfFileCharacters(std::vector<std::uint8_t>&, int);
template bool FilterEndOfFileCharacters(std::vector<std::uint16_t>&, int);
template void TranslateLineEnds(std::vector<std::uint8_t>&, LineEndMode, PendingLineEnd&, bool);
template void TranslateLineEnds(std::vector<std::uint16_t>&, LineEndMode, PendingLineEnd&, bool);

}  // namespace VynSDK::Util::TextFile::detail
