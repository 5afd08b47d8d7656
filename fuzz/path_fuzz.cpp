// Path normalisation, splitting and relative forms on arbitrary UTF-16 text: no crash, no hang,
// and no "." component left inside a normalized path.

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>

#include "vynutil/path.h"

using VynSDK::Util::Path;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  std::u16string text(size / 2, u'\0');
  if (!text.empty()) std::memcpy(text.data(), data, text.size() * 2);
  // The text up to the first terminator is one path, the rest another.
  const std::size_t split = text.find(u'\0');
  const std::u16string first = text.substr(0, split);
  const std::u16string second = split == std::u16string::npos ? std::u16string() : text.substr(split + 1);

  Path p(first.c_str());
  (void)p.IsLegal(), (void)p.IsRoot(), (void)p.IsAbsolute(), (void)p.IsUncShare();
  Path normalized(p);
  normalized.Normalize();
  const std::u16string n = normalized.GetCStr();
  if (n.find(u"\\.\\") != std::u16string::npos) __builtin_trap();
  for (int operation = 0; operation < 6; ++operation) {
    Path q(p);
    switch (operation) {
      case 0: q.RemoveLeaf(); break;
      case 1: q.StripToLeaf(); break;
      case 2: q.RemoveTopParent(); break;
      case 3: q.StripToTopParent(); break;
      case 4: q.Append(Path(second.c_str())).Prepend(Path(second.c_str())); break;
      case 5: q.ConvertToRelativeTo(Path(second.c_str())); break;
    }
  }
  (void)p.IsRootedToFolder(Path(second.c_str()));
  (void)p.GetResolvedAbsolutePath();
  return 0;
}
