// The text reader's buffer: filling it from the source, swapping and filtering each new block,
// detection on open, and going back to the start of the text.

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <memory>
#include <new>
#include <vector>

#include "files/text_reader_engine.h"
#include "files/text_reader_filter.h"

namespace VynSDK::Util::TextFile {

namespace {

constexpr std::size_t kMaxSize = std::numeric_limits<std::size_t>::max();
// The largest read asked of the source at once: the buffer grows with what arrives, not with
// what was asked for.
constexpr std::size_t kLargestRead = std::size_t(1) << 20;
// Bytes kept before the read position when a fill drops what was read.
constexpr std::size_t kKeptBeforePosition = 4;
// A source the reader opened itself and nobody else reads is read at least this much at a time:
// the text does not depend on the size of the reads (a Ctrl-Z ends it for good), and fewer, larger
// reads cost far less than one system call per read-buffer size.
constexpr std::size_t kOwnedSourceRead = 64 * 1024;
// Detection looks at no fewer bytes than this.
constexpr std::size_t kSmallestSample = 8;

std::size_t RoundUpToEven(std::size_t n) { return n % 2 == 0 ? n : (n == kMaxSize ? n - 1 : n + 1); }

}  // namespace

BinaryStreamMemory* Reader::Engine::NewBuffer() {
  BinaryStreamMemory* buffer = BinaryStream::FromMemory(nullptr, 0, std::realloc, std::free);
  if (buffer == nullptr) throw std::bad_alloc();
  return buffer;
}

BinaryStreamMemory* Reader::Engine::CopyBuffer(const BinaryStreamMemory& buffer) {
  const std::size_t length = buffer.Length();
  void* data = std::malloc(std::max<std::size_t>(length, 1));
  if (data == nullptr) throw std::bad_alloc();
  if (length != 0) std::memcpy(data, buffer.Data(), length);
  BinaryStreamMemory* copy = BinaryStream::FromMemory(data, length, std::realloc, std::free);
  if (copy == nullptr) {
    std::free(data);
    throw std::bad_alloc();
  }
  copy->Seek(static_cast<LONGLONG>(buffer.CurrentPosition()), 0);
  return copy;
}

bool Reader::Engine::SourceAtEnd(const Reader& r) {
  // A read that brought nothing, or the source's own end-of-file state.
  if (r.m_stopped || r.m_sourceDrained) return true;
  // A shared source's end-of-file state may be another reader's.
  if (r.m_share != nullptr && r.m_share->readers.load() > 1) return false;
  return r.m_source->IsEndOfFile();
}

bool Reader::Engine::CanFill(const Reader& r) {
  if (r.m_source == nullptr || r.m_buffer == nullptr) return false;
  return !SourceAtEnd(r) || r.m_pendingCR || r.m_pendingLF;
}

void Reader::Engine::DropConsumed(const Reader& r, std::size_t keep) {
  BinaryStreamMemory& buffer = *r.m_buffer;
  const std::size_t before = buffer.CurrentPosition();
  buffer.Precate(keep);
  const std::size_t dropped = before - buffer.CurrentPosition();
  if (dropped == 0) return;
  r.m_anchor = r.m_anchor >= dropped ? r.m_anchor - dropped : buffer.CurrentPosition();
  r.m_textStart = r.m_textStart >= dropped ? r.m_textStart - dropped : 0;
}

void Reader::Engine::AppendBytes(const Reader& r, const void* data, std::size_t bytes) {
  if (bytes == 0) return;
  BinaryStreamMemory& buffer = *r.m_buffer;
  const std::size_t position = buffer.CurrentPosition();
  buffer.Seek(static_cast<LONGLONG>(buffer.Length()), 0);
  const std::size_t written = buffer.Write(data, bytes);
  buffer.Seek(static_cast<LONGLONG>(position), 0);
  if (written != bytes) throw std::bad_alloc();
}

void Reader::Engine::ReplaceFrom(const Reader& r, std::size_t start, const void* text, std::size_t bytes,
                                 const std::vector<std::uint8_t>& stray) {
  r.m_buffer->Truncate(start);
  AppendBytes(r, text, bytes);
  AppendBytes(r, stray.data(), stray.size());
}

std::size_t Reader::Engine::ReadSourcePiece(const Reader& r, std::size_t request) {
  BinaryStreamMemory& buffer = *r.m_buffer;
  const std::size_t length = buffer.Length();
  if (request > kMaxSize - length - 64) throw std::bad_alloc();
  // Read into scratch memory that is never touched beyond what arrives: a small file costs the
  // bytes it has, not the bytes asked for (which the buffer would zero first).
  const std::unique_ptr<std::uint8_t[]> scratch(new std::uint8_t[request]);
  const std::size_t got = std::min(request, r.m_source->Read(scratch.get(), request));
  const std::size_t needed = length + got;
  if (buffer.Allocated() < needed) {
    // Grow by half again at least, so that many small fills do not each reallocate.
    const std::size_t generous = std::max(needed, buffer.Allocated() + buffer.Allocated() / 2);
    if (!buffer.EnsureAllocated(generous) && !buffer.EnsureAllocated(needed)) {
      throw std::bad_alloc();
    }
  }
  AppendBytes(r, scratch.get(), got);
  return got;
}

std::size_t Reader::Engine::ReadSource(const Reader& r, std::size_t request) {
  std::size_t total = 0;
  while (total < request) {
    const std::size_t piece = std::min(request - total, kLargestRead);
    const std::size_t got = ReadSourcePiece(r, piece);
    total += got;
    if (got == 0) r.m_sourceDrained = true;
    if (got < piece) break;  // the end, or a source that hands out less at a time
  }
  // UTF-16 units must not be split between two reads: complete an odd count.
  if (total % 2 != 0 && !r.m_sourceDrained) {
    const std::size_t got = ReadSourcePiece(r, 1);
    total += got;
    if (got == 0) r.m_sourceDrained = true;
  }
  r.m_sourceOffset += total;
  return total;
}

void Reader::Engine::SyncSharedSource(const Reader& r) {
  if (r.m_share == nullptr || r.m_share->readers.load() <= 1) return;
  if (r.m_sourceStart == kUnknownOffset) return;
  const auto offset = static_cast<LONGLONG>(r.m_sourceOffset);
  if (r.m_source->Seek(0, 1) != offset) r.m_source->Seek(offset, 0);
}

void Reader::Engine::SwapUnits(const Reader& r, std::size_t from) {
  BinaryStreamMemory& buffer = *r.m_buffer;
  auto* bytes = static_cast<std::uint8_t*>(buffer.Data());
  const std::size_t end = from + ((buffer.Length() - from) & ~std::size_t(1));
  for (std::size_t i = from; i < end; i += 2) std::swap(bytes[i], bytes[i + 1]);
}

namespace {

// Reads the units of [start, end of buffer) into a vector; a trailing partial unit goes to stray.
template <class Unit>
std::vector<Unit> TakeUnits(BinaryStreamMemory& buffer, std::size_t start, std::vector<std::uint8_t>& stray) {
  const std::size_t bytes = buffer.Length() - start;
  std::vector<Unit> units(bytes / sizeof(Unit));
  if (!units.empty()) std::memcpy(units.data(), buffer.Data(start), units.size() * sizeof(Unit));
  const std::size_t strayBytes = bytes % sizeof(Unit);
  const auto* strayAt = static_cast<const std::uint8_t*>(buffer.Data(start + bytes - strayBytes));
  stray.assign(strayAt, strayAt + strayBytes);
  return units;
}

// Runs work with a value of the buffer's unit type: 16-bit units for UTF-16, else bytes.
template <typename Work>
void ForEachUnitType(std::size_t unitSize, Work work) {
  if (unitSize == 2) {
    work(std::uint16_t());
  } else {
    work(std::uint8_t());
  }
}

}  // namespace

void Reader::Engine::FilterBlock(const Reader& r, std::size_t start, bool final) {
  const bool translates = r.m_mode == LineEndCRLF || r.m_mode == LineEndLF;
  const bool filtersEOF = r.m_eofHandling == EOFStopAtFirst || r.m_eofHandling == EOFRemove;
  if (!translates && !filtersEOF) return;

  auto filter = [&](auto unitType) {
    using Unit = decltype(unitType);
    std::vector<std::uint8_t> stray;
    std::vector<Unit> block = TakeUnits<Unit>(*r.m_buffer, start, stray);
    bool last = final;
    if (detail::FilterEndOfFileCharacters(block, r.m_eofHandling)) {
      r.m_stopped = true;  // the text ends here for good
      last = true;
      stray.clear();
    }
    detail::PendingLineEnd pending{r.m_pendingCR, r.m_pendingLF};
    detail::TranslateLineEnds(block, r.m_mode, pending, last);
    r.m_pendingCR = pending.cr;
    r.m_pendingLF = pending.lf;
    ReplaceFrom(r, start, block.data(), block.size() * sizeof(Unit), stray);
  };
  ForEachUnitType(UnitSize(r), filter);
}

std::size_t Reader::Engine::Fill(const Reader& r, std::size_t request) {
  if (!CanFill(r)) return 0;
  DropConsumed(r, kKeptBeforePosition);
  const std::size_t start = r.m_buffer->Length();
  if (SourceAtEnd(r)) {
    FilterBlock(r, start, true);  // only a held-back line end is left to come
    return r.m_buffer->Length() - start;
  }
  const std::size_t unit = UnitSize(r);
  request = std::max(request, unit);
  if (r.m_share != nullptr && r.m_share->owns && r.m_share->readers.load() == 1) {
    request = std::max(request, kOwnedSourceRead);
  }
  if (unit == 2) request = RoundUpToEven(request);
  SyncSharedSource(r);
  ReadSource(r, request);
  if (unit == 2 && (r.m_encoding & EncodingBigEndian)) SwapUnits(r, start);
  FilterBlock(r, start, SourceAtEnd(r));
  return r.m_buffer->Length() - start;
}

void Reader::Engine::EnsureAhead(const Reader& r, std::size_t bytes) {
  while (Remaining(r) < bytes && CanFill(r)) {
    Fill(r, std::max(r.m_readBufferSize, bytes - Remaining(r)));
  }
}

void Reader::Engine::DetectOnOpen(Reader& r) {
  r.m_buffer = NewBuffer();
  ReadSource(r, RoundUpToEven(std::max(r.m_detectSize, kSmallestSample)));

  BinaryStreamMemory& buffer = *r.m_buffer;
  UINT encoding = r.m_encoding;
  std::size_t mark = 0;
  r.m_detected = Reader::Detect(buffer.Data(), buffer.Length(), encoding, &mark) ? 1 : 0;
  r.m_encoding = encoding;

  const detail::TextCodec codec = detail::TextCodec::ForEncoding(encoding, true);
  r.m_codepage = codec.codepage;
  r.m_doubleByte = codec.doubleByte;
  // The buffer holds UTF-16 in little-endian order whatever the file's order.
  if (codec.bigEndian) SwapUnits(r, 0);

  mark = std::min(mark, buffer.Length());
  r.m_markLength = mark;
  r.m_bytePosition = mark;
  buffer.Seek(static_cast<LONGLONG>(mark), 0);
  r.m_anchor = r.m_textStart = mark;
  FilterBlock(r, mark, SourceAtEnd(r));
}

bool Reader::Engine::RestartAtMark(const Reader& r) {
  if (r.m_sourceStart == kUnknownOffset) return false;
  const unsigned long long target = r.m_sourceStart + r.m_markLength;
  if (r.m_source->Seek(static_cast<LONGLONG>(target), 0) < 0) return false;
  r.m_buffer->Reset();
  r.m_pendingCR = r.m_pendingLF = false;
  r.m_stopped = r.m_sourceDrained = false;
  r.m_sourceOffset = target;
  r.m_bytePosition = r.m_markLength;
  r.m_charPosition = 0;
  r.m_lineCount = 0;
  r.m_anchor = r.m_textStart = 0;
  return true;
}

void Reader::Engine::FilterUnread(const Reader& r) {
  if (r.m_buffer == nullptr) return;
  if (r.m_eofHandling != EOFStopAtFirst && r.m_eofHandling != EOFRemove) return;
  const std::size_t start = r.m_buffer->CurrentPosition();
  if (start >= r.m_buffer->Length()) return;

  auto filter = [&](auto unitType) {
    using Unit = decltype(unitType);
    std::vector<std::uint8_t> stray;
    std::vector<Unit> block = TakeUnits<Unit>(*r.m_buffer, start, stray);
    const std::size_t before = block.size();
    if (detail::FilterEndOfFileCharacters(block, r.m_eofHandling)) {
      r.m_stopped = true;
      r.m_pendingCR = r.m_pendingLF = false;  // held back after the cut: gone with it
      stray.clear();
    } else if (block.size() == before) {
      return;
    }
    ReplaceFrom(r, start, block.data(), block.size() * sizeof(Unit), stray);
  };
  ForEachUnitType(UnitSize(r), filter);
}

std::size_t Reader::Engine::NextChar(const Reader& r, bool& complete) {
  complete = true;
  if (r.m_buffer == nullptr) return 0;
  const detail::TextCodec codec = Codec(r);
  // Enough for the longest character: a UTF-8 sequence, a surrogate pair, a double-byte pair.
  const std::size_t longest =
      codec.form == detail::TextForm::Utf8 ? 6 : codec.form == detail::TextForm::Utf16 ? 4 : 2;
  EnsureAhead(r, longest);
  for (;;) {
    const std::size_t avail = Remaining(r);
    if (avail == 0) return 0;
    const std::size_t length = detail::CharLength(codec, Current(r), avail);
    if (length <= avail) return length;
    if (!CanFill(r)) {
      complete = false;
      return avail;
    }
    Fill(r, std::max(r.m_readBufferSize, length));
  }
}

void Reader::Engine::Advance(const Reader& r, std::size_t bytes, std::size_t chars,
                             std::size_t lineFeeds) {
  BinaryStreamMemory& buffer = *r.m_buffer;
  buffer.Seek(static_cast<LONGLONG>(buffer.CurrentPosition() + bytes), 0);
  r.m_bytePosition += bytes;
  r.m_charPosition += chars;
  r.m_lineCount += lineFeeds;
}

bool Reader::Engine::MoveBackInBuffer(const Reader& r, std::size_t count) {
  if (count == 0) return true;
  if (r.m_buffer == nullptr) return false;
  const std::size_t position = r.m_buffer->CurrentPosition();
  if (r.m_anchor > position) return false;
  const detail::TextCodec codec = Codec(r);
  const auto* base = static_cast<const std::uint8_t*>(r.m_buffer->Data());
  const std::size_t behind = position - r.m_anchor;
  const detail::TextSpan all = detail::StepText(codec, base + r.m_anchor, behind, false, true);
  if (all.chars < count) return false;

  // The start of the character count characters before the position.
  std::size_t target = r.m_anchor;
  for (std::size_t skip = all.chars - count; skip > 0; --skip) {
    target += std::min(detail::CharLength(codec, base + target, position - target), position - target);
  }
  const std::size_t back = position - target;
  const std::size_t lineFeeds = detail::StepText(codec, base + target, back, false, true).lineFeeds;
  r.m_buffer->Seek(static_cast<LONGLONG>(target), 0);
  r.m_bytePosition -= std::min(back, r.m_bytePosition);
  r.m_charPosition -= std::min(count, r.m_charPosition);
  r.m_lineCount -= std::min(lineFeeds, r.m_lineCount);
  return true;
}

}  // namespace VynSDK::Util::TextFile
