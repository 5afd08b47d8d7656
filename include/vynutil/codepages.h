#pragma once
// Encoding tags: 32-bit code-page numbers. Only the low 28 bits name the encoding; the top four
// bits are flags of the text-file layer (big-endian, declared, byte-order mark, prefer UTF-8).

#include "vynutil/wintypes.h"

inline constexpr UINT CP_ACP = 0;         // the process's active code page
inline constexpr UINT CP_OEMCP = 1;       // the OEM code page
inline constexpr UINT CP_MACCP = 2;       // the system default Macintosh code page
inline constexpr UINT CP_THREAD_ACP = 3;  // the calling thread's ANSI code page
inline constexpr UINT CP_UTF7 = 65000;
inline constexpr UINT CP_UTF8 = 65001;
inline constexpr UINT CP_UTF16 = 65012;    // UTF-16 in MCHAR units (little-endian)
inline constexpr UINT CP_NEUTRAL = 65013;  // 8-bit text valid in every 8-bit code page
inline constexpr UINT CP_UTF32 = 65014;    // UTF-32 in 32-bit unsigned units

// The bits of an encoding tag that name the encoding.
inline constexpr UINT CP_ENCODING_MASK = 0x0FFFFFFFu;
