#pragma once
// String and character conversions (%s %S %c %C with h, l and w): text of the format's own
// kind is copied, text of the other kind converted with the locale's code page.

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <memory>
#include <new>

#include "crt_format_convert.h"
#include "crt_format_field.h"
#include "crt_format_locale.h"
#include "crt_format_conversion.h"

namespace win32::detail::engine {

// Units of s before its terminator, at most `precision` of them (-1: no limit).
template <typename Char>
std::size_t TextLength(const Char* s, int precision) noexcept {
  if constexpr (sizeof(Char) == 1) {
    return precision < 0 ? std::strlen(s) : strnlen(s, static_cast<std::size_t>(precision));
  } else {
    const std::size_t limit = precision < 0 ? SIZE_MAX : static_cast<std::size_t>(precision);
    std::size_t n = 0;
    while (n < limit && s[n] != 0) ++n;
    return n;
  }
}

// The text printed for a null string argument.
template <typename Char>
const Char* NullText() noexcept {
  if constexpr (sizeof(Char) == 1) {
    return "(null)";
  } else {
    return u"(null)";
  }
}

// Appends converted text of `units` output units: in place when the sink has room, else
// through a temporary buffer (the sink then keeps what fits).
template <typename OutChar, typename Sink, typename Convert>
void AppendConverted(Sink& sink, std::size_t units, Convert&& convert) {
  if constexpr (!Sink::kKeepsText) {
    sink.Fill(OutChar{}, units);
  } else {
    if (OutChar* direct = sink.Reserve(units)) {
      convert(direct);
      sink.Commit(units);
      return;
    }
    OutChar local[256];
    std::unique_ptr<OutChar[]> heap;
    OutChar* temporary = local;
    if (units > std::size(local)) {
      heap.reset(new (std::nothrow) OutChar[units]);
      if (!heap) {  // no memory for text that is being cut anyway: keep its length only
        sink.Fill(OutChar{'?'}, units);
        return;
      }
      temporary = heap.get();
    }
    convert(temporary);
    sink.Append(temporary, units);
  }
}

// %s/%S: text of the format's own kind, or of the other kind converted with the code page.
template <typename Char, typename Sink, typename Arguments>
FormatStatus WriteString(Sink& sink, const Conversion& conversion, bool wideArgument,
                         const FormatLocale& locale, Arguments& args) {
  constexpr bool kWideFormat = sizeof(Char) == 2;
  if (wideArgument == kWideFormat) {
    const Char* text;
    if constexpr (kWideFormat) text = args.WideText(); else text = args.NarrowText();
    if (text == nullptr) text = NullText<Char>();
    const std::size_t n = TextLength(text, conversion.precision);
    WritePadded(sink, conversion, n, [&] { sink.Append(text, n); });
    return FormatStatus::kOk;
  }
  if constexpr (kWideFormat) {  // narrow text into MCHAR output
    const char* text = args.NarrowText();
    if (text == nullptr) text = NullText<char>();
    std::size_t n = TextLength(text, conversion.precision);
    if (conversion.precision >= 0 && text[n] != 0) n = WholeCharacterBytes(locale, text, n);
    const long long units = WideLengthOfNarrow(locale, text, n);
    if (units < 0) return FormatStatus::kUnconvertible;
    WritePadded(sink, conversion, static_cast<std::uint64_t>(units), [&] {
      AppendConverted<MCHAR>(sink, static_cast<std::size_t>(units), [&](MCHAR* out) {
        NarrowToWide(locale, text, n, out, static_cast<std::size_t>(units));
      });
    });
  } else {  // MCHAR text into narrow output
    const MCHAR* text = args.WideText();
    if (text == nullptr) text = NullText<MCHAR>();
    std::size_t n = TextLength(text, conversion.precision);
    if (conversion.precision >= 0 && text[n] != 0) n = WholeCharacterUnits(text, n);
    const long long bytes = NarrowLengthOfWide(locale, text, n);
    if (bytes < 0) return FormatStatus::kUnconvertible;
    WritePadded(sink, conversion, static_cast<std::uint64_t>(bytes), [&] {
      AppendConverted<char>(sink, static_cast<std::size_t>(bytes), [&](char* out) {
        WideToNarrow(locale, text, n, out, static_cast<std::size_t>(bytes));
      });
    });
  }
  return FormatStatus::kOk;
}

// %c/%C. A character the code page cannot convert is left out, padding and all, as the
// runtime does.
template <typename Char, typename Sink, typename Arguments>
void WriteCharacter(Sink& sink, const Conversion& conversion, bool wideArgument,
                    const FormatLocale& locale, Arguments& args) {
  constexpr bool kWideFormat = sizeof(Char) == 2;
  const int value = args.Int();
  Char out[4];
  std::size_t n = 1;
  if (wideArgument == kWideFormat) {
    out[0] = static_cast<Char>(value);
  } else if constexpr (kWideFormat) {
    if (!NarrowCharToWide(locale, static_cast<char>(value), &out[0])) return;
  } else {
    n = static_cast<std::size_t>(WideCharToNarrow(locale, static_cast<MCHAR>(value), out));
    if (n == 0) return;
  }
  WritePadded(sink, conversion, n, [&] {
    for (std::size_t i = 0; i < n; ++i) sink.Put(out[i]);
  });
}

// Whether a %c/%s/%C/%S argument is wide: h narrow, l and w wide, otherwise by the letter and
// the format's kind (lower case: the format's own kind).
template <typename Char>
bool IsWideArgument(const Conversion& conversion) {
  if (conversion.size == SizePrefix::kH) return false;
  if (conversion.size == SizePrefix::kL || conversion.size == SizePrefix::kW) return true;
  const bool ownKind = conversion.type == 'c' || conversion.type == 's';
  return ownKind == (sizeof(Char) == 2);
}

}  // namespace win32::detail::engine
