#pragma once
// The one export macro of vynutil. The library is built with hidden visibility; everything a
// plug-in or host may call is marked VYN_API.

#define VYN_API __attribute__((visibility("default")))
