// Global memory: fixed and movable blocks, lock counts, resizing, and handles that must be
// refused rather than trusted.

#include "win32/global_memory.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>

#include "win32/last_error.h"

namespace {

using namespace win32;

bool AllBytesAre(const void* data, std::size_t size, unsigned char value) {
  const auto* bytes = static_cast<const unsigned char*>(data);
  for (std::size_t i = 0; i < size; ++i) {
    if (bytes[i] != value) return false;
  }
  return true;
}

}  // namespace

TEST(GlobalMemory, FixedBlocksAreTheirOwnAddress) {
  HGLOBAL block = GlobalAlloc(GPTR, 4096);
  ASSERT_NE(block, nullptr);
  EXPECT_TRUE(AllBytesAre(block, 4096, 0)) << "GMEM_ZEROINIT";
  EXPECT_EQ(GlobalLock(block), block);
  EXPECT_EQ(GlobalSize(block), 4096u);
  EXPECT_TRUE(GlobalUnlock(block)) << "a fixed block has no lock count";

  std::memset(block, 0x5A, 32);
  EXPECT_EQ(GlobalReAlloc(block, 1 << 20, GMEM_ZEROINIT), nullptr) << "cannot grow in place";
  EXPECT_EQ(GlobalReAlloc(block, 8, 0), block);
  EXPECT_EQ(GlobalReAlloc(block, 32, GMEM_ZEROINIT), block) << "growing back within the block";
  EXPECT_TRUE(AllBytesAre(static_cast<char*>(block) + 8, 24, 0));
  HGLOBAL moved = GlobalReAlloc(block, 1 << 20, GMEM_MOVEABLE | GMEM_ZEROINIT);
  ASSERT_NE(moved, nullptr);
  EXPECT_EQ(GlobalLock(moved), moved) << "still a fixed block";
  EXPECT_TRUE(AllBytesAre(moved, 8, 0x5A));
  EXPECT_TRUE(AllBytesAre(static_cast<char*>(moved) + 8, (1 << 20) - 8, 0));
  EXPECT_EQ(GlobalFree(moved), nullptr);
}

TEST(GlobalMemory, MovableBlocksCountLocksAndResize) {
  HGLOBAL block = GlobalAlloc(GHND, 16);
  ASSERT_NE(block, nullptr);
  auto* bytes = static_cast<unsigned char*>(GlobalLock(block));
  ASSERT_NE(bytes, nullptr);
  EXPECT_NE(static_cast<void*>(bytes), block) << "the handle of a movable block is not its address";
  EXPECT_TRUE(AllBytesAre(bytes, 16, 0));
  std::memset(bytes, 0xAB, 16);
  EXPECT_EQ(GlobalLock(block), bytes);

  // GlobalUnlock page: nonzero while still locked; 0 with NO_ERROR when the count reaches 0;
  // 0 with ERROR_NOT_LOCKED when it was not locked.
  EXPECT_TRUE(GlobalUnlock(block));
  SetLastError(77);
  EXPECT_FALSE(GlobalUnlock(block));
  EXPECT_EQ(GetLastError(), ERROR_SUCCESS);
  EXPECT_FALSE(GlobalUnlock(block));
  EXPECT_EQ(GetLastError(), ERROR_NOT_LOCKED);

  EXPECT_EQ(GlobalReAlloc(block, 100000, GMEM_ZEROINIT), block) << "a movable handle stays";
  bytes = static_cast<unsigned char*>(GlobalLock(block));
  EXPECT_TRUE(AllBytesAre(bytes, 16, 0xAB));
  EXPECT_TRUE(AllBytesAre(bytes + 16, 100000 - 16, 0));
  // Locked: resized in place only, unless the caller allows a move.
  EXPECT_EQ(GlobalReAlloc(block, 1 << 24, 0), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_NOT_ENOUGH_MEMORY);
  EXPECT_EQ(GlobalSize(block), 100000u) << "a failed resize leaves the block";
  EXPECT_EQ(GlobalReAlloc(block, 1 << 24, GMEM_MOVEABLE), block);
  EXPECT_TRUE(AllBytesAre(GlobalLock(block), 16, 0xAB));
  GlobalUnlock(block);
  GlobalUnlock(block);

  // Unlocked and resized to 0 it is discarded: it stays, but cannot be locked.
  EXPECT_EQ(GlobalReAlloc(block, 0, GMEM_MOVEABLE), block);
  EXPECT_EQ(GlobalLock(block), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_DISCARDED);
  EXPECT_EQ(GlobalSize(block), 0u);
  EXPECT_EQ(GlobalReAlloc(block, 8, GMEM_ZEROINIT), block);
  EXPECT_TRUE(AllBytesAre(GlobalLock(block), 8, 0));
  EXPECT_EQ(GlobalFree(block), nullptr) << "a locked block may be freed";
}

TEST(GlobalMemory, UnknownHandlesAreRefusedNotTrusted) {
  int onTheStack = 0;
  HGLOBAL live = GlobalAlloc(GMEM_FIXED, 64);
  HGLOBAL freed = GlobalAlloc(GMEM_MOVEABLE, 64);
  ASSERT_EQ(GlobalFree(freed), nullptr);
  for (HGLOBAL bad : {HGLOBAL{&onTheStack}, freed, HGLOBAL{static_cast<char*>(live) + 8},
                      reinterpret_cast<HGLOBAL>(std::uintptr_t{0x1234})}) {
    SCOPED_TRACE(bad);
    EXPECT_EQ(GlobalLock(bad), nullptr);
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
    EXPECT_FALSE(GlobalUnlock(bad));
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
    EXPECT_EQ(GlobalSize(bad), 0u);
    EXPECT_EQ(GlobalReAlloc(bad, 16, 0), nullptr);
    EXPECT_EQ(GlobalFree(bad), bad) << "GlobalFree page: the handle comes back on failure";
    EXPECT_EQ(GetLastError(), ERROR_INVALID_HANDLE);
  }
  EXPECT_EQ(GlobalFree(nullptr), nullptr);
  EXPECT_EQ(GlobalSize(nullptr), 0u);
  EXPECT_EQ(GlobalFree(live), nullptr);
}

TEST(GlobalMemory, ImpossibleSizesFailCleanly) {
  for (UINT flags : {GMEM_FIXED, GMEM_MOVEABLE, GHND}) {
    SetLastError(0);
    EXPECT_EQ(GlobalAlloc(flags, SIZE_MAX / 2), nullptr);
    EXPECT_EQ(GetLastError(), ERROR_NOT_ENOUGH_MEMORY);
  }
  HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE, 8);
  EXPECT_EQ(GlobalReAlloc(block, SIZE_MAX / 2, GMEM_MOVEABLE), nullptr);
  EXPECT_EQ(GlobalSize(block), 8u);
  EXPECT_EQ(GlobalFree(block), nullptr);
  HGLOBAL empty = GlobalAlloc(GMEM_FIXED, 0);
  EXPECT_EQ(GlobalSize(empty), 0u);
  EXPECT_EQ(GlobalFree(empty), nullptr);
}
