// Which drive letters are network drives: the setter's word, else the environment.

#include "network_drive_config.h"

#include <array>
#include <mutex>

#include "utf_strings.h"
#include "win32/environment.h"
#include "win32/network_drives.h"

namespace win32 {

namespace {

struct Drives {
  std::mutex lock;
  std::array<std::optional<std::u16string>, 26> set;  // "" = explicitly not a network drive
};

Drives& Configured() {
  static Drives* drives = new Drives;
  return *drives;
}

std::optional<std::size_t> IndexOf(MCHAR letter) {
  if (letter >= u'a' && letter <= u'z') return letter - u'a';
  if (letter >= u'A' && letter <= u'Z') return letter - u'A';
  return std::nullopt;
}

// "\\server\share" with both parts present, one final backslash allowed; nothing otherwise.
std::optional<std::u16string> ShareName(std::u16string name) {
  if (!name.empty() && name.back() == u'\\') name.pop_back();
  if (name.size() < 5 || name[0] != u'\\' || name[1] != u'\\') return std::nullopt;
  const std::size_t split = name.find(u'\\', 2);
  if (split == std::u16string::npos || split == 2 || split + 1 == name.size() ||
      name.find(u'\\', split + 1) != std::u16string::npos || name.find(u'/') != std::u16string::npos) {
    return std::nullopt;
  }
  return name;
}

}  // namespace

bool SetMappedNetworkDrive(MCHAR drive, LPCWSTR uncName) {
  const std::optional<std::size_t> index = IndexOf(drive);
  if (!index) return false;
  std::optional<std::u16string> value;
  if (uncName != nullptr) {
    value = uncName[0] == 0 ? std::optional<std::u16string>(u"") : ShareName(uncName);
    if (!value) return false;
  }
  Drives& drives = Configured();
  std::lock_guard<std::mutex> lock(drives.lock);
  drives.set[*index] = std::move(value);
  return true;
}

namespace detail {

std::optional<std::u16string> MappedNetworkDrive(MCHAR letter) {
  const std::optional<std::size_t> index = IndexOf(letter);
  if (!index) return std::nullopt;
  {
    Drives& drives = Configured();
    std::lock_guard<std::mutex> lock(drives.lock);
    if (const std::optional<std::u16string>& set = drives.set[*index]) {
      return set->empty() ? std::nullopt : set;
    }
  }
  const std::string variable = std::string("TAVLO_PLATFORM_NETDRIVE_") + char('A' + *index);
  const std::optional<std::string> value = EnvironmentValue(variable.c_str());
  if (!value || value->empty()) return std::nullopt;
  return ShareName(Utf16Of(*value));
}

std::vector<std::pair<std::u16string, std::u16string>> ConnectedNetworkDrives() {
  std::vector<std::pair<std::u16string, std::u16string>> drives;
  for (MCHAR letter = u'A'; letter <= u'Z'; ++letter) {
    if (std::optional<std::u16string> share = MappedNetworkDrive(letter)) {
      drives.emplace_back(std::u16string{letter, u':'}, std::move(*share));
    }
  }
  return drives;
}

}  // namespace detail

}  // namespace win32
