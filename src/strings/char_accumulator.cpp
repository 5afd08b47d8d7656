// CharAccumulator: UTF-16 text built a character at a time in one malloc'd buffer that grows
// linearly and is reused after Reset.

#include "vynutil/char.h"

#include <cstdint>
#include <cstdlib>
#include <new>
#include <utility>

#include "strings/utf16_units.h"

namespace VynSDK::Util {

namespace {

// Units of room added by each growth step, before the n units being appended.
constexpr std::size_t kGrowthUnits = 64;

}  // namespace

CharAccumulator::~CharAccumulator() { std::free(m_buffer); }

CharAccumulator::CharAccumulator(CharAccumulator&& other) noexcept
    : m_buffer(std::exchange(other.m_buffer, nullptr)),
      m_length(std::exchange(other.m_length, 0)),
      m_capacity(std::exchange(other.m_capacity, 0)) {}

CharAccumulator& CharAccumulator::operator=(CharAccumulator&& other) noexcept {
  if (this != &other) {
    std::free(m_buffer);
    m_buffer = std::exchange(other.m_buffer, nullptr);
    m_length = std::exchange(other.m_length, 0);
    m_capacity = std::exchange(other.m_capacity, 0);
  }
  return *this;
}

void CharAccumulator::Reserve(std::size_t n) {
  if (m_buffer != nullptr && m_length + n < m_capacity) return;
  // capacity - n + 64 is at least length + n (n is 1 or 2 and length never exceeds capacity).
  const std::size_t capacity = m_capacity - n + kGrowthUnits;
  if (capacity >= SIZE_MAX / sizeof(MCHAR)) throw std::bad_alloc();
  void* grown = std::realloc(m_buffer, (capacity + 1) * sizeof(MCHAR));
  if (grown == nullptr) throw std::bad_alloc();
  m_buffer = static_cast<MCHAR*>(grown);
  m_capacity = capacity;
}

CharAccumulator& CharAccumulator::operator+=(const Char& c) {
  MCHAR units[Utf16Units::kMaxUnits];
  const unsigned n = Utf16Units::Encode(c.CharCode(), units);
  Reserve(n);
  for (unsigned k = 0; k < n; ++k) m_buffer[m_length + k] = units[k];
  m_length += n;
  m_buffer[m_length] = 0;
  return *this;
}

CharAccumulator::operator MCHAR*() {
  if (m_buffer == nullptr) {
    Reserve(1);
    m_buffer[0] = 0;
  }
  return m_buffer;
}

std::size_t CharAccumulator::LastCharacterIndex() const noexcept {
  if (m_buffer == nullptr || m_length == 0) return m_length;
  const std::size_t last = m_length - 1;
  if (last > 0 && Utf16Units::IsTrailSurrogate(m_buffer[last]) &&
      Utf16Units::IsLeadSurrogate(m_buffer[last - 1])) {
    return last - 1;
  }
  return last;
}

Char CharAccumulator::LastCharacter() const noexcept {
  const std::size_t index = LastCharacterIndex();
  if (index == m_length) return Char();
  const MCHAR first = m_buffer[index];
  return Char(index + 1 < m_length ? Utf16Units::Combine(first, m_buffer[index + 1])
                                   : static_cast<unsigned int>(first));
}

Char CharAccumulator::RemoveLastCharacter() noexcept {
  const Char last = LastCharacter();
  const std::size_t index = LastCharacterIndex();
  if (index == m_length) return last;
  m_length = index;
  m_buffer[m_length] = 0;
  return last;
}

void CharAccumulator::Reset() noexcept {
  m_length = 0;
  if (m_buffer != nullptr) m_buffer[0] = 0;
}

}  // namespace VynSDK::Util
