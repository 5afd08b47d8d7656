#pragma once
// The C runtime's stream transfers, 64-bit stream positioning and file-size change, with its
// errno results. Calls that may write (fwrite, fflush, fclose, seeks, size changes) never end the
// process on its file-size limit: they fail with ENOSPC instead, as a full disk does.

#include <cstdio>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

using errno_t = int;

// fread, fwrite, fflush and fclose of the runtime, with EFBIG and EDQUOT reported as ENOSPC.
VYN_API std::size_t fread(void* buffer, std::size_t size, std::size_t count, FILE* stream);
VYN_API std::size_t fwrite(const void* data, std::size_t size, std::size_t count, FILE* stream);
VYN_API int fflush(FILE* stream);
VYN_API int fclose(FILE* stream);

// Moves the stream's position (origin SEEK_SET, SEEK_CUR or SEEK_END) and clears its end-of-file
// indicator. 0, or -1 with errno: EINVAL for a null stream, another origin or a position before
// the start, otherwise the errno of the failed seek.
VYN_API int _fseeki64(FILE* stream, LONGLONG offset, int origin);
// The stream's position, or -1 with errno (EINVAL for a null stream).
VYN_API LONGLONG _ftelli64(FILE* stream);
// The descriptor of a stream (-1 with EINVAL for null).
VYN_API int _fileno(FILE* stream);
// Makes the file of descriptor fd size bytes long, cutting it or adding zeros. Returns 0 or the
// error, which also goes to errno: EINVAL for a negative size, EBADF for a descriptor that is not
// open or not open for writing, ENOSPC when the device, a quota or the process's file-size limit
// stops it (never SIGXFSZ), otherwise the errno of the failed call.
VYN_API errno_t _chsize_s(int fd, LONGLONG size);

}  // namespace win32
