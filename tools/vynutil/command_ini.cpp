// vynutil ini: INI settings through the library's INI functions (the file's mutex, any
// encoding, files turned into UTF-16 on writing, the application's folder rules).
//   vynutil ini get FILE SECTION KEY [--default TEXT]
//   vynutil ini set FILE SECTION KEY VALUE
//   vynutil ini delete FILE SECTION [KEY]
//   vynutil ini sections FILE
//   vynutil ini keys FILE SECTION
//   vynutil ini validate FILE [--plugin]

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "argument_reader.h"
#include "command.h"
#include "tool_error.h"
#include "vynutil/ini_profile.h"
#include "vynutil/ini_rule_set_mapper.h"
#include "vynutil/util_logger.h"
#include "vynutil/vynstring.h"

namespace vyntool {
namespace {

using VynSDK::Util::VynString;

constexpr std::string_view kCommand = "ini";
constexpr int kExitNotFound = 1;
// The default a lookup passes to tell a missing key from any value a file can hold.
constexpr char16_t kMissing[] = u"\x01vynutil-missing\x01";

void PrintHelp() {
  std::fputs(
      "Usage: vynutil ini get FILE SECTION KEY [--default TEXT]\n"
      "       vynutil ini set FILE SECTION KEY VALUE\n"
      "       vynutil ini delete FILE SECTION [KEY]\n"
      "       vynutil ini sections FILE\n"
      "       vynutil ini keys FILE SECTION\n"
      "       vynutil ini validate FILE [--plugin]\n"
      "\n"
      "Reads and writes INI settings as the library's modules do: holding the file's mutex, in\n"
      "any encoding (a file is turned into UTF-16 when written), with the folder rules of the\n"
      "application (environment variables expanded on reading). Text is UTF-8 on the command\n"
      "line and on output.\n"
      "\n"
      "  get       print the value of KEY (or TEXT from --default when it is missing)\n"
      "  set       write VALUE to KEY, creating the file and its folder when needed\n"
      "  delete    remove KEY, or the whole SECTION without KEY\n"
      "  sections  print the names of the sections, one per line\n"
      "  keys      print the names of the keys of SECTION, one per line\n"
      "  validate  check every folder value against the application's rules (the plug-in\n"
      "            rules with --plugin) and print what is wrong\n"
      "\n"
      "Exit status: 0 done, 1 not found (or validation findings), 2 bad usage or I/O error.\n",
      stdout);
}

std::u16string Utf16(std::string_view text) {
  const VynString string = VynString::FromUTF8(text.data(), text.size());
  std::size_t length = 0;
  const MCHAR* units = string.ToUTF16(&length);
  return std::u16string(units, length);
}

void PrintLine(const MCHAR* text, std::size_t length) {
  const VynString string = VynString::FromUTF16(text, length);
  std::size_t bytes = 0;
  const char* utf8 = string.ToUTF8(&bytes);
  std::fwrite(utf8, 1, bytes, stdout);
  std::fputc('\n', stdout);
}

// The operands of a verb (exactly count of them, or between least and most), options handled
// by option.
std::vector<std::u16string> Operands(ArgumentReader& reader, std::size_t least, std::size_t most,
                                     const std::function<bool(ArgumentReader&)>& option) {
  std::vector<std::u16string> operands;
  while (reader.Next()) {
    if (!reader.IsOperand()) {
      if (reader.IsOption("--help") || reader.IsOption("-h")) {
        PrintHelp();
        std::exit(0);
      }
      if (!option || !option(reader)) reader.RejectUnknown();
      continue;
    }
    if (operands.size() == most) reader.Reject("too many arguments");
    operands.push_back(Utf16(reader.Current()));
  }
  if (operands.size() < least) reader.Reject("missing arguments");
  return operands;
}

// The double-null list a names query fills, as separate names; none when the read gave nothing.
std::vector<std::u16string> Names(const MCHAR* section, const std::u16string& file) {
  VynSDK::Array<MCHAR> list;
  const unsigned long length = section != nullptr
                                   ? VynSDK::Util::GetPrivateProfileStringW(section, nullptr, u"", list, file.c_str())
                                   : VynSDK::Util::GetPrivateProfileSectionNamesW(list, file.c_str());
  std::vector<std::u16string> names;
  for (std::size_t at = 0; at < length;) {
    const std::u16string name(list.Addr() + at);
    if (name.empty()) break;
    names.push_back(name);
    at += name.size() + 1;
  }
  return names;
}

void RequireFile(const std::u16string& file) {
  const VynString path = VynString::FromUTF16(file.data(), file.size());
  if (!std::filesystem::exists(std::filesystem::path(path.ToUTF8().Get()))) {
    throw ToolError(kExitNotFound, "no such file " + Quoted(path.ToUTF8().Get()));
  }
}

int Get(ArgumentReader& reader) {
  std::optional<std::u16string> fallback;
  const auto operands = Operands(reader, 3, 3, [&](ArgumentReader& r) {
    if (!r.IsOption("--default")) return false;
    fallback = Utf16(r.Value());
    return true;
  });
  VynSDK::Array<MCHAR> value;
  const unsigned long length = VynSDK::Util::GetPrivateProfileStringW(operands[1].c_str(), operands[2].c_str(),
                                                                      kMissing, value, operands[0].c_str());
  if (std::u16string(value.Addr(), length) != kMissing) {
    PrintLine(value.Addr(), length);
    return 0;
  }
  if (!fallback) return kExitNotFound;
  PrintLine(fallback->data(), fallback->size());
  return 0;
}

int Write(const std::u16string& file, const MCHAR* section, const MCHAR* key, const MCHAR* value) {
  if (VynSDK::Util::WritePrivateProfileStringW(section, key, value, file.c_str())) return 0;
  throw ToolError(kExitUsage, "cannot write " + Quoted(VynString::FromUTF16(file.c_str()).ToUTF8().Get()));
}

int Validate(ArgumentReader& reader) {
  bool plugin = false;
  const auto operands = Operands(reader, 1, 1, [&](ArgumentReader& r) {
    if (!r.IsOption("--plugin")) return false;
    plugin = true;
    return true;
  });
  RequireFile(operands[0]);
  Util::IniRuleSetMapper& mapper = Util::IniRuleSetMapper::Instance();
  if (plugin) {
    mapper.AddPluginIniPath(operands[0]);
  } else {
    mapper.RegisterTavloIniRules(operands[0], u"", u"");
  }
  // Prints each finding instead of sending it to a host.
  class PrintingLogger : public Util::Logger {
   public:
    void Log(Level, const std::u16string& message) override { PrintLine(message.data(), message.size()); }
    using Util::Logger::Log;
  } printer;
  Util::IniRuleSet& rules = plugin ? mapper.GetPluginIniRuleSet() : mapper.GetTavloIniRuleSet();
  return rules.ValidateIniFile(operands[0].c_str(), printer) ? 0 : kExitNotFound;
}

}  // namespace

int RunIni(Arguments args) {
  ArgumentReader reader(args, kCommand);
  if (!reader.Next()) throw UsageError("ini needs a verb: get, set, delete, sections, keys or validate", kCommand);
  if (reader.IsOption("--help") || reader.IsOption("-h")) {
    PrintHelp();
    return 0;
  }
  const std::string verb(reader.Current());
  if (verb == "get") return Get(reader);
  if (verb == "set") {
    const auto operands = Operands(reader, 4, 4, nullptr);
    return Write(operands[0], operands[1].c_str(), operands[2].c_str(), operands[3].c_str());
  }
  if (verb == "delete") {
    const auto operands = Operands(reader, 2, 3, nullptr);
    RequireFile(operands[0]);
    return Write(operands[0], operands[1].c_str(), operands.size() == 3 ? operands[2].c_str() : nullptr, nullptr);
  }
  if (verb == "sections") {
    const auto operands = Operands(reader, 1, 1, nullptr);
    RequireFile(operands[0]);
    for (const std::u16string& name : Names(nullptr, operands[0])) PrintLine(name.data(), name.size());
    return 0;
  }
  if (verb == "keys") {
    const auto operands = Operands(reader, 2, 2, nullptr);
    RequireFile(operands[0]);
    const auto names = Names(operands[1].c_str(), operands[0]);
    for (const std::u16string& name : names) PrintLine(name.data(), name.size());
    return names.empty() ? kExitNotFound : 0;
  }
  if (verb == "validate") return Validate(reader);
  throw UsageError("unknown verb " + Quoted(verb) + " (get, set, delete, sections, keys or validate)", kCommand);
}

}  // namespace vyntool
