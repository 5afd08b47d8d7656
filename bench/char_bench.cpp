// Building UTF-16 text a character at a time, side by side with the standard library and Qt.
//
//   Accumulate: CharAccumulator += Char (grows linearly, 62-63 units a step)
//   Reuse:      the same after Reset, in a buffer that is already large enough
//   U16String:  std::u16string::push_back (grows geometrically)
//   QtString:   QString::append(QChar) / surrogate pairs via QChar::fromUcs4
//
// for 1,000 and 1,000,000 characters of BMP text and of text where every fourth character needs
// a surrogate pair. Every row starts from an empty buffer except Reuse.

#include <benchmark/benchmark.h>

#include <QString>
#include <string>

#include "vynutil/char.h"

using VynSDK::Util::Char;
using VynSDK::Util::CharAccumulator;

namespace {

unsigned int CharacterAt(std::size_t i, bool withPairs) {
  if (withPairs && i % 4 == 3) return 0x1F600 + static_cast<unsigned int>(i % 64);
  return u'a' + static_cast<unsigned int>(i % 26);
}

void Accumulate(benchmark::State& state, bool withPairs) {
  const auto count = static_cast<std::size_t>(state.range(0));
  for (auto _ : state) {
    CharAccumulator acc;
    for (std::size_t i = 0; i < count; ++i) acc += Char(CharacterAt(i, withPairs));
    benchmark::DoNotOptimize(acc.Get());
  }
  state.SetItemsProcessed(static_cast<int64_t>(state.iterations() * count));
}

void Reuse(benchmark::State& state, bool withPairs) {
  const auto count = static_cast<std::size_t>(state.range(0));
  CharAccumulator acc;
  for (std::size_t i = 0; i < count; ++i) acc += Char(CharacterAt(i, withPairs));
  for (auto _ : state) {
    acc.Reset();
    for (std::size_t i = 0; i < count; ++i) acc += Char(CharacterAt(i, withPairs));
    benchmark::DoNotOptimize(acc.Get());
  }
  state.SetItemsProcessed(static_cast<int64_t>(state.iterations() * count));
}

void U16String(benchmark::State& state, bool withPairs) {
  const auto count = static_cast<std::size_t>(state.range(0));
  for (auto _ : state) {
    std::u16string s;
    for (std::size_t i = 0; i < count; ++i) {
      const unsigned int c = CharacterAt(i, withPairs);
      if (c < 0x10000) {
        s.push_back(static_cast<char16_t>(c));
      } else {
        s.push_back(static_cast<char16_t>(0xD7C0 + (c >> 10)));
        s.push_back(static_cast<char16_t>(0xDC00 | (c & 0x3FF)));
      }
    }
    benchmark::DoNotOptimize(s.data());
  }
  state.SetItemsProcessed(static_cast<int64_t>(state.iterations() * count));
}

void QtString(benchmark::State& state, bool withPairs) {
  const auto count = static_cast<std::size_t>(state.range(0));
  for (auto _ : state) {
    QString s;
    for (std::size_t i = 0; i < count; ++i) {
      const unsigned int c = CharacterAt(i, withPairs);
      if (c < 0x10000) {
        s.append(QChar(static_cast<char16_t>(c)));
      } else {
        const auto pair = QChar::fromUcs4(c);
        s.append(QStringView(pair));
      }
    }
    benchmark::DoNotOptimize(s.constData());
  }
  state.SetItemsProcessed(static_cast<int64_t>(state.iterations() * count));
}

}  // namespace

BENCHMARK_CAPTURE(Accumulate, bmp, false)->Arg(1000)->Arg(1000000)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(Accumulate, pairs, true)->Arg(1000)->Arg(1000000)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(Reuse, bmp, false)->Arg(1000)->Arg(1000000)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(U16String, bmp, false)->Arg(1000)->Arg(1000000)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(U16String, pairs, true)->Arg(1000)->Arg(1000000)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(QtString, bmp, false)->Arg(1000)->Arg(1000000)->Unit(benchmark::kMicrosecond);
BENCHMARK_CAPTURE(QtString, pairs, true)->Arg(1000)->Arg(1000000)->Unit(benchmark::kMicrosecond);

BENCHMARK_MAIN();
