#pragma once
// The machinery behind TextFile::Reader: the buffer of text read from the source, filling it,
// filtering each new block, stepping through its characters, and the share count of a source.
//
// The buffer holds the file's text in the reader's encoding after byte swapping (UTF-16 always
// little-endian) and filtering; its read position is the reader's position. Everything is
// measured from the read position, because each fill first drops what lies more than 4 bytes
// before it.

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "files/text_reader_codec.h"
#include "vynutil/text_reader.h"

namespace VynSDK::Util::TextFile {

// The readers (a reader and its copies) that use one source; the last one to let go deletes an
// owned source.
struct Reader::SourceShare {
  std::atomic<long> readers{1};
  bool owns = false;
};

struct Reader::Engine {
  // The source offset of the start of the text when it is not known (the source cannot seek).
  static constexpr unsigned long long kUnknownOffset = ~0ull;

  static detail::TextCodec Codec(const Reader& r) {
    detail::TextCodec codec;
    codec.form = r.m_codepage == CP_UTF16  ? detail::TextForm::Utf16
                 : r.m_codepage == CP_UTF8 ? detail::TextForm::Utf8
                                           : detail::TextForm::Bytes;
    codec.codepage = r.m_codepage;
    codec.doubleByte = r.m_doubleByte;
    return codec;
  }
  static std::size_t UnitSize(const Reader& r) { return r.m_codepage == CP_UTF16 ? 2 : 1; }
  static const std::uint8_t* Current(const Reader& r) {
    return static_cast<const std::uint8_t*>(r.m_buffer->CurrentData());
  }
  static std::size_t Remaining(const Reader& r) {
    return r.m_buffer != nullptr ? r.m_buffer->Remaining() : 0;
  }

  // A new, empty buffer (std::bad_alloc when it cannot be made).
  static BinaryStreamMemory* NewBuffer();
  static BinaryStreamMemory* CopyBuffer(const BinaryStreamMemory& buffer);

  // No more text will come from the source: it reported its end, a read brought nothing, or the
  // text ended at a Ctrl-Z.
  static bool SourceAtEnd(const Reader& r);
  // A fill can still add text: the source has more, or a held-back line end waits.
  static bool CanFill(const Reader& r);
  // Appends up to request bytes from the source (at least one unit), byte-swapped and filtered,
  // keeping the read position. Returns the bytes the buffer grew by.
  static std::size_t Fill(const Reader& r, std::size_t request);
  // Fills until bytes bytes lie ahead of the position or nothing more can come.
  static void EnsureAhead(const Reader& r, std::size_t bytes);

  // Runs detection on a new source (Open's step after storing it).
  static void DetectOnOpen(Reader& r);
  // Goes back to the start of the text in the source and empties the buffer: false when the
  // source cannot seek.
  static bool RestartAtMark(const Reader& r);
  // Applies the end-of-file handling to the buffered text not yet read.
  static void FilterUnread(const Reader& r);
  // Drops buffered bytes more than keep bytes before the position.
  static void DropConsumed(const Reader& r, std::size_t keep);

  // The bytes of the next character, filling as needed: 0 when nothing is left. complete is
  // false for a character cut short by the end of the text (its bytes that are there count).
  static std::size_t NextChar(const Reader& r, bool& complete);
  // Reads the next character (moving past it unless peek): code receives its code point, or
  // detail::kMalformed. False when nothing is left.
  static bool NextCode(const Reader& r, bool peek, std::uint32_t& code);
  // The chunk of take bytes at the position when it is well-formed UTF-8 ending on a character
  // boundary: converted once, straight to UTF-16, and read past (true). False, nothing changed,
  // for anything else; the general path then steps and keeps the bytes as they are.
  static bool TakeWellFormedUtf8(const Reader& r, std::size_t take, bool trimLineEnd, VynString& text);
  // Moves the position over bytes bytes holding chars characters and lineFeeds LFs.
  static void Advance(const Reader& r, std::size_t bytes, std::size_t chars,
                      std::size_t lineFeeds);
  // Moves the position back over count characters inside the buffer; false (nothing changed)
  // when fewer lie between the anchor and the position.
  static bool MoveBackInBuffer(const Reader& r, std::size_t count);

 private:
  static std::size_t ReadSource(const Reader& r, std::size_t request);
  static std::size_t ReadSourcePiece(const Reader& r, std::size_t request);
  static void SyncSharedSource(const Reader& r);
  static void SwapUnits(const Reader& r, std::size_t from);
  static void FilterBlock(const Reader& r, std::size_t start, bool final);
  static void AppendBytes(const Reader& r, const void* data, std::size_t bytes);
  // Replaces the buffer from start on by bytes bytes of text and then the stray bytes.
  static void ReplaceFrom(const Reader& r, std::size_t start, const void* text, std::size_t bytes,
                          const std::vector<std::uint8_t>& stray);
};

}  // namespace VynSDK::Util::TextFile
