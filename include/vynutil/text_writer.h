#pragma once
// Text files written in a chosen encoding.
//
// BaseTextWriter is the writing interface, with the formatted output (Printf and Vprintf
// families) that every writer gets from it. Writer writes text to a binary stream in one encoding
// (UTF-8, UTF-16 in either byte order, or a Windows code page), with an optional byte-order mark
// and line-end translation, and can append to an existing file in that file's own encoding.
// ReaderWriter holds a whole text file in memory as code points, reads and writes it at
// positions, and writes it back in its encoding on Flush and Close.
//
// The encoding word, LineEndMode and the detection that appending relies on are those of the
// reader (text_file.h, text_reader.h). One writer belongs to one thread at a time.

#include <cstdarg>
#include <cstddef>
#include <cstdio>

#include "vynutil/binary_stream.h"
#include "vynutil/char.h"
#include "vynutil/crt_locale.h"
#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/text_file.h"
#include "vynutil/vynstring.h"
#include "vynutil/wintypes.h"

namespace VynSDK::Util::TextFile {

// The count of writers that share one owned stream (private to the library).
struct WriterStreamShare;

// What every text writer offers: text in three forms, position and end-of-file queries, and
// formatted output built on Write.
class VYN_API BaseTextWriter : public VynHeapOperators {
 public:
  // The virtual operations, in their fixed order.
  virtual ~BaseTextWriter();
  // Each Write returns a count of what was written ((size_t)-1 on failure; 0 for null text). A
  // count of (size_t)-1 means text up to its terminating zero.
  virtual std::size_t Write(const VynString& text) = 0;
  virtual std::size_t Write(const MCHAR* text, std::size_t count) = 0;
  // Narrow text is text in the active code page.
  virtual std::size_t Write(const char* text, std::size_t count) = 0;
  virtual bool CanWrite() const = 0;
  virtual bool IsFileOpen() const = 0;
  virtual void Flush() = 0;
  virtual bool IsEndOfFile() const = 0;
  virtual std::size_t Position() const = 0;
  // Origin 0 from the start, 1 from the current position, 2 from the end. Returns the new
  // position.
  virtual std::size_t Seek(LONG offset, int origin) = 0;

  // Formatted output with the runtime's printf rules (wide formats: %s and %c take wide text,
  // %S and %C narrow; narrow formats the other way round; %hs, %ls, %ws fixed), written through
  // Write: the wide forms write wide text, the A forms narrow text in the active code page. The
  // _l forms format with a runtime locale (its decimal point and its code page for converted
  // strings); the others with the current one. Each returns the Write result. A format the
  // runtime refuses (an unknown conversion, %n, a string argument the code page cannot convert)
  // writes nothing and returns (size_t)-1; when the formatting buffer cannot be allocated
  // nothing is written and 0 is returned.
  std::size_t Printf(const MCHAR* format, ...);
  std::size_t PrintfW(const MCHAR* format, ...);
  std::size_t PrintfA(const char* format, ...);
  std::size_t Printf_l(const MCHAR* format, _locale_t locale, ...);
  std::size_t PrintfW_l(const MCHAR* format, _locale_t locale, ...);
  std::size_t PrintfA_l(const char* format, _locale_t locale, ...);
  // The same with the arguments in a list, which is left as it was (it can be used again).
  std::size_t Vprintf(const MCHAR* format, va_list args);
  std::size_t VprintfW(const MCHAR* format, va_list args);
  std::size_t VprintfA(const char* format, va_list args);
  std::size_t Vprintf_l(const MCHAR* format, _locale_t locale, va_list args);
  std::size_t VprintfW_l(const MCHAR* format, _locale_t locale, va_list args);
  std::size_t VprintfA_l(const char* format, _locale_t locale, va_list args);

 protected:
  BaseTextWriter() = default;
  BaseTextWriter(const BaseTextWriter&) = default;
  BaseTextWriter& operator=(const BaseTextWriter&) = default;

