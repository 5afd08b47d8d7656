// The per-code-page codecs, each built once at first use. They live until the process ends (on
// purpose: conversions may still run in other objects' destructors at exit).

#include "codepage_codec.h"

#include <atomic>
#include <mutex>

namespace win32::detail {

namespace {

std::unique_ptr<Codec> MakeCodec(const CodePageEntry& entry) {
  switch (entry.kind) {
    case CodePageKind::kSingleByte:
    case CodePageKind::kDoubleByte: return MakeTableCodec(entry);
    case CodePageKind::kUtf8: return nullptr;  // converted without a codec
    case CodePageKind::kStateful: return MakeStatefulCodec(entry);
  }
  return nullptr;
}

}  // namespace

const Codec* GetCodec(const CodePageEntry& entry) {
  static std::atomic<const Codec*> codecs[64];
  static std::once_flag built[64];
  const Codec* codec = codecs[entry.slot].load(std::memory_order_acquire);
  if (codec != nullptr) return codec;
  std::call_once(built[entry.slot], [&entry] {
    codecs[entry.slot].store(MakeCodec(entry).release(), std::memory_order_release);
  });
  return codecs[entry.slot].load(std::memory_order_acquire);
}

}  // namespace win32::detail
