#pragma once
// Large transfers through calls that move at most 0x7FFFFFFF bytes each, as the file and handle
// streams make them.

#include <algorithm>
#include <cstddef>

namespace VynSDK::Util::stream_pieces {

// The most one read or write call of a file or handle stream is asked to move.
inline constexpr std::size_t kMaxPiece = 0x7FFFFFFF;

// What one call moved, and whether it ended the transfer (it failed, or met the end of the file).
struct Moved {
  std::size_t bytes;
  bool ended;
};

// Calls move(offset, piece) for consecutive pieces of at most kMaxPiece bytes until all bytes are
// moved, a call moves nothing or a call ends the transfer. Returns the bytes moved in total.
template <class Move>
std::size_t TransferInPieces(std::size_t bytes, Move move) {
  std::size_t done = 0;
  while (done < bytes) {
    const Moved moved = move(done, std::min(bytes - done, kMaxPiece));
    done += moved.bytes;
    if (moved.ended || moved.bytes == 0) break;
  }
  return done;
}

}  // namespace VynSDK::Util::stream_pieces
