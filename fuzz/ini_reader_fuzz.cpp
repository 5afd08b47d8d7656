// The private-profile functions on arbitrary file bytes, with section and key names and buffer
// sizes taken from the input, in a single-byte, a double-byte and the UTF-8 process code page.
// No crash, no hang, no access outside a buffer (the buffers are exactly as large as the size
// passed, so the sanitizers see any overrun), and:
// - a result never reaches the buffer's size, and the text ends where the rules say;
// - a write that succeeds can be read back, and a fresh parse of the written file (after the
//   cache is flushed) reads the same as the cached copy.
//
// Input: byte 0 picks the code page and the buffer size, bytes 1-2 the lengths of the section
// and key names (UTF-16 units, taken two bytes each), then the names, then the file.
// The file lives in a private folder under $TMPDIR (or /tmp).

#include <unistd.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "win32/codepage.h"
#include "win32/profile.h"

namespace {

void Check(bool condition) {
  if (!condition) __builtin_trap();
}

const std::u16string& FilePath() {
  static const std::u16string path = [] {
    const char* base = std::getenv("TMPDIR");
    std::string folder = std::string(base != nullptr && *base != 0 ? base : "/tmp") + "/ini-fuzz-XXXXXX";
    Check(mkdtemp(folder.data()) != nullptr);
    const std::string file = folder + "/f.ini";
    return std::u16string(file.begin(), file.end());
  }();
  return path;
}

void WriteFile(const std::uint8_t* data, std::size_t size) {
  const std::u16string& path = FilePath();
  const std::string narrow(path.begin(), path.end());
  FILE* out = std::fopen(narrow.c_str(), "wb");
  Check(out != nullptr);
  if (size > 0) Check(std::fwrite(data, 1, size, out) == size);
  std::fclose(out);
}

std::u16string Units(const std::uint8_t* data, std::size_t units) {
  std::u16string text(units, u'\0');
  for (std::size_t i = 0; i < units; ++i) {
    text[i] = static_cast<char16_t>(data[2 * i] | data[2 * i + 1] << 8);
    if (text[i] == 0) text[i] = u'.';
  }
  return text;
}

// Whether a key reads back as written: no comment marker in front.
bool ReadableKey(const std::u16string& key) {
  const std::size_t first = key.find_first_not_of(u" \t\v");
  return first == std::u16string::npos || key[first] != u';';
}

bool PlainAscii(const std::u16string& text) {
  for (char16_t c : text) {
    if (c < 0x20 || c >= 0x7F) return false;
  }
  return true;
}

// A single value: the result is below the size and the text ends right there.
std::u16string ReadValue(const MCHAR* section, const MCHAR* key, DWORD size) {
  std::vector<MCHAR> buffer(size);
  const DWORD result = win32::GetPrivateProfileStringW(section, key, u"dflt  ", buffer.data(), size,
                                                       FilePath().c_str());
  if (size == 0) return {};
  Check(result < size && buffer[result] == 0);
  return std::u16string(buffer.data(), result);
}

// A list: ends in two nulls (or one, when empty), and the result leaves room for them.
void ReadList(DWORD result, const std::vector<MCHAR>& buffer) {
  const DWORD size = static_cast<DWORD>(buffer.size());
  if (size == 0) return Check(result == 0);
  Check(buffer[result] == 0);
  // Whole: the last string's null before the final one. Cut: two nulls at the end.
  if (result > 0) Check(result + 1 < size && (buffer[result - 1] == 0 || buffer[result + 1] == 0));
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size < 3) return 0;
  static const UINT kCodePages[] = {1252, 932, 65001, 936};
  win32::SetProcessCodePages(kCodePages[data[0] & 3], 0);
  static const DWORD kSizes[] = {0, 1, 2, 3, 7, 16, 64, 300, 4096, 70000};
  const DWORD bufferSize = kSizes[(data[0] >> 2) % 10];
  std::size_t at = 3;
  const std::size_t sectionUnits = std::min<std::size_t>(data[1] % 12, (size - at) / 2);
  const std::u16string section = Units(data + at, sectionUnits);
  at += 2 * sectionUnits;
  const std::size_t keyUnits = std::min<std::size_t>(data[2] % 12, (size - at) / 2);
  const std::u16string key = Units(data + at, keyUnits);
  at += 2 * keyUnits;
  WriteFile(data + at, size - at);
  const MCHAR* file = FilePath().c_str();

  (void)ReadValue(section.c_str(), key.c_str(), bufferSize);
  std::vector<MCHAR> list(bufferSize);
  ReadList(win32::GetPrivateProfileStringW(nullptr, key.c_str(), nullptr, list.data(), bufferSize, file), list);
  ReadList(win32::GetPrivateProfileStringW(section.c_str(), nullptr, nullptr, list.data(), bufferSize, file), list);
  ReadList(win32::GetPrivateProfileSectionNamesW(list.data(), bufferSize, file), list);
  if (bufferSize > 0) {
    ReadList(win32::GetPrivateProfileSectionW(section.c_str(), list.data(), bufferSize, file), list);
  }
  (void)win32::GetPrivateProfileIntW(section.c_str(), key.c_str(), 7, file);
  unsigned char bytes[8];
  (void)win32::GetPrivateProfileStructW(section.c_str(), key.c_str(), bytes, data[0] & 7, file);

  // One write, read back from the cache and again from a fresh parse.
  const std::u16string value = u"v" + std::u16string(data[0] % 5, u'x');
  if (win32::WritePrivateProfileStringW(section.c_str(), key.c_str(), value.c_str(), file)) {
    const std::u16string cached = ReadValue(section.c_str(), key.c_str(), 4096);
    const bool readable = PlainAscii(section) && PlainAscii(key) && ReadableKey(key);
    if (readable) Check(cached == value);
    win32::WritePrivateProfileStringW(nullptr, nullptr, nullptr, file);  // drops the cache
    Check(ReadValue(section.c_str(), key.c_str(), 4096) == cached);
  }
  return 0;
}
