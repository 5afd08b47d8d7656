// The shared heap: allocation behaviours, the new-handler loop, cross-freeing between every entry
// point, aligned blocks, and the debug-heap variables.

#include "vynutil/heap.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <string>
#include <type_traits>
#include <vector>

namespace {

constexpr std::size_t kTooLarge = SIZE_MAX - 15;  // impossible, but not a failed size computation

// Installs a new handler for the duration of a test and restores the previous one.
class NewHandlerScope {
 public:
  explicit NewHandlerScope(_PNH handler) : previous_(VYN_set_new_handler(handler)) {}
  ~NewHandlerScope() { VYN_set_new_handler(previous_); }

 private:
  _PNH previous_;
};

struct HandlerLog {
  int calls = 0;
  int retries = 0;  // how many calls answer "try again"
  std::vector<std::size_t> sizes;
};
HandlerLog g_handlerLog;

int RecordingHandler(std::size_t size) {
  g_handlerLog.sizes.push_back(size);
  return ++g_handlerLog.calls <= g_handlerLog.retries ? 1 : 0;
}

int ThrowingHandler(std::size_t) { throw std::bad_alloc(); }

struct Widget : VynHeapOperators {
  int value = 7;
};

// The base adds no size and no virtual table.
static_assert(std::is_empty_v<VynHeapOperators> && !std::is_polymorphic_v<VynHeapOperators>);
static_assert(sizeof(Widget) == sizeof(int));

struct alignas(64) WideWidget : VynHeapOperators {
  char bytes[64] = {};
};

struct Exploding : VynHeapOperators {
  Exploding() { throw 42; }
};

// What a throwing allocation raised: "" when it returned, else the exception's kind and what().
std::string FailureOf(const std::function<void*()>& allocate) {
  try {
    std::free(allocate());
    return "";
  } catch (const std::bad_array_new_length& e) {
    return std::string("bad_array_new_length: ") + e.what();
  } catch (const std::bad_alloc& e) {
    return std::string("bad_alloc: ") + e.what();
  }
}

struct ThrowingForm {
  const char* name;
  std::function<void*(std::size_t)> allocate;
};

const std::vector<ThrowingForm>& ThrowingForms() {
  static const std::vector<ThrowingForm> forms = {
      {"VYN_new", [](std::size_t n) { return VYN_new(n); }},
      {"VYN_new_array", [](std::size_t n) { return VYN_new_array(n); }},
      {"new", [](std::size_t n) { return VynHeapOperators::operator new(n); }},
      {"new tag", [](std::size_t n) { return VynHeapOperators::operator new(n, ULONG{3}); }},
      {"new debug", [](std::size_t n) { return VynHeapOperators::operator new(n, 1, "f", 2); }},
      {"new file line", [](std::size_t n) { return VynHeapOperators::operator new(n, "f", 2); }},
      {"new[]", [](std::size_t n) { return VynHeapOperators::operator new[](n); }},
      {"new[] tag", [](std::size_t n) { return VynHeapOperators::operator new[](n, ULONG{3}); }},
      {"new[] debug",
       [](std::size_t n) { return VynHeapOperators::operator new[](n, 2, "f", 2); }},
      {"new[] file line",
       [](std::size_t n) { return VynHeapOperators::operator new[](n, "f", 2); }},
      {"new aligned",
       [](std::size_t n) { return VynHeapOperators::operator new(n, std::align_val_t{64}); }},
  };
  return forms;
}

struct NothrowForm {
  const char* name;
  std::function<void*(std::size_t)> allocate;
};

const std::vector<NothrowForm>& NothrowForms() {
  static const std::vector<NothrowForm> forms = {
      {"new nothrow",
       [](std::size_t n) { return VynHeapOperators::operator new(n, std::nothrow); }},
      {"new nothrow tag",
       [](std::size_t n) { return VynHeapOperators::operator new(n, std::nothrow, ULONG{1}); }},
      {"new nothrow file line",
       [](std::size_t n) { return VynHeapOperators::operator new(n, std::nothrow, "f", 1); }},
      {"new[] nothrow",
       [](std::size_t n) { return VynHeapOperators::operator new[](n, std::nothrow); }},
      {"new[] nothrow tag",
       [](std::size_t n) { return VynHeapOperators::operator new[](n, std::nothrow, ULONG{1}); }},
      {"new[] nothrow file line",
       [](std::size_t n) { return VynHeapOperators::operator new[](n, std::nothrow, "f", 1); }},
      {"new aligned nothrow",
       [](std::size_t n) {
         return VynHeapOperators::operator new(n, std::align_val_t{64}, std::nothrow);
       }},
      {"UtilAllocateMemory", [](std::size_t n) { return UtilAllocateMemory(n); }},
  };
  return forms;
}

TEST(HeapOperators, ThrowingFormsGiveBlocksAndTheDocumentedExceptions) {
  for (const ThrowingForm& form : ThrowingForms()) {
    SCOPED_TRACE(form.name);
    void* empty = form.allocate(0);
    void* other = form.allocate(0);
    EXPECT_NE(empty, nullptr);
    EXPECT_NE(empty, other) << "zero-size blocks must be unique";
    std::free(empty);
    std::free(other);
    EXPECT_EQ(FailureOf([&] { return form.allocate(SIZE_MAX); }),
              "bad_array_new_length: bad array new length");
    EXPECT_EQ(FailureOf([&] { return form.allocate(kTooLarge); }), "bad_alloc: bad allocation");
  }
}

TEST(HeapOperators, NonThrowingFormsReturnNullWhereTheThrowingFormsThrow) {
  for (const NothrowForm& form : NothrowForms()) {
    SCOPED_TRACE(form.name);
    void* block = form.allocate(24);
    ASSERT_NE(block, nullptr);
    std::memset(block, 0xAB, 24);
    std::free(block);
    EXPECT_EQ(form.allocate(SIZE_MAX), nullptr);
    EXPECT_EQ(form.allocate(kTooLarge), nullptr);
  }
}

TEST(HeapOperators, NewHandlerIsAskedUntilItGivesUp) {
  NewHandlerScope scope(RecordingHandler);
  g_handlerLog = {.calls = 0, .retries = 2, .sizes = {}};
  EXPECT_EQ(FailureOf([] { return VYN_new(kTooLarge); }), "bad_alloc: bad allocation");
  // Two retries were granted, so the handler saw three failures, each with the request's size.
  EXPECT_EQ(g_handlerLog.calls, 3);
  EXPECT_EQ(g_handlerLog.sizes, std::vector<std::size_t>(3, kTooLarge));

  g_handlerLog = {.calls = 0, .retries = 0, .sizes = {}};
  EXPECT_EQ(FailureOf([] { return VynHeapOperators::operator new[](SIZE_MAX); }),
            "bad_array_new_length: bad array new length");
  EXPECT_EQ(g_handlerLog.calls, 1);

  g_handlerLog = {.calls = 0, .retries = 1, .sizes = {}};
  EXPECT_EQ(VynHeapOperators::operator new(kTooLarge, std::nothrow), nullptr);
  EXPECT_EQ(g_handlerLog.calls, 2) << "the non-throwing forms run the same loop";

  g_handlerLog = {.calls = 0, .retries = 5, .sizes = {}};
  EXPECT_EQ(UtilAllocateMemory(kTooLarge), nullptr);
  EXPECT_EQ(g_handlerLog.calls, 0) << "UtilAllocateMemory never calls the new handler";
}

TEST(HeapOperators, NewHandlerIsProcessWideAndItsExceptionsPassOrAreSwallowed) {
  EXPECT_EQ(VYN_query_new_handler(), nullptr);
  {
    NewHandlerScope scope(ThrowingHandler);
    EXPECT_EQ(VYN_query_new_handler(), &ThrowingHandler);
    EXPECT_EQ(VYN_set_new_handler(RecordingHandler), &ThrowingHandler);
    EXPECT_EQ(VYN_set_new_handler(ThrowingHandler), &RecordingHandler);
    // The handler's own exception reaches the caller of a throwing form...
    EXPECT_EQ(FailureOf([] { return VYN_new(kTooLarge); }), "bad_alloc: std::bad_alloc");
    // ...and is swallowed by the non-throwing forms.
    EXPECT_EQ(VynHeapOperators::operator new[](kTooLarge, std::nothrow), nullptr);
  }
  EXPECT_EQ(VYN_query_new_handler(), nullptr);
}

TEST(HeapOperators, EveryEntryPointReleasesEveryOthersBlocks) {
  using Allocate = std::function<void*(std::size_t)>;
  using Release = std::function<void(void*)>;
  const std::vector<std::pair<const char*, Allocate>> allocators = {
      {"VYN_malloc", [](std::size_t n) { return VYN_malloc(n); }},
      {"VYN_calloc", [](std::size_t n) { return VYN_calloc(1, n); }},
      {"VYN_malloc_dbg", [](std::size_t n) { return VYN_malloc_dbg(n, 1, __FILE__, __LINE__); }},
      {"VYN_new", [](std::size_t n) { return VYN_new(n); }},
      {"VYN_new_array", [](std::size_t n) { return VYN_new_array(n); }},
      {"operator new", [](std::size_t n) { return VynHeapOperators::operator new(n); }},
      {"UtilAllocateMemory", [](std::size_t n) { return UtilAllocateMemory(n); }},
      {"malloc", [](std::size_t n) { return std::malloc(n); }},
  };
  const std::vector<std::pair<const char*, Release>> releasers = {
      {"VYN_free", [](void* p) { VYN_free(p); }},
      {"VYN_free_dbg", [](void* p) { VYN_free_dbg(p, 1); }},
      {"VYN_delete", [](void* p) { VYN_delete(p); }},
      {"VYN_delete_array", [](void* p) { VYN_delete_array(p); }},
      {"operator delete", [](void* p) { VynHeapOperators::operator delete(p); }},
      {"operator delete[]", [](void* p) { VynHeapOperators::operator delete[](p); }},
      {"UtilDeallocateMemory", [](void* p) { UtilDeallocateMemory(p); }},
      {"free", [](void* p) { std::free(p); }},
  };
  for (const auto& [allocatorName, allocate] : allocators) {
    for (const auto& [releaserName, release] : releasers) {
      SCOPED_TRACE(std::string(allocatorName) + " / " + releaserName);
      auto* block = static_cast<unsigned char*>(allocate(40));
      ASSERT_NE(block, nullptr);
      std::memset(block, 0x5A, 40);
      // No header: the runtime knows the block as exactly what it handed out.
      EXPECT_GE(VYN_msize(block), 40u);
      release(block);
      release(nullptr);
    }
  }
}

TEST(HeapOperators, ClassOperatorsServeDerivedClasses) {
  Widget* one = new Widget;
  EXPECT_EQ(one->value, 7);
  delete one;
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
  EXPECT_EQ(VynHeapOperators::operator new(sizeof storage, static_cast<void*>(storage)),
            static_cast<void*>(storage));
  EXPECT_EQ(storage[0], 0xEE) << "placement new touches no memory";
  Widget* placed = new (static_cast<void*>(storage)) Widget;
  EXPECT_EQ(static_cast<void*>(placed), static_cast<void*>(storage));
  placed->~Widget();
}

TEST(HeapOperators, OverAlignedClassesGetTheirAlignment) {
  for (int i = 0; i < 8; ++i) {
    auto* one = new WideWidget;
    auto* many = new WideWidget[3];
    auto* quiet = new (std::nothrow) WideWidget;
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(one) % 64, 0u);
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(many) % 64, 0u);
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(quiet) % 64, 0u);
    delete one;
    delete[] many;
    delete quiet;
  }
}

