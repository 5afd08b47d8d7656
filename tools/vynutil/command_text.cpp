// vynutil text: text files through the library's reader (with encoding detection) and writer.
//   vynutil text detect FILE...
//   vynutil text convert FILE --to ENCODING [--bom] [--crlf | --lf] [-o OUT]

#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "argument_reader.h"
#include "codepage_names.h"
#include "command.h"
#include "tool_error.h"
#include "vynutil/codepages.h"
#include "vynutil/text_reader.h"
#include "vynutil/text_writer.h"
#include "vynutil/vynstring.h"
#include "win32/codepage.h"

namespace vyntool {
namespace {

namespace tf = VynSDK::Util::TextFile;
using VynSDK::Util::VynString;

constexpr std::string_view kCommand = "text";
constexpr std::size_t kChunkBytes = 1 << 20;
constexpr std::uintmax_t kProgressFromBytes = 8u << 20;  // smaller files need no progress bar

void PrintHelp() {
  std::fputs(
      "Usage: vynutil text detect FILE...\n"
      "       vynutil text convert FILE --to ENCODING [--bom] [--crlf | --lf] [-o OUT]\n"
      "\n"
      "detect prints the encoding the library's text reader finds for each FILE: byte-order\n"
      "marks, a \"coding\" declaration in the first line, UTF-8 validity and UTF-16 statistics,\n"
      "in that order; otherwise the active code page stands (\"default\").\n"
      "\n"
      "convert reads FILE with that detection and writes its text in ENCODING to standard\n"
      "output, or to OUT with -o.\n"
      "\n"
      "  --to ENCODING      a code page as for 'vynutil convert' (utf-8, utf-16le, windows-1252,\n"
      "                     shift_jis, 936 ...), or utf-16be\n"
      "  --bom              write a byte-order mark (UTF-8 and UTF-16 only)\n"
      "  --crlf, --lf       turn every line end into CR LF, or into LF (default: keep them)\n"
      "  -o, --output OUT   write to OUT instead of standard output\n"
      "  -h, --help         show this help\n"
      "\n"
      "Exit status: 0 done, 1 output not written, 2 bad usage or unreadable input.\n",
      stdout);
}

VynString PathText(std::string_view path) { return VynString::FromUTF8(path.data(), path.size()); }

std::string EncodingName(UINT codepage) {
  for (const CodePageName& entry : CodePageNames()) {
    if (entry.codepage == codepage) return std::string(entry.name);
  }
  return "cp" + std::to_string(codepage);
}

// "utf-16le (65012), byte-order mark, detected".
std::string Describe(UINT encoding, bool detected) {
  const UINT codepage = encoding & CP_ENCODING_MASK;
  const bool bigEndian = (encoding & tf::EncodingBigEndian) && codepage == CP_UTF16;
  std::string text = bigEndian ? std::string("utf-16be") : EncodingName(codepage);
  text += " (" + std::to_string(codepage) + ")";
  if (encoding & tf::EncodingByteOrderMark) text += ", byte-order mark";
  if (encoding & tf::EncodingDeclared) text += ", coding declaration";
  text += detected ? ", detected" : ", default";
  return text;
}

int Detect(ArgumentReader& reader) {
  std::vector<std::string_view> files;
  while (reader.Next()) {
    if (reader.IsOperand()) {
      files.push_back(reader.Current());
    } else if (reader.IsOption("--help") || reader.IsOption("-h")) {
      PrintHelp();
      return 0;
    } else {
      reader.RejectUnknown();
    }
  }
  if (files.empty()) reader.Reject("text detect needs at least one FILE");
  int status = 0;
  for (std::string_view file : files) {
    tf::Reader text;
    if (!text.Open(PathText(file), win32::GetACP(), tf::LineEndNone)) {
      std::fprintf(stderr, "vynutil: cannot read %s\n", Quoted(file).c_str());
      status = kExitUsage;
      continue;
    }
    std::printf("%.*s: %s\n", static_cast<int>(file.size()), file.data(),
                Describe(text.Encoding(), text.Detected()).c_str());
  }
  return status;
}

// A progress bar on standard error while a large file is read, when that is a terminal.
class Progress {
 public:
  explicit Progress(std::uintmax_t total)
      : total_(total), shown_(total >= kProgressFromBytes && isatty(STDERR_FILENO)) {}
  ~Progress() {
    if (shown_) std::fputs("\r\033[K", stderr);
  }
  void Update(std::uintmax_t done) {
    if (!shown_ || total_ == 0) return;
    const int percent = static_cast<int>(done * 100 / total_);
    if (percent == last_) return;
    last_ = percent;
    const int filled = percent * 40 / 100;
    std::fprintf(stderr, "\r[%s%s] %3d%%", std::string(filled, '#').c_str(),
                 std::string(40 - filled, '.').c_str(), percent);
  }

