#pragma once
// The operating-system calls of the platform layer, gathered in one table of function pointers.
// Every call the layer makes into the system goes through this table, so a test can make one of
// them fail on demand (the Nth open, a dlopen, a setenv) with a chosen errno and check how the
// layer reports it. The entries start as the C library's own functions.

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/types.h>

#include <cstdio>
#include <ctime>

#include "vynutil/export.h"

namespace win32::sys {

struct SyscallTable {
  // Files.
  int (*open)(const char* path, int flags, mode_t mode);
  int (*close)(int fd);
  ssize_t (*read)(int fd, void* buffer, size_t bytes);
  ssize_t (*write)(int fd, const void* data, size_t bytes);
  off_t (*lseek)(int fd, off_t offset, int whence);
  int (*ftruncate)(int fd, off_t length);
  int (*fsync)(int fd);
  // fcntl with a struct flock argument: F_OFD_SETLK, F_OFD_GETLK and the like.
  int (*fcntlLock)(int fd, int command, struct flock* lock);
  int (*fadvise)(int fd, off_t offset, off_t length, int advice);
  int (*fchmod)(int fd, mode_t mode);
  int (*futimens)(int fd, const struct timespec times[2]);
  int (*stat)(const char* path, struct stat* info);
  int (*lstat)(const char* path, struct stat* info);
  int (*fstat)(int fd, struct stat* info);
  int (*chmod)(const char* path, mode_t mode);
  ssize_t (*lgetxattr)(const char* path, const char* name, void* value, size_t size);
  FILE* (*fopen)(const char* path, const char* mode);
  int (*fclose)(FILE* stream);
  size_t (*fread)(void* buffer, size_t size, size_t count, FILE* stream);
  size_t (*fwrite)(const void* data, size_t size, size_t count, FILE* stream);
  int (*fflush)(FILE* stream);
  int (*fseeko)(FILE* stream, off_t offset, int whence);
  off_t (*ftello)(FILE* stream);
  // Folders and names.
  ssize_t (*readlink)(const char* path, char* buffer, size_t size);
  char* (*getcwd)(char* buffer, size_t size);
  int (*rename)(const char* from, const char* to);
  // rename that fails with EEXIST instead of replacing (renameat2 with RENAME_NOREPLACE); EINVAL
  // on file systems that cannot do it.
  int (*renameNoReplace)(const char* from, const char* to);
  int (*unlink)(const char* path);
  int (*mkdir)(const char* path, mode_t mode);
  int (*rmdir)(const char* path);
  DIR* (*opendir)(const char* path);
  struct dirent* (*readdir)(DIR* folder);
  int (*closedir)(DIR* folder);
  // Shared objects.
  void* (*dlopen)(const char* path, int flags);
  int (*dlclose)(void* handle);
  void* (*dlsym)(void* handle, const char* name);
  // The process environment.
  char* (*getenv)(const char* name);
  int (*setenv)(const char* name, const char* value, int overwrite);
  int (*unsetenv)(const char* name);
};

// The table in use. The layer reads it at each call; tests change entries through
// ScopedSyscalls. Not synchronised: change it only while no other thread calls into the layer.
VYN_API SyscallTable& Syscalls() noexcept;

// The C library's own functions, as the table starts.
VYN_API const SyscallTable& DefaultSyscalls() noexcept;

// Saves the table on construction and puts it back on destruction, so a test can replace
// entries (Syscalls().open = FailingOpen) and be sure they return, also when it fails part-way.
class ScopedSyscalls {
 public:
  ScopedSyscalls() noexcept : saved_(Syscalls()) {}
  ~ScopedSyscalls() { Syscalls() = saved_; }
  ScopedSyscalls(const ScopedSyscalls&) = delete;
  ScopedSyscalls& operator=(const ScopedSyscalls&) = delete;

  SyscallTable& table() noexcept { return Syscalls(); }

 private:
  SyscallTable saved_;
};

}  // namespace win32::sys
