// The exported heap variables. All are constant-initialised, so they hold their values from the
// moment the library is loaded, before any static constructor or the host runs.

#include <cstdlib>

#include "vynutil/heap.h"
#include "win32/crt_heap.h"

namespace {

// The debug-heap entries in their release-build form: normal heap, debug arguments ignored.
void* MallocDbg(std::size_t size, int, const char*, int) { return UtilAllocateMemory(size); }
void FreeDbg(void* block, int) { UtilDeallocateMemory(block); }
void* CallocDbg(std::size_t count, std::size_t size, int, const char*, int) {
  return std::calloc(count, size);
}
void* ReallocDbg(void* block, std::size_t size, int, const char*, int) {
  return std::realloc(block, size);
}
void* ExpandDbg(void* block, std::size_t size, int, const char*, int) {
  return win32::_expand(block, size);
}
std::size_t MsizeDbg(void* block, int) { return win32::_msize(block); }

// Every block is valid; nothing is tracked, reported or dumped.
int CheckMemory() { return TRUE; }
int IsMemoryBlock(const void*, unsigned int, LONG*, char**, int*) { return TRUE; }
_CRT_REPORT_HOOK SetReportHook(_CRT_REPORT_HOOK) { return nullptr; }
int SetReportMode(int, int) { return 0; }
_HFILE SetReportFile(int, _HFILE) { return nullptr; }
int DbgReport(int, const char*, int, const char*, const char*, ...) { return 0; }
int DbgReportW(int, const MCHAR*, int, const MCHAR*, const MCHAR*, ...) { return 0; }
LONG SetBreakAlloc(LONG) { return 0; }
_CRT_ALLOC_HOOK SetAllocHook(_CRT_ALLOC_HOOK) { return nullptr; }
int SetDbgFlag(int) { return 0; }
_CRT_DUMP_CLIENT SetDumpClient(_CRT_DUMP_CLIENT) { return nullptr; }
int MemDifference(_CrtMemState*, const _CrtMemState*, const _CrtMemState*) { return 0; }
int DumpMemoryLeaks() { return 0; }
void DoForAllClientObjects(void (*)(void*, void*), void*) {}
void MemCheckpoint(_CrtMemState*) {}
void MemDumpAllObjectsSince(const _CrtMemState*) {}
void MemDumpStatistics(const _CrtMemState*) {}

LONG g_crtAssertBusy = 0;
LONG g_crtBreakAlloc = 0;
int g_crtDbgFlag = 0;

}  // namespace

extern "C" {
void* (*VYN_malloc)(std::size_t) = std::malloc;
void* (*VYN_calloc)(std::size_t, std::size_t) = std::calloc;
void* (*VYN_realloc)(void*, std::size_t) = std::realloc;
void (*VYN_free)(void*) = std::free;
void* (*VYN_expand)(void*, std::size_t) = win32::_expand;
std::size_t (*VYN_msize)(void*) = win32::_msize;
int (*VYN_heapchk)() = win32::_heapchk;
int (*VYN_heapmin)() = win32::_heapmin;
int (*VYN_heapwalk)(_HEAPINFO*) = win32::_heapwalk;
int (*VYN_query_new_mode)() = win32::_query_new_mode;
int (*VYN_set_new_mode)(int) = win32::_set_new_mode;
_PNH (*VYN_query_new_handler)() = win32::_query_new_handler;
_PNH (*VYN_set_new_handler)(_PNH) = win32::_set_new_handler;

void* (*VYN_malloc_dbg)(std::size_t, int, const char*, int) = MallocDbg;
void (*VYN_free_dbg)(void*, int) = FreeDbg;
void* (*VYN_calloc_dbg)(std::size_t, std::size_t, int, const char*, int) = CallocDbg;
void* (*VYN_realloc_dbg)(void*, std::size_t, int, const char*, int) = ReallocDbg;
void* (*VYN_expand_dbg)(void*, std::size_t, int, const char*, int) = ExpandDbg;
std::size_t (*VYN_msize_dbg)(void*, int) = MsizeDbg;
int (*VYN_CrtCheckMemory)() = CheckMemory;
int (*VYN_CrtIsMemoryBlock)(const void*, unsigned int, LONG*, char**, int*) = IsMemoryBlock;
_CRT_REPORT_HOOK (*VYN_CrtSetReportHook)(_CRT_REPORT_HOOK) = SetReportHook;
int (*VYN_CrtSetReportMode)(int, int) = SetReportMode;
_HFILE (*VYN_CrtSetReportFile)(int, _HFILE) = SetReportFile;
int (*VYN_CrtDbgReport)(int, const char*, int, const char*, const char*, ...) = DbgReport;
int (*VYN_CrtDbgReportW)(int, const MCHAR*, int, const MCHAR*, const MCHAR*, ...) = DbgReportW;
LONG (*VYN_CrtSetBreakAlloc)(LONG) = SetBreakAlloc;
_CRT_ALLOC_HOOK (*VYN_CrtSetAllocHook)(_CRT_ALLOC_HOOK) = SetAllocHook;
int (*VYN_CrtSetDbgFlag)(int) = SetDbgFlag;
_CRT_DUMP_CLIENT (*VYN_CrtSetDumpClient)(_CRT_DUMP_CLIENT) = SetDumpClient;
int (*VYN_CrtMemDifference)(_CrtMemState*, const _CrtMemState*, const _CrtMemState*) =
    MemDifference;
int (*VYN_CrtDumpMemoryLeaks)() = DumpMemoryLeaks;
void (*VYN_CrtDoForAllClientObjects)(void (*)(void*, void*), void*) = DoForAllClientObjects;
void (*VYN_CrtMemCheckpoint)(_CrtMemState*) = MemCheckpoint;
void (*VYN_CrtMemDumpAllObjectsSince)(const _CrtMemState*) = MemDumpAllObjectsSince;
void (*VYN_CrtMemDumpStatistics)(const _CrtMemState*) = MemDumpStatistics;
LONG* VYN_crtAssertBusy = &g_crtAssertBusy;
LONG* VYN_crtBreakAlloc = &g_crtBreakAlloc;
int* VYN_crtDbgFlag = &g_crtDbgFlag;
}
