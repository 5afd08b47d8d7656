#pragma once
// The converter behind MultiByteToWideChar and WideCharToMultiByte for one code page. The Win32
// entry points check parameters and flags; a codec only converts.

#include <cstddef>
#include <cstdint>
#include <memory>

#include "codepage_registry.h"
#include "vynutil/wintypes.h"

namespace win32::detail {

enum class ConvStatus : std::uint8_t {
  kOk,
  kInvalid,         // invalid input in strict mode (MB_ERR_INVALID_CHARS, WC_ERR_INVALID_CHARS)
  kBufferTooSmall,  // the output did not fit into the capacity given
};

struct ConvResult {
  std::size_t count;  // units (or bytes) written, or needed when measuring
  ConvStatus status;
};

// What WideCharToMultiByte passes on to a codec.
struct EncodeOptions {
  bool noBestFit = false;             // WC_NO_BEST_FIT_CHARS: only characters that round-trip
  const char* defaultChar = nullptr;  // lpDefaultChar, or null for the code page's own
  bool* usedDefault = nullptr;        // set when the default character was written
};

class Codec {
 public:
  virtual ~Codec() = default;

  // Converts n bytes to UTF-16. capacity 0 measures (out may be null). strict: invalid input
  // fails instead of being replaced. glyphs: MB_USEGLYPHCHARS.
  virtual ConvResult Decode(const char* s, std::size_t n, bool strict, bool glyphs, char16_t* out,
                            std::size_t capacity) const = 0;

  // Converts n UTF-16 units. capacity 0 measures (out may be null).
  virtual ConvResult Encode(const char16_t* s, std::size_t n, const EncodeOptions& options,
                            char* out, std::size_t capacity) const = 0;

  // True when the code unit converts to the code page (exactly, or by best fit unless noBestFit).
  // Used to decide whether a composed character can replace a base and a nonspacing mark.
  virtual bool CanEncode(char16_t c, bool noBestFit) const = 0;
};

// The codec of a table or stateful entry, built at first use (thread-safe); null when ICU lacks
// the converter. UTF-8 has no codec: it is converted by the two functions below.
const Codec* GetCodec(const CodePageEntry& entry);

// CP_UTF8 with Win32's buffer rules (capacity 0 measures).
ConvResult DecodeUtf8Bounded(const char* s, std::size_t n, bool strict, char16_t* out,
                             std::size_t capacity);
ConvResult EncodeUtf8Bounded(const char16_t* s, std::size_t n, bool strict, char* out,
                             std::size_t capacity);

// The codec makers GetCodec chooses from by the entry's kind (null when ICU lacks the data).
std::unique_ptr<Codec> MakeTableCodec(const CodePageEntry& entry);
std::unique_ptr<Codec> MakeStatefulCodec(const CodePageEntry& entry);

}  // namespace win32::detail
