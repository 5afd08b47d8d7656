#pragma once
// The one heap shared by the host, its plug-ins and this library. Every block handed across a
// module boundary comes from the process's C runtime heap (malloc and free), so a block obtained
// through any function or variable here may be released through any other of the matching kind,
// or by a plain free() in another module. Blocks from the aligned_* functions are the exception:
// release them with aligned_free / VYN_aligned_free only.
//
// Allocation comes in three behaviours:
// - throwing: malloc; when that fails, the installed new handler (VYN_set_new_handler) is called
//   and, while it returns nonzero, the allocation is retried. Without a handler, or once it
//   returns 0, a request of SIZE_MAX bytes throws std::bad_array_new_length and any other
//   std::bad_alloc (what() "bad allocation"). Never returns null; a size of 0 gives a unique block.
// - non-throwing: the same, but null instead of any exception.
// - release: free; null is accepted and does nothing.

#include <cstddef>
#include <new>

#include "vynutil/crt_heap_types.h"
#include "vynutil/export.h"
#include "vynutil/wintypes.h"

// The empty base of every exported SDK class: its class-level operators put objects on the shared
// heap, so an object created in one module can be deleted in another. No data, no virtual
// functions; as a base it takes no room.
class VYN_API VynHeapOperators {
 public:
  // Throwing allocation. The extra arguments (a tag, or the debug runtime's block type, file and
  // line) are accepted for source compatibility and ignored.
  static void* operator new(std::size_t size);
  static void* operator new(std::size_t size, ULONG tag);
  static void* operator new(std::size_t size, int blockType, const char* file, int line);
  static void* operator new(std::size_t size, const char* file, int line);
  // Non-throwing allocation: null on failure.
  static void* operator new(std::size_t size, const std::nothrow_t&) noexcept;
  static void* operator new(std::size_t size, const std::nothrow_t&, ULONG tag) noexcept;
  static void* operator new(std::size_t size, const std::nothrow_t&, const char* file,
                            int line) noexcept;
  // Placement: returns where and touches nothing.
  static void* operator new(std::size_t size, void* where) noexcept;

  static void* operator new[](std::size_t size);
  static void* operator new[](std::size_t size, ULONG tag);
  static void* operator new[](std::size_t size, int blockType, const char* file, int line);
  static void* operator new[](std::size_t size, const char* file, int line);
  static void* operator new[](std::size_t size, const std::nothrow_t&) noexcept;
  static void* operator new[](std::size_t size, const std::nothrow_t&, ULONG tag) noexcept;
  static void* operator new[](std::size_t size, const std::nothrow_t&, const char* file,
                              int line) noexcept;

  // Over-aligned classes (alignas larger than the allocator's 16 bytes) get blocks of their
  // alignment, with the same throwing / non-throwing behaviour. These blocks are free()-able too.
  static void* operator new(std::size_t size, std::align_val_t alignment);
  static void* operator new(std::size_t size, std::align_val_t alignment,
                            const std::nothrow_t&) noexcept;
  static void* operator new[](std::size_t size, std::align_val_t alignment);
  static void* operator new[](std::size_t size, std::align_val_t alignment,
                              const std::nothrow_t&) noexcept;

  // Release, for every allocation form above (the extra arguments are ignored).
  static void operator delete(void* block) noexcept;
  static void operator delete(void* block, ULONG tag) noexcept;
  static void operator delete(void* block, int blockType, const char* file, int line) noexcept;
  static void operator delete(void* block, const char* file, int line) noexcept;
  static void operator delete(void* block, const std::nothrow_t&) noexcept;
  static void operator delete(void* block, const std::nothrow_t&, ULONG tag) noexcept;
  static void operator delete(void* block, const std::nothrow_t&, const char* file,
                              int line) noexcept;
  static void operator delete(void* block, std::align_val_t alignment) noexcept;
  static void operator delete(void* block, std::align_val_t alignment,
                              const std::nothrow_t&) noexcept;
  // Placement delete: does nothing.
  static void operator delete(void* block, void* where) noexcept;

  static void operator delete[](void* block) noexcept;
  static void operator delete[](void* block, ULONG tag) noexcept;
  static void operator delete[](void* block, int blockType, const char* file, int line) noexcept;
  static void operator delete[](void* block, const char* file, int line) noexcept;
  static void operator delete[](void* block, const std::nothrow_t&) noexcept;
  static void operator delete[](void* block, const std::nothrow_t&, ULONG tag) noexcept;
  static void operator delete[](void* block, const std::nothrow_t&, const char* file,
                                int line) noexcept;
  static void operator delete[](void* block, std::align_val_t alignment) noexcept;
  static void operator delete[](void* block, std::align_val_t alignment,
                                const std::nothrow_t&) noexcept;

  // Aligned blocks with the runtime's _aligned_malloc rules: alignment must be a power of two
  // (else null, errno EINVAL); failure gives null, never an exception. aligned_realloc keeps the
  // content and the alignment; with size 0 it frees the block and returns null; on failure the
  // old block is left as it was. Release only with aligned_free (null accepted).
  static void* aligned_malloc(std::size_t size, std::size_t alignment) noexcept;
  static void* aligned_realloc(void* block, std::size_t size, std::size_t alignment) noexcept;
  static void aligned_free(void* block) noexcept;
};

// Untyped blocks: throwing allocation and release.
VYN_API void* VYN_new(std::size_t size);
VYN_API void VYN_delete(void* block) noexcept;
VYN_API void* VYN_new_array(std::size_t size);
VYN_API void VYN_delete_array(void* block) noexcept;

