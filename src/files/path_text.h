#pragma once
// The text rules of paths: Windows forms, canonical separators and the folding of "." and ".."
// components. Pure functions on UTF-16 text; the path class applies them.

#include <string>

namespace vyn::path_text {

// A letter (iswalpha) and a colon at the start.
bool HasDrivePrefix(const std::u16string& text);
// One backslash at the start, not followed by a second.
bool IsRootedAtBackslash(const std::u16string& text);
// The length of the root: up to the share's separator for "\\server\share…" (the whole text
// without one), 3 for "X:\", 1 for "\…", else 0.
std::size_t RootLength(const std::u16string& text);

// Every '/' becomes '\'.
void ForwardSlashesToBackslashes(std::u16string& text);
// Runs of backslashes starting at index 2 or later shrink to one; the first two characters are
// kept, so a UNC name's leading "\\" survives.
void CollapseBackslashes(std::u16string& text);
// Removes "." components ("a\.\b" → "a\b", ".\a" → "a", "C:\a\." → "C:\a", "." → "").
void RemoveDotComponents(std::u16string& text);
// Folds "x\.." components; a component that holds a symbol is never folded away, nor is a
// leading run of "..", nor anything at or before the root.
void FoldDotDotComponents(std::u16string& text);

// Whether text holds a symbol of the symbol manager.
bool HoldsSymbol(const std::u16string& text);

}  // namespace vyn::path_text
