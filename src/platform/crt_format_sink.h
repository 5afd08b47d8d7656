#pragma once
// Where the formatting engine writes. Both sinks count every unit the output has, so the
// engine's result is the same whether the text is kept or not:
//   CountingSink  only counts (the measuring functions);
//   BufferSink    keeps the first `capacity` units in a caller's buffer and counts the rest.
// Sinks never write a terminator; the entry points do.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>

namespace win32::detail {

template <typename Char>
class CountingSink {
 public:
  static constexpr bool kKeepsText = false;

  void Append(const Char*, std::size_t n) noexcept { count_ += n; }
  void AppendAscii(const char*, std::size_t n) noexcept { count_ += n; }
  void Put(Char) noexcept { ++count_; }
  void Fill(Char, std::uint64_t n) noexcept { count_ += n; }
  std::uint64_t Count() const noexcept { return count_; }

 private:
  std::uint64_t count_ = 0;
};

template <typename Char>
class BufferSink {
 public:
  static constexpr bool kKeepsText = true;

  BufferSink(Char* buffer, std::size_t capacity) noexcept : next_(buffer), end_(buffer + capacity) {}

  void Append(const Char* s, std::size_t n) noexcept {
    const std::size_t kept = std::min(n, Room());
    if (kept <= kShortCopy) {  // short pieces (most of them) are cheaper copied in line
      for (std::size_t i = 0; i < kept; ++i) next_[i] = s[i];
    } else {
      std::memcpy(next_, s, kept * sizeof(Char));
    }
    next_ += kept;
    count_ += n;
  }

  // ASCII text (digits, signs, float texts) widened unit by unit for MCHAR output.
  void AppendAscii(const char* s, std::size_t n) noexcept {
    if constexpr (sizeof(Char) == 1) {
      Append(reinterpret_cast<const Char*>(s), n);
    } else {
      const std::size_t kept = std::min(n, Room());
      for (std::size_t i = 0; i < kept; ++i) next_[i] = static_cast<Char>(static_cast<unsigned char>(s[i]));
      next_ += kept;
      count_ += n;
    }
  }

  void Put(Char c) noexcept {
    if (next_ != end_) *next_++ = c;
    ++count_;
  }

  void Fill(Char c, std::uint64_t n) noexcept {
    const std::size_t kept = static_cast<std::size_t>(std::min<std::uint64_t>(n, Room()));
    std::fill_n(next_, kept, c);
    next_ += kept;
    count_ += n;
  }

  // Space for n units written in place (then Commit(n)); null when fewer than n are left.
  Char* Reserve(std::size_t n) noexcept { return Room() >= n ? next_ : nullptr; }
  void Commit(std::size_t n) noexcept {
    next_ += n;
    count_ += n;
  }

  std::uint64_t Count() const noexcept { return count_; }

 private:
  static constexpr std::size_t kShortCopy = 16;

  std::size_t Room() const noexcept { return static_cast<std::size_t>(end_ - next_); }

  Char* next_;
  Char* end_;
  std::uint64_t count_ = 0;
};

}  // namespace win32::detail