// As VynHeapOperators::aligned_malloc, aligned_realloc and aligned_free.
VYN_API void* VYN_aligned_malloc(std::size_t size, std::size_t alignment) noexcept;
VYN_API void* VYN_aligned_realloc(void* block, std::size_t size, std::size_t alignment) noexcept;
VYN_API void VYN_aligned_free(void* block) noexcept;

// malloc without the new handler and without exceptions: null on failure.
VYN_API void* UtilAllocateMemory(std::size_t size) noexcept;
// free; null accepted.
VYN_API void UtilDeallocateMemory(void* block) noexcept;

// Stops in the debugger when one is attached; does nothing otherwise.
VYN_API void VYN_CrtDbgBreak() noexcept;

// Throws std::bad_alloc (what() "bad allocation"): the library's way of reporting exhausted
// memory from code that has no allocation of its own to fail. Never returns.
[[noreturn]] VYN_API void UtilOutOfMemoryException();

// The shared heap as function-pointer variables, for modules that reach it without linking
// against the functions above. Each points to the runtime function of the same suffix; all are
// set before any code of the host runs and the library never changes them. The debug-heap entries
// have their release-build meaning: they allocate from the normal heap (their debug arguments are
// ignored), report every block as valid and keep no statistics.
extern "C" {
VYN_API extern void* (*VYN_malloc)(std::size_t size);
VYN_API extern void* (*VYN_calloc)(std::size_t count, std::size_t size);
VYN_API extern void* (*VYN_realloc)(void* block, std::size_t size);
VYN_API extern void (*VYN_free)(void* block);
// Resizes a block in place only: the block, or null (errno ENOMEM) when it cannot stay put.
VYN_API extern void* (*VYN_expand)(void* block, std::size_t size);
// The usable size of a block (at least the size asked for).
VYN_API extern std::size_t (*VYN_msize)(void* block);
VYN_API extern int (*VYN_heapchk)();
VYN_API extern int (*VYN_heapmin)();
VYN_API extern int (*VYN_heapwalk)(_HEAPINFO* entry);
VYN_API extern int (*VYN_query_new_mode)();
VYN_API extern int (*VYN_set_new_mode)(int mode);
VYN_API extern _PNH (*VYN_query_new_handler)();
// Installs the handler the throwing allocations call on failure; returns the previous one.
VYN_API extern _PNH (*VYN_set_new_handler)(_PNH handler);

VYN_API extern void* (*VYN_malloc_dbg)(std::size_t size, int blockType, const char* file,
                                       int line);
VYN_API extern void (*VYN_free_dbg)(void* block, int blockType);
VYN_API extern void* (*VYN_calloc_dbg)(std::size_t count, std::size_t size, int blockType,
                                       const char* file, int line);
VYN_API extern void* (*VYN_realloc_dbg)(void* block, std::size_t size, int blockType,
                                        const char* file, int line);
VYN_API extern void* (*VYN_expand_dbg)(void* block, std::size_t size, int blockType,
                                       const char* file, int line);
VYN_API extern std::size_t (*VYN_msize_dbg)(void* block, int blockType);
VYN_API extern int (*VYN_CrtCheckMemory)();
VYN_API extern int (*VYN_CrtIsMemoryBlock)(const void* block, unsigned int size,
                                           LONG* requestNumber, char** file, int* line);
VYN_API extern _CRT_REPORT_HOOK (*VYN_CrtSetReportHook)(_CRT_REPORT_HOOK hook);
VYN_API extern int (*VYN_CrtSetReportMode)(int reportType, int reportMode);
VYN_API extern _HFILE (*VYN_CrtSetReportFile)(int reportType, _HFILE file);
VYN_API extern int (*VYN_CrtDbgReport)(int reportType, const char* file, int line,
                                       const char* module, const char* format, ...);
VYN_API extern int (*VYN_CrtDbgReportW)(int reportType, const MCHAR* file, int line,
                                        const MCHAR* module, const MCHAR* format, ...);
VYN_API extern LONG (*VYN_CrtSetBreakAlloc)(LONG requestNumber);
VYN_API extern _CRT_ALLOC_HOOK (*VYN_CrtSetAllocHook)(_CRT_ALLOC_HOOK hook);
VYN_API extern int (*VYN_CrtSetDbgFlag)(int flags);
VYN_API extern _CRT_DUMP_CLIENT (*VYN_CrtSetDumpClient)(_CRT_DUMP_CLIENT dumper);
VYN_API extern int (*VYN_CrtMemDifference)(_CrtMemState* difference, const _CrtMemState* before,
                                           const _CrtMemState* after);
VYN_API extern int (*VYN_CrtDumpMemoryLeaks)();
VYN_API extern void (*VYN_CrtDoForAllClientObjects)(void (*visit)(void* block, void* context),
                                                    void* context);
VYN_API extern void (*VYN_CrtMemCheckpoint)(_CrtMemState* state);
VYN_API extern void (*VYN_CrtMemDumpAllObjectsSince)(const _CrtMemState* state);
VYN_API extern void (*VYN_CrtMemDumpStatistics)(const _CrtMemState* state);
// Each points to its own 32-bit variable, 0 and never changed.
VYN_API extern LONG* VYN_crtAssertBusy;
VYN_API extern LONG* VYN_crtBreakAlloc;
VYN_API extern int* VYN_crtDbgFlag;
}
