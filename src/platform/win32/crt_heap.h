#pragma once
// The C runtime's heap services beyond malloc and free, as the Windows runtime provides them:
// in-place resizing, block sizes, heap checks, the new handler and mode, and aligned blocks.
// All of them work on the process heap that malloc and free use.

#include <cstddef>

#include "vynutil/crt_heap_types.h"
#include "vynutil/export.h"

namespace win32 {

// Resizes block in place: returns block when size fits where it lies, else null with errno
// ENOMEM (the block is unchanged). A null block gives null with errno EINVAL. Growing succeeds
// only within the room malloc already gave the block (its usable size).
VYN_API void* _expand(void* block, std::size_t size) noexcept;
// The usable size of a malloc'ed block (at least its requested size); (size_t)-1 with errno
// EINVAL for null.
VYN_API std::size_t _msize(void* block) noexcept;

// The heap is checked by malloc itself on every call: always _HEAPOK.
VYN_API int _heapchk() noexcept;
// Returns free memory at the top of the heap to the system; 0.
VYN_API int _heapmin() noexcept;
// The heap cannot be walked: _HEAPEND for any entry, _HEAPBADPTR for a null entry.
VYN_API int _heapwalk(_HEAPINFO* entry) noexcept;

// The new mode (0 or 1) is kept and reported; malloc itself never calls the new handler, whatever
// the mode. _set_new_mode returns the previous mode, or -1 with errno EINVAL for any other value.
VYN_API int _query_new_mode() noexcept;
VYN_API int _set_new_mode(int mode) noexcept;

// The process-wide new handler (null: none). Setting returns the previous handler.
VYN_API _PNH _query_new_handler() noexcept;
VYN_API _PNH _set_new_handler(_PNH handler) noexcept;
// Calls the new handler for a failed request of size bytes: 1 when a handler is installed and
// asks for a retry (returned nonzero), 0 otherwise. Whatever the handler throws passes through.
VYN_API int _callnewh(std::size_t size);

// Aligned blocks. alignment must be a power of two (else null, errno EINVAL); alignments below
// that of a pointer are raised to it. Failure gives null with errno ENOMEM.
VYN_API void* _aligned_malloc(std::size_t size, std::size_t alignment) noexcept;
// Resizes an aligned block keeping its content (up to the smaller size) and giving the requested
// alignment. A null block allocates; size 0 frees the block and returns null; on failure null is
// returned and the old block is left as it was.
VYN_API void* _aligned_realloc(void* block, std::size_t size, std::size_t alignment) noexcept;
// Releases a block of _aligned_malloc / _aligned_realloc; null accepted.
VYN_API void _aligned_free(void* block) noexcept;

}  // namespace win32
