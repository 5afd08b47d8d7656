// The table of the tool's subcommands.

#include "command.h"

namespace vyntool {

std::span<const Command> Commands() {
  static constexpr Command kCommands[] = {
      {"convert", "convert text from one code page to another", RunConvert},
      {"text", "detect the encoding of text files, convert them through the text reader and writer", RunText},
      {"ini", "read, write, list and check INI settings as the library's modules do", RunIni},
  };
  return kCommands;
}

}  // namespace vyntool
