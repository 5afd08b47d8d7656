// The test program's own resources, as a host program supplies them: its product name (30000),
// an empty string, and a 2×1 24-bit bitmap (red, blue) as packed DIB.

#include "vynutil/module_resources.h"

namespace {

const VynStringResource kStrings[] = {{30000, u"Tavlo Test Host"}, {30001, u""}};

const unsigned char kTwoPixelBitmap[] = {
    40, 0, 0, 0,  2, 0, 0, 0,  1, 0, 0, 0,  1, 0, 24, 0,  // size, width 2, height 1, planes, 24 bits
    0, 0, 0, 0,   8, 0, 0, 0,  0, 0, 0, 0,  0, 0, 0, 0,   // BI_RGB, 8 bytes of bits
    0, 0, 0, 0,   0, 0, 0, 0,                             // no colour table
    0x00, 0x00, 0xFF, 0xFF, 0x00, 0x00, 0, 0,             // red, blue (stored blue-green-red), padding
};

const VynDataResource kData[] = {{2, 7, kTwoPixelBitmap, sizeof kTwoPixelBitmap}};

const VynResourceLanguage kLanguages[] = {{0x0409, kStrings, 2, kData, 1}};
const VynModuleResources kResources = {kLanguages, 1};
VYN_MODULE_RESOURCES(kResources);

}  // namespace
