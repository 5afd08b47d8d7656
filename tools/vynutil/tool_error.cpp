// Construction of the tool's error reports.

#include "tool_error.h"

namespace vyntool {

ToolError UsageError(std::string_view message, std::string_view command) {
  std::string help = command.empty() ? "vynutil --help" : "vynutil " + std::string(command) + " --help";
  return ToolError(kExitUsage, std::string(message), "Try '" + help + "' for more information.");
}

ToolError InputError(std::string_view message) { return ToolError(kExitUsage, std::string(message)); }

ToolError OutputError(std::string_view message) { return ToolError(kExitFailure, std::string(message)); }

std::string Quoted(std::string_view text) {
  std::string quoted;
  quoted.reserve(text.size() + 2);
  quoted.append(1, '\'').append(text).append(1, '\'');
  return quoted;
}

}  // namespace vyntool
