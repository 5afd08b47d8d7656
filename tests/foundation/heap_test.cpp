// The shared heap: allocation behaviours, the new-handler loop, cross-freeing between every entry
// point, aligned blocks, and the debug-heap variables.

#include "vynutil/heap.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <string>
#include <type_traits>
#include <vector>

namespace {

using Op = VynHeapOperators;
using Allocate = std::function<void*(std::size_t)>;
constexpr std::size_t kTooLarge = SIZE_MAX - 15;  // impossible, but not a failed size computation

bool Aligned(const void* p, std::size_t alignment) {
  return reinterpret_cast<std::uintptr_t>(p) % alignment == 0;
}

// Installs a new handler for the duration of a test and restores the previous one.
struct NewHandlerScope {
  explicit NewHandlerScope(_PNH handler) : previous(VYN_set_new_handler(handler)) {}
  ~NewHandlerScope() { VYN_set_new_handler(previous); }
  _PNH previous;
};

int g_calls = 0, g_retries = 0;  // the handler answers "try again" for the first g_retries calls
std::vector<std::size_t> g_sizes;
int RecordingHandler(std::size_t size) {
  g_sizes.push_back(size);
  return ++g_calls <= g_retries ? 1 : 0;
}
void ResetHandlerLog(int retries) { g_calls = 0, g_retries = retries, g_sizes.clear(); }
int ThrowingHandler(std::size_t) { throw std::bad_alloc(); }

struct Widget : Op {
  int value = 7;
};
// The base adds no size and no virtual table.
static_assert(std::is_empty_v<Op> && !std::is_polymorphic_v<Op> && sizeof(Widget) == sizeof(int));
struct alignas(64) WideWidget : Op {
  char bytes[64] = {};
};
struct Exploding : Op {
  Exploding() { throw 42; }
};

// What an allocation did: "null", "block" (released), or the exception's kind and what().
std::string Outcome(const std::function<void*()>& allocate) {
  try {
    void* block = allocate();
    std::free(block);
    return block != nullptr ? "block" : "null";
  } catch (const std::bad_array_new_length& e) {
    return std::string("bad_array_new_length: ") + e.what();
  } catch (const std::bad_alloc& e) {
    return std::string("bad_alloc: ") + e.what();
  }
}

TEST(HeapOperators, FormsGiveUniqueBlocksAndFailByThrowingOrWithNull) {
  struct Row {
    const char* name;
    bool throws;
    Allocate allocate;
  };
  // Each row: name, whether failures throw, the call with n as the size.
#define FORM(name, throws, call) {name, throws, [](std::size_t n) -> void* { return call; }}
  const std::vector<Row> rows = {
      FORM("VYN_new", true, VYN_new(n)),
      FORM("VYN_new_array", true, VYN_new_array(n)),
      FORM("new", true, Op::operator new(n)),
      FORM("new tag", true, Op::operator new(n, ULONG{3})),
      FORM("new debug", true, Op::operator new(n, 1, "f", 2)),
      FORM("new file line", true, Op::operator new(n, "f", 2)),
      FORM("new[]", true, Op::operator new[](n)),
      FORM("new[] tag", true, Op::operator new[](n, ULONG{3})),
      FORM("new[] debug", true, Op::operator new[](n, 2, "f", 2)),
      FORM("new[] file line", true, Op::operator new[](n, "f", 2)),
      FORM("new aligned", true, Op::operator new(n, std::align_val_t{64})),
      FORM("new nothrow", false, Op::operator new(n, std::nothrow)),
      FORM("new nothrow tag", false, Op::operator new(n, std::nothrow, ULONG{1})),
      FORM("new nothrow file line", false, Op::operator new(n, std::nothrow, "f", 1)),
      FORM("new[] nothrow", false, Op::operator new[](n, std::nothrow)),
      FORM("new[] nothrow tag", false, Op::operator new[](n, std::nothrow, ULONG{1})),
      FORM("new[] nothrow file line", false, Op::operator new[](n, std::nothrow, "f", 1)),
      FORM("new aligned nothrow", false, Op::operator new(n, std::align_val_t{64}, std::nothrow)),
      FORM("UtilAllocateMemory", false, UtilAllocateMemory(n)),
  };
#undef FORM
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    void* empty = row.allocate(0);
    void* other = row.allocate(0);
    EXPECT_NE(empty, nullptr);
    EXPECT_NE(empty, other) << "zero-size blocks must be unique";
    std::free(empty);
    std::free(other);
    EXPECT_EQ(Outcome([&] { return std::memset(row.allocate(24), 0xAB, 24); }), "block");
    EXPECT_EQ(Outcome([&] { return row.allocate(SIZE_MAX); }),
              row.throws ? "bad_array_new_length: bad array new length" : "null");
    EXPECT_EQ(Outcome([&] { return row.allocate(kTooLarge); }),
              row.throws ? "bad_alloc: bad allocation" : "null");
  }
  EXPECT_EQ(Outcome([]() -> void* { UtilOutOfMemoryException(); }), "bad_alloc: bad allocation");
}

