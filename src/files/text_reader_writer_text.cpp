// Code points of read-write text files.

#include "files/text_reader_writer_text.h"

#include <algorithm>

#include "files/text_writer_line_ends.h"

namespace VynSDK::Util::TextFile::CodePoints {

namespace {

bool IsLead(unsigned unit) { return (unit & 0xFC00) == 0xD800; }
bool IsTrail(unsigned unit) { return (unit & 0xFC00) == 0xDC00; }

}  // namespace

std::size_t FromUTF16(const MCHAR* text, std::size_t count, unsigned int* out) {
  std::size_t points = 0;
  for (std::size_t i = 0; i < count; ++points) {
    unsigned int point = text[i++];
    if (IsLead(point) && i < count && IsTrail(text[i])) {
      point = 0x10000 + ((point - 0xD800) << 10) + (text[i++] - 0xDC00u);
    }
    if (out != nullptr) out[points] = point;
  }
  return points;
}

std::vector<unsigned int> FromUTF16(const MCHAR* text, std::size_t count) {
  std::vector<unsigned int> points(FromUTF16(text, count, nullptr));
  FromUTF16(text, count, points.data());
  return points;
}

std::size_t HoldLineEnds(unsigned int* text, std::size_t count, LineEndMode mode) {
  std::size_t kept = 0;
  if (mode == LineEndCRLF) {
    // Translating to LF never makes the text longer, so it can write over what it has read.
    unsigned pending = 0;
    LineEnds::Translate(text, count, LineEndLF, pending,
                        [&](unsigned int point) { text[kept++] = point; });
    return kept;
  }
  if (mode == LineEndLF) {
    return static_cast<std::size_t>(std::remove(text, text + count, LineEnds::kCR) - text);
  }
  return count;
}

void StoreLineEnds(std::vector<unsigned int>& text, LineEndMode mode, unsigned int before) {
  if (mode == LineEndLF) {
    text.erase(std::remove(text.begin(), text.end(), LineEnds::kCR), text.end());
    return;
  }
  if (mode != LineEndCRLF) return;
  std::vector<unsigned int> stored;
  stored.reserve(text.size() + text.size() / 8);
  unsigned int previous = before;
  for (unsigned int point : text) {
    if (point == LineEnds::kLF && previous != LineEnds::kCR) stored.push_back(LineEnds::kCR);
    stored.push_back(point);
    previous = point;
  }
  text.swap(stored);
}

}  // namespace VynSDK::Util::TextFile::CodePoints
