#pragma once
// The SDK's string classes: CStr (narrow code page), WStr (UTF-16) and UTF8Str (UTF-8).
// Each is one pointer into a shared VynString block; conversions between them share the block
// and cache the converted form in it.

#include "vynutil/cstr.h"
#include "vynutil/utf8str.h"
#include "vynutil/wstr.h"
