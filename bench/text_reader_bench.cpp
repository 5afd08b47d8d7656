// Reading a 50 MB UTF-8 file line by line: the library's text reader (lines as UTF-16) side by
// side with std::getline on std::ifstream (bytes only) and Qt's QTextStream::readLineInto
// (UTF-16 lines); and the cost of detection on the same file.

#include <benchmark/benchmark.h>

#include <QFile>
#include <QString>
#include <QTextStream>
#include <cstdio>
#include <fstream>
#include <string>
#include <unistd.h>

#include "vynutil/text_reader.h"
#include "vynutil/vynstring.h"

namespace {

namespace tf = VynSDK::Util::TextFile;

// A 50 MB file of mixed Latin, accented and CJK lines, made once per run.
const std::string& SampleFile() {
  static const std::string path = [] {
    const std::string file = "/tmp/vyn_bench_text_" + std::to_string(getpid()) + ".txt";
    std::ofstream out(file, std::ios::binary);
    const std::string lines[] = {
        "The quick brown fox jumps over the lazy dog, again and again.\n",
        "Größenänderung der Fenster: café, naïve, déjà vu, Ærøskøbing.\n",
        "\xe6\x97\xa5\xe6\x9c\xac\xe8\xaa\x9e\xe3\x81\xae\xe3\x83\x86\xe3\x82\xad\xe3\x82\xb9\xe3\x83\x88 mixed with ASCII words\n",
        "short\n",
    };
    std::size_t written = 0;
    for (std::size_t i = 0; written < (50u << 20); ++i) {
      out << lines[i % 4];
      written += lines[i % 4].size();
    }
    std::atexit([] { std::remove(("/tmp/vyn_bench_text_" + std::to_string(getpid()) + ".txt").c_str()); });
    return file;
  }();
  return path;
}

void ReaderLines(benchmark::State& state) {
  const VynSDK::Util::VynString path = VynSDK::Util::VynString::FromUTF8(SampleFile().c_str());
  for (auto _ : state) {
    tf::Reader reader;
    reader.Open(path, 0, tf::LineEndNone);
    std::size_t units = 0;
    for (VynSDK::Util::VynString line; !(line = reader.ReadLine()).IsNull();) {
      std::size_t length = 0;
      benchmark::DoNotOptimize(line.ToUTF16(&length).Get());
      units += length;
    }
    benchmark::DoNotOptimize(units);
  }
  state.SetBytesProcessed(state.iterations() * (50 << 20));
}

void StdGetline(benchmark::State& state) {
  for (auto _ : state) {
    std::ifstream in(SampleFile(), std::ios::binary);
    std::string line;
    std::size_t bytes = 0;
    while (std::getline(in, line)) bytes += line.size();
    benchmark::DoNotOptimize(bytes);
  }
  state.SetBytesProcessed(state.iterations() * (50 << 20));
}

void QtReadLineInto(benchmark::State& state) {
  for (auto _ : state) {
    QFile file(QString::fromStdString(SampleFile()));
    file.open(QIODevice::ReadOnly);
    QTextStream stream(&file);
    QString line;
    std::size_t units = 0;
    while (stream.readLineInto(&line)) units += static_cast<std::size_t>(line.size());
    benchmark::DoNotOptimize(units);
  }
  state.SetBytesProcessed(state.iterations() * (50 << 20));
}

void DetectionOnOpen(benchmark::State& state) {
  const VynSDK::Util::VynString path = VynSDK::Util::VynString::FromUTF8(SampleFile().c_str());
  for (auto _ : state) {
    tf::Reader reader;
    benchmark::DoNotOptimize(reader.Open(path, 1252, tf::LineEndNone));
    benchmark::DoNotOptimize(reader.Encoding());
  }
}

}  // namespace

BENCHMARK(ReaderLines)->Unit(benchmark::kMillisecond);
BENCHMARK(StdGetline)->Unit(benchmark::kMillisecond);
BENCHMARK(QtReadLineInto)->Unit(benchmark::kMillisecond);
BENCHMARK(DetectionOnOpen)->Unit(benchmark::kMicrosecond);

BENCHMARK_MAIN();
