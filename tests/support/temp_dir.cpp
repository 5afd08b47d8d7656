#include "support/temp_dir.h"

#include <cstdlib>
#include <fstream>
#include <stdexcept>

namespace vyn::test {

TempDir::TempDir() {
  std::string pattern = (std::filesystem::temp_directory_path() / "vyn-test-XXXXXX").string();
  if (!mkdtemp(pattern.data())) throw std::runtime_error("mkdtemp failed");
  path_ = pattern;
}

TempDir::~TempDir() {
  std::error_code ignored;
  std::filesystem::remove_all(path_, ignored);
}

std::u16string TempDir::File(const std::string& name) const {
  return (path_ / name).u16string();
}

std::u16string TempDir::Write(const std::string& name, const std::string& bytes) const {
  std::ofstream(path_ / name, std::ios::binary).write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
  return File(name);
}

}  // namespace vyn::test
