// The system-call table, filled with the C library's functions.

#include "syscalls.h"

#include <dlfcn.h>
#include <fcntl.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>

namespace win32::sys {

namespace {

// open and fcntl are variadic; the table takes their last argument as a plain one.
int OpenFile(const char* path, int flags, mode_t mode) { return ::open(path, flags, mode); }
int FcntlLock(int fd, int command, struct flock* lock) { return ::fcntl(fd, command, lock); }

// posix_fadvise returns its error instead of setting errno; the table keeps errno's convention.
int Fadvise(int fd, off_t offset, off_t length, int advice) {
  const int error = ::posix_fadvise(fd, offset, length, advice);
  if (error == 0) return 0;
  errno = error;
  return -1;
}

int RenameNoReplace(const char* from, const char* to) {
  return ::renameat2(AT_FDCWD, from, AT_FDCWD, to, RENAME_NOREPLACE);
}

constexpr SyscallTable kDefaults = {
    .open = OpenFile,
    .close = ::close,
    .read = ::read,
    .write = ::write,
    .lseek = ::lseek,
    .ftruncate = ::ftruncate,
    .fsync = ::fsync,
    .fcntlLock = FcntlLock,
    .fadvise = Fadvise,
    .fchmod = ::fchmod,
    .futimens = ::futimens,
    .stat = ::stat,
    .lstat = ::lstat,
    .fstat = ::fstat,
    .chmod = ::chmod,
    .lgetxattr = ::lgetxattr,
    .fopen = std::fopen,
    .fclose = std::fclose,
    .fread = std::fread,
    .fwrite = std::fwrite,
    .fflush = std::fflush,
    .fseeko = ::fseeko,
    .ftello = ::ftello,
    .readlink = ::readlink,
    .getcwd = ::getcwd,
    .rename = std::rename,
    .renameNoReplace = RenameNoReplace,
    .unlink = ::unlink,
    .mkdir = ::mkdir,
    .rmdir = ::rmdir,
    .opendir = ::opendir,
    .readdir = ::readdir,
    .closedir = ::closedir,
    .dlopen = ::dlopen,
    .dlclose = ::dlclose,
    .dlsym = ::dlsym,
    .getenv = std::getenv,
    .setenv = ::setenv,
    .unsetenv = ::unsetenv,
};

SyscallTable g_table = kDefaults;

}  // namespace

SyscallTable& Syscalls() noexcept { return g_table; }

const SyscallTable& DefaultSyscalls() noexcept { return kDefaults; }

}  // namespace win32::sys
