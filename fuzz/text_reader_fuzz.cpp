// The text reader on arbitrary bytes: detection, and each encoding forced by a byte-order mark or
// a "coding" declaration (UTF-8, UTF-16 LE/BE, 1252, 932), read by lines, characters, chunks and
// whole, with seeks back and forth, text put back and copies, in blocks of 1 to 16 bytes or the
// default. No crash, no hang, no access outside a buffer (the sanitizers watch), and:
// - reading whole, by lines and by characters gives the same characters, LFs and text;
// - a seek to an absolute position lands there (the source can always seek);
// - after any operation, reading to the end ends (IsEndOfFile).
//
// Input: byte 0 picks the encoding, byte 1 the line-end mode, end-of-file handling and sizes,
// bytes 2-3 seed the operations; the rest is the file.

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <string>

#include "vynutil/text_reader.h"

using VynSDK::Util::BinaryStream;
using VynSDK::Util::Char;
using VynSDK::Util::VynString;
using VynSDK::Util::TextFile::LineEndMode;
using VynSDK::Util::TextFile::Reader;

namespace {

class FuzzReader : public Reader {
 public:
  using Reader::Open;
  using Reader::Unread;
};

struct Settings {
  std::string bytes;
  UINT encoding = 0;
  LineEndMode mode = VynSDK::Util::TextFile::LineEndNone;
  int eofHandling = -1;
  std::size_t block = 0;
  std::size_t detect = 0;
};

void Check(bool condition) {
  if (!condition) __builtin_trap();
}

bool Open(FuzzReader& r, const Settings& s) {
  if (s.block != 0) r.SetReadBufferSize(s.block);
  if (s.detect != 0) r.SetDetectSize(s.detect);
  void* block = std::malloc(s.bytes.size() + 1);
  if (!s.bytes.empty()) std::memcpy(block, s.bytes.data(), s.bytes.size());
  if (!r.Open(BinaryStream::FromMemory(block, s.bytes.size(), std::realloc, std::free), s.encoding, s.mode, true)) {
    return false;
  }
  if (s.eofHandling >= 0) r.SetEOFCharacterHandling(static_cast<Reader::EOFCharacterHandling>(s.eofHandling));
  return true;
}

std::u16string Text(const VynString& s) {
  const MCHAR* chars = s.ToUTF16();
  return chars != nullptr ? std::u16string(chars) : std::u16string();
}

// Reads until the end; the end must come.
void ReadToEnd(Reader& r) {
  for (int guard = 0; !r.IsEndOfFile(); ++guard) {
    Check(guard < 1000000);
    (void)r.ReadChunk(64);
  }
  Check(r.ReadFull().IsNull());
  Check(r.ReadCharUTF32() == 0xFFFFFFFFu);
}

// The whole text, its lines and its characters agree: the same characters, the same LFs, and
// (when no zero character cuts a string short) the same text.
void CompareWaysOfReading(const Settings& s) {
  FuzzReader whole, lines, chars;
  if (!Open(whole, s) || !Open(lines, s) || !Open(chars, s)) return;
  std::size_t lineFeeds = 0;
  bool zero = false;
  for (int guard = 0; !chars.IsEndOfFile(); ++guard) {
    Check(guard < 1000000);
    const unsigned code = chars.ReadCharUTF32();
    lineFeeds += code == 10;
    zero = zero || code == 0;
  }
  const std::u16string all = Text(whole.ReadFull());
  std::u16string joined;
  for (VynString line = lines.ReadLine(); !line.IsNull(); line = lines.ReadLine()) joined += Text(line);
  Check(whole.IsEndOfFile() && lines.IsEndOfFile());
  Check(whole.Position() == chars.Position() && lines.Position() == chars.Position());
  Check(whole.PositionBytes() == chars.PositionBytes() && lines.PositionBytes() == chars.PositionBytes());
  Check(chars.LineNumber() == lineFeeds && lines.LineNumber() == lineFeeds && whole.LineNumber() == lineFeeds);
  if (!zero) Check(all == joined);
}

const char16_t* const kPutBack[] = {u"", u"x", u"\r\n", u"caf\u00e9", u"日本", u"\U0001F600", u"a\nb\nc"};

void Operate(FuzzReader& r, std::uint32_t seed, int steps) {
  std::uint32_t state = seed | 1;
  auto next = [&state] {
    state ^= state << 13, state ^= state >> 17, state ^= state << 5;
    return state;
  };
  for (int step = 0; step < steps; ++step) {
    const std::uint32_t n = next();
    switch (n % 14) {
      case 0: (void)r.ReadLine(n >> 8 & 31 ? (n >> 8 & 31) : static_cast<std::size_t>(-1), n & 0x100); break;
      case 1: (void)r.ReadChar(n & 0x100); break;
      case 2: Check(r.ReadCharUTF32(n & 0x100) <= 0x7FFFFFFFu || r.LastErrorCode() != 0 || r.IsEndOfFile()); break;
      case 3: (void)r.ReadChunk(n >> 8 & 63, n & 0x4000); break;
      case 4: (void)r.ReadChars(n >> 8 & 15); break;
      case 5: {
        const std::size_t target = n >> 8 & 255;
        const std::size_t reached = r.Seek(static_cast<LONG>(target), 0);
        Check(r.LastErrorCode() == 0);
        Check(reached == target || (reached < target && r.IsEndOfFile()));
        Check(r.Position() == reached);
        break;
      }
      case 6: (void)r.Seek(-static_cast<LONG>(n >> 8 & 31), n >> 16 & 3); break;
      case 7: (void)r.Seek(static_cast<LONG>(n >> 8 & 31), 1); break;
      case 8: {
        const std::size_t before = r.Position();
        const std::size_t back = r.Unread(VynString::FromUTF16(kPutBack[(n >> 8) % 7]));
        Check(r.Position() == (back > before ? 0 : before - back));
        break;
      }
      case 9: (void)r.UnreadChar(Char(static_cast<unsigned>(n >> 12))); break;
      case 10: (void)r.LineNumber(), (void)r.NumberOfChars(), (void)r.NumberOfLines(); break;
      case 11: r.SetEOFCharacterHandling(static_cast<Reader::EOFCharacterHandling>(n >> 8 & 3)); break;
      case 12: {
        FuzzReader copy(r);
        (void)copy.ReadLine();
        (void)copy.Seek(0, 0);
        break;
      }
      case 13: (void)r.IsEndOfFile(); break;
    }
  }
  ReadToEnd(r);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size < 4) return 0;
  Settings s;
  const std::string body(reinterpret_cast<const char*>(data) + 4, size - 4);
  switch (data[0] % 8) {
    case 0: s.bytes = body; break;                                     // detection decides
    case 1: s.bytes = "\xEF\xBB\xBF" + body; break;                    // UTF-8
    case 2: s.bytes = "\xFF\xFE" + body; break;                        // UTF-16 LE
    case 3: s.bytes = "\xFE\xFF" + body; break;                        // UTF-16 BE
    case 4: s.bytes = "coding:windows-1252\n" + body; break;           // 1252
    case 5: s.bytes = "coding:shift_jis\n" + body; break;              // 932
    case 6: s.bytes = body, s.encoding = 0x8000FDF4; break;            // default big-endian
    case 7: s.bytes = body, s.encoding = 0x10000000 | 1252; break;     // prefer UTF-8
  }
  s.mode = static_cast<LineEndMode>(data[1] % 3);
  s.eofHandling = (data[1] >> 2) % 5 - 1;
  s.block = (data[1] >> 5) == 7 ? 0 : (data[1] >> 5) * 2 + 1;
  s.detect = (data[0] >> 3) % 2 ? 8 : 0;

  CompareWaysOfReading(s);
  FuzzReader r;
  if (!Open(r, s)) __builtin_trap();
  Operate(r, static_cast<std::uint32_t>(data[2]) << 8 | data[3], 40);
  return 0;
}
