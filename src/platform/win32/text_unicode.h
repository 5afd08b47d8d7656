#pragma once
// IsTextUnicode: whether a buffer of bytes is likely UTF-16 text, in either byte order.
//
// Every test looks at the buffer as 16-bit units in little-endian order (the "forward" reading);
// the REVERSE tests look at the same units with their two bytes swapped (big-endian text). A
// trailing odd byte takes part in no unit test.
//
// The tests, each one bit of the request and of the answer:
//   ASCII16            every unit is U+0001..U+007F: zero-extended ASCII.
//   STATISTICS         the units read like natural UTF-16 text rather than like 8-bit text. All of:
//                      - at least two units;
//                      - the reading is plausible: no unit below U+0020 but TAB, LF, FF and CR,
//                        no C1 control (U+0080..U+009F), no private-use unit (U+E000..U+F8FF), no
//                        noncharacter U+FFFE / U+FFFF, and no surrogate out of a lead-trail pair
//                        (a lead surrogate as the very last unit is allowed: samples are cut);
//                      - not every byte is printable ASCII, TAB, CR or LF: such bytes are 8-bit
//                        text far more plausibly than UTF-16 ("Bush hid the facts");
//                      - and either every high byte is zero while every low byte is not and one
//                        is 0x80 or more (Latin-1 range text), or the high bytes vary less than
//                        the low bytes: the sum of the differences between neighbouring high bytes
//                        is below half that of the low bytes, and the high bytes take fewer
//                        distinct values than the low bytes. In UTF-16 the high byte names the
//                        script block (0x00 Latin, 0x04 Cyrillic, 0x30 kana, 0x4E..0x9F CJK) and
//                        changes seldom; in 8-bit text both bytes of a unit are letters alike.
//   CONTROLS           the reading is plausible (as for STATISTICS) and holds more of TAB, LF, CR,
//                      SPACE and IDEOGRAPHIC SPACE (U+0009, U+000A, U+000D, U+0020, U+3000) than
//                      of their byte-swapped values (U+0900, U+0A00, U+0D00, U+2000, U+0030).
//                      Comparing with the swapped values keeps a digit '0' of big-endian text
//                      (read here as U+3000) from passing; plausibility keeps binary data, where
//                      any unit turns up now and then, from passing.
//   SIGNATURE          the first unit is the byte-order mark U+FEFF.
//   REVERSE_...        the same four tests on the byte-swapped units.
//   ILLEGAL_CHARS      a unit no UTF-16 text holds: U+0000, U+FFFF, a reversed mark U+FFFE after
//                      the first unit, or 0x0A0D, the bytes CR LF of 8-bit text at an even offset.
//   ODD_LENGTH         the byte count is odd.
//   DBCS_LEADBYTE      the active code page is a double-byte code page and the buffer is text in
//                      it: at least one lead byte, every pair valid in that code page (a lead byte
//                      as the last byte is allowed), and no zero byte.
//   NULL_BYTES         a byte is zero, so the buffer is no 8-bit text.
//
// Result: with *lpiResult asking for any test of the UNICODE or REVERSE masks, TRUE when one of
// those that was asked for passed and none of the NOT_UNICODE tests that were asked for did
// ("this is UTF-16 in the byte order asked about"). A request of NOT_UNICODE or NOT_ASCII tests
// alone returns TRUE when any of them passed ("this is clearly not UTF-16 / not ASCII"). A null
// lpiResult runs every test. On return *lpiResult holds the requested tests that passed. A null
// buffer or a size below 1 passes nothing and returns FALSE.

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

namespace win32 {

inline constexpr INT IS_TEXT_UNICODE_ASCII16 = 0x0001;
inline constexpr INT IS_TEXT_UNICODE_REVERSE_ASCII16 = 0x0010;
inline constexpr INT IS_TEXT_UNICODE_STATISTICS = 0x0002;
inline constexpr INT IS_TEXT_UNICODE_REVERSE_STATISTICS = 0x0020;
inline constexpr INT IS_TEXT_UNICODE_CONTROLS = 0x0004;
inline constexpr INT IS_TEXT_UNICODE_REVERSE_CONTROLS = 0x0040;
inline constexpr INT IS_TEXT_UNICODE_SIGNATURE = 0x0008;
inline constexpr INT IS_TEXT_UNICODE_REVERSE_SIGNATURE = 0x0080;
inline constexpr INT IS_TEXT_UNICODE_ILLEGAL_CHARS = 0x0100;
inline constexpr INT IS_TEXT_UNICODE_ODD_LENGTH = 0x0200;
inline constexpr INT IS_TEXT_UNICODE_DBCS_LEADBYTE = 0x0400;
inline constexpr INT IS_TEXT_UNICODE_NULL_BYTES = 0x1000;

inline constexpr INT IS_TEXT_UNICODE_UNICODE_MASK = 0x000F;
inline constexpr INT IS_TEXT_UNICODE_REVERSE_MASK = 0x00F0;
inline constexpr INT IS_TEXT_UNICODE_NOT_UNICODE_MASK = 0x0F00;
inline constexpr INT IS_TEXT_UNICODE_NOT_ASCII_MASK = 0xF000;

VYN_API BOOL IsTextUnicode(const void* lpv, int iSize, INT* lpiResult);

}  // namespace win32