  // Called when formatted output fails because the runtime refuses the format or its
  // arguments; a writer with a last-error code records it here. Does nothing by default.
  virtual void FormatFailed();
};

// Writes text to a binary stream in one encoding.
//
// The encoding word chooses the encoding (its low 28 bits: CP_UTF8, CP_UTF16, a code page; 0 the
// active code page) and, for a new file, the byte-order mark (EncodingByteOrderMark: EF BB BF for
// UTF-8, FF FE for UTF-16, FE FF for UTF-16 with EncodingBigEndian) and UTF-8 instead of the code
// page (EncodingPreferUTF8). Line ends are translated on the way out: LineEndCRLF turns every
// line end (CR LF, LF CR, lone CR, lone LF) into CR LF, LineEndLF into LF, LineEndNone writes
// the text as it is. A line end split between two writes (a CR at the end of one, its LF at the
// start of the next) is still one line end, so text written in pieces gives the bytes it gives
// when written whole (as long as no Seek comes between the pieces).
//
// Copies of a writer write to the same stream; an owned stream is deleted when the last of them
// closes.
class VYN_API Writer : public BaseTextWriter {
 public:
  // Last-error codes (LastErrorCode), with the texts LastError() gives for them.
  static constexpr DWORD ErrorNullStream = 1;   // "Invalid Open argument - NULL stream."
  static constexpr DWORD ErrorAlreadyOpen = 2;  // "Stream already open."
  static constexpr DWORD ErrorNotOpen = 3;      // "Stream not open."
  static constexpr DWORD ErrorFormat = 4;       // "Error formatting buffer."
  static constexpr DWORD ErrorOutOfMemory = 5;  // "Error allocating memory."

  Writer() = default;
  Writer(const Writer& other);
  Writer& operator=(const Writer& other);
  ~Writer() override;

  // Opens the file at path for writing (created when missing) and owns the stream. Without
  // append the file is emptied and starts with the byte-order mark the encoding asks for. With
  // append, text goes to the end of the file in the file's own encoding as the reader detects it
  // (a mark, a "coding" declaration, UTF-8, UTF-16 statistics; encoding is the default when
  // detection does not decide), and no mark is written; an empty file is started as a new one.
  // False when the file cannot be opened (no error code is set), or with code 2 while a stream
  // is open (the open one stays).
  bool Open(const VynString& path, bool append = false, UINT encoding = 0,
            LineEndMode mode = LineEndCRLF);
  bool Open(const MCHAR* path, bool append = false, UINT encoding = 0,
            LineEndMode mode = LineEndCRLF);
  // Writes to the caller's open file or Win32 file handle, as the path forms do; closing the
  // writer leaves it open. Without append the file is emptied first. False with code 1 for a
  // null file or an invalid handle.
  bool Open(FILE* file, bool append = false, UINT encoding = 0, LineEndMode mode = LineEndCRLF);
  bool Open(void* handle, bool append = false, UINT encoding = 0,
            LineEndMode mode = LineEndCRLF);
  // Forgets the stream (deleting it when owned and no copy uses it) and clears the last error.
  void Close();

  // Writes text in the writer's encoding and returns the bytes the stream took (after
  // translation, a mark never included). (size_t)-1 with code 3 when no stream is open, with
  // code 5 when the output cannot be allocated. Null text returns 0. In append mode every write
  // goes to the end of the stream.
  std::size_t Write(const VynString& text) override;
  std::size_t Write(const MCHAR* text, std::size_t count) override;
  // Text in the active code page: passed on as it is when that is the writer's code page, else
  // converted.
  std::size_t Write(const char* text, std::size_t count) override;
  // Write(&c, 1).
  std::size_t WriteChar(char c) { return Write(&c, 1); }
  std::size_t WriteChar(MCHAR c) { return Write(&c, 1); }

  // A stream is open and says it can write.
  bool CanWrite() const override;
  bool IsFileOpen() const override { return m_stream != nullptr; }
  // The stream's Flush; nothing without a stream.
  void Flush() override;
  // The stream's end-of-file state; true without a stream.
  bool IsEndOfFile() const override;
  // The stream's position in bytes; (size_t)-1 without a stream or when the stream cannot tell.
  std::size_t Position() const override;
  // Moves the stream (bytes; origins as the stream's); returns the new position, or (size_t)-1
  // when the stream cannot move (or, with code 3, when none is open).
  std::size_t Seek(LONG offset, int origin) override;