TEST(HeapOperators, NewHandlerIsAskedUntilItGivesUp) {
  ASSERT_EQ(VYN_query_new_handler(), nullptr);
  NewHandlerScope scope(RecordingHandler);
  ResetHandlerLog(2);
  EXPECT_EQ(Outcome([] { return VYN_new(kTooLarge); }), "bad_alloc: bad allocation");
  // Two retries were granted, so the handler saw three failures, each with the request's size.
  EXPECT_EQ(g_sizes, std::vector<std::size_t>(3, kTooLarge));
  ResetHandlerLog(0);
  EXPECT_EQ(Outcome([] { return Op::operator new[](SIZE_MAX); }),
            "bad_array_new_length: bad array new length");
  EXPECT_EQ(g_calls, 1);
  ResetHandlerLog(1);
  EXPECT_EQ(Op::operator new(kTooLarge, std::nothrow), nullptr);
  EXPECT_EQ(g_calls, 2) << "the non-throwing forms run the same loop";
  ResetHandlerLog(5);
  EXPECT_EQ(UtilAllocateMemory(kTooLarge), nullptr);
  EXPECT_EQ(g_calls, 0) << "UtilAllocateMemory never calls the new handler";

  // The handler is process-wide; its own exception reaches the caller of a throwing form and is
  // swallowed by the non-throwing forms.
  EXPECT_EQ(VYN_set_new_handler(ThrowingHandler), &RecordingHandler);
  EXPECT_EQ(VYN_query_new_handler(), &ThrowingHandler);
  EXPECT_EQ(Outcome([] { return VYN_new(kTooLarge); }), "bad_alloc: std::bad_alloc");
  EXPECT_EQ(Op::operator new[](kTooLarge, std::nothrow), nullptr);
}

TEST(HeapOperators, EveryEntryPointReleasesEveryOthersBlocks) {
  const std::vector<std::pair<const char*, Allocate>> allocators = {
      {"VYN_malloc", [](std::size_t n) { return VYN_malloc(n); }},
      {"VYN_calloc", [](std::size_t n) { return VYN_calloc(1, n); }},
      {"VYN_malloc_dbg", [](std::size_t n) { return VYN_malloc_dbg(n, 1, __FILE__, __LINE__); }},
      {"VYN_new", [](std::size_t n) { return VYN_new(n); }},
      {"VYN_new_array", [](std::size_t n) { return VYN_new_array(n); }},
      {"operator new", [](std::size_t n) { return Op::operator new(n); }},
      {"UtilAllocateMemory", [](std::size_t n) { return UtilAllocateMemory(n); }},
      {"malloc", [](std::size_t n) { return std::malloc(n); }},
  };
  const std::vector<std::pair<const char*, std::function<void(void*)>>> releasers = {
      {"VYN_free", [](void* p) { VYN_free(p); }},
      {"VYN_free_dbg", [](void* p) { VYN_free_dbg(p, 1); }},
      {"VYN_delete", [](void* p) { VYN_delete(p); }},
      {"VYN_delete_array", [](void* p) { VYN_delete_array(p); }},
      {"operator delete", [](void* p) { Op::operator delete(p); }},
      {"operator delete[]", [](void* p) { Op::operator delete[](p); }},
      {"UtilDeallocateMemory", [](void* p) { UtilDeallocateMemory(p); }},
      {"free", [](void* p) { std::free(p); }},
  };
  for (const auto& [allocatorName, allocate] : allocators) {
    for (const auto& [releaserName, release] : releasers) {
      SCOPED_TRACE(std::string(allocatorName) + " / " + releaserName);
      void* block = allocate(40);
      ASSERT_NE(block, nullptr);
      std::memset(block, 0x5A, 40);
      // No header: the runtime knows the block as exactly what it handed out.
      EXPECT_GE(VYN_msize(block), 40u);
      release(block);
      release(nullptr);
    }
  }
}

