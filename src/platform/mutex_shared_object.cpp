// Joining and leaving the shared-memory object of a named mutex (protocol in the header).

#include "mutex_shared_object.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <utility>

#include "mutex_names.h"
#include "syscalls.h"
#include "win32/errno_map.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {

constexpr off_t kUsersByte = 0;
constexpr off_t kSetupByte = 1;

// Sets an open-file-description lock on one byte (F_RDLCK, F_WRLCK or F_UNLCK). 0 or an errno.
int LockByte(int fd, short type, off_t byte, bool wait) {
  struct flock lock {};
  lock.l_type = type;
  lock.l_whence = SEEK_SET;
  lock.l_start = byte;
  lock.l_len = 1;
  for (;;) {
    if (sys::Syscalls().fcntlLock(fd, wait ? F_OFD_SETLKW : F_OFD_SETLK, &lock) == 0) return 0;
    if (errno != EINTR) return errno;
  }
}

// Whether an open file description other than fd's holds the users byte. 0 or an errno.
int OtherUsers(int fd, bool* others) {
  struct flock probe {};
  probe.l_type = F_WRLCK;
  probe.l_whence = SEEK_SET;
  probe.l_start = kUsersByte;
  probe.l_len = 1;
  if (sys::Syscalls().fcntlLock(fd, F_OFD_GETLK, &probe) != 0) return errno;
  *others = probe.l_type != F_UNLCK;
  return 0;
}

// Closes the descriptor at the end of the scope unless it was taken over.
class FdCloser {
 public:
  explicit FdCloser(int fd) : fd_(fd) {}
  ~FdCloser() {
    if (fd_ >= 0) sys::Syscalls().close(fd_);
  }
  FdCloser(const FdCloser&) = delete;
  FdCloser& operator=(const FdCloser&) = delete;
  int release() { return std::exchange(fd_, -1); }

 private:
  int fd_;
};

DWORD Failure(int error) { return ErrorFromErrno(error); }

}  // namespace

DWORD SharedMutexObject::Join(const std::string& fileName, Mode mode, bool lockIfCreated,
                              std::unique_ptr<SharedMutexObject>* joined, bool* created) {
  const sys::SyscallTable& calls = sys::Syscalls();
  const std::string path = std::string(kSharedMemoryFolder) + fileName;
  const bool create = mode == Mode::kOpenOrCreate;
  const int flags = O_RDWR | O_CLOEXEC | O_NOFOLLOW | (create ? O_CREAT : 0);
  for (;;) {
    const int fd = calls.open(path.c_str(), flags, S_IRUSR | S_IWUSR);
    if (fd < 0) {
      if (errno == ENOENT) return create ? ERROR_PATH_NOT_FOUND : ERROR_FILE_NOT_FOUND;
      return Failure(errno);
    }
    FdCloser closer(fd);
    if (const int error = LockByte(fd, F_WRLCK, kSetupByte, true)) return Failure(error);
    struct stat info {};
    if (calls.fstat(fd, &info) != 0) return Failure(errno);
    if (info.st_nlink == 0) continue;  // removed while this process waited: a new one is due
    // Only the user's own objects: another user may not plant one under this user's names.
    if (info.st_uid != geteuid()) return ERROR_ACCESS_DENIED;
    bool others = false;
    if (const int error = OtherUsers(fd, &others)) return Failure(error);
    if (!others && !create) {
      // Left by a process that died; as a Win32 object it ended with that process.
      calls.unlink(path.c_str());
      return ERROR_FILE_NOT_FOUND;
    }
    if (others && info.st_size < static_cast<off_t>(sizeof(MutexState))) return ERROR_INVALID_HANDLE;
    if (!others && calls.ftruncate(fd, sizeof(MutexState)) != 0) return Failure(errno);

    void* memory = mmap(nullptr, sizeof(MutexState), PROT_READ | PROT_WRITE, MAP_SHARED, fd, 0);
    if (memory == MAP_FAILED) return Failure(errno);
    auto* state = static_cast<MutexState*>(memory);
    int error = 0;
    if (!others) {
      std::memset(state, 0, sizeof(MutexState));
      error = InitMutexState(state, true);
    }
    if (error == 0) error = LockByte(fd, F_RDLCK, kUsersByte, false);
    if (error != 0) {
      munmap(memory, sizeof(MutexState));
      return Failure(error);
    }
    // Nothing can fail from here on, so a mutex owned by this thread is never unmapped again.
    if (!others && lockIfCreated) WaitForMutexState(state, 0);
    LockByte(fd, F_UNLCK, kSetupByte, false);
    *created = !others;
    joined->reset(new SharedMutexObject(path, closer.release(), state, getpid()));
    return ERROR_SUCCESS;
  }
}

SharedMutexObject::~SharedMutexObject() {
  munmap(state_, sizeof(MutexState));
  RemoveIfUnused();
  sys::Syscalls().close(fd_);
}

void SharedMutexObject::RemoveIfUnused() {
  if (getpid() != joinedBy_ || LockByte(fd_, F_WRLCK, kSetupByte, true) != 0) return;
  const sys::SyscallTable& calls = sys::Syscalls();
  struct stat info {};
  bool others = true;
  // A file already unlinked (by this process at exit) may meanwhile name another object.
  if (calls.fstat(fd_, &info) == 0 && info.st_nlink > 0 && OtherUsers(fd_, &others) == 0 && !others) {
    calls.unlink(path_.c_str());
  }
  LockByte(fd_, F_UNLCK, kSetupByte, false);
}

}  // namespace win32::detail
