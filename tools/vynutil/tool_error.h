#pragma once
// Failures the tool reports: main prints "vynutil: <message>" (and the hint, if any) on standard
// error and exits with the error's status.

#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

namespace vyntool {

inline constexpr int kExitFailure = 1;  // the work itself failed (output not written, conversion failed)
inline constexpr int kExitUsage = 2;    // bad command line or unusable input

class ToolError : public std::runtime_error {
 public:
  ToolError(int exitCode, const std::string& message, std::string hint = {})
      : std::runtime_error(message), m_exitCode(exitCode), m_hint(std::move(hint)) {}
  int ExitCode() const noexcept { return m_exitCode; }
  // A line telling what to do instead, or empty.
  const std::string& Hint() const noexcept { return m_hint; }

 private:
  int m_exitCode;
  std::string m_hint;
};

// A bad command line: exit 2, with a hint to the help of `command` (the tool's own when empty).
ToolError UsageError(std::string_view message, std::string_view command = {});
// Input the tool cannot use (an unreadable file): exit 2.
ToolError InputError(std::string_view message);
// Output the tool could not write: exit 1.
ToolError OutputError(std::string_view message);

// "'text'" as the messages quote file names and arguments.
std::string Quoted(std::string_view text);

}  // namespace vyntool
