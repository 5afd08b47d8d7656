#pragma once
// The C runtime's heap and debug-heap types, with the names and layouts the plug-in SDK's heap
// variables are declared with (see vynutil/heap.h). Only the types: the functions behind them are
// reached through the VYN_ heap variables.

#include <cstddef>

#include "vynutil/wintypes.h"

// A new handler: called with the size of a failed allocation; a nonzero result asks the
// allocator to try again, zero gives up.
using _PNH = int (*)(std::size_t);

// One heap entry as _heapwalk reports it.
struct _HEAPINFO {
  int* _pentry;
  std::size_t _size;
  int _useflag;
};

// Results of _heapchk and _heapwalk.
inline constexpr int _HEAPEMPTY = -1;
inline constexpr int _HEAPOK = -2;
inline constexpr int _HEAPBADBEGIN = -3;
inline constexpr int _HEAPBADNODE = -4;
inline constexpr int _HEAPEND = -5;
inline constexpr int _HEAPBADPTR = -6;

// Debug-heap types. The library's debug heap keeps no statistics; the types exist so that code
// written for the debug runtime still compiles and links.
using _HFILE = void*;
using _CRT_REPORT_HOOK = int (*)(int reportType, char* message, int* returnValue);
using _CRT_ALLOC_HOOK = int (*)(int allocType, void* userData, std::size_t size, int blockType,
                                LONG requestNumber, const unsigned char* fileName, int lineNumber);
using _CRT_DUMP_CLIENT = void (*)(void* userPortion, std::size_t blockSize);

struct _CrtMemBlockHeader;
struct _CrtMemState {
  _CrtMemBlockHeader* pBlockHeader;
  std::size_t lCounts[5];
  std::size_t lSizes[5];
  std::size_t lHighWaterCount;
  std::size_t lTotalCount;
};
