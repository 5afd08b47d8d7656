#pragma once
// A fresh folder under the system's temporary folder, removed with everything in it at the end
// of the scope.

#include <filesystem>
#include <string>

namespace vyn::test {

class TempDir {
 public:
  TempDir();
  ~TempDir();
  TempDir(const TempDir&) = delete;
  TempDir& operator=(const TempDir&) = delete;

  const std::filesystem::path& path() const { return path_; }
  // The path of name inside the folder, as UTF-16 (the library's path type).
  std::u16string File(const std::string& name) const;
  // Writes bytes to name inside the folder and returns its UTF-16 path.
  std::u16string Write(const std::string& name, const std::string& bytes) const;

 private:
  std::filesystem::path path_;
};

}  // namespace vyn::test