  // The encoding word in use: after an append, the detected one.
  UINT Encoding() const { return m_encoding; }
  LineEndMode Mode() const { return m_mode; }

  // The text of the last-error code; for code 0 the stream's own last-error text (null when
  // there is no stream or the stream has none).
  VynString LastError();
  DWORD LastErrorCode() const { return m_lastError; }

 protected:
  // The core of Open: writes to stream (deleted on Close when ownStream and no copy uses it).
  // Clears the last error; false with code 2 while a stream is open, 1 for a null stream.
  bool Open(BinaryStream* stream, bool append, UINT encoding, LineEndMode mode, bool ownStream);
  void FormatFailed() override;

 private:
  bool BeginWrite();
  bool StartAppending();
  std::size_t WriteEncoded(const VynString& text);
  std::size_t WriteWide(const MCHAR* text, std::size_t count);
  std::size_t Emit(bool made, const void* bytes, std::size_t count, unsigned pending);
  void ReleaseStream();
  void CopyFrom(const Writer& other);

  BinaryStream* m_stream = nullptr;
  bool m_ownsStream = false;
  bool m_append = false;
  UINT m_encoding = 0;
  LineEndMode m_mode = LineEndCRLF;
  DWORD m_lastError = 0;

  WriterStreamShare* m_share = nullptr;
  unsigned m_pendingLineEnd = 0;  // a CR or LF that ended the last write unpaired
};

// A whole text file in memory, as code points, read and written at positions and written back
// in its encoding on Flush and Close.
//
// Open reads the file through the reader's detection (byte-order mark, "coding" declaration,
// UTF-8, UTF-16 statistics; the caller's encoding is the default) and keeps the detected
// encoding word for writing back. Line ends in memory: LineEndCRLF holds each line end of the
// file as one LF, LineEndLF drops every CR, LineEndNone keeps the text as it is (end-of-file
// characters are kept in every mode). Flush writes the whole text from the start of the stream as
// a Writer with the same encoding word and line-end mode would.
//
// Reading and writing positions count code points. Unless the file was opened with the append
// flag (4), reads and seeks move the write position with the read position, so text is written
// where reading stopped; with it, writes go to the end of the text.
//
// Copies hold their own text and share the stream (an owned stream is deleted when the last of
// them closes); each writes its own text back when it flushes.
class VYN_API ReaderWriter : public BaseTextReader, public BaseTextWriter {
 public:
  using BaseTextReader::operator new;
  using BaseTextReader::operator new[];
  using BaseTextReader::operator delete;
  using BaseTextReader::operator delete[];

  // Open flags, with the values of BinaryStream's mode flags.
  static constexpr UINT OpenAppend = BinaryStream::ModeAppend;      // writes go to the end
  static constexpr UINT OpenTruncate = BinaryStream::ModeTruncate;  // without append: start empty
  static constexpr UINT OpenDefault = BinaryStream::ModeText;

  ReaderWriter() = default;
  ReaderWriter(const ReaderWriter& other);
  ReaderWriter& operator=(const ReaderWriter& other);
  // Closes, writing unsaved changes back.
  ~ReaderWriter() override;

  // Opens the file at path for reading and writing and owns the stream. openFlags are
  // BinaryStream mode flags: read and write access are always asked for; ModeCreate creates a
  // missing file, OpenTruncate empties the file (and the text starts empty), OpenAppend makes
  // writes go to the end; the others (exclusive, write-through ...) are passed on. A file open
  // before is closed first (its changes written back). False when the file cannot be opened.
  bool Open(const VynString& path, UINT openFlags = OpenDefault, UINT encoding = 0,
            LineEndMode mode = LineEndCRLF);
  bool Open(const MCHAR* path, UINT openFlags = OpenDefault, UINT encoding = 0,
            LineEndMode mode = LineEndCRLF);
  // Writes unsaved changes back, deletes the stream when owned (and no copy uses it), frees the
  // text and returns every field to its initial value.
  void Close();

  // The encoding word the text is written back in, the open flags and the line-end mode.
  UINT Encoding() const { return m_encoding; }
  UINT OpenFlags() const { return m_openFlags; }
  LineEndMode Mode() const { return m_mode; }
  // Code points held, and whether they differ from the file since the last Flush.
  std::size_t Length() const { return m_end; }
  bool IsModified() const { return m_modified; }
  // The position the next write goes to.
  std::size_t WritePosition() const { return m_writePosition; }

