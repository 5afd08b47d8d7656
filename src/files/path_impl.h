#pragma once
// The state of a Path: its text (a symbol string) and the cache of its resolved absolute form.

#include "vynutil/path.h"
#include "vynutil/symbol_manager.h"

namespace VynSDK::Util {

class Path::PathImpl : public TSymbolString {
 public:
  PathImpl() = default;
  PathImpl(const PathImpl& other);
  PathImpl& operator=(const PathImpl&) = delete;

  // The text as a string (the base class).
  std::u16string& text() { return *this; }
  const std::u16string& text() const { return *this; }

  AutoPtr<Path> cache;       // the last resolved absolute path, or none
  int cacheChangeCount = 0;  // the symbol manager's change count when it was computed
  bool cacheStale = true;    // the text changed since
  bool normalized = false;   // Normalize has run on the current text
};

}  // namespace VynSDK::Util
