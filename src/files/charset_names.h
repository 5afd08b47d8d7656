#pragma once
// The charset names of "coding" declarations and their code pages, in search order: a longer
// name that begins like a shorter one comes first.

#include <cstddef>
#include <span>

#include "vynutil/wintypes.h"

namespace VynSDK::Util::TextFile::detail {

struct CharsetName {
  const MCHAR* name;  // lower case ASCII
  std::size_t length;
  UINT codepage;
};

std::span<const CharsetName> CharsetNames();

}  // namespace VynSDK::Util::TextFile::detail
