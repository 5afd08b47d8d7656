// The library's own string resources (English).

#include "vynutil/module_resources.h"

namespace {

const VynStringResource kEnglishStrings[] = {
    {109, u"Software"},
    {112, u"Korv"},
    // Symbols in paths: "$(" name ")"; the project folder's symbol is "$(ProjectFolder)".
    {123, u"ProjectFolder"},
    {126, u"$("},
    {128, u")"},
};

const VynResourceLanguage kLanguages[] = {
    {0x0409, kEnglishStrings, sizeof(kEnglishStrings) / sizeof(kEnglishStrings[0]), nullptr, 0},
};

const VynModuleResources kLibraryResources = {kLanguages, 1};

VYN_MODULE_RESOURCES(kLibraryResources);

}  // namespace
