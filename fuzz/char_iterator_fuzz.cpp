// The character layer on arbitrary bytes: the UTF-8 check and its out-parameters agree with a
// walk by sequence lengths; narrow text in code pages 1252, 932 and 65001 and the same bytes as
// UTF-16 are walked to their terminators and read a character at every position; characters
// appended to an accumulator come back in reverse. Every text is an exact heap copy, so the
// sanitizers catch any read past a terminator.

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <vector>

#include "vynutil/char.h"
#include "win32/codepage.h"

using VynSDK::Util::Char;
using VynSDK::Util::CharAccumulator;
using VynSDK::Util::CharIterator;

namespace {

void Check(bool condition) {
  if (!condition) std::abort();
}

void CheckUtf8(const uint8_t* data, size_t size) {
  bool multiByte = true;
  size_t missing = 99;
  const bool valid = Char::IsValidUTF8(data, size, &multiByte, &missing);
  if (!valid) {
    Check(missing == 0);
    return;
  }
  // Walking by sequence lengths ends exactly at the end, or missing bytes beyond it.
  size_t i = 0;
  bool sawMultiByte = false;
  while (i < size) {
    const unsigned len = Char::UTF8CharLength(data[i]);
    Check(len >= 1 && len <= 6);
    if (len > 1 && i + len <= size) sawMultiByte = true;
    if (len > 1) Check(data[i] >= 0xC0);
    i += len;
  }
  Check(i == size + missing);
  Check(multiByte == sawMultiByte);
}

template <class T>
T* HeapText(const uint8_t* data, size_t units) {
  T* text = new T[units + 1];
  std::memcpy(text, data, units * sizeof(T));
  text[units] = 0;
  return text;
}

template <class T>
void Walk(T* text, size_t units) {
  size_t length = 0;
  while (text[length] != 0) ++length;
  CharIterator<T> it(text);
  size_t steps = 0;
  while (*it.Get() != 0) {
    (void)*it;
    const size_t step = it.CharLength();
    Check(step == 1 || step == 2);
    CharIterator<T> before = it;
    ++it;
    Check(static_cast<size_t>(it.Get() - before.Get()) == step);
    Check(it.Get() <= text + length);
    Check(++steps <= length);
  }
  Check(it.Get() == text + length);
  Check((it + 3).Get() == text + length);
  Check((CharIterator<T>(text) + (units + 5)).Get() == text + length);
}

void CheckNarrow(const uint8_t* data, size_t size) {
  char* text = HeapText<char>(data, size);
  static const UINT kCodePages[] = {1252, 932, CP_UTF8};
  for (UINT cp : kCodePages) {
    win32::SetProcessCodePages(cp, cp);
    Walk(text, size);
    for (size_t i = 0; i <= size; ++i) {
      const Char c(cp, text + i);
      char out[8];
      const size_t n = c.ToCP(cp, out, sizeof out);
      Check(n <= sizeof out);
      (void)Char(text[i]);
      (void)Char(text + i).ToACP(out, 2);
    }
  }
  win32::SetProcessCodePages(0, 0);
  delete[] text;
}

void CheckWide(const uint8_t* data, size_t size) {
  const size_t units = size / 2;
  MCHAR* text = HeapText<MCHAR>(data, units);
  Walk(text, units);
  for (size_t i = 0; i <= units; ++i) {
    const Char c(text + i);
    MCHAR out[3];
    Check(c.ToUTF16(out, 3) <= 2);
    const MCHAR* found = c.IsInCharacterSet(text);
    if (found) Check(found >= text && found < text + units);
  }
  delete[] text;
}

void CheckAccumulator(const uint8_t* data, size_t size) {
  std::vector<unsigned int> appended;
  CharAccumulator acc;
  for (size_t i = 0; i + 3 <= size; i += 3) {
    unsigned int c = (data[i] | data[i + 1] << 8 | data[i + 2] << 16) % 0x110000;
    if (c == 0 || (c >= 0xD800 && c <= 0xDFFF)) continue;
    acc += Char(c);
    appended.push_back(c);
  }
  while (!appended.empty()) {
    Check(acc.RemoveLastCharacter().CharCode() == appended.back());
    appended.pop_back();
  }
  Check(acc.Length() == 0 && acc.RemoveLastCharacter().IsNull());
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  CheckUtf8(data, size);
  CheckNarrow(data, size);
  CheckWide(data, size);
  CheckAccumulator(data, size);
  return 0;
}