  // Reading, from the read position. Nothing reaches past the end of the text: ReadCharUTF32
  // gives 0xFFFFFFFF there, ReadChar the null character, ReadChars and ReadLine a null string.
  unsigned int ReadCharUTF32(bool peek = false) const override;
  Char ReadChar(bool peek = false) override;
  // Up to count code points.
  VynString ReadChars(std::size_t count) override;
  // Up to and including the next LF, or at most limit code points; trimLineEnd leaves trailing
  // CR and LF out of the result.
  VynString ReadLine(std::size_t limit = static_cast<std::size_t>(-1),
                     bool trimLineEnd = false) override;
  // Puts c's code point back in front of the read position (see Unread); 0 for the null
  // character.
  std::size_t UnreadChar(const Char& c) override;
  // The read position.
  std::size_t Position() const override { return m_readPosition; }
  // LFs before the write position.
  std::size_t LineNumber() const override;
  // Moves the read position (and without the append flag the write position): origin 0 from the
  // start, 2 from the end of the text, any other value from the read position. The target is
  // kept within the text (before the start: the start; past the end: the end). Returns the new
  // read position.
  std::size_t Seek(LONG offset, int origin) override;
  // Seek(0, 2).
  std::size_t SeekToEnd();
  bool IsFileOpen() const override { return m_stream != nullptr; }
  // The read position has reached the end of the text (true when nothing is open).
  bool IsEndOfFile() const override { return m_readPosition >= m_end; }

  // Writing at the write position, overwriting what lies there and extending the text past its
  // end. Line ends first get the line-end mode: LineEndCRLF turns an LF not preceded by CR into
  // CR LF, LineEndLF drops every CR. The write position advances and the read position follows
  // it. Each returns the code points stored; (size_t)-1 when no file is open; 0 for null text.
  std::size_t Write(const VynString& text) override;
  std::size_t Write(const MCHAR* text, std::size_t count) override;
  // Text in the active code page.
  std::size_t Write(const char* text, std::size_t count) override;
  // A file is open and its stream says it can write.
  bool CanWrite() const override;
  // Writes the whole text back when it was changed: from the start of the stream, which is cut
  // there, in the encoding word (EncodingPreferUTF8 writing UTF-8, EncodingByteOrderMark a mark)
  // with the line-end mode. The text stays marked as changed when the stream does not take all
  // of it.
  void Flush() override;
  // Makes room for at least count code points. Throws std::bad_alloc when it cannot.
  void EnsureAllocated(std::size_t count);

 protected:
  // The core of Open: reads stream from its start (deleted on Close when ownStream and no copy
  // uses it). Closes first; false for a null stream.
  bool Open(BinaryStream* stream, UINT openFlags, UINT encoding, LineEndMode mode,
            bool ownStream);
  // Writes text's code points into the text just before the read position, moving the read
  // position back over them; when fewer code points lie before it, the text is first moved up to
  // make room. Without the append flag the write position follows the read position. Marks the
  // text changed and returns the code points put back; null or empty text (or no file open)
  // returns 0.
  std::size_t Unread(const VynString& text);

 private:
  void Load(UINT encoding);
  std::size_t Store(const unsigned int* codePoints, std::size_t count);
  std::size_t WriteUTF16(const MCHAR* text, std::size_t count);
  void AfterRead() const;
  void ReleaseStream();
  // Lets go of the stream and the text without writing back; every field as initially.
  void Reset();
  void CopyFrom(const ReaderWriter& other);

  BinaryStream* m_stream = nullptr;
  bool m_ownsStream = false;
  UINT m_openFlags = OpenDefault;
  LineEndMode m_mode = LineEndCRLF;
  UINT m_encoding = 0;
  unsigned int* m_text = nullptr;
  std::size_t m_end = 0;
  mutable std::size_t m_writePosition = 0;
  mutable std::size_t m_readPosition = 0;
  bool m_modified = false;

  std::size_t m_allocated = 0;  // code points m_text has room for
  WriterStreamShare* m_share = nullptr;
};

}  // namespace VynSDK::Util::TextFile
