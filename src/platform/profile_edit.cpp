// Profile edits as splices of the file's bytes.

#include "profile_edit.h"

#include <algorithm>
#include <cstdint>

#include "win32/codepage.h"

namespace win32::detail::profile_edit {

using profile::Text;

namespace {

// Bytes [begin, end) of the old file give way to text (already encoded).
struct Splice {
  std::size_t begin;
  std::size_t end;
  std::string bytes;
};

class Edit {
 public:
  explicit Edit(const ProfileDocument* document)
      : doc_(document),
        utf16_(document != nullptr && document->encoding() == ProfileEncoding::kUtf16),
        codePage_(document != nullptr ? document->codePage() : GetACP()) {}

  void Remove(const ProfileLine& line) { splices_.push_back({line.rawBegin, line.rawNext, {}}); }

  // The line's text becomes text; its line break stays.
  void Rewrite(const ProfileLine& line, Text text) {
    splices_.push_back({line.rawBegin, line.rawEnd, Encode(text)});
  }

  // Whole lines at offset at, which is the start of a line or the end of the content.
  void Insert(std::size_t at, const std::vector<std::u16string>& lines) {
    std::string bytes;
    if (!StartsLine(at)) bytes += Encode(u"\r\n");
    for (const std::u16string& line : lines) {
      bytes += Encode(line);
      bytes += Encode(u"\r\n");
    }
    splices_.push_back({at, at, std::move(bytes)});
  }

  std::size_t End() const { return doc_ != nullptr ? doc_->contentEnd() : 0; }

  Bytes Render() {
    if (lossy_) return std::nullopt;
    // Insertions sort before a removal that starts where they stand.
    std::stable_sort(splices_.begin(), splices_.end(), [](const Splice& a, const Splice& b) {
      return a.begin != b.begin ? a.begin < b.begin : a.end < b.end;
    });
    const std::string empty;
    const std::string& old = doc_ != nullptr ? doc_->bytes() : empty;
    std::string out;
    std::size_t size = End();
    for (const Splice& splice : splices_) size += splice.bytes.size();
    out.reserve(size);
    std::size_t cursor = 0;
    for (const Splice& splice : splices_) {
      out.append(old, cursor, splice.begin - cursor);
      out += splice.bytes;
      cursor = splice.end;
    }
    out.append(old, cursor, End() - cursor);
    return out;
  }

 private:
  // True when offset at follows a line break (or starts the content).
  bool StartsLine(std::size_t at) const {
    if (doc_ == nullptr) return true;
    const std::string& bytes = doc_->bytes();
    if (utf16_) {
      if (at <= 2) return true;
      const char16_t unit = static_cast<char16_t>(static_cast<unsigned char>(bytes[at - 2]) |
                                                  (static_cast<unsigned char>(bytes[at - 1]) << 8));
      return unit == u'\r' || unit == u'\n';
    }
    return at == 0 || bytes[at - 1] == '\r' || bytes[at - 1] == '\n';
  }

  std::string Encode(Text text) {
    std::string bytes;
    if (text.empty()) return bytes;
    if (utf16_) {
      bytes.resize(2 * text.size());
      for (std::size_t i = 0; i < text.size(); ++i) {
        bytes[2 * i] = static_cast<char>(text[i] & 0xFF);
        bytes[2 * i + 1] = static_cast<char>(text[i] >> 8);
      }
      return bytes;
    }
    // Asked to report every character the code page lacks (no best-fit substitutes either); for
    // UTF-8 only lone surrogates are such, and the converter fails on them.
    const bool utf8 = codePage_ == CP_UTF8;
    const DWORD flags = utf8 ? WC_ERR_INVALID_CHARS : WC_NO_BEST_FIT_CHARS;
    BOOL usedDefault = FALSE;
    BOOL* report = utf8 ? nullptr : &usedDefault;
    const int units = static_cast<int>(text.size());
    const int size =
        WideCharToMultiByte(codePage_, flags, text.data(), units, nullptr, 0, nullptr, report);
    if (size <= 0 || usedDefault) {
      lossy_ = true;
      return bytes;
    }
    bytes.resize(static_cast<std::size_t>(size));
    WideCharToMultiByte(codePage_, flags, text.data(), units, bytes.data(), size, nullptr, nullptr);
    return bytes;
  }

