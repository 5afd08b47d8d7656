#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <exception>
#include <new>
#include <string>
#include <vector>

#include "vynutil/tab.h"

using VynSDK::Util::Exception;
using VynSDK::Util::OutOfRangeException;
using VynSDK::Util::TabOutOfRangeException;

extern "C" void TabModuleAppend(Tab<int>* tab, int from, int count);
extern "C" Tab<int>* TabModuleNewTab();
extern "C" void TabModuleDeleteTab(Tab<int>* tab);
extern "C" int TabModuleThrowOutOfRange(const Tab<int>* tab);

namespace {

// A raw block owned by a test, inspected through its header.
struct Block {
  TabHdr* th = nullptr;
  ~Block() { zfree(reinterpret_cast<void**>(&th)); }
  int* elements() const { return reinterpret_cast<int*>(th + 1); }
  std::vector<int> values() const {
    return th ? std::vector<int>(elements(), elements() + th->count) : std::vector<int>{};
  }
  void fill(std::initializer_list<int> values) {
    TBCopy(&th, static_cast<int>(values.size()), values.begin(), sizeof(int));
  }
};

std::u16string Message(const Exception& e) { return e.What(); }

}  // namespace

TEST(Tab, AppendingOneAtATimeGrowsByHalfTheCount) {
  Tab<int> tab;
  std::vector<int> capacities;
  for (int i = 0; i < 9; ++i) {
    tab.Append(1, &i);
    capacities.push_back(tab.Capacity());
  }
  EXPECT_EQ(capacities, (std::vector<int>{1, 2, 3, 4, 6, 6, 9, 9, 9}));
  // The documented capacity sequence 1, 2, 3, 4, 6, 9, 13, 19, 28: amortised constant appends.
  std::vector<int> distinct;
  for (int i = 9; i < 100000; ++i) {
    tab.Append(1, &i);
    if (distinct.empty() || distinct.back() != tab.Capacity()) distinct.push_back(tab.Capacity());
  }
  EXPECT_EQ(std::vector<int>(distinct.begin(), distinct.begin() + 3), (std::vector<int>{13, 19, 28}));
  EXPECT_LT(distinct.size(), 30u);
  for (int i = 0; i < tab.Count(); ++i) ASSERT_EQ(tab[i], i);
}

TEST(Tab, InsertPlacesAndGrowsAsDocumented) {
  struct Row {
    const char* name;
    std::vector<int> before;  // empty: no block
    int capacityBefore;
    int at, num, extra;
    int result;
    std::vector<int> after;
    int capacityAfter;
  };
  const Row rows[] = {
      {"first element makes a block of one", {}, 0, 0, 1, 0, 0, {7}, 1},
      {"extra adds head-room to a new block", {}, 0, 0, 1, 3, 0, {7}, 4},
      {"negative position inserts at 0", {1, 2, 3}, 3, -5, 1, 0, 0, {7, 1, 2, 3}, 4},
      {"position past the end appends", {1, 2, 3}, 3, 100, 1, 0, 3, {1, 2, 3, 7}, 4},
      {"middle insert moves the tail", {1, 2, 3}, 3, 1, 2, 0, 1, {1, 7, 8, 2, 3}, 5},
      {"one more than full: 4 + 4/2", {1, 2, 3, 4}, 4, 4, 1, 0, 4, {1, 2, 3, 4, 7}, 6},
      {"five more than full: max(9, 6)", {1, 2, 3, 4}, 4, 4, 5, 0, 4, {1, 2, 3, 4, 7, 8, 9, 10, 11}, 9},
      {"extra on growth: 5 + 10", {1, 2, 3, 4}, 4, 4, 1, 10, 4, {1, 2, 3, 4, 7}, 15},
      {"room left: no growth", {1, 2}, 6, 0, 1, 50, 0, {7, 1, 2}, 6},
      {"nothing to insert", {1, 2}, 2, 9, 0, 0, 9, {1, 2}, 2},
      {"negative extra still leaves room", {1, 2, 3, 4}, 4, 4, 2, -5, 4, {1, 2, 3, 4, 7, 8}, 6},
  };
  const int source[] = {7, 8, 9, 10, 11};
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    Block block;
    if (!row.before.empty()) {
      TBMakeSize(&block.th, row.capacityBefore, sizeof(int));
      TBInsertAt(&block.th, 0, static_cast<int>(row.before.size()), row.before.data(), sizeof(int), 0);
      ASSERT_EQ(block.th->alloc, row.capacityBefore);
    }
    EXPECT_EQ(TBInsertAt(&block.th, row.at, row.num, source, sizeof(int), row.extra), row.result);
    EXPECT_EQ(block.values(), row.after);
    EXPECT_EQ(block.th->alloc, row.capacityAfter);
  }
  // No room at all and nothing to hold it: -1, no block.
  Block empty;
  EXPECT_EQ(TBInsertAt(&empty.th, 0, 1, source, sizeof(int), -1), -1);
  EXPECT_EQ(empty.th, nullptr);
}

