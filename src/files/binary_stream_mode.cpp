// BinaryStream::ParseStreamMode: mode letters to Mode flags.

#include "vynutil/binary_stream.h"

namespace VynSDK::Util {

unsigned BinaryStream::ParseStreamMode(const MCHAR* mode) {
  unsigned flags = ModeText;
  if (mode == nullptr) return flags;
  for (const MCHAR* c = mode; *c != 0; ++c) {
    switch (*c) {
      case u'r':
        if (c[1] == u'+' || c[1] == u'w') {
          flags |= ModeRead | ModeWrite;
          ++c;
        } else {
          flags |= ModeRead;
        }
        break;
      case u'w':
        flags |= ModeWrite | ModeTruncate | ModeCreate;
        if (c[1] == u'+') {
          flags |= ModeRead;
          ++c;
        }
        break;
      case u'a':
        flags |= ModeWrite | ModeAppend | ModeCreate;
        if (c[1] == u'+') {
          flags |= ModeRead;
          ++c;
        }
        break;
      case u'b': flags = (flags & ~ModeText) | ModeBinary; break;
      case u't': flags = (flags & ~ModeBinary) | ModeText; break;
      case u'c': flags |= ModeWriteThrough; break;
      case u'n': flags &= ~ModeWriteThrough; break;
      case u'e': flags |= ModeExclusive; break;
      case u'T': flags |= ModeTemporary; break;
      case u'D': flags |= ModeDeleteOnClose; break;
      case u'S': flags = (flags & ~ModeRandomAccess) | ModeSequentialScan; break;
      case u'R': flags = (flags & ~ModeSequentialScan) | ModeRandomAccess; break;
      case u'N': break;
      default: return 0;
    }
  }
  return flags;
}

}  // namespace VynSDK::Util
