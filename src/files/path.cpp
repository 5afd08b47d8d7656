// Path: construction, queries and the operations that rewrite the text.

#include "vynutil/path.h"

#include <string_view>

#include "files/path_asset.h"
#include "files/path_impl.h"
#include "files/path_text.h"
#include "vynutil/file_exists.h"
#include "vynutil/host_registry.h"
#include "win32/crt_ctype.h"
#include "win32/crt_string.h"
#include "win32/shell_path.h"

namespace VynSDK::Util {

using namespace vyn::path_text;
namespace path_text = vyn::path_text;

namespace {

constexpr char16_t kBackslash = u'\\';
constexpr std::u16string_view kIllegalCharacters = u"*:?\"<>|";

bool EndsWithBackslash(const std::u16string& text) { return !text.empty() && text.back() == kBackslash; }

void RemoveOneTrailingBackslash(std::u16string& text) {
  if (EndsWithBackslash(text)) text.pop_back();
}

// Where the characters that must be legal start: after a drive prefix.
std::size_t AfterDrivePrefix(const std::u16string& text) { return HasDrivePrefix(text) ? 2 : 0; }

}  // namespace

Path::PathImpl::PathImpl(const PathImpl& other)
    : TSymbolString(other),
      cache(other.cache ? new Path(*other.cache) : nullptr),
      cacheChangeCount(other.cacheChangeCount),
      cacheStale(other.cacheStale),
      normalized(other.normalized) {}

Path::Path() : mImpl(new PathImpl) {}
Path::Path(const MCHAR* text) : mImpl(new PathImpl) { SetPath(text); }
Path::Path(const WStr& text) : mImpl(new PathImpl) { SetPath(text); }
Path::Path(const Path& other) : mImpl(new PathImpl(*other.mImpl)) {}
Path::~Path() = default;

Path& Path::operator=(const MCHAR* text) { return SetPath(text); }
Path& Path::operator=(const WStr& text) { return SetPath(text); }
Path& Path::operator=(const Path& other) { return SetPath(other); }

Path& Path::SetPath(const MCHAR* text) {
  std::u16string& t = mImpl->text();
  t = vyn::StoredPathText(text);
  ForwardSlashesToBackslashes(t);
  CollapseBackslashes(t);
  mImpl->normalized = false;
  mImpl->cacheStale = true;
  return *this;
}

Path& Path::SetPath(const WStr& text) { return SetPath(text.data()); }

Path& Path::SetPath(const Path& other) {
  if (this == &other) return *this;
  mImpl->text() = other.mImpl->text();
  if (other.mImpl->cache) {
    mImpl->cache.Reset(new Path(*other.mImpl->cache));
    mImpl->cacheStale = other.mImpl->cacheStale;
    mImpl->cacheChangeCount = other.mImpl->cacheChangeCount;
  } else {
    mImpl->cacheStale = true;
  }
  mImpl->normalized = other.mImpl->normalized;
  return *this;
}

const MCHAR* Path::GetCStr() const { return mImpl->text().c_str(); }

WStr Path::GetString() const { return WStr::FromMCHAR(mImpl->text().data(), mImpl->text().size()); }

bool Path::IsEmpty() const { return mImpl->text().empty(); }

bool Path::operator==(const Path& other) const { return mImpl->text() == other.mImpl->text(); }

bool Path::IsEqual(const Path& other) const { return *this == other; }

bool Path::HasTrailingBackslash() const { return EndsWithBackslash(mImpl->text()); }

bool Path::IsRootedAtBackslash() const { return path_text::IsRootedAtBackslash(mImpl->text()); }

bool Path::IsRootedAtDriveLetter() const { return HasDrivePrefix(mImpl->text()); }

bool Path::IsUnc() const { return win32::PathIsUNCW(GetCStr()) != FALSE; }

bool Path::IsUncShare() const { return win32::PathIsUNCServerShareW(GetCStr()) != FALSE; }

bool Path::IsAbsolute() const {
  return HasDrivePrefix(mImpl->text()) || IsRootedAtBackslash() || IsUnc();
}

bool Path::IsLegal() const {
  const std::u16string& t = mImpl->text();
  if (t.empty()) return true;
  if (t[0] == u':') return false;
  if (HasDrivePrefix(t) && t.size() > 2 && t[2] != kBackslash) return false;
  return std::u16string_view(t).substr(AfterDrivePrefix(t)).find_first_of(kIllegalCharacters) ==
         std::u16string_view::npos;
}

bool Path::IsRoot() const {
  return !IsEmpty() && IsLegal() && win32::PathIsRootW(GetCStr()) != FALSE;
}

bool Path::IsRootedToFolder(const Path& folder) const {
  Path self(*this);
  self.Normalize().RemoveTrailingBackslash();
  Path prefix(folder);
  prefix.Normalize();
  if (!prefix.HasTrailingBackslash()) prefix.mImpl->text() += kBackslash;
  const std::u16string& p = prefix.mImpl->text();
  return win32::_wcsnicmp(self.GetCStr(), p.c_str(), p.size()) == 0;
}

bool Path::StartsWithUpDirectory() const {
  Path copy(*this);
  const std::u16string& t = copy.Normalize().mImpl->text();
  return t.size() >= 2 && t[0] == u'.' && t[1] == u'.';
}

bool Path::ResolvesEquivalent(const Path& other) const {
  std::u16string_view a = GetResolvedAbsolutePath().mImpl->text();
  std::u16string_view b = other.GetResolvedAbsolutePath().mImpl->text();
  if (!a.empty() && a.back() == kBackslash) a.remove_suffix(1);
  if (!b.empty() && b.back() == kBackslash) b.remove_suffix(1);
  return a == b;
}

const Path& Path::GetResolvedAbsolutePath() const {
  PathImpl& impl = *mImpl;
  const int changeCount = ISymbolManager::GetInstance()->GetChangeCount();
  if (impl.cache && !impl.cacheStale && impl.cacheChangeCount >= changeCount) return *impl.cache;
  if (impl.cache) {
    impl.cache->SetPath(GetCStr());
  } else {
    impl.cache.Reset(new Path(GetCStr()));
  }
  impl.cache->ConvertToAbsolute().ConvertToLowerCase();
  impl.cacheChangeCount = changeCount;
  impl.cacheStale = false;
  return *impl.cache;
}

bool Path::Exists() {
  ResolveSymbols();
  return UtilFileExists(GetCStr(), true);
}

bool Path::SaveBaseFile() const {
  IAppInternal* app = UtilGetIAppInternal();
  return app ? app->SaveBaseFile(GetCStr()) : false;
}

Path& Path::AddTrailingBackslash() {
  if (!HasTrailingBackslash()) {
    mImpl->text() += kBackslash;
    mImpl->cacheStale = true;
  }
  return *this;
}

Path& Path::RemoveTrailingBackslash() {
  if (HasTrailingBackslash()) {
    mImpl->text().pop_back();
    mImpl->cacheStale = true;
  }
  return *this;
}

Path& Path::Append(const Path& other) {
  const std::u16string tail = other.mImpl->text();  // other may be this path
  std::u16string& t = mImpl->text();
  if (!t.empty() && t.back() != kBackslash && !tail.empty() && tail.front() != kBackslash) t += kBackslash;
  t += tail;
  if (t.size() > 1) CollapseBackslashes(t);
  mImpl->normalized = mImpl->normalized && other.mImpl->normalized;
  mImpl->cacheStale = true;
  return *this;
}

Path& Path::Prepend(const Path& other) {
  const std::u16string head = other.mImpl->text();
  std::u16string& t = mImpl->text();
  if (!head.empty() && head.back() != kBackslash && !t.empty() && t.front() != kBackslash) {
    t.insert(0, 1, kBackslash);
  }
  t.insert(0, head);
  if (t.size() > 1) CollapseBackslashes(t);
  mImpl->normalized = mImpl->normalized && other.mImpl->normalized;
  mImpl->cacheStale = true;
  return *this;
}

Path& Path::RemoveLeaf() {
  std::u16string& t = mImpl->text();
  RemoveOneTrailingBackslash(t);
  const std::size_t b = t.rfind(kBackslash);
  if (b == std::u16string::npos || (IsUnc() && b < 2)) {
    t.clear();
  } else if (HasDrivePrefix(t) && b == 2) {
    t.resize(3);
  } else {
    t.resize(b);
  }
  mImpl->cacheStale = true;
  return *this;
}

Path& Path::StripToLeaf() {
  if (IsRoot() && !IsUnc()) return *this;
  std::u16string& t = mImpl->text();
  std::size_t b = t.rfind(kBackslash);
  if (b != std::u16string::npos && b + 1 == t.size()) {
    b = b == 0 ? std::u16string::npos : t.rfind(kBackslash, b - 1);
  }
  if (b == std::u16string::npos) return *this;
  t.erase(0, b + 1);
  mImpl->cacheStale = true;
  return *this;
}

Path& Path::RemoveTopParent() {
  std::u16string& t = mImpl->text();
  const std::size_t f = t.find(kBackslash, IsUnc() ? 2 : 0);
  if (f == std::u16string::npos) {
    t.clear();
  } else {
    t.erase(0, f + 1);
  }
  mImpl->cacheStale = true;
  return *this;
}

Path& Path::StripToTopParent() {
  std::u16string& t = mImpl->text();
  const std::size_t f = t.find(kBackslash);
  if (f == std::u16string::npos) return *this;
  const std::size_t root = RootLength(t);
  t.resize(f > root ? f : root);
  mImpl->cacheStale = true;
  return *this;
}

Path& Path::ConvertToLowerCase() {
  for (char16_t& c : mImpl->text()) c = static_cast<char16_t>(win32::towlower(c));
  mImpl->cacheStale = true;
  return *this;
}

Path& Path::ConvertToAbsolute() {
  ResolveSymbols();
  if (IsAbsolute()) return *this;
  std::u16string& t = mImpl->text();
  const bool startsUp = t.size() >= 2 && t[0] == u'.' && t[1] == u'.';
  ISymbolManager* symbols = ISymbolManager::GetInstance();
  const std::u16string& rootSymbol = symbols->GetDefaultRootSymbol();
  std::u16string base;
  if (ISymbolResolver* resolver = symbols->GetSymbolResolver(rootSymbol)) {
    base = resolver->ResolveSymbol(rootSymbol);
  }
  if (!base.empty() && base.back() != kBackslash && (t.empty() || t.front() != kBackslash)) {
    base += kBackslash;
  }
  t.insert(0, base);
  mImpl->cacheStale = true;
  if (startsUp) {
    mImpl->normalized = false;
    Normalize();
  } else {
    RemoveDotComponents(t);
  }
  return *this;
}

Path& Path::ConvertToRelativeTo(const Path& base) {
  std::u16string& t = mImpl->text();
  const std::u16string& b = base.mImpl->text();
  if (path_text::IsRootedAtBackslash(t) && HasDrivePrefix(b)) {
    t.insert(0, b, 0, 2);
    mImpl->normalized = false;
  } else if (HasDrivePrefix(t) && path_text::IsRootedAtBackslash(b)) {
    t.erase(0, 2);
    mImpl->normalized = false;
  }
  mImpl->cacheStale = true;
  Normalize();
  Path from(base);
  if (!(from.IsRoot() && !from.IsUnc())) from.RemoveTrailingBackslash();
  from.Normalize();
  MCHAR relative[win32::MAX_PATH];
  if (win32::PathRelativePathToW(relative, from.GetCStr(), win32::FILE_ATTRIBUTE_DIRECTORY,
                                 GetCStr(), win32::FILE_ATTRIBUTE_DIRECTORY)) {
    t = relative;
  }
  return *this;
}

Path& Path::ConvertToRelativeToProjectFolder() {
  Path project(ISymbolManager::GetInstance()->GetDefaultRootSymbol().c_str());
  project.ResolveSymbols();
  return ConvertToRelativeTo(project);
}

Path& Path::ConvertToUNC() {
  WStr universal;
  if (UtilGetUniversalFilename(universal, GetCStr()) == 1) {
    SetPath(universal);
    RemoveTrailingBackslash();
    Normalize();
  }
  return *this;
}

Path& Path::ResolveSymbols() {
  mImpl->Resolve();
  mImpl->normalized = false;
  mImpl->cacheStale = true;
  return Normalize();
}

Path& Path::Normalize() {
  PathImpl& impl = *mImpl;
  if (impl.normalized) return *this;
  impl.normalized = true;
  std::u16string& t = impl.text();
  if (!t.empty()) {
    ForwardSlashesToBackslashes(t);
    CollapseBackslashes(t);
    // The drive's backslash goes in first, so that "C:.\a" and "C:..\a" fold like "C:\.\a".
    if (HasDrivePrefix(t) && (t.size() == 2 || t[2] != kBackslash)) t.insert(2, 1, kBackslash);
    RemoveDotComponents(t);
    FoldDotDotComponents(t);
    impl.cacheStale = true;
  }
  if (IsAbsolute() || (t.size() >= 2 && t[0] == u'.' && t[1] == u'.')) return *this;
  // A relative path: made explicit with ".\", unless its first component is a symbol.
  const std::size_t separator = t.find(kBackslash);
  std::size_t firstEnd = separator == std::u16string::npos ? t.size() : separator;
  const std::size_t root = RootLength(t);
  if (root > firstEnd) firstEnd = root;
  if (HoldsSymbol(t.substr(0, firstEnd))) return *this;
  if (t.empty()) {
    t = u".";
  } else {
    t.insert(0, u".\\");
    CollapseBackslashes(t);
  }
  impl.cacheStale = true;
  return *this;
}

}  // namespace VynSDK::Util
