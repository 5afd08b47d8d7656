// The runtime's 64-bit stream positions and _chsize_s, with the errno results of the Microsoft
// runtime's documentation.

#include "win32/crt_file.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <string>

#include "file_test_helpers.h"
#include "support/temp_dir.h"
#include "win32/crt_stdio.h"

using namespace win32;
namespace fs = std::filesystem;

TEST(CrtFile, SeeksAndTellsBeyondFourGigabytes) {
  vyn::test::TempDir dir;
  FILE* file = _wfopen(dir.File("big.bin").c_str(), u"w+b");
  ASSERT_NE(file, nullptr);
  const LONGLONG far = (LONGLONG{1} << 32) + 10;
  EXPECT_EQ(_fseeki64(file, far, SEEK_SET), 0);
  EXPECT_EQ(_ftelli64(file), far);
  ASSERT_EQ(std::fputc('z', file), 'z');
  EXPECT_EQ(_fseeki64(file, -1, SEEK_END), 0);
  EXPECT_EQ(_ftelli64(file), far);
  EXPECT_EQ(std::fgetc(file), 'z');
  EXPECT_EQ(std::fgetc(file), EOF);
  EXPECT_EQ(_fseeki64(file, 0, SEEK_CUR), 0);
  EXPECT_FALSE(std::feof(file)) << "a seek clears the end-of-file indicator";
  // fseek documentation: EINVAL for a bad origin, a position before the start, a null stream.
  for (auto [offset, origin] : {std::pair<LONGLONG, int>{0, 3}, {-1, SEEK_SET}, {-far - 2, SEEK_END}}) {
    errno = 0;
    EXPECT_EQ(_fseeki64(file, offset, origin), -1);
    EXPECT_EQ(errno, EINVAL);
  }
  EXPECT_EQ(_ftelli64(file), far + 1);
  errno = 0;
  EXPECT_EQ(_fseeki64(nullptr, 0, SEEK_SET), -1);
  EXPECT_EQ(errno, EINVAL);
  EXPECT_EQ(_ftelli64(nullptr), -1);
  EXPECT_EQ(_fileno(nullptr), -1);
  std::fclose(file);
}

TEST(CrtFile, ChsizeCutsAndExtendsWithZeros) {
  vyn::test::TempDir dir;
  const std::u16string path = dir.Write("sized.bin", "abcdef");
  FILE* file = _wfopen(path.c_str(), u"r+b");
  ASSERT_NE(file, nullptr);
  EXPECT_EQ(_chsize_s(_fileno(file), 3), 0);
  EXPECT_EQ(vyn::test::Contents(dir.path() / "sized.bin"), "abc");
  EXPECT_EQ(_chsize_s(_fileno(file), 6), 0);
  EXPECT_EQ(vyn::test::Contents(dir.path() / "sized.bin"), std::string("abc\0\0\0", 6));
  // _chsize_s documentation: EINVAL for a negative size, EBADF for a read-only or bad descriptor.
  errno = 0;
  EXPECT_EQ(_chsize_s(_fileno(file), -1), EINVAL);
  EXPECT_EQ(errno, EINVAL);
  std::fclose(file);
  FILE* reader = _wfopen(path.c_str(), u"rb");
  ASSERT_NE(reader, nullptr);
  EXPECT_EQ(_chsize_s(_fileno(reader), 1), EBADF);
  EXPECT_EQ(errno, EBADF);
  std::fclose(reader);
  EXPECT_EQ(_chsize_s(-1, 1), EBADF);
  EXPECT_EQ(fs::file_size(dir.path() / "sized.bin"), 6u);
}
