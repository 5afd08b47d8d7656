// The Tab block functions: every change of a Tab's storage, in whichever module, comes here.

#include <climits>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <new>

#include "vynutil/tab.h"

namespace {

constexpr std::size_t kHeaderSize = sizeof(TabHdr);

char* Elements(TabHdr* th) { return reinterpret_cast<char*>(th) + kHeaderSize; }

// Signed 32-bit arithmetic that wraps as the machine does, without undefined behaviour.
int Wrap(std::int64_t value) { return static_cast<int>(static_cast<std::uint32_t>(value)); }

// 8 + n × elsize, or SIZE_MAX (an impossible request) when that does not fit.
std::size_t BlockBytes(int n, int elsize) {
  std::size_t product = 0;
  std::size_t total = 0;
  if (n < 0 || elsize < 0 ||
      __builtin_mul_overflow(static_cast<std::size_t>(n), static_cast<std::size_t>(elsize),
                             &product) ||
      __builtin_add_overflow(product, kHeaderSize, &total)) {
    return SIZE_MAX;
  }
  return total;
}

// Gives the block n slots (0 frees it). A new block starts with count 0; the caller sets alloc.
// On failure throws std::bad_alloc and leaves *pth as it was.
void ResizeBlock(TabHdr** pth, int n, int elsize) {
  if (n == 0) {
    if (*pth) {
      std::free(*pth);
      *pth = nullptr;
    }
    return;
  }
  const std::size_t bytes = BlockBytes(n, elsize);
  if (!*pth) {
    auto* block = static_cast<TabHdr*>(bytes == SIZE_MAX ? nullptr : std::malloc(bytes));
    if (!block) throw std::bad_alloc();
    block->count = 0;
    *pth = block;
    return;
  }
  auto* block = static_cast<TabHdr*>(bytes == SIZE_MAX ? nullptr : std::realloc(*pth, bytes));
  if (!block) throw std::bad_alloc();
  *pth = block;
}

// Resizes to exactly n slots unless the count already is n, recording the new capacity.
void MakeExactSize(TabHdr** pth, int n, int elsize) {
  if (*pth && (*pth)->count == n) return;
  ResizeBlock(pth, n, elsize);
  if (TabHdr* th = *pth) {
    th->alloc = n;
    if (th->count > n) th->count = n;
  }
}

// The capacity an insertion of num elements into c elements grows to.
int GrownCapacity(const TabHdr* th, int num, int extra) {
  if (!th) {
    const int cap = Wrap(std::int64_t{num} + extra);
    return cap < 0 && extra >= 1 ? INT_MAX : cap;
  }
  const int c = th->count;
  const int need = Wrap(std::int64_t{c} + num);
  int cap = Wrap(std::int64_t{need} + extra);
  if (c != 0 && cap > c) {
    const int grown = Wrap(std::int64_t{c} + c / 2);
    if (grown > cap) cap = grown;
  }
  return cap < 0 && extra >= 1 && need >= 1 ? INT_MAX : cap;
}

// Copies one element; the common element sizes avoid a library call.
void CopyElement(void* to, const void* from, int elsize) {
  switch (elsize) {
    case 4: std::memcpy(to, from, 4); break;
    case 8: std::memcpy(to, from, 8); break;
    default: std::memmove(to, from, static_cast<std::size_t>(elsize));
  }
}

}  // namespace

int TBInsertAt(TabHdr** pth, int at, int num, const void* el, int elsize, int extra) {
  if (num < 1) return at;
  TabHdr* th = *pth;
  const int c = th ? th->count : 0;
  const std::int64_t need = std::int64_t{c} + num;
  if (!th || need > th->alloc) {
    int cap = GrownCapacity(th, num, extra);
    if (cap == 0 && !th) return -1;
    // A negative extra must not leave the elements without room (or free the ones there are).
    if (cap < need) {
      if (need > INT_MAX) throw std::bad_alloc();
      cap = static_cast<int>(need);
    }
    ResizeBlock(pth, cap, elsize);
    th = *pth;
    th->alloc = cap;
  }
  int p = at < 0 ? 0 : at;
  if (p > c) p = c;
  char* elements = Elements(th);
  const std::size_t size = static_cast<std::size_t>(elsize);
  if (p < c) {
    std::memmove(elements + (static_cast<std::size_t>(p) + num) * size,
                 elements + static_cast<std::size_t>(p) * size,
                 static_cast<std::size_t>(c - p) * size);
  }
  if (num == 1) {
    CopyElement(elements + static_cast<std::size_t>(p) * size, el, elsize);
  } else {
    std::memmove(elements + static_cast<std::size_t>(p) * size, el,
                 static_cast<std::size_t>(num) * size);
  }
  th->count = static_cast<int>(need);
  return p;
}

int TBDelete(TabHdr** pth, int starting, int num, int elsize) {
  TabHdr* th = *pth;
  if (!th) return 0;
  // A negative start names no element: nothing is deleted.
  if (starting < 0 || starting >= th->count || num < 1) return th->count;
  if (std::int64_t{starting} + num > th->count) {
    th->count = starting;
    return starting;
  }
  const std::size_t size = static_cast<std::size_t>(elsize);
  char* elements = Elements(th);
  std::memmove(elements + static_cast<std::size_t>(starting) * size,
               elements + (static_cast<std::size_t>(starting) + num) * size,
               static_cast<std::size_t>(th->count - starting - num) * size);
  th->count -= num;
  return th->count;
}

void TBSetCount(TabHdr** pth, int n, int elsize, int resize) {
  if (resize) {
    TabHdr* th = *pth;
    if (th && n != 0 && th->alloc == n) {
      th->count = n;
      return;
    }
    int target = 0;
    if (n != 0) {
      const int c = th ? th->count : 0;
      target = n;
      if (c != 0 && n > c) {
        const int grown = Wrap(std::int64_t{c} + c / 2);
        if (grown > target) target = grown;
      }
    }
    MakeExactSize(pth, target, elsize);
  }
  TabHdr* th = *pth;
  if (n <= 0) {
    if (th) th->count = 0;
    return;
  }
  if (th && th->alloc >= n) {
    th->count = n;
    return;
  }
  MakeExactSize(pth, n, elsize);
  (*pth)->count = n;
}

int TBMakeSize(TabHdr** pth, int num, int elsize) {
  MakeExactSize(pth, num, elsize);
  return *pth ? 1 : 0;
}

int TBCopy(TabHdr** pth, int num, const void* el, int elsize) {
  MakeExactSize(pth, num, elsize);
  if (*pth) (*pth)->count = 0;
  return TBInsertAt(pth, 0, num, el, elsize, 0);
}

void zfree(void** p) {
  if (*p) {
    std::free(*p);
    *p = nullptr;
  }
}
