// Walking a subcommand's arguments.

#include "argument_reader.h"

#include <string>

#include "tool_error.h"

namespace vyntool {

bool ArgumentReader::Next() {
  while (m_next < m_args.size()) {
    m_current = m_args[m_next++];
    if (!m_operandsOnly && m_current == "--") {
      m_operandsOnly = true;
      continue;
    }
    m_currentIsOperand = m_operandsOnly || m_current == "-" || !m_current.starts_with('-');
    return true;
  }
  return false;
}

bool ArgumentReader::IsOperand() const { return m_currentIsOperand; }

bool ArgumentReader::IsOption(std::string_view name) const {
  if (m_currentIsOperand) return false;
  if (m_current == name) return true;
  return name.starts_with("--") && m_current.size() > name.size() && m_current.starts_with(name) &&
         m_current[name.size()] == '=';
}

std::string_view ArgumentReader::Value() {
  const std::size_t equals = m_current.find('=');
  if (m_current.starts_with("--") && equals != std::string_view::npos) return m_current.substr(equals + 1);
  if (m_next >= m_args.size()) Reject("option " + Quoted(m_current) + " needs a value");
  return m_args[m_next++];
}

void ArgumentReader::RejectUnknown() const { Reject("unknown option " + Quoted(m_current)); }

void ArgumentReader::Reject(std::string_view message) const { throw UsageError(message, m_command); }

}  // namespace vyntool
