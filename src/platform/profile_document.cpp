// Parsing a profile file: line breaks, line kinds, decoding and the name index.

#include "profile_document.h"

#include <algorithm>
#include <utility>

#include "win32/codepage.h"

namespace win32::detail {

using profile::Text;

namespace {

constexpr bool IsLineBreak(char16_t unit) { return unit == u'\r' || unit == u'\n'; }

// The units of an ANSI file: its bytes. Line breaks, blanks, '[' and ';' are ASCII bytes, which
// no double-byte code page uses as the second byte of a character and UTF-8 only uses for
// themselves, so lines can be found and sorted before anything is decoded.
struct AnsiUnits {
  const std::string& bytes;
  std::size_t size() const { return bytes.size(); }
  char16_t operator[](std::size_t i) const { return static_cast<unsigned char>(bytes[i]); }
  static std::size_t ByteOffset(std::size_t unit) { return unit; }
};

// The units of a UTF-16 LE file after its byte-order mark; a trailing odd byte is no unit.
struct Utf16Units {
  const std::string& bytes;
  std::size_t count;
  std::size_t size() const { return count; }
  char16_t operator[](std::size_t i) const {
    const unsigned char* p = reinterpret_cast<const unsigned char*>(bytes.data()) + 2 + 2 * i;
    return static_cast<char16_t>(p[0] | (p[1] << 8));
  }
  static std::size_t ByteOffset(std::size_t unit) { return 2 + 2 * unit; }
};

std::uint32_t SlotHash(std::uint32_t owner, std::uint32_t nameHash) {
  std::uint32_t hash = (nameHash ^ (owner * 0x9E3779B9u)) * 0x85EBCA6Bu;
  return hash ^ (hash >> 16);
}

}  // namespace

class ProfileDocument::Builder {
 public:
  explicit Builder(ProfileDocument& document) : doc_(document) {}

  template <typename Units>
  void Split(const Units& units) {
    const std::size_t count = units.size();
    std::size_t i = 0;
    while (i < count && !tooLarge_) {
      const std::size_t begin = i;
      while (i < count && !IsLineBreak(units[i])) ++i;
      const std::size_t end = i;
      if (i < count) i += (units[i] == u'\r' && i + 1 < count && units[i + 1] == u'\n') ? 2 : 1;
      Classify(units, begin, end, i);
    }
    doc_.endsWithLineBreak_ = count == 0 || IsLineBreak(units[count - 1]);
    if (!doc_.sections_.empty()) {
      doc_.sections_.back().end = static_cast<std::uint32_t>(doc_.lines_.size());
    }
  }

  bool tooLarge() const { return tooLarge_; }

  void BuildIndex() {
    std::size_t names = doc_.sections_.size();
    for (const ProfileLine& line : doc_.lines_) names += line.kind == ProfileLineKind::kEntry;
    std::size_t capacity = 16;
    while (capacity < 2 * names) capacity *= 2;
    doc_.slots_.assign(capacity, Slot{0, 0, kEmptySlot});
    for (std::size_t s = 0; s < doc_.sections_.size(); ++s) {
      const ProfileSection& section = doc_.sections_[s];
      const auto index = static_cast<std::uint32_t>(s);
      if (doc_.Insert(0, doc_.SectionName(section), index) != index) continue;  // a repeat
      for (std::uint32_t l = section.header + 1; l < section.end; ++l) {
        const ProfileLine& line = doc_.lines_[l];
        if (line.kind == ProfileLineKind::kEntry) doc_.Insert(index + 1, doc_.Entry(line).key, l);
      }
    }
  }

 private:
  template <typename Units>
  void Classify(const Units& units, std::size_t begin, std::size_t end, std::size_t next) {
    std::size_t first = begin;
    while (first < end && profile::IsBlank(units[first])) ++first;
    if (first == end || units[first] == u';') return;  // blank line or comment
    const bool header = units[first] == u'[';
    if (!header && doc_.sections_.empty()) return;  // text before the first section
    if (doc_.lines_.size() == kMaxLines) {
      tooLarge_ = true;
      return;
    }
    ProfileLine line{};
    line.rawBegin = static_cast<std::uint32_t>(units.ByteOffset(begin));
    line.rawEnd = static_cast<std::uint32_t>(units.ByteOffset(end));
    line.rawNext = static_cast<std::uint32_t>(units.ByteOffset(next));
    line.textBegin = static_cast<std::uint32_t>(doc_.text_.size());
    Decode(units, begin, end);
    line.textEnd = static_cast<std::uint32_t>(doc_.text_.size());
    if (header) {
      line.kind = ProfileLineKind::kSection;
      const auto index = static_cast<std::uint32_t>(doc_.lines_.size());
      if (!doc_.sections_.empty()) doc_.sections_.back().end = index;
      doc_.sections_.push_back(ProfileSection{index, index + 1});
    } else {
      const Text text = doc_.LineText(line);
      line.kind = text.find(u'=') != Text::npos ? ProfileLineKind::kEntry : ProfileLineKind::kOther;
    }
    doc_.lines_.push_back(line);
  }

  void Decode(const Utf16Units& units, std::size_t begin, std::size_t end) {
    for (std::size_t i = begin; i < end; ++i) doc_.text_.push_back(units[i]);
  }

