// Reading and writing whole files through the C runtime.

#include "byte_io.h"

#include <cerrno>
#include <cstdio>
#include <cstring>

#include "tool_error.h"

namespace vyntool {
namespace {

bool IsStandardStream(const std::string& path) { return path == "-"; }

std::string DisplayName(const std::string& path, const char* streamName) {
  return IsStandardStream(path) ? std::string(streamName) : path;
}

std::string Reason(int error) { return std::strerror(error != 0 ? error : EIO); }

// Reads the rest of file; returns the errno of a failed read, 0 on success.
int ReadRest(std::FILE* file, std::string& bytes) {
  char chunk[64 * 1024];
  for (;;) {
    errno = 0;
    const std::size_t got = std::fread(chunk, 1, sizeof chunk, file);
    bytes.append(chunk, got);
    if (got < sizeof chunk) return std::ferror(file) ? (errno != 0 ? errno : EIO) : 0;
  }
}

}  // namespace

std::string ReadAllBytes(const std::string& path) {
  const std::string name = DisplayName(path, "standard input");
  std::FILE* file = IsStandardStream(path) ? stdin : std::fopen(path.c_str(), "rb");
  if (!file) throw InputError("cannot read " + Quoted(name) + ": " + Reason(errno));
  std::string bytes;
  const int error = ReadRest(file, bytes);
  if (file != stdin) std::fclose(file);
  if (error != 0) throw InputError("cannot read " + Quoted(name) + ": " + Reason(error));
  return bytes;
}

void WriteAllBytes(const std::string& path, std::string_view bytes) {
  const std::string name = DisplayName(path, "standard output");
  std::FILE* file = IsStandardStream(path) ? stdout : std::fopen(path.c_str(), "wb");
  if (!file) throw OutputError("cannot write " + Quoted(name) + ": " + Reason(errno));
  errno = 0;
  std::fwrite(bytes.data(), 1, bytes.size(), file);
  int error = std::ferror(file) ? errno : 0;
  if (std::fflush(file) != 0 && error == 0) error = errno;
  if (std::ferror(file) && error == 0) error = EIO;
  if (file != stdout && std::fclose(file) != 0 && error == 0) error = errno;
  if (error != 0) throw OutputError("cannot write " + Quoted(name) + ": " + Reason(error));
}

}  // namespace vyntool
