// A stand-in for the host's asset library: braced asset identifiers become file names under
// "C:\assets\", other text is returned as it is.

#include "vynutil/wstr.h"

extern "C" __attribute__((visibility("default"))) WStr
ConvertFileNameOrAssetIDStringToFileName(const MCHAR* text) {
  WStr result(text);
  if (text && text[0] == u'{') {
    WStr name(u"C:\\assets\\");
    name += WStr(text + 1);
    name.Resize(name.Length() - 1);
    return name;
  }
  return result;
}
