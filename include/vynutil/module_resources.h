#pragma once
// Resources of a module (the host program, a plug-in or this library): numbered strings and
// binary resources such as bitmaps, one table per language. A module declares its tables once,
// at namespace scope in one of its source files:
//
//   static const VynStringResource kStrings[] = {{30000, u"My Product"}};
//   static const VynResourceLanguage kLanguages[] = {{0x0409, kStrings, 1, nullptr, 0}};
//   static const VynModuleResources kResources = {kLanguages, 1};
//   VYN_MODULE_RESOURCES(kResources);
//
// The tables are registered while the module initialises and withdrawn when it unloads; the
// library's string and bitmap loaders find them through the module's handle.

#include <cstddef>

#include "vynutil/export.h"
#include "vynutil/wintypes.h"

// One numbered string; text is zero-terminated UTF-16.
struct VynStringResource {
  UINT id;
  const MCHAR* text;
};

// One binary resource: its numeric type (2 for a bitmap: a packed DIB without file header, as a
// Windows resource compiler stores it), its number and its bytes.
struct VynDataResource {
  UINT type;
  UINT id;
  const void* data;
  DWORD size;
};

// The resources of one language (a LANGID; 0 for language-neutral resources).
struct VynResourceLanguage {
  LANGID language;
  const VynStringResource* strings;
  std::size_t stringCount;
  const VynDataResource* data;
  std::size_t dataCount;
};

struct VynModuleResources {
  const VynResourceLanguage* languages;
  std::size_t languageCount;
};

// Registers the tables of the module that contains them (found from the tables' own address);
// a second registration for the same module replaces the first. The tables must outlive the
// registration. Use VYN_MODULE_RESOURCES rather than calling these directly.
VYN_API void VynRegisterModuleResources(const VynModuleResources* resources) noexcept;
VYN_API void VynUnregisterModuleResources(const VynModuleResources* resources) noexcept;

// Registers a module's tables for as long as the module is loaded.
class VynModuleResourcesRegistration {
 public:
  explicit VynModuleResourcesRegistration(const VynModuleResources& resources) noexcept
      : resources_(&resources) {
    VynRegisterModuleResources(resources_);
  }
  ~VynModuleResourcesRegistration() { VynUnregisterModuleResources(resources_); }
  VynModuleResourcesRegistration(const VynModuleResourcesRegistration&) = delete;
  VynModuleResourcesRegistration& operator=(const VynModuleResourcesRegistration&) = delete;

 private:
  const VynModuleResources* resources_;
};

#define VYN_MODULE_RESOURCES(resources) \
  static const VynModuleResourcesRegistration vyn_module_resources_registration_{resources}