TEST(HeapOperators, ClassOperatorsServeDerivedAndOverAlignedClasses) {
  Widget* many = new Widget[5];
  EXPECT_EQ(many[4].value, 7);
  delete[] many;
  delete new (ULONG{9}) Widget;
  delete new (__FILE__, __LINE__) Widget;
  delete new (1, __FILE__, __LINE__) Widget;
  delete new (std::nothrow) Widget;
  delete[] new (__FILE__, __LINE__) Widget[2];
  // A constructor that throws from a placement form has its block released by the matching
  // placement delete (LeakSanitizer would report it otherwise).
  EXPECT_THROW(new (std::nothrow) Exploding, int);
  EXPECT_THROW(new (__FILE__, __LINE__) Exploding, int);
  EXPECT_THROW(new (ULONG{1}) Exploding[2], int);

  alignas(Widget) unsigned char storage[sizeof(Widget)];
  std::memset(storage, 0xEE, sizeof storage);
  EXPECT_EQ(Op::operator new(sizeof storage, static_cast<void*>(storage)), storage);
  EXPECT_EQ(storage[0], 0xEE) << "placement new touches no memory";

  for (int i = 0; i < 8; ++i) {
    auto* one = new WideWidget;
    auto* array = new WideWidget[3];
    auto* quiet = new (std::nothrow) WideWidget;
    EXPECT_TRUE(Aligned(one, 64) && Aligned(array, 64) && Aligned(quiet, 64));
    delete one;
    delete[] array;
    delete quiet;
  }
}

TEST(HeapOperators, AlignedBlocksFollowTheRuntimeRules) {
  for (std::size_t alignment : {1u, 2u, 8u, 16u, 64u, 4096u}) {
    void* block = VYN_aligned_malloc(100, alignment);
    EXPECT_TRUE(block != nullptr && Aligned(block, alignment)) << alignment;
    Op::aligned_free(block);
  }
  for (std::size_t alignment : {0u, 3u, 48u}) {
    errno = 0;
    EXPECT_EQ(Op::aligned_malloc(100, alignment), nullptr) << alignment;
    EXPECT_EQ(errno, EINVAL);
  }
  EXPECT_EQ(VYN_aligned_malloc(kTooLarge, 64), nullptr);
  VYN_aligned_free(nullptr);

  auto* block = static_cast<unsigned char*>(VYN_aligned_realloc(nullptr, 256, 128));
  ASSERT_NE(block, nullptr);
  for (int i = 0; i < 256; ++i) block[i] = static_cast<unsigned char>(i);
  const auto keptBytes = [&](int count) {
    for (int i = 0; i < count; ++i) {
      if (block[i] != static_cast<unsigned char>(i)) return false;
    }
    return true;
  };
  // Growing far enough that the block has to move, then a stricter alignment.
  for (auto [size, alignment] : {std::pair<std::size_t, std::size_t>{300, 128}, {4096, 128},
                                 {1u << 20, 128}, {256, 8192}}) {
    block = static_cast<unsigned char*>(Op::aligned_realloc(block, size, alignment));
    ASSERT_NE(block, nullptr);
    EXPECT_TRUE(Aligned(block, alignment) && keptBytes(256)) << size << " @ " << alignment;
  }
  // Failure leaves the old block as it was; size 0 releases it.
  EXPECT_EQ(VYN_aligned_realloc(block, kTooLarge, 8192), nullptr);
  EXPECT_EQ(VYN_aligned_realloc(block, 200, 24), nullptr);
  EXPECT_TRUE(keptBytes(256));
  EXPECT_EQ(VYN_aligned_realloc(block, 0, 8192), nullptr);
}

