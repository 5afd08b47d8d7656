#pragma once
// An open file of the layer: the object behind a CreateFileW handle, also used directly by the
// calls that open files on their own (CopyFileW, DeleteFileW, MoveFileExW).

#include <memory>
#include <string>

#include "file_sharing.h"
#include "handle_table.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

class FileObject : public KernelObject {
 public:
  FileObject(int fd, unsigned rights, ShareClaim claim)
      : fd_(fd), rights_(rights), claim_(std::move(claim)) {}
  ~FileObject() override;
  FileObject(const FileObject&) = delete;
  FileObject& operator=(const FileObject&) = delete;

  int fd() const { return fd_; }
  bool CanRead() const { return (rights_ & kRightRead) != 0; }
  bool CanWrite() const { return (rights_ & kRightWrite) != 0; }
  // See ShareClaim::DeleteWhenLastCloses.
  void DeleteWhenLastCloses(const std::string& path) { claim_.DeleteWhenLastCloses(path); }

 private:
  int fd_;
  unsigned rights_;
  ShareClaim claim_;
};

// What an open asks for, in the terms of CreateFileW.
struct OpenRequest {
  unsigned rights = 0;          // kRightRead | kRightWrite | kRightDelete
  unsigned share = 0;           // FILE_SHARE_ bits
  unsigned disposition = 0;     // CREATE_NEW ... TRUNCATE_EXISTING
  bool writeThrough = false;
  bool deleteOnClose = false;   // adds kRightDelete
  bool createReadOnly = false;  // a file this open creates gets no write permission
  int advice = 0;               // posix_fadvise advice, 0 for none
};

struct OpenOutcome {
  std::shared_ptr<FileObject> file;  // null on failure
  DWORD error = 0;                   // the Win32 code when file is null
  bool existed = false;              // the file was there before
};

// Opens posixPath by the rules of CreateFileW (see file_handle.h), without registering a handle.
OpenOutcome OpenFileObject(const std::string& posixPath, const OpenRequest& request);

}  // namespace win32::detail
