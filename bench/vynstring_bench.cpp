// Making a string and asking for its other Unicode form, side by side with ICU and Qt.
//
//   utf8->utf16: VynString::FromUTF8(s).ToUTF16()  |  ICU u_strFromUTF8 (measure, allocate
//                exactly, convert)                 |  QString::fromUtf8
//   utf16->utf8: VynString::FromUTF16(s).ToUTF8()  |  ICU u_strToUTF8                 |  QString::toUtf8
//
// on ASCII, Latin, CJK and emoji-heavy text of 16 B, 64 B and 1 MiB (sizes in UTF-8 bytes), and the
// cost of a second request for a form that is already cached. Every row allocates and frees its
// result, as a caller would.

#include <benchmark/benchmark.h>
#include <unicode/ustring.h>

#include <QByteArray>
#include <QString>
#include <cstdlib>
#include <string>
#include <vector>

#include "vynutil/vynstring.h"

using VynSDK::Util::VynString;

namespace {

struct Sample {
  const char* name;
  const char* seed;  // UTF-8
};

const Sample kSamples[] = {
    {"ascii", "The quick brown fox jumps over the lazy dog. 0123456789 "},
    {"latin", "Fa\xC3\xA7" "ade d\xC3\xA9j\xC3\xA0 vu, \xC3\xBC" "ber gro\xC3\x9F" "e Stra\xC3\x9F" "en, se\xC3\xB1or! "},
    {"cjk", "\xE6\x97\xA5\xE6\x9C\xAC\xE8\xAA\x9E\xE3\x81\xAE\xE6\x96\x87\xE7\xAB\xA0\xE3\x81\xA7\xE3\x81\x99\xE3\x80\x82\xE4\xB8\xAD\xE6\x96\x87\xE6\xB5\x8B\xE8\xAF\x95"},
    {"emoji", "\xF0\x9F\x98\x80\xF0\x9F\x8E\x89 ok \xF0\x9F\x9A\x80\xF0\x9F\x8C\x8D\xF0\x9F\x91\x8D "},
};

const std::size_t kSizes[] = {16, 64, 1 << 20};

// seed repeated up to at most size bytes, cut at a character boundary.
std::string MakeUtf8(const char* seed, std::size_t size) {
  std::string out;
  std::string s(seed);
  while (out.size() < size) {
    for (std::size_t i = 0; i < s.size(); ++i) {
      unsigned char c = static_cast<unsigned char>(s[i]);
      std::size_t len = c < 0x80 ? 1 : c < 0xE0 ? 2 : c < 0xF0 ? 3 : 4;
      if (out.size() + len > size) return out;
      out.append(s, i, len);
      i += len - 1;
    }
  }
  return out;
}

std::u16string ToUtf16(const std::string& utf8) {
  QString q = QString::fromUtf8(utf8.data(), static_cast<qsizetype>(utf8.size()));
  return std::u16string(reinterpret_cast<const char16_t*>(q.utf16()), static_cast<std::size_t>(q.size()));
}

void Utf8ToUtf16Vyn(benchmark::State& state, const std::string& text) {
  for (auto _ : state) {
    auto form = VynString::FromUTF8(text.data(), text.size()).ToUTF16();
    benchmark::DoNotOptimize(form.Get());
  }
}

void Utf8ToUtf16Icu(benchmark::State& state, const std::string& text) {
  for (auto _ : state) {
    UErrorCode status = U_ZERO_ERROR;
    int32_t units = 0;
    u_strFromUTF8(nullptr, 0, &units, text.data(), static_cast<int32_t>(text.size()), &status);
    auto* out = static_cast<UChar*>(std::malloc((units + 1) * sizeof(UChar)));
    status = U_ZERO_ERROR;
    u_strFromUTF8(out, units + 1, nullptr, text.data(), static_cast<int32_t>(text.size()), &status);
    benchmark::DoNotOptimize(out);
    std::free(out);
  }
}

void Utf8ToUtf16Qt(benchmark::State& state, const std::string& text) {
  for (auto _ : state) {
    QString q = QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
    benchmark::DoNotOptimize(q.constData());
  }
}

void Utf16ToUtf8Vyn(benchmark::State& state, const std::u16string& text) {
  for (auto _ : state) {
    auto form = VynString::FromUTF16(text.data(), text.size()).ToUTF8();
    benchmark::DoNotOptimize(form.Get());
  }
}

void Utf16ToUtf8Icu(benchmark::State& state, const std::u16string& text) {
  for (auto _ : state) {
    UErrorCode status = U_ZERO_ERROR;
    int32_t bytes = 0;
    u_strToUTF8(nullptr, 0, &bytes, text.data(), static_cast<int32_t>(text.size()), &status);
    auto* out = static_cast<char*>(std::malloc(bytes + 1));
    status = U_ZERO_ERROR;
    u_strToUTF8(out, bytes + 1, nullptr, text.data(), static_cast<int32_t>(text.size()), &status);
    benchmark::DoNotOptimize(out);
    std::free(out);
  }
}

void Utf16ToUtf8Qt(benchmark::State& state, const std::u16string& text) {
  QString q = QString::fromUtf16(text.data(), static_cast<qsizetype>(text.size()));
  for (auto _ : state) {
    QByteArray bytes = q.toUtf8();
    benchmark::DoNotOptimize(bytes.constData());
  }
}

// A second request for a form that is already cached: no conversion, no allocation.
void CachedForm(benchmark::State& state, const std::string& text) {
  VynString s = VynString::FromUTF8(text.data(), text.size());
  s.ToUTF16();
  for (auto _ : state) {
    auto form = s.ToUTF16();
    benchmark::DoNotOptimize(form.Get());
  }
}

template <class Text>
void Register(const std::string& name, void (*fn)(benchmark::State&, const Text&), const Text& text,
              std::size_t bytes) {
  benchmark::RegisterBenchmark(name.c_str(), [fn, text, bytes](benchmark::State& state) {
    fn(state, text);
    state.SetBytesProcessed(static_cast<int64_t>(state.iterations() * bytes));
  });
}

}  // namespace

int main(int argc, char** argv) {
  for (const Sample& sample : kSamples) {
    for (std::size_t size : kSizes) {
      std::string utf8 = MakeUtf8(sample.seed, size);
      std::u16string utf16 = ToUtf16(utf8);
      std::string suffix = std::string("/") + sample.name + "/" + std::to_string(size);
      Register("utf8->utf16/vyn" + suffix, Utf8ToUtf16Vyn, utf8, utf8.size());
      Register("utf8->utf16/icu" + suffix, Utf8ToUtf16Icu, utf8, utf8.size());
      Register("utf8->utf16/qt " + suffix, Utf8ToUtf16Qt, utf8, utf8.size());
      Register("utf16->utf8/vyn" + suffix, Utf16ToUtf8Vyn, utf16, utf8.size());
      Register("utf16->utf8/icu" + suffix, Utf16ToUtf8Icu, utf16, utf8.size());
      Register("utf16->utf8/qt " + suffix, Utf16ToUtf8Qt, utf16, utf8.size());
    }
  }
  for (std::size_t size : kSizes) {
    Register("cached-utf16/vyn/ascii/" + std::to_string(size), CachedForm, MakeUtf8(kSamples[0].seed, size), size);
  }
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