  void Decode(const AnsiUnits& units, std::size_t begin, std::size_t end) {
    const char* bytes = units.bytes.data() + begin;
    const std::size_t length = end - begin;
    std::u16string& text = doc_.text_;
    const std::size_t start = text.size();
    if (std::all_of(bytes, bytes + length, [](char c) { return (c & 0x80) == 0; })) {
      text.append(bytes, bytes + length);
      return;
    }
    // No code page makes more UTF-16 units than bytes: one byte gives at most one unit.
    text.resize(start + length);
    int made = MultiByteToWideChar(doc_.codePage_, 0, bytes, static_cast<int>(length),
                                   text.data() + start, static_cast<int>(length));
    if (made <= 0) {
      made = MultiByteToWideChar(doc_.codePage_, 0, bytes, static_cast<int>(length), nullptr, 0);
      text.resize(start + static_cast<std::size_t>(std::max(made, 0)));
      if (made > 0) {
        made = MultiByteToWideChar(doc_.codePage_, 0, bytes, static_cast<int>(length),
                                   text.data() + start, made);
      }
    }
    if (made <= 0) {  // a code page the converter refuses: keep the bytes as Latin-1
      text.resize(start);
      for (std::size_t i = 0; i < length; ++i) text.push_back(static_cast<unsigned char>(bytes[i]));
      return;
    }
    text.resize(start + static_cast<std::size_t>(made));
  }

  ProfileDocument& doc_;
  bool tooLarge_ = false;
};

std::shared_ptr<const ProfileDocument> ProfileDocument::Parse(std::string bytes,
                                                              UINT ansiCodePage) {
  if (bytes.size() > kMaxBytes) return nullptr;
  std::shared_ptr<ProfileDocument> doc(new ProfileDocument());
  doc->bytes_ = std::move(bytes);
  doc->codePage_ = ansiCodePage;
  const std::string& raw = doc->bytes_;
  Builder builder(*doc);
  if (raw.size() >= 2 && static_cast<unsigned char>(raw[0]) == 0xFF &&
      static_cast<unsigned char>(raw[1]) == 0xFE) {
    doc->encoding_ = ProfileEncoding::kUtf16;
    const std::size_t units = (raw.size() - 2) / 2;
    doc->contentEnd_ = 2 + 2 * units;
    builder.Split(Utf16Units{raw, units});
  } else {
    doc->encoding_ = ProfileEncoding::kAnsi;
    doc->contentEnd_ = raw.size();
    builder.Split(AnsiUnits{raw});
  }
  if (builder.tooLarge()) return nullptr;
  builder.BuildIndex();
  doc->text_.shrink_to_fit();
  return doc;
}

std::size_t ProfileDocument::Footprint() const {
  return sizeof(*this) + bytes_.capacity() + text_.capacity() * sizeof(char16_t) +
         lines_.capacity() * sizeof(ProfileLine) + sections_.capacity() * sizeof(ProfileSection) +
         slots_.capacity() * sizeof(Slot);
}

Text ProfileDocument::LineText(const ProfileLine& line) const {
  return Text(text_).substr(line.textBegin, line.textEnd - line.textBegin);
}

Text ProfileDocument::SectionName(const ProfileSection& section) const {
  Text text = profile::TrimBlanks(LineText(lines_[section.header]));
  text.remove_prefix(1);  // '['
  const std::size_t close = text.find(u']');
  if (close != Text::npos) text = text.substr(0, close);
  return profile::TrimBlanks(text);
}

ProfileEntryParts ProfileDocument::Entry(const ProfileLine& line) const {
  const Text text = LineText(line);
  const std::size_t equals = std::min(text.find(u'='), text.size());
  ProfileEntryParts parts;
  parts.key = profile::TrimBlanks(text.substr(0, equals));
  parts.valueOffset = std::min(equals + 1, text.size());
  parts.value = profile::TrimBlanks(text.substr(parts.valueOffset));
  return parts;
}

std::ptrdiff_t ProfileDocument::FindSection(Text name) const {
  const std::uint32_t found = Find(0, name);
  return found == kEmptySlot ? -1 : static_cast<std::ptrdiff_t>(found);
}

std::ptrdiff_t ProfileDocument::FindEntry(std::size_t section, Text key) const {
  const std::uint32_t found = Find(static_cast<std::uint32_t>(section) + 1, key);
  return found == kEmptySlot ? -1 : static_cast<std::ptrdiff_t>(found);
}

Text ProfileDocument::IndexedName(std::uint32_t owner, std::uint32_t payload) const {
  return owner == 0 ? SectionName(sections_[payload]) : Entry(lines_[payload]).key;
}

std::uint32_t ProfileDocument::Find(std::uint32_t owner, Text name) const {
  const std::uint32_t hash = SlotHash(owner, profile::FoldedHash(name));
  const std::size_t mask = slots_.size() - 1;
  for (std::size_t i = hash & mask;; i = (i + 1) & mask) {
    const Slot& slot = slots_[i];
    if (slot.payload == kEmptySlot) return kEmptySlot;
    if (slot.hash == hash && slot.owner == owner &&
        profile::EqualFolded(IndexedName(owner, slot.payload), name)) {
      return slot.payload;
    }
  }
}

std::uint32_t ProfileDocument::Insert(std::uint32_t owner, Text name, std::uint32_t payload) {
  const std::uint32_t hash = SlotHash(owner, profile::FoldedHash(name));
  const std::size_t mask = slots_.size() - 1;
  for (std::size_t i = hash & mask;; i = (i + 1) & mask) {
    Slot& slot = slots_[i];
    if (slot.payload == kEmptySlot) {
      slot = Slot{hash, owner, payload};
      return payload;
    }
    if (slot.hash == hash && slot.owner == owner &&
        profile::EqualFolded(IndexedName(owner, slot.payload), name)) {
      return slot.payload;
    }
  }
}

}  // namespace win32::detail