TEST(HeapOperators, AlignedBlocksFollowTheRuntimeRules) {
  for (std::size_t alignment : {1u, 2u, 8u, 16u, 64u, 4096u}) {
    SCOPED_TRACE(alignment);
    void* block = VYN_aligned_malloc(100, alignment);
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(block) % alignment, 0u);
    VynHeapOperators::aligned_free(block);
  }
  for (std::size_t alignment : {0u, 3u, 48u}) {
    SCOPED_TRACE(alignment);
    errno = 0;
    EXPECT_EQ(VynHeapOperators::aligned_malloc(100, alignment), nullptr);
    EXPECT_EQ(errno, EINVAL);
  }
  EXPECT_EQ(VYN_aligned_malloc(kTooLarge, 64), nullptr);
  VYN_aligned_free(nullptr);
  VynHeapOperators::aligned_free(nullptr);
}

TEST(HeapOperators, AlignedReallocKeepsContentAndAlignment) {
  auto* block = static_cast<unsigned char*>(VYN_aligned_realloc(nullptr, 256, 128));
  ASSERT_NE(block, nullptr);
  for (int i = 0; i < 256; ++i) block[i] = static_cast<unsigned char>(i);
  // Growing far enough that the block has to move.
  for (std::size_t size : {300u, 4096u, 1u << 20}) {
    SCOPED_TRACE(size);
    block = static_cast<unsigned char*>(VynHeapOperators::aligned_realloc(block, size, 128));
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(reinterpret_cast<std::uintptr_t>(block) % 128, 0u);
    for (int i = 0; i < 256; ++i) ASSERT_EQ(block[i], static_cast<unsigned char>(i));
  }
  // A stricter alignment moves the block as needed.
  block = static_cast<unsigned char*>(VYN_aligned_realloc(block, 100, 8192));
  ASSERT_NE(block, nullptr);
  EXPECT_EQ(reinterpret_cast<std::uintptr_t>(block) % 8192, 0u);
  for (int i = 0; i < 100; ++i) ASSERT_EQ(block[i], static_cast<unsigned char>(i));
  // Failure leaves the old block as it was.
  EXPECT_EQ(VYN_aligned_realloc(block, kTooLarge, 8192), nullptr);
  EXPECT_EQ(VYN_aligned_realloc(block, 200, 24), nullptr);
  for (int i = 0; i < 100; ++i) ASSERT_EQ(block[i], static_cast<unsigned char>(i));
  // Size 0 releases the block.
  EXPECT_EQ(VYN_aligned_realloc(block, 0, 8192), nullptr);
}

