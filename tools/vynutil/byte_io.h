#pragma once
// Whole files as bytes. The path "-" means standard input or standard output.

#include <string>
#include <string_view>

namespace vyntool {

// Every byte of path. Throws an InputError "cannot read 'path': <reason>" when it cannot.
std::string ReadAllBytes(const std::string& path);

// Writes bytes to path (created or truncated) and makes sure they arrived. Throws an OutputError
// "cannot write 'path': <reason>" when they did not.
void WriteAllBytes(const std::string& path, std::string_view bytes);

}  // namespace vyntool
