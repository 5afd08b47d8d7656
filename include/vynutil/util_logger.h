#pragma once
// The reporting interface of the configuration code (INI rules, environment folders): messages
// by number, their texts from the library's string resources. The base class forwards every
// message to the host's system log; derive and override Log to send them elsewhere.

#include <string>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace Util {

class VYN_API Logger {
 public:
  enum Level { Information = 0, Warning = 1, Error = 2 };

  Logger() = default;
  Logger(const Logger&) = default;
  Logger& operator=(const Logger&) = default;
  virtual ~Logger();

  // Adds the message to the host's system log (information, warning or error entry, no dialog,
  // empty title); dropped while the host has registered no core interface or it has no log.
  virtual void Log(Level level, const std::u16string& message);
  // Formats the library's string resource messageId with the arguments (wide printf
  // conventions: %s takes const MCHAR*, %d an int), cut to fit 1040 characters beyond the
  // format's length, and passes the text to the virtual Log. A missing resource formats empty.
  void Log(Level level, unsigned int messageId, ...);

  // The logger the configuration code uses when it is given none.
  static Logger Default;
};

}  // namespace Util
