#pragma once
// Tab<T>: the SDK's dynamic array of plain, bitwise-copyable elements.
//
// The storage is one block of the shared heap: a TabHdr {count, alloc} followed directly by the
// elements (element i at byte 8 + i × sizeof(T)). Every change of the block goes through the six
// exported TB… functions below, so a Tab filled in one module may be grown, shrunk or freed in
// any other. Elements are moved with memmove, never constructed, copied or destroyed.
//
// A Tab is not synchronised; concurrent use of one array needs an outside lock.

#include <cstdlib>
#include <cstring>
#include <type_traits>

#include "vynutil/exception.h"
#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/wintypes.h"

// The header of a Tab's block; the elements follow it. Invariant: 0 ≤ count ≤ alloc.
struct TabHdr {
  int count;  // elements in use
  int alloc;  // element slots allocated
};

// The block functions. pth is the address of the block pointer, which they may replace; a null
// block counts as 0 elements and 0 slots; elsize is the element size in bytes. Growing throws
// std::bad_alloc when memory runs out, leaving the array as it was.

// Inserts num elements copied from el at position at (clamped below to 0; beyond the count
// appends), growing the block when needed: by num + extra slots, but at least to 1.5 × the
// current count. Returns the index of the first inserted element, at itself when num < 1 (nothing
// changes), or −1 when no block could be made. el must hold num × elsize bytes.
VYN_API int TBInsertAt(TabHdr** pth, int at, int num, const void* el, int elsize, int extra);
// Deletes num elements from starting (starting ≥ 0); past the end it truncates. The capacity
// never shrinks. Returns the new count.
VYN_API int TBDelete(TabHdr** pth, int starting, int num, int elsize);
// Sets the count to n (new elements are not initialised), growing the block as needed. With
// resize the capacity is also set: 0 frees the block; a growing n gets at least 1.5 × the count.
VYN_API void TBSetCount(TabHdr** pth, int n, int elsize, int resize);
// Sets the capacity to exactly num slots (the count is cut to fit; 0 frees the block). Nothing
// changes when the count already equals num. Returns 1, or 0 when no block remains.
VYN_API int TBMakeSize(TabHdr** pth, int num, int elsize);
// Replaces the contents by num elements copied from el, in a block of exactly num slots unless
// the count already is num. Returns as TBInsertAt.
VYN_API int TBCopy(TabHdr** pth, int num, const void* el, int elsize);
// Frees *p when it is not null and sets it to null.
VYN_API void zfree(void** p);

namespace VynSDK::Util {

// Thrown by Tab's checked element access for an index outside [0, Count()).
class VYN_API TabOutOfRangeException : public OutOfRangeException {
 public:
  TabOutOfRangeException(const MCHAR* message) : OutOfRangeException(message) {}
  TabOutOfRangeException(const TabOutOfRangeException& other) : OutOfRangeException(other) {}
  ~TabOutOfRangeException() override {}
  // The message, or "VynSDK::Util::TabOutOfRangeException" when there is none.
  const MCHAR* What() const override {
    return message ? message : u"VynSDK::Util::TabOutOfRangeException";
  }
};

}  // namespace VynSDK::Util

template <class T>
class Tab : public VynHeapOperators {
  static_assert(std::is_trivially_copyable_v<T>, "Tab elements are moved bitwise");

 public:
  Tab() = default;
  // A copy holds its own block of exactly the other's count.
  Tab(const Tab& other) { *this = other; }
  Tab& operator=(const Tab& other) {
    if (this != &other) TBCopy(&th, other.Count(), other.Data(), sizeof(T));
    return *this;
  }
  // Moving hands the block over; the source is left empty.
  Tab(Tab&& other) noexcept : th(other.th) { other.th = nullptr; }
  Tab& operator=(Tab&& other) noexcept {
    if (this != &other) {
      zfree(reinterpret_cast<void**>(&th));
      th = other.th;
      other.th = nullptr;
    }
    return *this;
  }
  virtual ~Tab() { zfree(reinterpret_cast<void**>(&th)); }

  // The number of elements, 0 without block.
  int Count() const { return th ? th->count : 0; }
  // The number of slots allocated, 0 without block.
  int Capacity() const { return th ? th->alloc : 0; }

  // Element i; throws TabOutOfRangeException outside [0, Count()).
  T& operator[](INT_PTR i) {
    Check(i, u"Invalid index passed into a Vyn SDK Tab::operator[]");
    return Data()[i];
  }
  const T& operator[](INT_PTR i) const {
    Check(i, u"Invalid index passed into a Vyn SDK Tab::operator[]");
    return Data()[i];
  }
  // The address of element i; throws TabOutOfRangeException outside [0, Count()).
  T* Addr(INT_PTR i) {
    Check(i, u"Invalid index passed into a Vyn SDK Tab::Addr(const INT_PTR i)");
    return Data() + i;
  }
  const T* Addr(INT_PTR i) const {
    Check(i, u"Invalid index passed into a Vyn SDK Tab::Addr(const INT_PTR i)");
    return Data() + i;
  }

  // Appends num elements from el with allocExtra slots of head-room when the block grows;
  // returns the index of the first. Appending one element into free room is done in place,
  // with exactly TBInsertAt's result.
  int Append(int num, const T* el, int allocExtra = 0) {
    if (num == 1 && th && th->count < th->alloc) {
      std::memcpy(static_cast<void*>(Data() + th->count), el, sizeof(T));
      return th->count++;
    }
    return TBInsertAt(&th, Count(), num, el, sizeof(T), allocExtra);
  }
  // Inserts num elements from el at position at; returns where they went.
  int Insert(int at, int num, const T* el) { return TBInsertAt(&th, at, num, el, sizeof(T), 0); }
  // Deletes num elements from start; returns the new count.
  int Delete(int start, int num) { return TBDelete(&th, start, num, sizeof(T)); }
  // Sets the count (new elements are not initialised); resize also sets the capacity.
  void SetCount(int n, BOOL resize = TRUE) { TBSetCount(&th, n, sizeof(T), resize); }
  // Empties the array and keeps its block.
  void ZeroCount() { TBSetCount(&th, 0, sizeof(T), FALSE); }
  // Sets the capacity to num slots (the count is cut to fit; 0 frees the block), unless the
  // count already is num. Returns 1, or 0 when no block remains.
  int Resize(int num) { return TBMakeSize(&th, num, sizeof(T)); }
  // Sorts with a qsort-style comparison.
  void Sort(int (*compare)(const void*, const void*)) {
    if (Count() > 1) std::qsort(Data(), Count(), sizeof(T), compare);
  }

  // Unchecked iteration over the elements.
  T* begin() { return Data(); }
  T* end() { return Data() + Count(); }
  const T* begin() const { return Data(); }
  const T* end() const { return Data() + Count(); }

 private:
  T* Data() const {
    return th ? reinterpret_cast<T*>(reinterpret_cast<char*>(th) + sizeof(TabHdr)) : nullptr;
  }
  void Check(INT_PTR i, const MCHAR* message) const {
    if (!th || i < 0 || i >= th->count) throw VynSDK::Util::TabOutOfRangeException(message);
  }

  TabHdr* th = nullptr;
};
