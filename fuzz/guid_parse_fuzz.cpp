// CLSIDFromString under libFuzzer. The input bytes are UTF-16 units (little-endian pairs),
// terminated for the call. Checked against an independent reading of the grammar: the call
// succeeds exactly when the text is "{" 8 "-" 4 "-" 4 "-" 4 "-" 12 "}" hexadecimal digits; on
// success the GUID written back as text equals the input without regard to case, on failure the
// GUID is all zeros. Reads stay inside the terminated text (AddressSanitizer watches).
//
// Run: build-fuzz/fuzz/fuzz_guid_parse -max_total_time=300 fuzz/corpus/guid_parse

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <vector>

#include "win32/guid.h"

namespace {

using namespace win32;

void Check(bool ok) {
  if (!ok) std::abort();
}

bool IsHex(char16_t c) {
  return (c >= u'0' && c <= u'9') || (c >= u'a' && c <= u'f') || (c >= u'A' && c <= u'F');
}

// The grammar, written out position by position.
bool WellFormed(const std::vector<char16_t>& text) {
  static const char kShape[] = "{hhhhhhhh-hhhh-hhhh-hhhh-hhhhhhhhhhhh}";
  if (text.size() != 38) return false;
  for (std::size_t i = 0; i < 38; ++i) {
    const char want = kShape[i];
    if (want == 'h' ? !IsHex(text[i]) : text[i] != static_cast<char16_t>(want)) return false;
  }
  return true;
}

char16_t Upper(char16_t c) { return c >= u'a' && c <= u'f' ? static_cast<char16_t>(c - 32) : c; }

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  std::vector<char16_t> text;
  for (std::size_t i = 0; i + 1 < size; i += 2) {
    const char16_t unit = static_cast<char16_t>(data[i] | (data[i + 1] << 8));
    if (unit == 0) break;
    text.push_back(unit);
  }
  std::vector<char16_t> terminated(text);
  terminated.push_back(0);
  // An exact-size heap copy, so that a read past the terminator is caught.
  auto* exact = static_cast<char16_t*>(std::malloc(terminated.size() * sizeof(char16_t)));
  std::memcpy(exact, terminated.data(), terminated.size() * sizeof(char16_t));
  GUID guid;
  std::memset(&guid, 0x5A, sizeof guid);
  const HRESULT result = CLSIDFromString(exact, &guid);
  std::free(exact);

  const bool wellFormed = WellFormed(text);
  Check((result == NOERROR) == wellFormed);
  Check(result == NOERROR || result == CO_E_CLASSSTRING);
  if (!wellFormed) {
    const GUID zero{};
    Check(std::memcmp(&guid, &zero, sizeof guid) == 0);
    return 0;
  }
  char written[40];
  std::snprintf(written, sizeof written, "{%08X-%04X-%04X-%02X%02X-%02X%02X%02X%02X%02X%02X}",
                static_cast<unsigned>(guid.Data1), guid.Data2, guid.Data3, guid.Data4[0], guid.Data4[1],
                guid.Data4[2], guid.Data4[3], guid.Data4[4], guid.Data4[5], guid.Data4[6],
                guid.Data4[7]);
  for (std::size_t i = 0; i < 38; ++i) Check(static_cast<char16_t>(written[i]) == Upper(text[i]));
  return 0;
}
