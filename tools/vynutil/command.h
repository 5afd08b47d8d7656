#pragma once
// The subcommands of the vynutil tool. Each one lives in its own command_<name>.cpp and is listed
// once in commands.cpp; main.cpp finds it there by name and hands it the rest of the command line.
// A command with verbs of its own ("text detect", "ini get") is one entry whose run function
// reads the verb first and passes the remaining arguments on.

#include <span>
#include <string_view>

namespace vyntool {

// The arguments after the subcommand's name.
using Arguments = std::span<char* const>;

struct Command {
  std::string_view name;     // as typed after "vynutil"
  std::string_view summary;  // one line for "vynutil --help"
  // Runs the command and returns the exit status; throws ToolError for failures it reports.
  int (*run)(Arguments args);
};

// Every command, in the order "vynutil --help" lists them.
std::span<const Command> Commands();

// The commands themselves.
int RunConvert(Arguments args);
int RunText(Arguments args);
int RunIni(Arguments args);

}  // namespace vyntool
