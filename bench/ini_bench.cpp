// INI lookups: the library's GetPrivateProfileStringW (file mutex, change check, cached parse,
// rules) for random keys of a file of 50 sections x 100 keys, side by side with QSettings
// opening the file and reading one key (what one call promises: the file's current value); and
// the uncontended FileMutexObject round trip every INI call makes.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <QSettings>
#include <QString>
#include <chrono>
#include <cstdio>
#include <thread>
#include <fstream>
#include <random>
#include <string>

#include "vynutil/ini_profile.h"
#include "vynutil/mutex.h"

namespace {

constexpr int kSections = 50;
constexpr int kKeys = 100;

const std::string& SampleFile() {
  static const std::string path = [] {
    const std::string file = "/tmp/vyn_bench_ini_" + std::to_string(getpid()) + ".ini";
    std::ofstream out(file, std::ios::binary);
    for (int s = 0; s < kSections; ++s) {
      out << "[Section" << s << "]\r\n";
      for (int k = 0; k < kKeys; ++k) out << "Key" << k << "=C:\\Program Files\\Value " << s << "-" << k << "\r\n";
    }
    std::atexit([] { std::remove(("/tmp/vyn_bench_ini_" + std::to_string(getpid()) + ".ini").c_str()); });
    // An unchanged file, as settings files are between writes: older than its clock's step.
    std::this_thread::sleep_for(std::chrono::milliseconds(200));
    return file;
  }();
  return path;
}

std::u16string U16(const std::string& text) { return std::u16string(text.begin(), text.end()); }

void LibraryLookup(benchmark::State& state) {
  const std::u16string file = U16(SampleFile());
  std::mt19937 random(7);
  MCHAR buffer[256];
  for (auto _ : state) {
    const std::u16string section = U16("Section" + std::to_string(random() % kSections));
    const std::u16string key = U16("Key" + std::to_string(random() % kKeys));
    benchmark::DoNotOptimize(
        VynSDK::Util::GetPrivateProfileStringW(section.c_str(), key.c_str(), u"", buffer, 256, file.c_str()));
  }
}

void QSettingsOpenAndRead(benchmark::State& state) {
  const QString file = QString::fromStdString(SampleFile());
  std::mt19937 random(7);
  for (auto _ : state) {
    QSettings settings(file, QSettings::IniFormat);
    const QString key = QStringLiteral("Section%1/Key%2").arg(random() % kSections).arg(random() % kKeys);
    benchmark::DoNotOptimize(settings.value(key).toString().size());
  }
}

void FileMutexRoundTrip(benchmark::State& state) {
  const std::u16string file = U16(SampleFile());
  for (auto _ : state) {
    VynSDK::Util::FileMutexObject mutex(file.c_str(), INFINITE);
    benchmark::DoNotOptimize(mutex.MutexAquired());
  }
}

}  // namespace

BENCHMARK(LibraryLookup)->Iterations(10000)->Unit(benchmark::kMicrosecond);
BENCHMARK(QSettingsOpenAndRead)->Unit(benchmark::kMicrosecond);
BENCHMARK(FileMutexRoundTrip)->Unit(benchmark::kMicrosecond);
BENCHMARK_MAIN();
