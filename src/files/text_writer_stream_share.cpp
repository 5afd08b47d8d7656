// Streams shared by copies of text writers.

#include "files/text_writer_stream_share.h"

namespace VynSDK::Util::TextFile::WriterStreams {

WriterStreamShare* Adopt(bool owns) { return owns ? new WriterStreamShare : nullptr; }

WriterStreamShare* Join(WriterStreamShare* share) {
  if (share != nullptr) ++share->users;
  return share;
}

void Leave(BinaryStream*& stream, WriterStreamShare*& share) {
  if (share != nullptr && --share->users == 0) {
    delete stream;
    delete share;
  }
  share = nullptr;
  stream = nullptr;
}

}  // namespace VynSDK::Util::TextFile::WriterStreams
