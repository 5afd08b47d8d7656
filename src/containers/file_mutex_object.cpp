// FileMutexObject: the mutex named after a file, held from construction.

#include <algorithm>
#include <cstdio>
#include <string>

#include "containers/file_mutex_cache.h"
#include "vynutil/mutex.h"
#include <cstdint>
#include "win32/sync.h"
#include "win32/user_text.h"

namespace VynSDK::Util {

namespace {

constexpr std::size_t kNameBuffer = 260;
// Units of a long name kept in front of its hash.
constexpr std::size_t kKeptPrefix = kNameBuffer - 1 - 17;

// 64-bit FNV-1a over the units of a name.
std::uint64_t NameHash(const std::u16string& name) {
  std::uint64_t hash = 0xCBF29CE484222325ull;
  for (const char16_t unit : name) {
    hash = (hash ^ unit) * 0x100000001B3ull;
  }
  return hash;
}

// The mutex name of a path: lower case, "/" for "\". A path too long for a mutex name keeps its
// beginning and ends in a hash of the whole, so that long paths still lock (and differ).
std::u16string MutexName(const MCHAR* path) {
  std::u16string name(path);
  if (name.size() < kNameBuffer) name.resize(kNameBuffer, u'\0');
  win32::CharLowerBuffW(name.data(), static_cast<DWORD>(name.size()));
  std::replace(name.begin(), name.end(), u'\\', u'/');
  name.resize(std::char_traits<char16_t>::length(name.c_str()));
  if (name.size() >= kNameBuffer) {
    char hex[18];
    std::snprintf(hex, sizeof hex, "#%016llx", static_cast<unsigned long long>(NameHash(name)));
    name.resize(kKeptPrefix);
    name.append(hex, hex + 17);
  }
  return name;
}

}  // namespace

FileMutexObject::FileMutexObject(const MCHAR* path, DWORD timeout) {
  if (path == nullptr || path[0] == 0) {
    m_acquired = true;
    return;
  }
  bool kept = false;
  m_handle = vyn::containers::OpenFileMutex(MutexName(path), kept);
  if (m_handle == nullptr) return;
  // A mutex whose owner died is ours now: it counts as acquired and is released like any other,
  // or one process that died holding a file's mutex would make every other wait for ever.
  const DWORD result = win32::WaitForSingleObject(m_handle, timeout);
  m_acquired = result == WAIT_OBJECT_0 || result == WAIT_ABANDONED;
}

FileMutexObject::~FileMutexObject() { ReleaseMutex(); }

bool FileMutexObject::MutexAquired() { return m_acquired; }

void FileMutexObject::ReleaseMutex() {
  if (m_acquired && m_handle != nullptr) win32::ReleaseMutex(m_handle);
  m_acquired = false;
  if (m_handle != nullptr) {
    vyn::containers::CloseFileMutex(m_handle);
    m_handle = nullptr;
  }
}

}  // namespace VynSDK::Util
