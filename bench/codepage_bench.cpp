// Code-page conversion side by side with ICU and Qt: UTF-8 <-> UTF-16 (the win32::text fast
// functions and MultiByteToWideChar/WideCharToMultiByte for CP_UTF8) on ASCII, Latin, CJK and
// emoji text of 16 B, 64 B and 1 MiB, and the single-byte code pages 1252 and 1251 against
// ICU's own converters.
//
// Run: build-rel/bench/bench_codepage --benchmark_min_time=0.05 --benchmark_repetitions=9 \
//        --benchmark_enable_random_interleaving=true --benchmark_report_aggregates_only=true
// and compare the "min" aggregates (the fastest repetition) of the implementations of one case.

#include <benchmark/benchmark.h>
#include <unicode/ucnv.h>
#include <unicode/ustring.h>

#include <QString>
#include <QStringDecoder>
#include <QStringEncoder>
#include <algorithm>
#include <string>
#include <vector>

#include "win32/codepage.h"

namespace {

enum Kind { kAscii, kLatin, kCjk, kEmoji };

const char* const kSamples[] = {
    "The quick brown fox jumps over the lazy dog while the busy programmer measures text. ",
    "Le c\u0153ur d\u00e9\u00e7u mais l'\u00e2me plut\u00f4t na\u00efve, Lou\u00ffs r\u00eava "
    "de crapa\u00fcter en cano\u00eb. Zw\u00f6lf Boxk\u00e4mpfer jagen Viktor quer \u00fcber "
    "den gro\u00dfen Sylter Deich. ",
    "\u65e5\u672c\u8a9e\u306e\u6587\u7ae0\u306f\u3001\u3072\u3089\u304c\u306a\u3068\u30ab\u30bf"
    "\u30ab\u30ca\u3068\u6f22\u5b57\u3067\u66f8\u304b\u308c\u3066\u3044\u307e\u3059\u3002\u4e2d"
    "\u6587\u6587\u672c\u4e5f\u5f88\u5e38\u89c1\u3002",
    ("\U0001F600\U0001F603 \U0001F44D\U0001F3FD\U0001F389\U0001F38A ok \U0001F680\U0001F30D\u2764"
     "\U0001F525 \U0001F431\U0001F436"),
};

// UTF-8 text of the kind, cut at a character boundary at or below `size` bytes.
std::string MakeUtf8(Kind kind, std::size_t size) {
  std::string text;
  while (text.size() < size) text += kSamples[kind];
  std::size_t cut = size;
  while (cut > 0 && (static_cast<unsigned char>(text[cut]) & 0xC0) == 0x80) --cut;
  text.resize(cut);
  return text;
}

std::u16string ToUtf16(const std::string& s) {
  std::u16string out(s.size(), u'\0');
  out.resize(win32::text::Utf8ToUtf16(s.data(), s.size(), out.data()));
  return out;
}

struct Case {
  Kind kind;
  std::size_t size;
};

// ---- UTF-8 -> UTF-16 ----

void Utf8ToUtf16_Vyn(benchmark::State& state, Case c) {
  const std::string in = MakeUtf8(c.kind, c.size);
  std::u16string out(in.size(), u'\0');
  for (auto _ : state) {
    benchmark::DoNotOptimize(win32::text::Utf8ToUtf16(in.data(), in.size(), out.data()));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * in.size());
}

void Utf8ToUtf16_VynWin32(benchmark::State& state, Case c) {
  const std::string in = MakeUtf8(c.kind, c.size);
  std::u16string out(in.size(), u'\0');
  for (auto _ : state) {
    benchmark::DoNotOptimize(win32::MultiByteToWideChar(CP_UTF8, 0, in.data(),
                                                        static_cast<int>(in.size()), out.data(),
                                                        static_cast<int>(out.size())));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * in.size());
}

void Utf8ToUtf16_Icu(benchmark::State& state, Case c) {
  const std::string in = MakeUtf8(c.kind, c.size);
  std::u16string out(in.size() + 1, u'\0');
  for (auto _ : state) {
    int32_t length = 0;
    UErrorCode error = U_ZERO_ERROR;
    u_strFromUTF8(out.data(), static_cast<int32_t>(out.size()), &length, in.data(),
                  static_cast<int32_t>(in.size()), &error);
    benchmark::DoNotOptimize(length);
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * in.size());
}

void Utf8ToUtf16_QtFromUtf8(benchmark::State& state, Case c) {
  const std::string in = MakeUtf8(c.kind, c.size);
  for (auto _ : state) {
    QString s = QString::fromUtf8(in.data(), static_cast<qsizetype>(in.size()));
    benchmark::DoNotOptimize(s.constData());
  }
  state.SetBytesProcessed(state.iterations() * in.size());
}

void Utf8ToUtf16_QtDecoderBuffer(benchmark::State& state, Case c) {
  const std::string in = MakeUtf8(c.kind, c.size);
  std::vector<QChar> out(in.size() + 1);
  QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
  for (auto _ : state) {
    decoder.resetState();
    benchmark::DoNotOptimize(
        decoder.appendToBuffer(out.data(), QByteArrayView(in.data(), in.size())));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * in.size());
}

// ---- UTF-16 -> UTF-8 (bytes processed: the UTF-8 size, for comparable rates) ----

void Utf16ToUtf8_Vyn(benchmark::State& state, Case c) {
  const std::string utf8 = MakeUtf8(c.kind, c.size);
  const std::u16string in = ToUtf16(utf8);
  std::string out(in.size() * 3, '\0');
  for (auto _ : state) {
    benchmark::DoNotOptimize(win32::text::Utf16ToUtf8(in.data(), in.size(), out.data()));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * utf8.size());
}

void Utf16ToUtf8_VynWin32(benchmark::State& state, Case c) {
  const std::string utf8 = MakeUtf8(c.kind, c.size);
  const std::u16string in = ToUtf16(utf8);
  std::string out(in.size() * 3, '\0');
  for (auto _ : state) {
    benchmark::DoNotOptimize(
        win32::WideCharToMultiByte(CP_UTF8, 0, in.data(), static_cast<int>(in.size()), out.data(),
                                   static_cast<int>(out.size()), nullptr, nullptr));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * utf8.size());
}

void Utf16ToUtf8_Icu(benchmark::State& state, Case c) {
  const std::string utf8 = MakeUtf8(c.kind, c.size);
  const std::u16string in = ToUtf16(utf8);
  std::string out(in.size() * 3 + 1, '\0');
  for (auto _ : state) {
    int32_t length = 0;
    UErrorCode error = U_ZERO_ERROR;
    u_strToUTF8(out.data(), static_cast<int32_t>(out.size()), &length, in.data(),
                static_cast<int32_t>(in.size()), &error);
    benchmark::DoNotOptimize(length);
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * utf8.size());
}

void Utf16ToUtf8_QtToUtf8(benchmark::State& state, Case c) {
  const std::string utf8 = MakeUtf8(c.kind, c.size);
  const QString in = QString::fromUtf8(utf8.data(), static_cast<qsizetype>(utf8.size()));
  for (auto _ : state) {
    QByteArray bytes = in.toUtf8();
    benchmark::DoNotOptimize(bytes.constData());
  }
  state.SetBytesProcessed(state.iterations() * utf8.size());
}

void Utf16ToUtf8_QtEncoderBuffer(benchmark::State& state, Case c) {
  const std::string utf8 = MakeUtf8(c.kind, c.size);
  const QString in = QString::fromUtf8(utf8.data(), static_cast<qsizetype>(utf8.size()));
  std::string out(in.size() * 3 + 1, '\0');
  QStringEncoder encoder(QStringEncoder::Utf8, QStringEncoder::Flag::Stateless);
  for (auto _ : state) {
    encoder.resetState();
    benchmark::DoNotOptimize(encoder.appendToBuffer(out.data(), in));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * utf8.size());
}

// ---- single-byte code pages ----

struct SingleByteCase {
  UINT codePage;
  const char* icuName;
  const char* sample;  // UTF-8
  std::size_t size;
};

// The sample in the code page, about `size` bytes long.
std::string MakeSingleByte(const SingleByteCase& c) {
  std::string utf8;
  while (utf8.size() < c.size * 2) utf8 += c.sample;
  const std::u16string wide = ToUtf16(utf8);
  std::string bytes(wide.size(), '\0');
  win32::WideCharToMultiByte(c.codePage, 0, wide.data(), static_cast<int>(wide.size()),
                             bytes.data(), static_cast<int>(bytes.size()), nullptr, nullptr);
  bytes.resize(c.size);
  return bytes;
}

UConverter* OpenIcu(const char* name) {
  UErrorCode error = U_ZERO_ERROR;
  return ucnv_open(name, &error);
}

void SingleByteToUtf16_Vyn(benchmark::State& state, SingleByteCase c) {
  const std::string in = MakeSingleByte(c);
  std::u16string out(in.size(), u'\0');
  for (auto _ : state) {
    benchmark::DoNotOptimize(win32::MultiByteToWideChar(c.codePage, 0, in.data(),
                                                        static_cast<int>(in.size()), out.data(),
                                                        static_cast<int>(out.size())));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * in.size());
}

void SingleByteToUtf16_Icu(benchmark::State& state, SingleByteCase c) {
  const std::string in = MakeSingleByte(c);
  std::u16string out(in.size() + 1, u'\0');
  UConverter* cnv = OpenIcu(c.icuName);
  for (auto _ : state) {
    UErrorCode error = U_ZERO_ERROR;
    benchmark::DoNotOptimize(ucnv_toUChars(cnv, out.data(), static_cast<int32_t>(out.size()),
                                           in.data(), static_cast<int32_t>(in.size()), &error));
    benchmark::ClobberMemory();
  }
  ucnv_close(cnv);
  state.SetBytesProcessed(state.iterations() * in.size());
}

void Utf16ToSingleByte_Vyn(benchmark::State& state, SingleByteCase c) {
  const std::u16string in = [&] {
    const std::string bytes = MakeSingleByte(c);
    std::u16string wide(bytes.size(), u'\0');
    win32::MultiByteToWideChar(c.codePage, 0, bytes.data(), static_cast<int>(bytes.size()),
                               wide.data(), static_cast<int>(wide.size()));
    return wide;
  }();
  std::string out(in.size(), '\0');
  for (auto _ : state) {
    benchmark::DoNotOptimize(
        win32::WideCharToMultiByte(c.codePage, 0, in.data(), static_cast<int>(in.size()),
                                   out.data(), static_cast<int>(out.size()), nullptr, nullptr));
    benchmark::ClobberMemory();
  }
  state.SetBytesProcessed(state.iterations() * in.size());
}

void Utf16ToSingleByte_Icu(benchmark::State& state, SingleByteCase c) {
  const std::u16string in = [&] {
    const std::string bytes = MakeSingleByte(c);
    std::u16string wide(bytes.size(), u'\0');
    win32::MultiByteToWideChar(c.codePage, 0, bytes.data(), static_cast<int>(bytes.size()),
                               wide.data(), static_cast<int>(wide.size()));
    return wide;
  }();
  std::string out(in.size() + 1, '\0');
  UConverter* cnv = OpenIcu(c.icuName);
  for (auto _ : state) {
    UErrorCode error = U_ZERO_ERROR;
    benchmark::DoNotOptimize(ucnv_fromUChars(cnv, out.data(), static_cast<int32_t>(out.size()),
                                             in.data(), static_cast<int32_t>(in.size()), &error));
    benchmark::ClobberMemory();
  }
  ucnv_close(cnv);
  state.SetBytesProcessed(state.iterations() * in.size());
}

// With repetitions, the fastest run: the machine may be shared, and interference only slows.
double Fastest(const std::vector<double>& values) {
  return *std::min_element(values.begin(), values.end());
}

void RegisterAll() {
  const char* const kinds[] = {"ascii", "latin", "cjk", "emoji"};
  const std::pair<std::size_t, const char*> sizes[] = {{16, "16B"}, {64, "64B"}, {1 << 20, "1MiB"}};
  using Fn = void (*)(benchmark::State&, Case);
  const std::pair<const char*, Fn> utf[] = {
      {"Utf8ToUtf16/vyn", Utf8ToUtf16_Vyn},
      {"Utf8ToUtf16/vyn_win32", Utf8ToUtf16_VynWin32},
      {"Utf8ToUtf16/icu", Utf8ToUtf16_Icu},
      {"Utf8ToUtf16/qt_fromUtf8", Utf8ToUtf16_QtFromUtf8},
      {"Utf8ToUtf16/qt_decoder_buffer", Utf8ToUtf16_QtDecoderBuffer},
      {"Utf16ToUtf8/vyn", Utf16ToUtf8_Vyn},
      {"Utf16ToUtf8/vyn_win32", Utf16ToUtf8_VynWin32},
      {"Utf16ToUtf8/icu", Utf16ToUtf8_Icu},
      {"Utf16ToUtf8/qt_toUtf8", Utf16ToUtf8_QtToUtf8},
      {"Utf16ToUtf8/qt_encoder_buffer", Utf16ToUtf8_QtEncoderBuffer},
  };
  // The implementations of one case next to each other, so that they run under the same load.
  for (int k = 0; k < 4; ++k) {
    for (const auto& [size, sizeName] : sizes) {
      for (const auto& [name, fn] : utf) {
        const std::string full = std::string(name) + "/" + kinds[k] + "/" + sizeName;
        benchmark::RegisterBenchmark(full.c_str(), fn, Case{static_cast<Kind>(k), size})
            ->ComputeStatistics("min", Fastest);
      }
    }
  }
  using SbFn = void (*)(benchmark::State&, SingleByteCase);
  const std::pair<const char*, SbFn> single[] = {
      {"SingleByteToUtf16/vyn", SingleByteToUtf16_Vyn},
      {"SingleByteToUtf16/icu", SingleByteToUtf16_Icu},
      {"Utf16ToSingleByte/vyn", Utf16ToSingleByte_Vyn},
      {"Utf16ToSingleByte/icu", Utf16ToSingleByte_Icu},
  };
  const SingleByteCase pages[] = {
      {1252, "windows-1252", kSamples[kLatin], 64},
      {1252, "windows-1252", kSamples[kLatin], 1 << 20},
      {1251, "windows-1251",
       "\u0421\u044a\u0435\u0448\u044c \u0436\u0435 \u0435\u0449\u0451 \u044d\u0442\u0438\u0445 "
       "\u043c\u044f\u0433\u043a\u0438\u0445 \u0444\u0440\u0430\u043d\u0446\u0443\u0437\u0441"
       "\u043a\u0438\u0445 \u0431\u0443\u043b\u043e\u043a. ",
       64},
      {1251, "windows-1251",
       "\u0421\u044a\u0435\u0448\u044c \u0436\u0435 \u0435\u0449\u0451 \u044d\u0442\u0438\u0445 "
       "\u043c\u044f\u0433\u043a\u0438\u0445 \u0444\u0440\u0430\u043d\u0446\u0443\u0437\u0441"
       "\u043a\u0438\u0445 \u0431\u0443\u043b\u043e\u043a. ",
       1 << 20},
  };
  for (const SingleByteCase& page : pages) {
    for (const auto& [name, fn] : single) {
      const std::string full = std::string(name) + "/" + std::to_string(page.codePage) + "/" +
                               (page.size == 64 ? "64B" : "1MiB");
      benchmark::RegisterBenchmark(full.c_str(), fn, page)->ComputeStatistics("min", Fastest);
    }
  }
}

}  // namespace

int main(int argc, char** argv) {
  RegisterAll();
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  return 0;
}
