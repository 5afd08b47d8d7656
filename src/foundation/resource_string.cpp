#include "vynutil/resource_string.h"

#include "win32/resource.h"

namespace VynSDK {

bool GetResourceStringAsMSTR(HINSTANCE module, unsigned int id, WStr& out) {
  if (!module) return false;
  const MCHAR* text = nullptr;
  const int length = win32::LoadStringW(module, id, reinterpret_cast<MCHAR*>(&text), 0);
  if (length <= 0 || !text) {
    out = WStr(u"");
    return false;
  }
  out = WStr::FromMCHAR(text, static_cast<std::size_t>(length));
  return true;
}

WStr GetResourceStringAsMSTR(HINSTANCE module, unsigned int id) {
  WStr text(u"");
  GetResourceStringAsMSTR(module, id, text);
  return text;
}

}  // namespace VynSDK
