#pragma once
// Streams shared by copies of a text writer or read-write text file: a stream the first of them
// owns is deleted when the last copy lets go of it.

#include <cstddef>

#include "vynutil/binary_stream.h"

namespace VynSDK::Util::TextFile {

struct WriterStreamShare {
  std::size_t users = 1;
};

namespace WriterStreams {

// The share for a newly opened stream: a count of one for an owned stream, null for a stream the
// caller keeps (nothing to delete). Throws std::bad_alloc.
WriterStreamShare* Adopt(bool owns);
// One more user of share (null stays null); returns share.
WriterStreamShare* Join(WriterStreamShare* share);
// One user fewer: the last one deletes stream. Both are null afterwards.
void Leave(BinaryStream*& stream, WriterStreamShare*& share);

}  // namespace WriterStreams

}  // namespace VynSDK::Util::TextFile
