// vynutil convert: text from one code page to another.

#include <cstdio>
#include <optional>
#include <string>

#include "argument_reader.h"
#include "byte_io.h"
#include "codepage_names.h"
#include "command.h"
#include "tool_error.h"
#include "transcode.h"

namespace vyntool {
namespace {

constexpr std::string_view kCommand = "convert";

void PrintHelp() {
  std::fputs(
      "Usage: vynutil convert --from CP --to CP [-o OUT] [FILE]\n"
      "\n"
      "Converts the bytes of FILE (standard input when FILE is missing or '-') from code page\n"
      "--from to code page --to and writes them to standard output, or to OUT with -o.\n"
      "\n"
      "  --from CP          the code page of the input\n"
      "  --to CP            the code page of the output\n"
      "  -o, --output OUT   write to OUT instead of standard output\n"
      "  -h, --help         show this help\n"
      "\n"
      "CP is a code-page number (932, 1252, 65001) or a name; cpN, windows-N and ibmN mean code\n"
      "page N. The names (case ignored):\n",
      stdout);
  for (std::size_t i = 0; i < CodePageNames().size();) {
    const UINT codepage = CodePageNames()[i].codepage;
    std::string names;
    for (; i < CodePageNames().size() && CodePageNames()[i].codepage == codepage; ++i) {
      names += (names.empty() ? "" : ", ") + std::string(CodePageNames()[i].name);
    }
    std::printf("  %-6u %s\n", codepage, names.c_str());
  }
  std::fputs(
      "\n"
      "ansi and oem (0, 1) are the process's active and OEM code pages (TAVLO_PLATFORM_ACP and\n"
      "TAVLO_PLATFORM_OEMCP override them). utf-16le (65012) and utf-32le (65014) are raw\n"
      "little-endian units: no byte-order mark is read or written.\n"
      "\n"
      "Conversion follows Windows: malformed input becomes U+FFFD, characters the target code page\n"
      "lacks become its default character '?'. Text ends at a NUL character in the library's\n"
      "strings, so the input is converted piece by piece between NULs and every NUL is written\n"
      "as the NUL of the target code page. Bytes after the last whole UTF-16 or UTF-32 unit\n"
      "become U+FFFD.\n"
      "\n"
      "Exit status: 0 converted, 1 output not written, 2 bad usage or unreadable input.\n",
      stdout);
}

UINT RequireCodePage(const ArgumentReader& reader, std::string_view text) {
  const std::optional<UINT> codepage = ParseCodePage(text);
  if (!codepage) reader.Reject("unknown code page " + Quoted(text));
  return *codepage;
}

}  // namespace

int RunConvert(Arguments args) {
  ArgumentReader reader(args, kCommand);
  std::optional<std::string_view> from, to, input;
  std::string output = "-";
  while (reader.Next()) {
    if (reader.IsOperand()) {
      if (input) reader.Reject("convert takes one FILE");
      input = reader.Current();
    } else if (reader.IsOption("--help") || reader.IsOption("-h")) {
      PrintHelp();
      return 0;
    } else if (reader.IsOption("--from")) {
      from = reader.Value();
    } else if (reader.IsOption("--to")) {
      to = reader.Value();
    } else if (reader.IsOption("--output") || reader.IsOption("-o")) {
      output = reader.Value();
    } else {
      reader.RejectUnknown();
    }
  }
  if (!from) reader.Reject("convert needs --from CP");
  if (!to) reader.Reject("convert needs --to CP");
  const UINT fromCodePage = RequireCodePage(reader, *from);
  const UINT toCodePage = RequireCodePage(reader, *to);

  const std::string bytes = ReadAllBytes(std::string(input.value_or("-")));
  WriteAllBytes(output, Transcode(fromCodePage, toCodePage, bytes));
  return 0;
}

}  // namespace vyntool