  const ProfileDocument* doc_;
  bool utf16_;
  UINT codePage_;
  std::vector<Splice> splices_;
  bool lossy_ = false;  // some text could not be encoded
};

std::u16string Header(Text section) {
  std::u16string header(u"[");
  header.append(section);
  header += u']';
  return header;
}

std::u16string EntryLine(Text key, Text value) {
  std::u16string line(key);
  line += u'=';
  line.append(value);
  return line;
}

bool IsContent(const ProfileLine& line) { return line.kind != ProfileLineKind::kSection; }

// The line that a new entry of the section follows: its last entry or line without '=', else
// its header.
const ProfileLine& LastLineOf(const ProfileDocument& doc, const ProfileSection& section) {
  std::uint32_t last = section.header;
  for (std::uint32_t l = section.header + 1; l < section.end; ++l) {
    if (IsContent(doc.lines()[l])) last = l;
  }
  return doc.lines()[last];
}

std::ptrdiff_t FindSection(const ProfileDocument* doc, Text section) {
  return doc != nullptr ? doc->FindSection(section) : -1;
}

}  // namespace

Bytes SetValue(const ProfileDocument* document, Text section, Text key, Text value) {
  Edit edit(document);
  const std::ptrdiff_t s = FindSection(document, section);
  if (s < 0) {
    edit.Insert(edit.End(), {Header(section), EntryLine(key, value)});
    return edit.Render();
  }
  const ProfileSection& found = document->sections()[static_cast<std::size_t>(s)];
  const std::ptrdiff_t entry = document->FindEntry(static_cast<std::size_t>(s), key);
  if (entry < 0) {
    edit.Insert(LastLineOf(*document, found).rawNext, {EntryLine(key, value)});
    return edit.Render();
  }
  // Keep everything up to the old value: indentation, the key's spelling, the blanks around '='.
  const ProfileLine& line = document->lines()[static_cast<std::size_t>(entry)];
  const Text text = document->LineText(line);
  const ProfileEntryParts parts = document->Entry(line);
  std::size_t keep = parts.valueOffset;
  if (!parts.value.empty()) keep = static_cast<std::size_t>(parts.value.data() - text.data());
  std::u16string rewritten(text.substr(0, keep));
  rewritten.append(value);
  edit.Rewrite(line, rewritten);
  return edit.Render();
}

Bytes DeleteKey(const ProfileDocument* document, Text section, Text key) {
  Edit edit(document);
  const std::ptrdiff_t s = FindSection(document, section);
  if (s >= 0) {
    const ProfileSection& found = document->sections()[static_cast<std::size_t>(s)];
    for (std::uint32_t l = found.header + 1; l < found.end; ++l) {
      const ProfileLine& line = document->lines()[l];
      if (line.kind == ProfileLineKind::kEntry &&
          profile::EqualFolded(document->Entry(line).key, key)) {
        edit.Remove(line);
      }
    }
  }
  return edit.Render();
}

Bytes DeleteSection(const ProfileDocument* document, Text section) {
  Edit edit(document);
  if (document != nullptr) {
    for (const ProfileSection& each : document->sections()) {
      if (!profile::EqualFolded(document->SectionName(each), section)) continue;
      for (std::uint32_t l = each.header; l < each.end; ++l) edit.Remove(document->lines()[l]);
    }
  }
  return edit.Render();
}

Bytes ReplaceSection(const ProfileDocument* document, Text section,
                     const std::vector<Text>& lines) {
  Edit edit(document);
  std::vector<std::u16string> text;
  const std::ptrdiff_t s = FindSection(document, section);
  if (s < 0) text.push_back(Header(section));
  for (Text line : lines) text.emplace_back(line);
  if (s < 0) {
    edit.Insert(edit.End(), text);
    return edit.Render();
  }
  const ProfileSection& found = document->sections()[static_cast<std::size_t>(s)];
  std::size_t at = document->lines()[found.header].rawNext;
  bool first = true;
  for (std::uint32_t l = found.header + 1; l < found.end; ++l) {
    const ProfileLine& line = document->lines()[l];
    if (!IsContent(line)) continue;
    if (first) at = line.rawBegin;
    first = false;
    edit.Remove(line);
  }
  if (!text.empty()) edit.Insert(at, text);
  return edit.Render();
}

}  // namespace win32::detail::profile_edit
