// BinaryStreamMemory: growth through the creator's callbacks, writes cut to a fixed buffer, the
// in-place operations, and positions far outside the buffer, which must never lead to an access
// outside it (AddressSanitizer watches the buffers here).

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <functional>
#include <limits>
#include <string>

#include "files/binary_stream_test_support.h"

namespace {

using VynSDK::Util::BinaryStream;
using VynSDK::Util::BinaryStreamMemory;
using vyn::test::MemoryStreamPtr;

std::string Contents(const BinaryStreamMemory& s) { return {static_cast<const char*>(s.Data()), s.Length()}; }

// A reallocation callback that refuses blocks above a limit, as an exhausted heap would.
std::size_t g_heapLimit = 0;
void* LimitedRealloc(void* data, std::size_t size) {
  return size <= g_heapLimit ? std::realloc(data, size) : nullptr;
}

MemoryStreamPtr Make(const std::string& text, bool grows) {
  void* block = std::malloc(text.size() + 1);
  std::memcpy(block, text.data(), text.size());
  return MemoryStreamPtr(grows ? BinaryStream::FromMemory(block, text.size(), std::realloc, std::free)
                               : BinaryStream::FromMemory(block, text.size(), std::free));
}

}  // namespace

TEST(BinaryStreamMemory, GrowsBy32ZeroedBytesOrCutsWritesWithoutACallback) {
  MemoryStreamPtr grown(BinaryStream::FromMemory(nullptr, 0, std::realloc, std::free));
  EXPECT_EQ(grown->Write("0123456789", 10), 10u);
  EXPECT_EQ(grown->Allocated(), 42u);
  EXPECT_EQ(std::string(static_cast<const char*>(grown->Data(10)), 32), std::string(32, '\0'));
  EXPECT_EQ(grown->Write(nullptr, 3), 3u) << "a null source reserves zero bytes";
  EXPECT_EQ(Contents(*grown), std::string("0123456789\0\0\0", 13));
  EXPECT_TRUE(grown->EnsureAllocated(100));
  EXPECT_EQ(grown->Allocated(), 132u);

  MemoryStreamPtr fixed = Make("abcdefghij", false);
  fixed->Seek(8, 0);
  EXPECT_EQ(fixed->Write("XYZWV", 5), 2u);
  EXPECT_EQ(Contents(*fixed), "abcdefghXY");
  std::size_t bytes = std::numeric_limits<std::size_t>::max();
  fixed->Seek(7, 0);
  EXPECT_EQ(fixed->Write(bytes), fixed->Data(7));
  EXPECT_EQ(bytes, 3u) << "a count that overflows the position is cut as well";
  EXPECT_FALSE(fixed->EnsureAllocated(11));
  EXPECT_EQ(fixed->Allocated(), 10u);
}

