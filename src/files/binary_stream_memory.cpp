// BinaryStreamMemory: a stream over one buffer that the creator's callbacks grow and release.
//
// The length never exceeds the allocation. The position is whatever Seek made it (a negative
// position is a very large one here), so every access is measured against the length or the
// allocation first and nothing outside the buffer is ever touched.

#include <algorithm>
#include <cstring>
#include <limits>

#include "vynutil/binary_stream.h"

namespace VynSDK::Util {

namespace {

constexpr std::size_t kMaxSize = std::numeric_limits<std::size_t>::max();
// Growth adds this much beyond what is needed, so that small writes do not reallocate each time.
constexpr std::size_t kGrowthSlack = 32;

std::byte* Bytes(void* data) { return static_cast<std::byte*>(data); }

}  // namespace

BinaryStreamMemory::BinaryStreamMemory(void* data, std::size_t size,
                                       void* (*reallocate)(void*, std::size_t),
                                       void (*release)(void*))
    : data_(data),
      allocated_(data != nullptr ? size : 0),
      length_(allocated_),
      position_(0),
      reallocate_(reallocate),
      release_(release) {}

BinaryStreamMemory::~BinaryStreamMemory() {
  if (release_ != nullptr && data_ != nullptr) release_(data_);
}

VynString BinaryStreamMemory::LastError() { return VynString(); }

bool BinaryStreamMemory::IsEndOfFile() const { return position_ >= length_; }

bool BinaryStreamMemory::CanWrite() const { return true; }

void BinaryStreamMemory::Flush() {}

void* BinaryStreamMemory::Data(std::size_t offset) const {
  return Bytes(data_) + std::min(offset, allocated_);
}

void* BinaryStreamMemory::CurrentData() const { return Data(position_); }

std::size_t BinaryStreamMemory::Remaining() const {
  return position_ < length_ ? length_ - position_ : 0;
}

bool BinaryStreamMemory::Reallocate(std::size_t bytes) {
  if (reallocate_ == nullptr) return false;
  void* moved = reallocate_(data_, bytes);
  if (moved == nullptr) return false;  // the old buffer is still ours and unchanged
  data_ = moved;
  allocated_ = bytes;
  return true;
}

bool BinaryStreamMemory::Grow(std::size_t needed) {
  if (needed <= allocated_) return true;
  if (needed > kMaxSize - kGrowthSlack) return false;
  const std::size_t old = allocated_;
  if (!Reallocate(needed + kGrowthSlack)) return false;
  std::memset(Bytes(data_) + old, 0, allocated_ - old);
  return true;
}

bool BinaryStreamMemory::EnsureAllocated(std::size_t bytes) { return Grow(bytes); }

void BinaryStreamMemory::ExtendLengthTo(std::size_t end) {
  if (end <= length_) return;
  std::memset(Bytes(data_) + length_, 0, end - length_);
  length_ = end;
}

void* BinaryStreamMemory::Read(std::size_t& bytes) {
  bytes = std::min(bytes, Remaining());
  void* at = CurrentData();
  position_ += bytes;
  return at;
}

std::size_t BinaryStreamMemory::Read(void* buffer, std::size_t bytes) {
  if (buffer == nullptr) return 0;
  const void* from = Read(bytes);
  if (bytes != 0) std::memcpy(buffer, from, bytes);
  return bytes;
}

void* BinaryStreamMemory::Write(std::size_t& bytes) {
  const bool fits = bytes <= kMaxSize - position_;
  if (!fits || !Grow(position_ + bytes)) {
    bytes = position_ < allocated_ ? std::min(bytes, allocated_ - position_) : 0;
  }
  void* at = CurrentData();
  if (position_ <= allocated_) {
    // A position beyond the allocation moved nothing and leaves the length alone.
    position_ += bytes;
    ExtendLengthTo(position_);
  }
  return at;
}

std::size_t BinaryStreamMemory::Write(const void* data, std::size_t bytes) {
  void* to = Write(bytes);
  if (bytes == 0) return 0;
  if (data != nullptr) {
    std::memcpy(to, data, bytes);
  } else {
    std::memset(to, 0, bytes);
  }
  return bytes;
}

LONGLONG BinaryStreamMemory::Seek(LONGLONG offset, int origin) {
  // Positions wrap as unsigned numbers: a negative one reads back as itself from Seek.
  const auto distance = static_cast<std::size_t>(offset);
  switch (origin) {
    case 0: position_ = distance; break;
    case 1: position_ += distance; break;
    case 2: position_ = length_ + distance; break;
    default: break;
  }
  return static_cast<LONGLONG>(position_);
}

void BinaryStreamMemory::Truncate() { Truncate(position_); }

void BinaryStreamMemory::Truncate(std::size_t length) {
  if (!Grow(length)) length = allocated_;
  if (length > length_) {
    ExtendLengthTo(length);
  } else {
    length_ = length;
  }
  position_ = std::min(position_, length_);
}

void BinaryStreamMemory::Reset() {
  length_ = 0;
  position_ = 0;
}

void* BinaryStreamMemory::Insert(std::size_t at, std::size_t bytes) {
  at = std::min(at, length_);
  if (bytes > kMaxSize - length_ || !Grow(length_ + bytes)) return nullptr;
  std::byte* gap = Bytes(data_) + at;
  if (bytes != 0) std::memmove(gap + bytes, gap, length_ - at);
  length_ += bytes;
  return gap;
}

void BinaryStreamMemory::Precate(std::size_t keep) {
  const std::size_t drop = position_ - std::min(keep, position_);
  if (drop == 0) return;
  if (drop < length_) {
    std::memmove(data_, Bytes(data_) + drop, length_ - drop);
    length_ -= drop;
  } else {
    length_ = 0;
  }
  position_ -= drop;
}

void BinaryStreamMemory::Compact() {
  if (allocated_ > length_) Reallocate(std::max<std::size_t>(length_, 1));
}

}  // namespace VynSDK::Util
