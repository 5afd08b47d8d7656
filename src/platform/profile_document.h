#pragma once
// One profile file, parsed: its bytes as they are on disk, and the lines that mean something
// (section headers, entries, lines without '=' inside a section) with their decoded text, plus an
// index of section and key names. Blank lines, comments and text before the first section are
// not recorded: nothing reads them and no edit touches them, so they stay in the bytes only.
//
// A document never changes once parsed; the cache hands the same one to many threads.

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "profile_text.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

enum class ProfileEncoding : std::uint8_t {
  kAnsi,   // the process code page the document was decoded with
  kUtf16,  // UTF-16 little-endian after the byte-order mark FF FE
};

enum class ProfileLineKind : std::uint8_t {
  kSection,  // "[name]"
  kEntry,    // "key=value" inside a section
  kOther,    // a line without '=' inside a section
};

struct ProfileLine {
  std::uint32_t rawBegin;   // first byte of the line in the file
  std::uint32_t rawEnd;     // first byte after its text (its line break starts here)
  std::uint32_t rawNext;    // first byte after its line break
  std::uint32_t textBegin;  // its decoded text in ProfileDocument::text()
  std::uint32_t textEnd;
  ProfileLineKind kind;
};

// A section: its header line and the lines up to the next header, as indexes into lines().
struct ProfileSection {
  std::uint32_t header;
  std::uint32_t end;
};

// The parts of an entry line: the key and the value without surrounding blanks.
struct ProfileEntryParts {
  profile::Text key;
  profile::Text value;
  std::size_t valueOffset;  // where the value's region starts in the line's text (after '=')
};

class ProfileDocument {
 public:
  // Files beyond these limits are refused (ERROR_FILE_TOO_LARGE): a profile is small, and the
  // parsed form of a file costs a few times its size. A single line may take all of it.
  static constexpr std::size_t kMaxBytes = std::size_t{128} << 20;
  static constexpr std::size_t kMaxLines = std::size_t{1} << 22;  // sections, entries, others

  // Parses bytes, decoding ANSI text with ansiCodePage. Takes any bytes; null when they exceed
  // the limits. Throws std::bad_alloc when memory runs out.
  static std::shared_ptr<const ProfileDocument> Parse(std::string bytes, UINT ansiCodePage);

  ProfileEncoding encoding() const { return encoding_; }
  UINT codePage() const { return codePage_; }
  const std::string& bytes() const { return bytes_; }
  // The end of the decodable content: the file's size, less a trailing odd byte of UTF-16.
  std::size_t contentEnd() const { return contentEnd_; }
  // True when the content is empty or ends with a line break.
  bool endsWithLineBreak() const { return endsWithLineBreak_; }

  // The memory the document holds, in bytes.
  std::size_t Footprint() const;

  const std::vector<ProfileLine>& lines() const { return lines_; }
  const std::vector<ProfileSection>& sections() const { return sections_; }

  profile::Text LineText(const ProfileLine& line) const;
  // The name of a section header, without brackets and surrounding blanks.
  profile::Text SectionName(const ProfileSection& section) const;
  ProfileEntryParts Entry(const ProfileLine& line) const;

  // The first section named name (compared without case), or -1.
  std::ptrdiff_t FindSection(profile::Text name) const;
  // The line of the first entry named key in that section, or -1. Only the first section of a
  // name has its entries indexed: later ones are invisible to reads, as on Windows.
  std::ptrdiff_t FindEntry(std::size_t section, profile::Text key) const;

 private:
  ProfileDocument() = default;

  class Builder;

  // Open addressing over (owner, folded name): owner 0 holds sections (payload: section index),
  // owner s + 1 the entries of section s (payload: line index).
  struct Slot {
    std::uint32_t hash;
    std::uint32_t owner;
    std::uint32_t payload;  // kEmptySlot when free
  };
  static constexpr std::uint32_t kEmptySlot = 0xFFFFFFFFu;

  profile::Text IndexedName(std::uint32_t owner, std::uint32_t payload) const;
  // The payload stored under (owner, name), or kEmptySlot.
  std::uint32_t Find(std::uint32_t owner, profile::Text name) const;
  // Stores payload under (owner, name) unless the name is there already; returns the payload
  // that is stored now. The table must have a free slot.
  std::uint32_t Insert(std::uint32_t owner, profile::Text name, std::uint32_t payload);

  std::string bytes_;
  std::u16string text_;
  std::vector<ProfileLine> lines_;
  std::vector<ProfileSection> sections_;
  std::vector<Slot> slots_;
  std::size_t contentEnd_ = 0;
  ProfileEncoding encoding_ = ProfileEncoding::kAnsi;
  UINT codePage_ = 0;
  bool endsWithLineBreak_ = true;
};

}  // namespace win32::detail
