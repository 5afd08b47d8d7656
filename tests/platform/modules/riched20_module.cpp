// A small module for the platform tests to load by name, as the library loads system modules:
// two exported functions, an exported counter of its own initialisations, and resources in
// several languages.

#include "vynutil/module_resources.h"

#define PROBE_EXPORT extern "C" __attribute__((visibility("default")))

// How many times this image was initialised: 1 after each real load, whatever the load count.
extern "C" {
__attribute__((visibility("default"))) int VynProbeInitialisations = 0;
}

PROBE_EXPORT int VynProbeAnswer() { return 42; }

PROBE_EXPORT const void* VynProbeResources();

namespace {

struct CountInitialisation {
  CountInitialisation() { ++VynProbeInitialisations; }
} count_initialisation;

const VynStringResource kEnglish[] = {{1, u"Rich text (en-US)"}, {2, u"Only in English"}};
const VynStringResource kGerman[] = {{1, u"Formatierter Text (de-DE)"}};

// A 2 x 1 pixel, 24 bits per pixel bitmap as a resource compiler stores it: the 40-byte
// information header, then one row of two pixels padded to 4 bytes.
const unsigned char kBitmap[] = {
    40, 0, 0, 0,  2, 0, 0, 0,  1, 0, 0, 0,  1, 0,  24, 0,  0, 0, 0, 0,  8, 0, 0, 0,
    0,  0, 0, 0,  0, 0, 0, 0,  0, 0, 0, 0,  0, 0, 0, 0,
    0x00, 0x00, 0xFF,  0xFF, 0x00, 0x00,  0, 0,  // red, blue (stored blue-green-red)
};
const VynDataResource kData[] = {{2, 7, kBitmap, sizeof(kBitmap)}};

const VynResourceLanguage kLanguages[] = {
    {0x0409, kEnglish, 2, kData, 1},
    {0x0407, kGerman, 1, nullptr, 0},
};
const VynModuleResources kResources = {kLanguages, 2};

VYN_MODULE_RESOURCES(kResources);

}  // namespace

PROBE_EXPORT const void* VynProbeResources() { return &kResources; }