TEST(BinaryStreamMemory, InPlaceOperations) {
  const struct {
    const char* what;
    bool grows;
    std::size_t position;
    std::function<void(BinaryStreamMemory&)> operation;
    std::string contents;
    std::size_t positionAfter;
  } rows[] = {
      {"Precate(4) keeps the 4 bytes before the position", false, 7,
       [](BinaryStreamMemory& s) { s.Precate(4); }, "defghij", 4},
      {"Precate with fewer bytes before the position", false, 2,
       [](BinaryStreamMemory& s) { s.Precate(4); }, "abcdefghij", 2},
      {"Precate beyond the length drops everything", false, 50,
       [](BinaryStreamMemory& s) { s.Precate(4); }, "", 4},
      {"Insert opens a gap and keeps the position", true, 5,
       [](BinaryStreamMemory& s) { std::memcpy(s.Insert(2, 3), "XYZ", 3); }, "abXYZcdefghij", 5},
      {"Insert beyond the length inserts at the end", true, 0,
       [](BinaryStreamMemory& s) { std::memcpy(s.Insert(99, 1), "!", 1); }, "abcdefghij!", 0},
      {"Insert into a full fixed buffer refuses", false, 0,
       [](BinaryStreamMemory& s) { EXPECT_EQ(s.Insert(0, 1), nullptr); }, "abcdefghij", 0},
      {"Truncate(n) below the position lowers it", false, 8,
       [](BinaryStreamMemory& s) { s.Truncate(3); }, "abc", 3},
      {"Truncate() past the end extends with zeros", true, 12,
       [](BinaryStreamMemory& s) { s.Truncate(); }, std::string("abcdefghij\0\0", 12), 12},
      {"a fixed buffer extends only to its allocation", false, 3,
       [](BinaryStreamMemory& s) { s.Truncate(1); s.Truncate(20); },
       std::string("a\0\0\0\0\0\0\0\0\0", 10), 1},
      {"a write past the end leaves zeros, also over old bytes", false, 0,
       [](BinaryStreamMemory& s) { s.Reset(); s.Seek(3, 1); s.Write("z", 1); }, std::string("\0\0\0z", 4), 4},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    MemoryStreamPtr stream = Make("abcdefghij", row.grows);
    stream->Seek(static_cast<LONGLONG>(row.position), 0);
    row.operation(*stream);
    EXPECT_EQ(Contents(*stream), row.contents);
    EXPECT_EQ(stream->CurrentPosition(), row.positionAfter);
  }
  // Precate(4) at position 100 of 150 bytes keeps bytes 96 to 149.
  std::string text(150, '\0');
  for (std::size_t i = 0; i < text.size(); ++i) text[i] = static_cast<char>(i);
  MemoryStreamPtr stream = Make(text, false);
  stream->Seek(100, 0);
  stream->Precate(4);
  EXPECT_EQ(Contents(*stream), text.substr(96));
  EXPECT_EQ(stream->CurrentPosition(), 4u);
  // Compact gives back the slack, keeping at least one byte.
  MemoryStreamPtr compacted(BinaryStream::FromMemory(nullptr, 0, std::realloc, std::free));
  compacted->Write("abcde", 5);
  compacted->Compact();
  EXPECT_EQ(compacted->Allocated(), 5u);
  compacted->Reset();
  compacted->Compact();
  EXPECT_EQ(compacted->Allocated(), 1u);
}

TEST(BinaryStreamMemory, FarPositionsAndRefusedGrowthTouchNothingOutside) {
  g_heapLimit = 40;
  MemoryStreamPtr stream(BinaryStream::FromMemory(std::malloc(4), 4, LimitedRealloc, std::free));
  std::memcpy(stream->Data(), "abcd", 4);
  // Seek applies no bounds: negative positions read back as themselves.
  EXPECT_EQ(stream->Seek(-5, 0), -5);
  EXPECT_EQ(stream->Seek(2, 1), -3);
  EXPECT_EQ(stream->Seek(-6, 2), -2);
  EXPECT_EQ(stream->Seek(0, 9), -2) << "an unknown origin leaves the position";
  char buffer[8];
  for (LONGLONG position : {LONGLONG{-2}, LONGLONG{1} << 40, std::numeric_limits<LONGLONG>::max()}) {
    SCOPED_TRACE(position);
    stream->Seek(position, 0);
    EXPECT_TRUE(stream->IsEndOfFile());
    EXPECT_EQ(stream->Remaining(), 0u);
    EXPECT_EQ(stream->Read(buffer, 8), 0u);
    EXPECT_EQ(stream->Write("zz", 2), 0u);
    EXPECT_EQ(stream->CurrentData(), stream->Data(4)) << "pointers stop at the allocation";
  }
  stream->Seek(0, 2);
  EXPECT_EQ(stream->Write(nullptr, 30), 0u) << "needs 4 + 30 + 32 bytes, above the heap's limit";
  EXPECT_EQ(stream->Insert(0, 30), nullptr);
  EXPECT_EQ(Contents(*stream), "abcd") << "the old buffer is kept";
  EXPECT_EQ(stream->Write("ef", 2), 2u);
  EXPECT_EQ(Contents(*stream), "abcdef");
  // A null buffer with a size is an empty one.
  MemoryStreamPtr empty(BinaryStream::FromMemory(nullptr, 100, nullptr));
  EXPECT_EQ(empty->Allocated(), 0u);
  EXPECT_EQ(empty->Write("a", 1), 0u);
  EXPECT_EQ(empty->Read(nullptr, 1), 0u);
}
