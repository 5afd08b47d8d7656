// Windows-form paths to POSIX paths: separators, drive roots and UNC roots.

#include "win32/path_map.h"

#include <array>
#include <mutex>
#include <optional>
#include <string_view>

#include "network_drive_config.h"
#include "utf_strings.h"
#include "win32/environment.h"

namespace win32 {

namespace {

constexpr std::string_view kDefaultDriveRoot = "/";
constexpr std::string_view kDefaultUncRoot = "/mnt/unc";

// Roots set by SetDriveRoot / SetUncRoot; they win over the environment.
struct RootOverrides {
  std::mutex lock;
  std::array<std::optional<std::string>, 26> drives;
  std::optional<std::string> unc;
};

RootOverrides& Overrides() {
  static RootOverrides overrides;
  return overrides;
}

bool IsAsciiLetter(char c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z'); }

char UpperLetter(char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c; }

bool StartsWithNoCase(std::string_view text, std::string_view prefix) {
  if (text.size() < prefix.size()) return false;
  for (std::size_t i = 0; i < prefix.size(); ++i) {
    if (UpperLetter(text[i]) != UpperLetter(prefix[i])) return false;
  }
  return true;
}

std::string Root(const std::optional<std::string>& set, const std::string& variable,
                 std::string_view fallback) {
  if (set) return *set;
  std::optional<std::string> fromEnvironment = detail::EnvironmentValue(variable.c_str());
  if (fromEnvironment && !fromEnvironment->empty()) return *fromEnvironment;
  return std::string(fallback);
}

std::string DriveRoot(char letter) {
  const char upper = UpperLetter(letter);
  std::optional<std::string> set;
  {
    RootOverrides& overrides = Overrides();
    std::lock_guard<std::mutex> lock(overrides.lock);
    set = overrides.drives[static_cast<std::size_t>(upper - 'A')];
  }
  return Root(set, std::string("TAVLO_PLATFORM_DRIVE_") + upper, kDefaultDriveRoot);
}

std::string UncRoot() {
  std::optional<std::string> set;
  {
    RootOverrides& overrides = Overrides();
    std::lock_guard<std::mutex> lock(overrides.lock);
    set = overrides.unc;
  }
  return Root(set, "TAVLO_PLATFORM_UNC_ROOT", kDefaultUncRoot);
}

// root + "/" + rest, with one separator between them whatever either side brings.
std::string Join(std::string root, std::string_view rest) {
  while (!root.empty() && root.back() == '/') root.pop_back();
  while (!rest.empty() && rest.front() == '/') rest.remove_prefix(1);
  if (rest.empty()) return root.empty() ? std::string("/") : root;
  root.push_back('/');
  root.append(rest);
  return root;
}

}  // namespace

std::string MapPath(const MCHAR* path) {
  if (path == nullptr) return {};
  std::string text = detail::Utf8Of(path);
  for (char& c : text) {
    if (c == '\\') c = '/';
  }
  std::string_view view = text;
  // "\\?\" turns off Windows' own path parsing; here it only has to go.
  if (view.starts_with("//?/")) {
    view.remove_prefix(4);
    if (StartsWithNoCase(view, "UNC/")) return Join(UncRoot(), view.substr(4));
  }
  if (view.size() >= 2 && IsAsciiLetter(view[0]) && view[1] == ':') {
    // A network drive is its share: "N:\x" is "\\server\share\x".
    if (std::optional<std::u16string> share = detail::MappedNetworkDrive(view[0])) {
      const std::string rest(view.substr(2));
      std::string shareFolder = detail::Utf8Of(std::u16string_view(*share).substr(2));
      for (char& c : shareFolder) {
        if (c == '\\') c = '/';
      }
      return Join(Join(UncRoot(), shareFolder), rest);
    }
    return Join(DriveRoot(view[0]), view.substr(2));
  }
  if (view.size() > 2 && view.starts_with("//") && view[2] != '/') {
    return Join(UncRoot(), view.substr(2));
  }
  return std::string(view);
}

void SetDriveRoot(MCHAR drive, const char* root) {
  if (drive > 0x7F || !IsAsciiLetter(static_cast<char>(drive))) return;
  RootOverrides& overrides = Overrides();
  std::lock_guard<std::mutex> lock(overrides.lock);
  auto& slot =
      overrides.drives[static_cast<std::size_t>(UpperLetter(static_cast<char>(drive)) - 'A')];
  slot = root != nullptr ? std::optional<std::string>(root) : std::nullopt;
}

void SetUncRoot(const char* root) {
  RootOverrides& overrides = Overrides();
  std::lock_guard<std::mutex> lock(overrides.lock);
  overrides.unc = root != nullptr ? std::optional<std::string>(root) : std::nullopt;
}

}  // namespace win32
