// The three kinds of binary stream behave alike through the interface: each is driven with the
// same random reads, writes, seeks and truncations as a byte-string model of a file (a gap left
// by a write beyond the end reads as zeros, a truncation beyond the end extends with zeros) and
// must agree with it at every step. Plus the partial read at the end, and transfers in pieces.

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>
#include <vector>

#include "files/binary_stream_pieces.h"
#include "files/binary_stream_test_support.h"
#include "support/temp_dir.h"

namespace {

using VynSDK::Util::BinaryStream;
using vyn::test::ReadText;
using vyn::test::StreamPtr;
using vyn::test::WriteText;

// An empty stream of the kind, readable and writable, on a new file of dir for the file kinds.
StreamPtr NewStream(const std::string& kind, const vyn::test::TempDir& dir, const std::string& name) {
  if (kind == "Memory") return StreamPtr(BinaryStream::FromMemory(nullptr, 0, std::realloc, std::free));
  if (kind == "File") {
    return StreamPtr(BinaryStream::FromFile(std::fopen((dir.path() / name).c_str(), "w+b"), true));
  }
  return StreamPtr(BinaryStream::FromFilename(vyn::test::StringOf(dir.File(name)), 0x3B, nullptr));
}

// A file as a byte string and a position.
struct Model {
  std::string bytes;
  std::size_t position = 0;

  std::size_t Write(const std::string& data) {
    if (position > bytes.size()) bytes.resize(position, '\0');
    bytes.replace(position, std::min(data.size(), bytes.size() - position), data);
    position += data.size();
    return data.size();
  }
  std::string Read(std::size_t n) {
    const std::string got = position < bytes.size() ? bytes.substr(position, n) : std::string();
    position += got.size();
    return got;
  }
};

class BinaryStreamKinds : public testing::TestWithParam<std::string> {};

}  // namespace

TEST_P(BinaryStreamKinds, AgreeWithAByteStringModelOfAFile) {
  vyn::test::TempDir dir;
  std::mt19937 random(20240607);
  auto below = [&](std::size_t n) { return std::uniform_int_distribution<std::size_t>(0, n - 1)(random); };
  for (int round = 0; round < 40; ++round) {
    StreamPtr stream = NewStream(GetParam(), dir, "model" + std::to_string(round));
    ASSERT_NE(stream, nullptr);
    Model model;
    std::string log = "round " + std::to_string(round) + ":";  // the operations, for failures
    for (int step = 0; step < 80; ++step) {
      const std::size_t operation = below(10), n = below(41);
      if (operation < 4) {
        std::string data(n, '\0');
        for (char& c : data) c = static_cast<char>('a' + below(26));
        log += " W" + std::to_string(n);
        ASSERT_EQ(WriteText(*stream, data), model.Write(data)) << log;
      } else if (operation < 7) {
        log += " R" + std::to_string(n);
        ASSERT_EQ(ReadText(*stream, n), model.Read(n)) << log;
      } else if (operation < 9) {
        // A target at or after the start, reached from each origin.
        const auto target = static_cast<LONGLONG>(below(model.bytes.size() + 20));
        const int origin = static_cast<int>(below(3));
        const auto base = static_cast<LONGLONG>(origin == 0   ? 0
                                                : origin == 1 ? model.position
                                                              : model.bytes.size());
        log += " S" + std::to_string(target) + "/" + std::to_string(origin);
        ASSERT_EQ(stream->Seek(target - base, origin), target) << log;
        model.position = static_cast<std::size_t>(target);
      } else {
        log += " T";
        stream->Truncate();
        model.bytes.resize(model.position, '\0');
      }
    }
    ASSERT_EQ(stream->Seek(0, 0), 0);
    EXPECT_EQ(ReadText(*stream, model.bytes.size() + 10), model.bytes) << log;
    EXPECT_TRUE(stream->LastError().IsNull()) << log;
  }
}

TEST_P(BinaryStreamKinds, PartialReadAtTheEndThenEndOfFileUntilASeek) {
  vyn::test::TempDir dir;
  StreamPtr stream = NewStream(GetParam(), dir, "partial");
  ASSERT_EQ(WriteText(*stream, "0123456789"), 10u);
  EXPECT_EQ(stream->Seek(-4, 2), 6);
  EXPECT_FALSE(stream->IsEndOfFile());
  EXPECT_EQ(ReadText(*stream, 100), "6789");
  EXPECT_TRUE(stream->IsEndOfFile()) << "after a read that got fewer bytes than asked";
  EXPECT_EQ(stream->Seek(2, 0), 2);
  EXPECT_FALSE(stream->IsEndOfFile());
  EXPECT_EQ(ReadText(*stream, 3), "234");
  EXPECT_TRUE(stream->CanWrite());
}

INSTANTIATE_TEST_SUITE_P(, BinaryStreamKinds, testing::Values("Memory", "File", "Handle"),
                         [](const testing::TestParamInfo<std::string>& info) { return info.param; });

TEST(BinaryStreamPieces, LargeCountsMoveInPiecesOfAtMost0x7FFFFFFFBytes) {
  using VynSDK::Util::stream_pieces::Moved;
  constexpr std::size_t kPiece = 0x7FFFFFFF, kFiveGiB = std::size_t{5} << 30, kNoEnd = SIZE_MAX;
  const struct {
    const char* what;
    std::size_t bytes;
    std::size_t endAt;  // calls move less from this total on
    bool endFails;      // and then also say the transfer ended
    std::size_t moved;
    std::vector<std::size_t> asked;  // the piece each call was given
  } rows[] = {
      {"nothing", 0, kNoEnd, false, 0, {}},
      {"five GiB in three calls", kFiveGiB, kNoEnd, false, kFiveGiB,
       {kPiece, kPiece, kFiveGiB - 2 * kPiece}},
      // A short call is followed by one that moves nothing: the end.
      {"short, then nothing", kFiveGiB, kPiece + 5, false, kPiece + 5, {kPiece, kPiece, kPiece}},
      {"a call that ends it", kFiveGiB, kPiece + 5, true, kPiece + 5, {kPiece, kPiece}},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(row.what);
    std::vector<std::size_t> asked;
    const std::size_t moved = VynSDK::Util::stream_pieces::TransferInPieces(
        row.bytes, [&](std::size_t offset, std::size_t piece) {
          asked.push_back(piece);
          const std::size_t got = std::min(piece, offset < row.endAt ? row.endAt - offset : 0);
          return Moved{got, row.endFails && got < piece};
        });
    EXPECT_EQ(moved, row.moved);
    EXPECT_EQ(asked, row.asked);
  }
}
