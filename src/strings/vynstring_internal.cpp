// Raw form references for the string classes that hold one character pointer.

#include "strings/vynstring_data.h"

namespace VynSDK::Util {

namespace SB = StringBlocks;

const void* VynStringInternal::ToRef(const VynString& str, UINT codepage) {
  if (!str.m_data) return nullptr;
  EncodedForm* form = SB::FindOrMakeForm(str.m_data, VynString::NormalizeCP(codepage));
  SB::AddRef(str.m_data);
  return form->Chars();
}

const char* VynStringInternal::ToACPRef(const VynString& str) {
  return static_cast<const char*>(ToRef(str, CP_ACP));
}

const MCHAR* VynStringInternal::ToUTF16Ref(const VynString& str) {
  return static_cast<const MCHAR*>(ToRef(str, CP_UTF16));
}

VynString VynStringInternal::FromRef(const void* ref) {
  if (!ref) return VynString();
  VynStringData* data = SB::OwnerOf(ref);
  SB::AddRef(data);
  return VynString(data);
}

VynString VynStringInternal::Adopt(VynStringData* data) noexcept { return VynString(data); }

LONG VynStringInternal::IncRef(const void* ref) noexcept {
  if (!ref) return 0;
  VynStringData* data = SB::OwnerOf(ref);
  return static_cast<LONG>(data->refs.fetch_add(1, std::memory_order_relaxed) + 1);
}

LONG VynStringInternal::DecRef(const void* ref) noexcept {
  if (!ref) return 0;
  return static_cast<LONG>(SB::Release(SB::OwnerOf(ref)));
}

VynStringData* VynStringInternal::ToStringData(const void* ref) noexcept {
  return ref ? SB::OwnerOf(ref) : nullptr;
}

}  // namespace VynSDK::Util