TEST(HeapOperators, RuntimeHeapVariables) {
  auto* block = static_cast<char*>(VYN_malloc(64));
  ASSERT_NE(block, nullptr);
  const std::size_t room = VYN_msize(block);
  EXPECT_GE(room, 64u);
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
  for (int i = 0; i < 64; ++i) ASSERT_EQ(zeroed[i], 0);
  VYN_free(zeroed);

  EXPECT_EQ(VYN_heapchk(), _HEAPOK);
  EXPECT_EQ(VYN_heapmin(), 0);
  _HEAPINFO entry{};
  EXPECT_EQ(VYN_heapwalk(&entry), _HEAPEND);
  EXPECT_EQ(VYN_heapwalk(nullptr), _HEAPBADPTR);

  EXPECT_EQ(VYN_query_new_mode(), 0);
  EXPECT_EQ(VYN_set_new_mode(1), 0);
  EXPECT_EQ(VYN_query_new_mode(), 1);
  EXPECT_EQ(VYN_set_new_mode(2), -1);
  EXPECT_EQ(VYN_set_new_mode(0), 1);
}

TEST(HeapOperators, DebugHeapVariablesHaveTheirReleaseMeaning) {
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
  // Each flag variable is its own 32-bit variable, 0, unchanged by the calls above.
  static_assert(sizeof(*VYN_crtAssertBusy) == 4 && sizeof(*VYN_crtBreakAlloc) == 4 &&
                sizeof(*VYN_crtDbgFlag) == 4);
  EXPECT_EQ(*VYN_crtAssertBusy, 0);
  EXPECT_EQ(*VYN_crtBreakAlloc, 0);
  EXPECT_EQ(*VYN_crtDbgFlag, 0);
  EXPECT_NE(static_cast<void*>(VYN_crtAssertBusy), static_cast<void*>(VYN_crtBreakAlloc));
  EXPECT_NE(static_cast<void*>(VYN_crtBreakAlloc), static_cast<void*>(VYN_crtDbgFlag));
  VYN_CrtDbgBreak();  // no debugger attached: returns
}

TEST(HeapOperators, OutOfMemorySignalIsAPlainBadAlloc) {
  EXPECT_EQ(FailureOf([]() -> void* {
              UtilOutOfMemoryException();
            }),
            "bad_alloc: bad allocation");
}


}  // namespace
