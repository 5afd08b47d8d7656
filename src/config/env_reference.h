#pragma once
// Finding %NAME% references: '%', a letter or '_', then letters, digits or '_', then '%' (the
// language of the pattern %[a-zA-Z_][a-zA-Z0-9_]*%), searched anywhere in a text.

#include <cstddef>

namespace vyn::config {

template <typename Unit>
bool HasEnvironmentReference(const Unit* text, std::size_t length) {
  auto first = [](Unit c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_'; };
  auto next = [&](Unit c) { return first(c) || (c >= '0' && c <= '9'); };
  for (std::size_t i = 0; i + 2 < length; ++i) {
    if (text[i] != '%' || !first(text[i + 1])) continue;
    std::size_t j = i + 2;
    while (j < length && next(text[j])) ++j;
    if (j < length && text[j] == '%') return true;
  }
  return false;
}

}  // namespace vyn::config
