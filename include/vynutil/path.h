#pragma once
// Path: the library's value type for a file-system path.
//
// The text is kept with backslash separators (forward slashes become backslashes when text is
// stored) and brought into one canonical form by Normalize: no doubled separators, no "."
// components, ".." folded where that is safe, a relative path starting with ".\". Symbols of the
// symbol manager inside a path are respected everywhere: a component holding a symbol is never
// folded away. A path can compute and cache its resolved absolute form (symbols resolved, made
// absolute against the project folder, normalized, lower case).
//
// A Path is a value without locking: one path must not be used from two threads at once, and
// GetResolvedAbsolutePath changes the cache of a const path. Operations that modify return the
// path, so they chain; none reports errors: what cannot apply leaves the text as it was.

#include "vynutil/auto_ptr.h"
#include "vynutil/export.h"
#include "vynutil/heap.h"
#include "vynutil/wintypes.h"
#include "vynutil/wstr.h"

namespace VynSDK::Util {

class VYN_API Path : public VynHeapOperators {
 public:
  class PathImpl;

  // Text is stored as given (a null text as empty), except that a braced asset identifier of 38
  // characters is turned into a file name by the host's asset library when it offers that.
  Path();
  Path(const MCHAR* text);
  Path(const WStr& text);
  // A deep copy, cache included.
  Path(const Path& other);
  ~Path();
  Path& operator=(const MCHAR* text);
  Path& operator=(const WStr& text);
  Path& operator=(const Path& other);
  Path& SetPath(const MCHAR* text);
  Path& SetPath(const WStr& text);
  Path& SetPath(const Path& other);

  // The text; valid until the path changes.
  const MCHAR* GetCStr() const;
  WStr GetString() const;
  bool IsEmpty() const;
  // Same characters, case included; no normalizing.
  bool operator==(const Path& other) const;
  bool IsEqual(const Path& other) const;

  bool HasTrailingBackslash() const;
  // Starts with one backslash not followed by a second ("\" counts).
  bool IsRootedAtBackslash() const;
  // Starts with a drive letter and a colon.
  bool IsRootedAtDriveLetter() const;
  // "\\server…" form.
  bool IsUnc() const;
  // Exactly "\\server\share".
  bool IsUncShare() const;
  // A drive prefix, a leading backslash or a UNC name.
  bool IsAbsolute() const;
  // No illegal character (* : ? " < > |) after the drive prefix, which must be followed by a
  // backslash when anything follows it. The empty path is legal.
  bool IsLegal() const;
  // A legal root: "\", "C:\", "\\server\share".
  bool IsRoot() const;
  // Lies inside folder (not the folder itself), compared without regard to case.
  bool IsRootedToFolder(const Path& folder) const;
  // Its normalized form starts with "..".
  bool StartsWithUpDirectory() const;
  // Both resolve to the same absolute path (trailing backslashes aside).
  bool ResolvesEquivalent(const Path& other) const;
  // The resolved absolute path, computed again when the text or a symbol value changed.
  const Path& GetResolvedAbsolutePath() const;
  // Resolves the symbols of this path in place, then whether the file or folder exists.
  bool Exists();
  // Asks the host to keep a base copy of the file before it is written; false without host.
  bool SaveBaseFile() const;

  Path& AddTrailingBackslash();
  Path& RemoveTrailingBackslash();
  Path& Append(const Path& other);
  Path& Prepend(const Path& other);
  // The parent folder: "C:\a\b" → "C:\a", "C:\a" → "C:\", "\\srv\share" → "\\srv".
  Path& RemoveLeaf();
  // The last component: "C:\a\b\" → "b\".
  Path& StripToLeaf();
  // Everything after the first component: "C:\a\b" → "a\b".
  Path& RemoveTopParent();
  // The first component: "C:\a\b" → "C:\", "a\b" → "a".
  Path& StripToTopParent();
  Path& ConvertToLowerCase();
  // Resolves symbols and makes a relative path absolute against the project folder.
  Path& ConvertToAbsolute();
  Path& ConvertToRelativeTo(const Path& base);
  Path& ConvertToRelativeToProjectFolder();
  // A path on a mapped network drive becomes its UNC form.
  Path& ConvertToUNC();
  // Resolves the symbols and normalizes the result.
  Path& ResolveSymbols();
  Path& Normalize();

 private:
  AutoPtr<PathImpl> mImpl;
};

}  // namespace VynSDK::Util
