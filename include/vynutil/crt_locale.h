#pragma once
// The C runtime's locale object, as the SDK's *_l formatting functions take it.

#include "vynutil/export.h"

struct VynCrtLocale;
// An opaque runtime locale made by _create_locale and freed by _free_locale.
using _locale_t = VynCrtLocale*;
