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
    // Messages of the configuration code (Util::Logger). Arguments in the order noted.
    // 150-152: environment variable name, folder text.
    {150, u"Environment variable %s: the folder \"%s\" still holds an undefined %%NAME%% reference and is ignored."},
    {151, u"Environment variable %s: the folder \"%s\" is blank or not a legal path and is ignored."},
    {152, u"Environment variable %s: the folder \"%s\" does not exist."},
    // 153: file, section, key, value, expansion.
    {153, u"INI file %s, section [%s], key %s: the value \"%s\" expands to \"%s\", which still holds an undefined %%NAME%% reference."},
    // 154: file, section, key, expansion.
    {154, u"INI file %s, section [%s], key %s: the path \"%s\" is empty or does not exist."},
    // 155: name, value.
    {155, u"%s: the value \"%s\" holds a %%NAME%% reference where none is allowed."},
    // 156: file, section, key, raw value, new value.
    {156, u"INI file %s, section [%s], key %s: kept \"%s\"; the new value \"%s\" was rejected."},
    // 157: file, section, key, value.
    {157, u"INI file %s, section [%s], key %s: the value \"%s\" was rejected on reading."},
};

const VynResourceLanguage kLanguages[] = {
    {0x0409, kEnglishStrings, sizeof(kEnglishStrings) / sizeof(kEnglishStrings[0]), nullptr, 0},
};

const VynModuleResources kLibraryResources = {kLanguages, 1};

VYN_MODULE_RESOURCES(kLibraryResources);

}  // namespace
