#pragma once
// TextFile::Reader: reads text of any encoding the library knows (UTF-8, UTF-16 in either byte
// order, Windows code pages) from a binary stream and hands it out as VynStrings or characters.
//
// On Open the reader works out the encoding by itself, in this order of precedence: a byte-order
// mark, a "coding" declaration in the first non-blank line, a UTF-8 validity test and the UTF-16
// statistics of IsTextUnicode; when none decides, the caller's encoding stands. Text can have its
// line ends and end-of-file characters (Ctrl-Z) translated on the way in. The reader keeps
// character, byte and line positions and can step back.
//
// Text is read in blocks of the read-buffer size into one buffer that holds it in the file's
// encoding (UTF-16 always in little-endian order). Reading through a character that lacks bytes
// at the end of the text consumes what is there; malformed UTF-8 is consumed one sequence at a
// time (a lead byte and the continuation bytes that follow it, up to its length).
//
// Copies of a reader are independent readers over the same source: each has its own buffer and
// positions, an owned source is deleted when the last of them closes, and a copy that reads from
// the source first moves the source back to where it left off (when the source can seek).
//
// One reader belongs to one thread at a time.

#include <cstddef>
#include <cstdio>

#include "vynutil/binary_stream.h"
#include "vynutil/export.h"
#include "vynutil/text_file.h"

namespace VynSDK::Util::TextFile {

class VYN_API Reader : public BaseTextReader {
 public:
  // How end-of-file characters (Ctrl-Z, code 26) are treated.
  enum EOFCharacterHandling {
    EOFKeep = 0,         // kept in the text (as 3)
    EOFStopAtFirst = 1,  // the text ends at the first one, for good
    EOFRemove = 2,       // every one is removed
    EOFKeepText = 3,     // kept in the text (the choice of Open for LineEndNone)
  };

  // Last-error codes.
  static constexpr DWORD ErrorNullStream = 1;      // Open with a null stream
  static constexpr DWORD ErrorAlreadyOpen = 2;     // Open while a source is open
  static constexpr DWORD ErrorNotOpen = 3;         // reading with no source open
  static constexpr DWORD ErrorInvalidChar = 4;     // a malformed character (UTF-8 lead byte ...)
  static constexpr DWORD ErrorSeekImpossible = 5;  // a backward seek the source cannot make

  static constexpr std::size_t DefaultDetectSize = 65536;
  static constexpr std::size_t DefaultReadBufferSize = 4096;

  Reader() = default;
  Reader(const Reader& other);
  Reader& operator=(const Reader& other);
  ~Reader() override;

  // Opens the file at path for reading and owns the stream. encoding is the default that stands
  // when detection does not decide (0: the active code page; EncodingPreferUTF8 may be added). On
  // Open, end-of-file handling becomes EOFKeepText for LineEndNone and EOFStopAtFirst otherwise.
  // False when a source is already open (last error 2; the open one stays) or the file cannot be
  // opened (a null path included).
  bool Open(const VynString& path, UINT encoding = 0, LineEndMode mode = LineEndCRLF);
  bool Open(const MCHAR* path, UINT encoding = 0, LineEndMode mode = LineEndCRLF);
  // Reads the caller's open file or Win32 file handle from its current position; closing the
  // reader leaves it open. False for a null file or an invalid handle.
  bool Open(FILE* file, UINT encoding = 0, LineEndMode mode = LineEndCRLF);
  bool Open(void* handle, UINT encoding = 0, LineEndMode mode = LineEndCRLF);
  // Forgets the source (deleting it when owned and no copy uses it) and clears the last error.
  // The buffer stays until the next Open or the destructor.
  void Close();

  // The encoding word: the detected or default encoding tag with the flags EncodingBigEndian,
  // EncodingDeclared, EncodingByteOrderMark (and EncodingPreferUTF8 when given and undecided).
  UINT Encoding() const { return m_encoding; }
  // Whether detection decided the encoding (false: the caller's default stands).
  bool Detected() const { return m_detected != 0; }
  LineEndMode Mode() const { return m_mode; }
  // Bytes sampled by detection on the next Open (at least 8 are).
  void SetDetectSize(std::size_t bytes) { m_detectSize = bytes; }
  std::size_t GetDetectSize() const { return m_detectSize; }
  // Bytes asked of the source per read (at least 1, and 2 for UTF-16, are asked).
  void SetReadBufferSize(std::size_t bytes) { m_readBufferSize = bytes; }
  std::size_t GetReadBufferSize() const { return m_readBufferSize; }
  // Stores the handling and applies it at once to the buffered text not yet read.
  void SetEOFCharacterHandling(EOFCharacterHandling handling);
  EOFCharacterHandling GetEOFCharacterHandling() const { return m_eofHandling; }

  // A source is open.
  bool IsFileOpen() const override { return m_source != nullptr; }
  // True when no source is open, or when the buffered text is all read and the source has no
  // more (the source is asked for more when the buffer is empty, so the answer is final).
  bool IsEndOfFile() const override;
  // Characters handed out.
  std::size_t Position() const override { return m_charPosition; }
  std::size_t LineNumber() const override;

