// The readable copy of an INI file, and turning a file into UTF-16 before a write.

#include "config/ini_readable_copy.h"

#include <chrono>
#include <mutex>
#include <unordered_map>
#include <utility>
#include <cstdio>
#include <thread>

#include "vynutil/codepages.h"
#include "vynutil/text_reader.h"
#include "vynutil/text_writer.h"
#include "win32/crt_file.h"
#include "win32/crt_stdio.h"
#include "win32/file_attributes.h"
#include "win32/file_handle.h"
#include "win32/file_ops.h"
#include "win32/file_replace.h"
#include "win32/file_stamp.h"
#include "win32/file_types.h"
#include "win32/handles.h"
#include "win32/temp_files.h"

namespace vyn::config {

namespace {

namespace TextFile = VynSDK::Util::TextFile;

// UTF-16 little-endian with the flag that writes its byte-order mark.
constexpr UINT kUtf16WithMark = 0x2000FDF4;
constexpr UINT kCodePageBits = 0x0FFFFFFF;
// The detection flags that do not change what the platform reads.
constexpr UINT kIgnoredFlags = 0xAFFFFFFF;
constexpr int kMarkReads = 150;
constexpr auto kMarkRetryDelay = std::chrono::milliseconds(25);

// Whether the platform INI functions read the file as it is: its detected encoding is the ANSI
// code page or UTF-16 LE with its mark.
bool DetectPlatformReadsDirectly(const MCHAR* file) {
  TextFile::Reader reader;
  if (!reader.Open(file, 0, TextFile::LineEndCRLF)) return true;
  const UINT encoding = reader.Encoding();
  return (encoding & kCodePageBits) == 0 || (encoding & kIgnoredFlags) == kUtf16WithMark;
}

// Detection reads up to 64 KiB of the file: its answer is kept per file name for as long as the
// file's stamp stays and is settled, so a lookup in an unchanged file reads nothing.
struct DetectionCache {
  std::mutex lock;
  std::unordered_map<std::u16string, std::pair<win32::FileStamp, bool>> answers;
};

// A file that cannot be looked at (missing above all) is read under its own name.
bool PlatformReadsDirectly(const MCHAR* file) {
  static DetectionCache* cache = new DetectionCache;
  win32::FileStamp stamp;
  BOOL settled = FALSE;
  if (!win32::GetFileStampW(file, &stamp, &settled)) return true;
  const std::u16string name(file);
  if (settled) {
    std::lock_guard<std::mutex> hold(cache->lock);
    const auto found = cache->answers.find(name);
    if (found != cache->answers.end() && found->second.first == stamp) return found->second.second;
  }
  const bool direct = DetectPlatformReadsDirectly(file);
  if (settled) {
    std::lock_guard<std::mutex> hold(cache->lock);
    if (cache->answers.size() >= 4096) cache->answers.clear();
    cache->answers[name] = {stamp, direct};
  }
  return direct;
}

// The file's first bytes: true when at least 2 could be read and they are FF FE; false when
// they are not; no value when every try to read them failed.
enum class MarkCheck { Utf16, Other, Unreadable };

MarkCheck CheckMark(const MCHAR* file) {
  FILE* stream = win32::_wfopen(file, u"rb");
  if (stream == nullptr) return MarkCheck::Unreadable;
  unsigned char bytes[4] = {};
  std::size_t got = 0;
  bool read = false;
  for (int attempt = 0; attempt < kMarkReads; ++attempt) {
    std::clearerr(stream);
    got = win32::fread(bytes, 1, sizeof bytes, stream);
    if (got != 0 || std::feof(stream)) {
      read = true;
      break;
    }
    std::this_thread::sleep_for(kMarkRetryDelay);
  }
  win32::fclose(stream);
  if (!read) return MarkCheck::Unreadable;
  return got >= 2 && bytes[0] == 0xFF && bytes[1] == 0xFE ? MarkCheck::Utf16 : MarkCheck::Other;
}

// A new, empty file holding only the UTF-16 mark.
void CreateWithMark(const MCHAR* file) {
  const HANDLE handle = win32::CreateFileW(file, win32::GENERIC_WRITE, 0, nullptr, win32::CREATE_ALWAYS,
                                           win32::FILE_ATTRIBUTE_TEMPORARY, nullptr);
  if (handle == INVALID_HANDLE_VALUE) return;
  const unsigned char mark[2] = {0xFF, 0xFE};
  DWORD written = 0;
  win32::WriteFile(handle, mark, sizeof mark, &written, nullptr);
  win32::CloseHandle(handle);
}

// The whole content of a file; false when it cannot be read.
bool ReadBytes(const MCHAR* file, std::string& bytes) {
  FILE* stream = win32::_wfopen(file, u"rb");
  if (stream == nullptr) return false;
  char chunk[65536];
  std::size_t got = 0;
  while ((got = win32::fread(chunk, 1, sizeof chunk, stream)) != 0) bytes.append(chunk, got);
  const bool ok = std::ferror(stream) == 0;
  win32::fclose(stream);
  return ok;
}

}  // namespace

std::u16string MakeUtf16Copy(const MCHAR* file) {
  MCHAR folder[win32::MAX_PATH] = {};
  MCHAR name[win32::MAX_PATH] = {};
  if (win32::GetTempPathW(win32::MAX_PATH, folder) == 0) return {};
  if (win32::GetTempFileNameW(folder, u"INI", 0, name) == 0) return {};
  TextFile::Reader reader;
  TextFile::Writer writer;
  if (!reader.Open(file, 0, TextFile::LineEndCRLF) ||
      !writer.Open(name, false, kUtf16WithMark, TextFile::LineEndCRLF)) {
    win32::DeleteFileW(name);
    return {};
  }
  const VynSDK::Util::VynString text = reader.ReadFull();
  if (!text.IsNull()) writer.Write(text);
  writer.Close();
  return name;
}

ReadableCopy::ReadableCopy(const MCHAR* file) : m_file(file) {
  if (file == nullptr || PlatformReadsDirectly(file)) return;
  m_copy = MakeUtf16Copy(file);
}

ReadableCopy::~ReadableCopy() {
  if (!m_copy.empty()) win32::DeleteFileW(m_copy.c_str());
}

void MakeFileUtf16(const MCHAR* file) {
  if (!win32::PathFileExistsW(file)) {
    CreateWithMark(file);
    return;
  }
  if (CheckMark(file) != MarkCheck::Other) return;
  const std::u16string copy = MakeUtf16Copy(file);
  if (copy.empty()) return;
  // The converted text replaces the file's content in one step (a copy over it could be cut
  // short by a crash and leave neither text); the file keeps its permissions and links.
  std::string bytes;
  if (ReadBytes(copy.c_str(), bytes)) win32::ReplaceFileContentW(file, bytes.data(), bytes.size());
  win32::DeleteFileW(copy.c_str());
}

}  // namespace vyn::config
