// CharIterator: a character at a time through narrow text in the active code page or through
// UTF-16 text, never past the terminator.

#include <type_traits>

#include "vynutil/char.h"
#include "strings/utf16_units.h"
#include "win32/codepage.h"

namespace VynSDK::Util {

namespace {

template <class T>
bool IsLeadUnit(T unit) {
  if constexpr (sizeof(T) == 1) {
    return win32::IsDBCSLeadByte(static_cast<BYTE>(unit)) != 0;
  } else {
    return Utf16Units::IsLeadSurrogate(static_cast<MCHAR>(unit));
  }
}

}  // namespace

template <class T>
Char CharIterator<T>::operator*() const {
  if (m_pos == nullptr) return Char();
  using Unit = std::remove_const_t<T>;
  return Char(static_cast<Unit>(*m_pos));
}

template <class T>
std::size_t CharIterator<T>::CharLength() const {
  if (m_pos == nullptr || *m_pos == 0) return 1;
  return IsLeadUnit(*m_pos) && m_pos[1] != 0 ? 2 : 1;
}

template <class T>
CharIterator<T>& CharIterator<T>::operator++() {
  if (m_pos != nullptr && *m_pos != 0) m_pos += CharLength();
  return *this;
}

template <class T>
CharIterator<T> CharIterator<T>::operator++(int) {
  CharIterator old = *this;
  ++*this;
  return old;
}

template <class T>
CharIterator<T> CharIterator<T>::operator+(std::size_t n) const {
  CharIterator result = *this;
  result += n;
  return result;
}

template <class T>
CharIterator<T>& CharIterator<T>::operator+=(std::size_t n) {
  for (; n > 0 && m_pos != nullptr && *m_pos != 0; --n) ++*this;
  return *this;
}

template class CharIterator<char>;
template class CharIterator<const char>;
template class CharIterator<MCHAR>;
template class CharIterator<const MCHAR>;

}  // namespace VynSDK::Util
