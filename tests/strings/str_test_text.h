#pragma once
// Making CStr, WStr and UTF8Str from UTF-8 text and reading their text back as UTF-8, so that one
// table of rows can run over the three classes.

#include <gtest/gtest.h>

#include <string>
#include <type_traits>

#include "vynutil/strclass.h"

namespace vyn::test {

// The class's string of the UTF-8 text; the null string for a null text. For CStr the text is
// converted to the narrow code page, so rows meant for all three classes hold ASCII.
template <class Str>
Str FromText(const char* utf8) {
  return Str::FromUTF8(utf8);
}

// The string's text in UTF-8 (empty for the null string).
template <class Str>
std::string TextOf(const Str& s) {
  const auto utf8 = s.ToUTF8();
  return utf8.Get() ? std::string(utf8.Get()) : std::string();
}

template <class Str>
bool IsNullString(const Str& s) {
  return s.ToVynString().IsNull();
}

// The typed-test lists: all three classes, and the two with the unit-wise editing operations.
using AllStrClasses = testing::Types<WStr, CStr, UTF8Str>;
using UnitStrClasses = testing::Types<WStr, CStr>;

// Names typed tests after the string class they run on.
struct StrClassNames {
  template <class Str>
  static std::string GetName(int) {
    if (std::is_same_v<Str, WStr>) return "WStr";
    if (std::is_same_v<Str, CStr>) return "CStr";
    return "UTF8Str";
  }
};

}  // namespace vyn::test