TEST(Tab, DeleteSetCountMakeSizeAndCopy) {
  Block block;
  EXPECT_EQ(TBDelete(&block.th, 0, 1, sizeof(int)), 0);  // no block
  block.fill({1, 2, 3, 4, 5});
  EXPECT_EQ(TBDelete(&block.th, 1, 2, sizeof(int)), 3);
  EXPECT_EQ(block.values(), (std::vector<int>{1, 4, 5}));
  EXPECT_EQ(TBDelete(&block.th, 3, 1, sizeof(int)), 3);   // at the count: nothing
  EXPECT_EQ(TBDelete(&block.th, -1, 2, sizeof(int)), 3);  // before the start: nothing
  EXPECT_EQ(TBDelete(&block.th, 0, 0, sizeof(int)), 3);
  EXPECT_EQ(block.th->alloc, 5);  // deleting never shrinks

  block.fill({1, 2, 3, 4, 5});
  EXPECT_EQ(TBDelete(&block.th, 1, 100, sizeof(int)), 1);  // past the end truncates

  // SetCount with resize: exact capacity, at least 1.5 × a growing count.
  block.fill({1, 2, 3, 4});
  TBSetCount(&block.th, 5, sizeof(int), TRUE);
  EXPECT_EQ(block.th->count, 5);
  EXPECT_EQ(block.th->alloc, 6);
  TBSetCount(&block.th, 2, sizeof(int), TRUE);
  EXPECT_EQ(block.th->alloc, 2);
  EXPECT_EQ(block.values(), (std::vector<int>{1, 2}));
  // Without resize: the capacity only grows, to exactly n.
  TBSetCount(&block.th, 1, sizeof(int), FALSE);
  EXPECT_EQ(block.th->alloc, 2);
  TBSetCount(&block.th, 7, sizeof(int), FALSE);
  EXPECT_EQ(block.th->count, 7);
  EXPECT_EQ(block.th->alloc, 7);
  TBSetCount(&block.th, -3, sizeof(int), FALSE);
  EXPECT_EQ(block.th->count, 0);
  // Count 0 with resize keeps an empty block, frees a filled one.
  TBSetCount(&block.th, 0, sizeof(int), TRUE);
  ASSERT_NE(block.th, nullptr);
  block.fill({1});
  TBSetCount(&block.th, 0, sizeof(int), TRUE);
  EXPECT_EQ(block.th, nullptr);

  // MakeSize: nothing changes when the count already matches, even with spare slots.
  block.fill({1, 2, 3});
  TBSetCount(&block.th, 20, sizeof(int), FALSE);
  TBSetCount(&block.th, 3, sizeof(int), FALSE);
  EXPECT_EQ(TBMakeSize(&block.th, 3, sizeof(int)), 1);
  EXPECT_EQ(block.th->alloc, 20);
  EXPECT_EQ(TBMakeSize(&block.th, 2, sizeof(int)), 1);
  EXPECT_EQ(block.values(), (std::vector<int>{1, 2}));
  EXPECT_EQ(TBMakeSize(&block.th, 0, sizeof(int)), 0);
  EXPECT_EQ(block.th, nullptr);

  // Copy: exactly num slots, contents replaced.
  const int source[] = {9, 8, 7};
  block.fill({1, 2, 3, 4, 5, 6});
  EXPECT_EQ(TBCopy(&block.th, 3, source, sizeof(int)), 0);
  EXPECT_EQ(block.values(), (std::vector<int>{9, 8, 7}));
  EXPECT_EQ(block.th->alloc, 3);

  void* p = nullptr;
  zfree(&p);  // null is fine
}

