#pragma once
// VynSDK::Array: the SDK's growable array of plain elements (wide characters above all), on the
// shared heap, so an array filled in one module can be read and freed in another.

#include <cstddef>
#include <cstring>

#include "vynutil/exception.h"
#include "vynutil/heap.h"

namespace VynSDK {

template <typename T>
class Array : public ::VynHeapOperators {
 public:
  explicit Array(std::size_t growBy = 16) : m_growBy(growBy) {}
  ~Array() { ::VynHeapOperators::operator delete(m_data); }
  Array(const Array& other) : m_growBy(other.m_growBy) { Assign(other); }
  Array& operator=(const Array& other) {
    if (this != &other) Assign(other);
    return *this;
  }

  // Elements in use.
  std::size_t Length() const { return m_length; }
  // Elements room is reserved for.
  std::size_t Reserved() const { return m_reserved; }
  // Sets the length to n. Growing past the reserved room reserves n plus the larger of the growth
  // step and n / 2, keeps the old elements and sets the new ones to fill; shortening only changes
  // the length. A failed allocation throws std::bad_alloc and leaves the array as it was.
  void SetLength(std::size_t n, const T& fill = T()) {
    if (n > m_reserved) {
      const std::size_t extra = m_growBy > n / 2 ? m_growBy : n / 2;
      Reserve(n + extra);
    }
    for (std::size_t i = m_length; i < n; ++i) m_data[i] = fill;
    m_length = n;
  }

  T* Addr() { return m_data; }
  const T* Addr() const { return m_data; }
  // Element i; OutOfRangeException for an index at or past the length.
  T& operator[](std::size_t i) {
    Check(i);
    return m_data[i];
  }
  const T& operator[](std::size_t i) const {
    Check(i);
    return m_data[i];
  }

 private:
  void Check(std::size_t i) const {
    if (i >= m_length) {
      throw Util::OutOfRangeException(u"Argument index out of bounds, passed into a VynSDK::Array::operator[]");
    }
  }
  void Reserve(std::size_t count) {
    if (count > static_cast<std::size_t>(-1) / sizeof(T)) throw std::bad_array_new_length();
    T* grown = static_cast<T*>(::VynHeapOperators::operator new(count * sizeof(T)));
    if (m_length != 0) std::memcpy(grown, m_data, m_length * sizeof(T));
    ::VynHeapOperators::operator delete(m_data);
    m_data = grown;
    m_reserved = count;
  }
  void Assign(const Array& other) {
    m_length = 0;
    if (other.m_length > m_reserved) Reserve(other.m_length);
    if (other.m_length != 0) std::memcpy(m_data, other.m_data, other.m_length * sizeof(T));
    m_length = other.m_length;
  }

  T* m_data = nullptr;
  std::size_t m_reserved = 0;
  std::size_t m_length = 0;
  std::size_t m_growBy;
};

}  // namespace VynSDK