  // Characters and LFs of the text held in the buffer, in the reader's encoding.
  std::size_t NumberOfChars() const;
  std::size_t NumberOfLines() const;
  // Characters of bytes bytes of text in encoding (an encoding word: UTF-16 in the byte order of
  // EncodingBigEndian). A character whose bytes do not all fit, and a zero unit, end the count.
  static std::size_t NumberOfChars(const void* data, std::size_t bytes, UINT encoding);
  // LF characters of the same text, counted by the same stepping.
  static std::size_t NumberOfLines(const void* data, std::size_t bytes, UINT encoding);
  // Works out the encoding of a sample of a file's first bytes. encoding holds the caller's
  // default on entry and the result on return; markLength (optional) receives the bytes of the
  // byte-order mark. Returns true when the sample decided (byte-order mark, "coding"
  // declaration, UTF-8 with a multi-byte sequence, UTF-16 statistics); false leaves the default,
  // except that a default with EncodingPreferUTF8 becomes CP_UTF8 for a sample valid as UTF-8.
  // A declared charset name compares without regard to case and must not run on into a letter
  // or digit ("iso-8859-10" is not "iso-8859-1"; "utf-8-unix" and "utf-8;" are UTF-8).
  static bool Detect(const void* data, std::size_t bytes, UINT& encoding, std::size_t* markLength);

  // Clears the last-error code and returns the source's own last-error text (null without a
  // source).
  VynString LastError();
  // The last-error code (0, or one of the Error... codes above).
  DWORD LastErrorCode() const { return m_lastError; }

  // The next character as a code point. Malformed UTF-8 (a stray continuation byte, 0xFE, 0xFF,
  // a sequence cut short, an overlong form) is consumed unless peeking and gives 0xFFFFFFFF with
  // last error 4, as does a UTF-16 unit cut short at the end of the text or a lead surrogate
  // without its trail. 0xFFFFFFFF (last error 3) with no source.
  unsigned int ReadCharUTF32(bool peek = false) const override;
  VynString ReadChars(std::size_t count) override;
  VynString ReadLine(std::size_t limit = static_cast<std::size_t>(-1),
                     bool trimLineEnd = false) override;
  // The next character; malformed input gives U+FFFD (and last error 4) where ReadCharUTF32
  // gives 0xFFFFFFFF.
  Char ReadChar(bool peek = false) override;
  std::size_t UnreadChar(const Char& c) override;
  // Offsets count characters. A target before the start goes to the start, one past the end to
  // the end. Moving back further than the buffer reaches reads again from the start of the
  // source, which must be able to seek (else last error 5 and the position stays).
  std::size_t Seek(LONG offset, int origin) override;

  // The next bytes bytes (as far as there are), extended to finish the last character, at least
  // one character when bytes is not 0. trimLineEnd as for ReadLine. Null when nothing is left.
  virtual VynString ReadChunk(std::size_t bytes, bool trimLineEnd = false);
  // Everything that is left; null when nothing is.
  virtual VynString ReadFull();
  // Bytes of the buffered text consumed, the byte-order mark included.
  virtual std::size_t PositionBytes() const { return m_bytePosition; }

 protected:
  // The core of Open: reads stream (deleted on Close when ownStream and no copy uses it).
  // Clears the last error; false with last error 2 while a source is open, 1 for a null stream.
  bool Open(BinaryStream* stream, UINT encoding, LineEndMode mode, bool ownStream);
  // Puts text back in front of the position, converted to the reader's encoding; the positions
  // move back by its bytes, characters and LFs (not below 0). Returns its characters; a null or
  // empty text (or no source) returns 0 and changes nothing.
  std::size_t Unread(const VynString& text);
  // Moves to character position (see Seek). Returns the new position.
  std::size_t SeekToAbsolute(std::size_t position);
  // Reads count characters forward (fewer at the end). Returns the new position.
  std::size_t SeekFromCurrent(std::size_t count);

 private:
  struct Engine;  // the buffer, decoding and filtering machinery (text_reader_engine.h)
  friend struct Engine;
  struct SourceShare;  // the count of readers using one source

  void ReleaseSource();
  // Takes other's fields, with buffer (a copy of other's) as the buffer, and shares its source.
  void CopyFrom(const Reader& other, BinaryStreamMemory* buffer);

  BinaryStream* m_source = nullptr;
  bool m_ownsSource = false;
  // Reading moves the state below, also through the const ReadCharUTF32 and IsEndOfFile.
  mutable bool m_pendingCR = false;  // a CR held back at the end of a block (line-end mode 1)
  mutable bool m_pendingLF = false;  // the same for an LF
  LineEndMode m_mode = LineEndCRLF;
  std::size_t m_detectSize = DefaultDetectSize;
  std::size_t m_readBufferSize = DefaultReadBufferSize;
  EOFCharacterHandling m_eofHandling = EOFStopAtFirst;
  mutable DWORD m_lastError = 0;
  UINT m_encoding = 0;
  DWORD m_detected = 0;                   // 1 when detection decided the encoding
  BinaryStreamMemory* m_buffer = nullptr;  // the file's text, read position at the reader's
  std::size_t m_markLength = 0;
  mutable std::size_t m_bytePosition = 0;
  mutable std::size_t m_charPosition = 0;
  mutable std::size_t m_lineCount = 0;

  SourceShare* m_share = nullptr;
  UINT m_codepage = 0;         // the encoding tag, normalised: CP_UTF8, CP_UTF16 or a code page
  bool m_doubleByte = false;   // m_codepage has lead bytes
  mutable std::size_t m_anchor = 0;     // buffer offset of a character start before the position
  mutable std::size_t m_textStart = 0;  // buffer offset where the text after the mark begins
  unsigned long long m_sourceStart = 0;           // source offset of the start (all ones: unknown)
  mutable unsigned long long m_sourceOffset = 0;  // source offset after the last byte taken
  mutable bool m_sourceDrained = false;    // a read from the source brought nothing
  mutable bool m_stopped = false;          // the text ended at a Ctrl-Z (EOFStopAtFirst)
};

}  // namespace VynSDK::Util::TextFile
