#pragma once
// Folders named by environment variables: single-folder variables and semicolon-separated folder
// lists, expanded, checked (with warnings through Util::Logger) and cached; files located along
// a list.

#include <vector>

#include "vynutil/export.h"
#include "vynutil/path.h"
#include "vynutil/util_logger.h"
#include "vynutil/wstr.h"

namespace Util {

class VYN_API EnvPath {
 public:
  enum MultiPathVariable {
    ScriptsAddon = 0,         // KORV_TAVLO_SCRIPTS_ADDON_DIR
    StartupScriptsAddon = 1,  // KORV_TAVLO_STARTUPSCRIPTS_ADDON_DIR
    MacrosAddon = 2,          // KORV_TAVLO_MACROS_ADDON_DIR
    IconsAddon = 3,           // KORV_TAVLO_ICONS_ADDON_DIR
    PluginsAddon = 4,         // KORV_TAVLO_PLUGINS_ADDON_DIR
    AssetsXrefs = 5,          // KORV_TAVLO_ASSETS_XREFS_DIR
    AssetsMaps = 6,           // KORV_TAVLO_ASSETS_MAPS_DIR
  };
  enum SinglePathVariable {
    ProjectFolder = 0,  // KORV_TAVLO_PROJECT_FOLDER_DIR
    UserSettings = 1,   // KORV_TAVLO_USERSETTINGS_DIR
    UserTools = 2,      // KORV_TAVLO_USERTOOLS_DIR
    AppData = 3,        // KORV_TAVLO_APPDATA_DIR
    AutoBackup = 4,     // KORV_TAVLO_AUTOBACKUP_DIR
  };

  // text with %NAME% references of set variables replaced; others stay as written.
  static WStr ExpandEnvVars(const WStr& text);
  // Reads variable name into out: false when it is not set, or when lengthLimit is not 0 and the
  // value with its terminator is longer than lengthLimit (out unchanged then).
  static bool GetEnvironmentMSTR(const MCHAR* name, WStr& out, size_t lengthLimit);
  // The pieces of text between semicolons, empty ones included ("" gives one empty piece).
  static std::vector<WStr> SplitPath(const MCHAR* text);
  // The usable folders among candidates, in their order, normalized: candidates still holding a
  // reference after expansion (message 150), blank or illegal ones (151) are left out; missing
  // ones (152) are left out only with skipMissing.
  static std::vector<VynSDK::Util::Path> ValidatePathCandidates(Logger& logger, const std::vector<WStr>& candidates,
                                                                const MCHAR* variableName, bool skipMissing);
  // The folders of a list variable (empty when unset or unknown); computed and checked once per
  // value of the variable, cached until the value changes.
  static std::vector<VynSDK::Util::Path> ComputePathList(MultiPathVariable variable);
  // The normalized folder of a single-folder variable of at most 259 characters; false when it
  // is unset, too long, or holds an unresolved reference (message 150, except for AppData).
  // Whether the folder exists is not checked.
  static bool GetSinglePath(SinglePathVariable variable, VynSDK::Util::Path& out);
  // GetSinglePath for the host's directory identifiers 32 (project folder), 48 (user settings)
  // and 49 (user tools); false for any other identifier.
  static bool GetSinglePathByVynDirectoryID(int directoryId, VynSDK::Util::Path& out);
  // Looks for fileName in the folders of the list, in order (SearchPathW in each): the first
  // non-zero result (length written, or the size needed), 0 when no folder holds it.
  static unsigned long LocateFile(MultiPathVariable variable, const MCHAR* fileName, unsigned long bufferLength,
                                  MCHAR* buffer, MCHAR** filePart);
  // The full path of fileName in the first folder of the list that holds it.
  static bool LocateFile(MultiPathVariable variable, const MCHAR* fileName, WStr& out);
};

}  // namespace Util