TEST(HeapOperators, RuntimeAndDebugHeapVariables) {
  auto* block = static_cast<char*>(VYN_malloc(64));
  ASSERT_NE(block, nullptr);
  const std::size_t room = VYN_msize(block);
  EXPECT_EQ(VYN_msize_dbg(block, 1), room);
  EXPECT_EQ(VYN_expand(block, 16), block) << "shrinking stays in place";
  EXPECT_EQ(VYN_expand_dbg(block, room, 1, nullptr, 0), block) << "the block's own room fits";
  errno = 0;
  EXPECT_EQ(VYN_expand(block, room + (1u << 20)), nullptr);
  EXPECT_EQ(errno, ENOMEM);
  errno = 0;
  EXPECT_EQ(VYN_expand(nullptr, 8), nullptr);
  EXPECT_EQ(errno, EINVAL);
  std::memcpy(block, "kept", 5);
  block = static_cast<char*>(VYN_realloc_dbg(block, 4096, 1, nullptr, 0));
  EXPECT_STREQ(block, "kept");
  VYN_free(block);
  auto* zeroed = static_cast<unsigned char*>(VYN_calloc_dbg(16, 4, 1, nullptr, 0));
  ASSERT_NE(zeroed, nullptr);
  EXPECT_TRUE(std::all_of(zeroed, zeroed + 64, [](unsigned char c) { return c == 0; }));
  VYN_free(zeroed);

  EXPECT_EQ(VYN_heapchk(), _HEAPOK);
  EXPECT_EQ(VYN_heapmin(), 0);
  _HEAPINFO entry{};
  EXPECT_EQ(VYN_heapwalk(&entry), _HEAPEND);
  EXPECT_EQ(VYN_heapwalk(nullptr), _HEAPBADPTR);
  EXPECT_EQ(VYN_set_new_mode(1), 0);
  EXPECT_EQ(VYN_query_new_mode(), 1);
  EXPECT_EQ(VYN_set_new_mode(2), -1);
  EXPECT_EQ(VYN_set_new_mode(0), 1);

  EXPECT_EQ(VYN_CrtCheckMemory(), 1);
  EXPECT_EQ(VYN_CrtIsMemoryBlock(nullptr, 0, nullptr, nullptr, nullptr), 1);
  EXPECT_EQ(VYN_CrtDumpMemoryLeaks(), 0);
  EXPECT_EQ(VYN_CrtSetDbgFlag(0x21), 0);
  EXPECT_EQ(VYN_CrtSetBreakAlloc(12), 0);
  EXPECT_EQ(VYN_CrtDbgReport(0, "f", 1, "m", "%s %d", "x", 3), 0);
  _CrtMemState before{}, after{}, difference{};
  VYN_CrtMemCheckpoint(&before);
  VYN_CrtMemCheckpoint(&after);
  EXPECT_EQ(VYN_CrtMemDifference(&difference, &before, &after), 0);
  // Each flag variable is its own variable, 0, unchanged by the calls above.
  EXPECT_TRUE(*VYN_crtAssertBusy == 0 && *VYN_crtBreakAlloc == 0 && *VYN_crtDbgFlag == 0);
  EXPECT_NE(static_cast<void*>(VYN_crtAssertBusy), static_cast<void*>(VYN_crtBreakAlloc));
  EXPECT_NE(static_cast<void*>(VYN_crtBreakAlloc), static_cast<void*>(VYN_crtDbgFlag));
  VYN_CrtDbgBreak();  // no debugger attached: returns
}

}  // namespace
