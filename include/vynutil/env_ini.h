#pragma once
// %NAME% references in INI values: expansion from the process environment, and the memory of
// what was read (raw text and its expansion) per section, key and INI file, so that a folder
// written back unchanged can be stored in its unexpanded form again.

#include <map>
#include <mutex>
#include <string>
#include <tuple>
#include <utility>

#include "vynutil/export.h"

namespace Util {

class VYN_API EnvIni {
 public:
  // The process-wide object, made on first use.
  static EnvIni& Instance();

  // text with every %NAME% of a set variable replaced by its value; others stay as written.
  static std::u16string ExpandEnvVars(const std::u16string& text);
  // Whether text holds a reference: '%', a letter or '_', letters, digits or '_', '%'.
  static bool NeedsExpansion(const std::u16string& text);

  // Names are used as passed: compared exactly, case counting.
  bool HasExpansion(const std::u16string& section, const std::u16string& key, const std::u16string& file);
  // The stored expansion; empty when nothing is stored.
  std::u16string GetExpansion(const std::u16string& section, const std::u16string& key, const std::u16string& file);
  // The stored raw text, or fallback when nothing is stored.
  std::u16string GetRawValue(const std::u16string& section, const std::u16string& key, const std::u16string& file,
                             const std::u16string& fallback);
  // Expands raw, stores raw and expansion (replacing an earlier pair), returns the expansion.
  std::u16string SetExpansion(const std::u16string& section, const std::u16string& key, const std::u16string& file,
                              const std::u16string& raw);

 private:
  EnvIni() = default;
  using Key = std::tuple<std::u16string, std::u16string, std::u16string>;
  struct Value {
    std::u16string raw;
    std::u16string expansion;
  };
  // INI reads of different files run at the same time on several threads: the map is locked.
  std::mutex m_lock;
  std::map<Key, Value> m_values;
};

}  // namespace Util