 private:
  std::uintmax_t total_;
  bool shown_;
  int last_ = -1;
};

UINT TargetEncoding(const ArgumentReader& reader, std::string_view name, bool bom) {
  UINT encoding = 0;
  if (name == "utf-16be" || name == "UTF-16BE") {
    encoding = CP_UTF16 | tf::EncodingBigEndian;
  } else {
    const std::optional<UINT> codepage = ParseCodePage(name);
    if (!codepage || *codepage == CP_UTF32) reader.Reject("unknown encoding " + Quoted(name));
    encoding = *codepage;
  }
  if (bom) {
    const UINT codepage = encoding & CP_ENCODING_MASK;
    if (codepage != CP_UTF8 && codepage != CP_UTF16) reader.Reject("--bom needs UTF-8 or UTF-16");
    encoding |= tf::EncodingByteOrderMark;
  }
  return encoding;
}

int Convert(ArgumentReader& reader) {
  std::optional<std::string_view> input, to;
  std::string output = "-";
  bool bom = false;
  tf::LineEndMode mode = tf::LineEndNone;
  while (reader.Next()) {
    if (reader.IsOperand()) {
      if (input) reader.Reject("text convert takes one FILE");
      input = reader.Current();
    } else if (reader.IsOption("--help") || reader.IsOption("-h")) {
      PrintHelp();
      return 0;
    } else if (reader.IsOption("--to")) {
      to = reader.Value();
    } else if (reader.IsOption("--bom")) {
      bom = true;
    } else if (reader.IsOption("--crlf") || reader.IsOption("--lf")) {
      const tf::LineEndMode chosen = reader.IsOption("--crlf") ? tf::LineEndCRLF : tf::LineEndLF;
      if (mode != tf::LineEndNone && mode != chosen) reader.Reject("--crlf and --lf exclude each other");
      mode = chosen;
    } else if (reader.IsOption("--output") || reader.IsOption("-o")) {
      output = reader.Value();
    } else {
      reader.RejectUnknown();
    }
  }
  if (!input) reader.Reject("text convert needs a FILE");
  if (!to) reader.Reject("text convert needs --to ENCODING");
  const UINT encoding = TargetEncoding(reader, *to, bom);

  tf::Reader source;
  if (!source.Open(PathText(*input), win32::GetACP(), tf::LineEndNone)) {
    throw InputError("cannot read " + Quoted(*input));
  }
  tf::Writer target;
  const bool opened = output == "-" ? target.Open(stdout, false, encoding, mode)
                                    : target.Open(PathText(output), false, encoding, mode);
  if (!opened) throw OutputError("cannot write " + Quoted(output));

  std::error_code ignored;
  Progress progress(std::filesystem::file_size(std::string(*input), ignored));
  for (VynString chunk; !(chunk = source.ReadChunk(kChunkBytes)).IsNull();) {
    if (target.Write(chunk) == static_cast<std::size_t>(-1)) throw OutputError("cannot write " + Quoted(output));
    progress.Update(source.PositionBytes());
  }
  target.Flush();
  return 0;
}

}  // namespace

int RunText(Arguments args) {
  ArgumentReader reader(args, kCommand);
  if (!reader.Next()) throw UsageError("text needs a verb: detect or convert", kCommand);
  if (reader.IsOption("--help") || reader.IsOption("-h")) {
    PrintHelp();
    return 0;
  }
  const std::string_view verb = reader.Current();
  if (verb == "detect") return Detect(reader);
  if (verb == "convert") return Convert(reader);
  throw UsageError("unknown verb " + Quoted(verb) + " (detect or convert)", kCommand);
}

}  // namespace vyntool
