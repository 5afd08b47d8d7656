#pragma once
// Walks a subcommand's arguments one at a time: options ("--from CP", "--from=CP", "-o OUT"),
// flags ("--help") and operands (file names; "-" alone is an operand, and so is everything after
// "--"). Mistakes become usage errors that point at the subcommand's help.

#include <cstddef>
#include <string_view>

#include "command.h"

namespace vyntool {

class ArgumentReader {
 public:
  ArgumentReader(Arguments args, std::string_view command) : m_args(args), m_command(command) {}

  // Moves to the next argument; false when there is none left.
  bool Next();
  // The current argument is an operand rather than an option.
  bool IsOperand() const;
  std::string_view Current() const { return m_current; }
  // The current argument is the option `name` ("--from", "-o"); a long option may carry its
  // value as "--from=CP".
  bool IsOption(std::string_view name) const;
  // The value of the current option: the text after '=', or else the next argument (consumed).
  std::string_view Value();
  // Rejects the current argument as an option this command does not know.
  [[noreturn]] void RejectUnknown() const;
  // Rejects the command line with message.
  [[noreturn]] void Reject(std::string_view message) const;

 private:
  Arguments m_args;
  std::string_view m_command;
  std::size_t m_next = 0;
  std::string_view m_current;
  bool m_operandsOnly = false;  // "--" has been seen
  bool m_currentIsOperand = false;
};

}  // namespace vyntool