TEST(Tab, ExhaustedMemoryThrowsAndLeavesTheArrayAlone) {
  Block block;
  block.fill({1, 2, 3});
  TabHdr* const before = block.th;
  // 0x7FFFFFFF slots of 1 MiB cannot be had; an overflowing capacity is clamped to that.
  EXPECT_THROW(TBSetCount(&block.th, INT_MAX, 1 << 20, FALSE), std::bad_alloc);
  EXPECT_THROW(TBInsertAt(&block.th, 0, 1, before + 1, 1 << 20, INT_MAX), std::bad_alloc);
  EXPECT_THROW(TBMakeSize(&block.th, -2, sizeof(int)), std::bad_alloc);
  EXPECT_EQ(block.th, before);
  EXPECT_EQ(block.values(), (std::vector<int>{1, 2, 3}));
  EXPECT_EQ(block.th->alloc, 3);
  // A count that would pass 0x7FFFFFFF is refused instead of wrapping.
  block.th->alloc = block.th->count = INT_MAX - 1;  // header only: nothing is read or written
  const int two[] = {0, 0};
  EXPECT_THROW(TBInsertAt(&block.th, INT_MAX, 2, two, sizeof(int), 0), std::bad_alloc);
  block.th->alloc = block.th->count = 3;
}

TEST(Tab, CheckedAccessThrowsSdkExceptionsOnly) {
  Tab<int> tab;
  const auto expectThrow = [](auto access, const std::u16string& message) {
    try {
      access();
      ADD_FAILURE() << "no exception";
    } catch (const std::exception&) {
      ADD_FAILURE() << "caught as std::exception";
    } catch (const OutOfRangeException& e) {
      EXPECT_EQ(Message(e), message);
      EXPECT_NE(dynamic_cast<const TabOutOfRangeException*>(&e), nullptr);
    }
  };
  const std::u16string index = u"Invalid index passed into a Vyn SDK Tab::operator[]";
  const std::u16string addr = u"Invalid index passed into a Vyn SDK Tab::Addr(const INT_PTR i)";
  expectThrow([&] { (void)tab[0]; }, index);  // no block at all
  int values[] = {1, 2, 3};
  tab.Append(3, values);
  tab.ZeroCount();
  expectThrow([&] { (void)tab[0]; }, index);  // a block without elements
  tab.Append(3, values);
  expectThrow([&] { (void)tab[tab.Count()]; }, index);
  expectThrow([&] { (void)std::as_const(tab)[-1]; }, index);
  expectThrow([&] { (void)tab.Addr(3); }, addr);
  EXPECT_EQ(*tab.Addr(2), 3);
  EXPECT_THROW((void)tab[INT_PTR{1} << 40], Exception);
  EXPECT_EQ(Message(TabOutOfRangeException(nullptr)), u"VynSDK::Util::TabOutOfRangeException");
}

TEST(Tab, TemplateConveniencesKeepTheirOwnBlocks) {
  Tab<int> tab;
  int values[] = {5, 3, 9, 1};
  tab.Append(4, values, 4);
  Tab<int> copy(tab);
  copy[0] = 0;
  EXPECT_EQ(tab[0], 5);
  EXPECT_EQ(copy.Capacity(), 4);
  tab.Sort([](const void* a, const void* b) {
    return *static_cast<const int*>(a) - *static_cast<const int*>(b);
  });
  EXPECT_EQ(std::vector<int>(tab.begin(), tab.end()), (std::vector<int>{1, 3, 5, 9}));
  EXPECT_EQ(tab.Capacity(), 8);
  EXPECT_EQ(tab.Resize(6), 1);
  EXPECT_EQ(tab.Capacity(), 6);
  Tab<int> moved(std::move(tab));
  EXPECT_EQ(tab.Count(), 0);
  EXPECT_EQ(moved.Count(), 4);
  copy = moved;
  EXPECT_EQ(copy[3], 9);
  EXPECT_EQ(moved.Delete(moved.Count() - 1, 1), 3);
}

TEST(Tab, BlocksCrossModuleBoundaries) {
  // Grown here, grown further and freed by the other module.
  auto* tab = TabModuleNewTab();
  for (int i = 0; i < 10; ++i) tab->Append(1, &i);
  TabModuleAppend(tab, 10, 1000);
  ASSERT_EQ(tab->Count(), 1010);
  for (int i = 0; i < tab->Count(); ++i) ASSERT_EQ((*tab)[i], i);
  TabModuleDeleteTab(tab);
  // Made by the other module, freed here.
  Tab<int>* local = new Tab<int>;
  TabModuleAppend(local, 0, 100);
  local->Delete(0, 50);
  EXPECT_EQ((*local)[0], 50);
  // The other module's exception is this module's exception type.
  EXPECT_THROW(TabModuleThrowOutOfRange(local), TabOutOfRangeException);
  delete local;
}
