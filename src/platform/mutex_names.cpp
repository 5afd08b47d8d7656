// Mutex names: namespace prefixes, the checks CreateMutexW makes, and the shared-memory file
// name of a named mutex.

#include "mutex_names.h"

#include <unistd.h>

#include <QByteArray>
#include <QCryptographicHash>

#include <climits>

#include "win32/file_types.h"
#include "win32/last_error.h"

namespace win32::detail {

namespace {

// Bumped whenever MutexState or the locking protocol changes, so that processes of different
// builds never share an object they would read differently.
constexpr std::string_view kFilePrefix = "vyn-mutex.1.";

bool IsPlain(MCHAR unit) {
  return (unit >= u'A' && unit <= u'Z') || (unit >= u'a' && unit <= u'z') ||
         (unit >= u'0' && unit <= u'9') || unit == u'.' || unit == u'_' || unit == u'-';
}

void AppendHex(std::string* out, unsigned value, int digits) {
  static constexpr char kDigits[] = "0123456789ABCDEF";
  for (int shift = (digits - 1) * 4; shift >= 0; shift -= 4) *out += kDigits[(value >> shift) & 0xF];
}

// The name with every unit outside [A-Za-z0-9._-] written as %XX (below U+0100) or %uXXXX. One
// name gives one text and back: lone surrogates and case are kept apart.
std::string Escaped(std::u16string_view name) {
  std::string out;
  out.reserve(name.size());
  for (const MCHAR unit : name) {
    if (IsPlain(unit)) {
      out += static_cast<char>(unit);
    } else if (unit < 0x100) {
      out += '%';
      AppendHex(&out, unit, 2);
    } else {
      out += "%u";
      AppendHex(&out, unit, 4);
    }
  }
  return out;
}

std::string Sha256Hex(std::u16string_view name) {
  QByteArray bytes;
  bytes.reserve(static_cast<qsizetype>(name.size() * 2));
  for (const MCHAR unit : name) {
    bytes.append(static_cast<char>(unit & 0xFF));
    bytes.append(static_cast<char>(unit >> 8));
  }
  return QCryptographicHash::hash(bytes, QCryptographicHash::Sha256).toHex().toStdString();
}

}  // namespace

DWORD ParseMutexName(const MCHAR* text, MutexName* parsed) {
  *parsed = MutexName{};
  if (text == nullptr) return ERROR_SUCCESS;
  std::u16string_view name = text;
  if (name.size() > MAX_PATH) return ERROR_FILENAME_EXCED_RANGE;
  bool prefixed = false;
  if (name.starts_with(u"Global\\")) {
    parsed->global = true;
    name.remove_prefix(7);
    prefixed = true;
  } else if (name.starts_with(u"Local\\")) {
    name.remove_prefix(6);
    prefixed = true;
  }
  if (name.find(u'\\') != std::u16string_view::npos) return ERROR_PATH_NOT_FOUND;
  if (prefixed && name.empty()) return ERROR_INVALID_NAME;
  parsed->name = name;
  return ERROR_SUCCESS;
}

std::string SharedMutexFileName(const MutexName& name) {
  std::string file(kFilePrefix);
  file += std::to_string(geteuid());
  file += name.global ? ".G." : ".L.";
  const std::string escaped = Escaped(name.name);
  file += file.size() + escaped.size() <= NAME_MAX ? escaped : '#' + Sha256Hex(name.name);
  return file;
}

}  // namespace win32::detail
