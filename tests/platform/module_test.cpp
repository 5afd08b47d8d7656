// LoadLibraryW and its family on a real module: "Riched20.dll", built next to this program
// (modules/riched20_module.cpp). Whether a module is really loaded is asked of the loader itself
// (dlopen with RTLD_NOLOAD), not of the code under test.

#include "win32/module.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "scoped_env.h"
#include "support/temp_dir.h"
#include "syscalls.h"
#include "win32/last_error.h"
#include "win32/path_map.h"

namespace {

namespace fs = std::filesystem;
using namespace win32;

const fs::path kProgram = fs::read_symlink("/proc/self/exe");
const fs::path kProbe = kProgram.parent_path() / "Riched20.dll";

// True while the loader has the file loaded; the probe's own load is given back at once.
bool IsLoaded(const fs::path& path) {
  void* handle = dlopen(path.c_str(), RTLD_LAZY | RTLD_NOLOAD);
  if (handle != nullptr) dlclose(handle);
  return handle != nullptr;
}

std::u16string FileName(HMODULE module) {
  MCHAR buffer[4096];
  return std::u16string(buffer, GetModuleFileNameW(module, buffer, 4096));
}

// Gives back every load taken through it, also when a test fails part-way.
struct Loads {
  ~Loads() {
    for (HMODULE module : taken) FreeLibrary(module);
  }
  HMODULE operator()(const MCHAR* name) {
    HMODULE module = LoadLibraryW(name);
    if (module != nullptr) taken.push_back(module);
    return module;
  }
  std::vector<HMODULE> taken;
};

HMODULE NotAModule() {
  static int notAModule;
  return reinterpret_cast<HMODULE>(&notAModule);
}

}  // namespace

TEST(Module, LoadsAreCountedUntilTheLastFree) {
  ASSERT_TRUE(fs::exists(kProbe)) << "the test module is built next to the test program";
  ASSERT_FALSE(IsLoaded(kProbe));
  HMODULE first = LoadLibraryExW(u"Riched20.dll", nullptr, 0);  // without flags: LoadLibraryW
  ASSERT_NE(first, nullptr) << GetLastError();
  // Names match without regard to case; a name without extension gets ".dll".
  EXPECT_EQ(LoadLibraryW(u"RICHED20"), first);
  EXPECT_EQ(GetModuleHandleW(u"riched20.DLL"), first);
  const auto* initialisations =
      reinterpret_cast<const int*>(GetProcAddress(first, "VynProbeInitialisations"));
  ASSERT_NE(initialisations, nullptr);
  EXPECT_EQ(*initialisations, 1) << "a second load only counts";

  EXPECT_TRUE(FreeLibrary(first));
  EXPECT_TRUE(IsLoaded(kProbe)) << "one load is left";
  EXPECT_TRUE(FreeLibrary(first));
  EXPECT_FALSE(IsLoaded(kProbe)) << "GetModuleHandleW must not have counted a load";
  EXPECT_EQ(GetModuleHandleW(u"Riched20.dll"), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_MOD_NOT_FOUND);
  // The stale handle and made-up ones are refused, not handed to the loader.
  for (HMODULE bad : {first, NotAModule(), static_cast<HMODULE>(nullptr)}) {
    EXPECT_FALSE(FreeLibrary(bad));
    EXPECT_EQ(GetLastError(), ERROR_MOD_NOT_FOUND);
  }
}

TEST(Module, ReportsModulesThatCannotBeLoaded) {
  EXPECT_EQ(LoadLibraryExW(u"Riched20.dll", nullptr, 0x2), nullptr) << "LoadLibraryExW takes no flags";
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
  vyn::test::TempDir dir;
  const std::u16string broken = dir.Write("Broken.dll", "not a shared object");
  struct Row {
    const char* what;
    std::u16string name;
    DWORD error;  // "System Error Codes" page
  };
  const Row rows[] = {
      {"no such module anywhere", u"NoSuchProbeModule", ERROR_MOD_NOT_FOUND},
      {"no such file at a path", dir.File("Missing.dll"), ERROR_MOD_NOT_FOUND},
      {"a file that is no module", broken, ERROR_DLL_INIT_FAILED},
      {"the same, found case-insensitively", dir.File("BROKEN"), ERROR_DLL_INIT_FAILED},
      {"an empty name", u"", ERROR_MOD_NOT_FOUND},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.what);
    EXPECT_EQ(LoadLibraryW(row.name.c_str()), nullptr);
    EXPECT_EQ(GetLastError(), row.error);
  }
  EXPECT_EQ(LoadLibraryW(nullptr), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_INVALID_PARAMETER);
}

TEST(Module, FindsOnlyTheModulesOwnExports) {
  Loads load;
  HMODULE module = load(u"Riched20.dll");
  ASSERT_NE(module, nullptr);
  // Through void (*)(), the form for casting between function types.
  auto answer = reinterpret_cast<int (*)()>(
      reinterpret_cast<void (*)()>(GetProcAddress(module, "VynProbeAnswer")));
  ASSERT_NE(answer, nullptr);
  EXPECT_EQ(answer(), 42);

  const char* ordinal = reinterpret_cast<const char*>(static_cast<ULONG_PTR>(1));
  // "malloc" is reachable through dlsym's search of the module's dependencies.
  for (const char* missing :
       {"VynProbeMissing", "malloc", ordinal, static_cast<const char*>(nullptr)}) {
    EXPECT_EQ(GetProcAddress(module, missing), nullptr);
    EXPECT_EQ(GetLastError(), ERROR_PROC_NOT_FOUND);
  }
  // A module loaded as a dependency, which the loader gave no handle of its own.
  HMODULE libc = GetModuleHandleW(u"libc.so.6");
  ASSERT_NE(libc, nullptr);
  EXPECT_NE(GetProcAddress(libc, "malloc"), nullptr);
  EXPECT_EQ(GetProcAddress(NotAModule(), "malloc"), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_MOD_NOT_FOUND);
}

TEST(Module, FileNameIsCutToTheBufferAsWin32CutsIt) {
  Loads load;
  HMODULE module = load(u"riched20");
  ASSERT_NE(module, nullptr);
  const std::u16string expected = kProbe.u16string();
  EXPECT_EQ(FileName(module), expected);
  EXPECT_EQ(FileName(nullptr), kProgram.u16string());

  // GetModuleFileNameW page: a short buffer gets size - 1 units and a terminator, the result is
  // size and the last error ERROR_INSUFFICIENT_BUFFER; success leaves the last error alone.
  const DWORD length = static_cast<DWORD>(expected.size());
  struct Row {
    DWORD size, result, kept, error;
  };
  const Row rows[] = {{0, 0, 0, ERROR_INSUFFICIENT_BUFFER},
                      {1, 1, 0, ERROR_INSUFFICIENT_BUFFER},
                      {length, length, length - 1, ERROR_INSUFFICIENT_BUFFER},
                      {length + 1, length, length, 777}};
  for (const Row& row : rows) {
    SCOPED_TRACE(row.size);
    std::u16string buffer(length + 8, u'#');
    SetLastError(777);
    EXPECT_EQ(GetModuleFileNameW(module, buffer.data(), row.size), row.result);
    EXPECT_EQ(GetLastError(), row.error);
    EXPECT_EQ(buffer.substr(0, row.kept), expected.substr(0, row.kept));
    if (row.size > 0) {
      EXPECT_EQ(buffer[row.kept], u'\0');
    }
    EXPECT_EQ(buffer[row.size], u'#') << "nothing written past the buffer";
  }
  MCHAR small[16];
  EXPECT_EQ(GetModuleFileNameW(NotAModule(), small, 16), 0u);
  EXPECT_EQ(GetLastError(), ERROR_MOD_NOT_FOUND);
}

TEST(Module, HandlesOfTheProgramTheLibraryAndAddresses) {
  void* program = dlopen(nullptr, RTLD_LAZY);
  dlclose(program);
  EXPECT_EQ(GetModuleHandleW(nullptr), program);
  EXPECT_EQ(detail::ModuleOfAddress(&kProgram), program);
  // A trailing dot means "no extension"; the program's own name has none.
  const std::u16string programName = kProgram.filename().u16string();
  EXPECT_EQ(GetModuleHandleW((programName + u".").c_str()), program);
  EXPECT_EQ(GetModuleHandleW(programName.c_str()), nullptr) << "\".dll\" is added";

  Dl_info info{};
  ASSERT_NE(dladdr(reinterpret_cast<void*>(&LoadLibraryW), &info), 0);
  HMODULE library = GetModuleHandleW(fs::path(info.dli_fname).filename().u16string().c_str());
  ASSERT_NE(library, nullptr);
  EXPECT_NE(library, program);
  EXPECT_EQ(detail::ModuleOfAddress(reinterpret_cast<void*>(&LoadLibraryW)), library);

  auto onTheHeap = std::make_unique<int>(0);
  EXPECT_EQ(detail::ModuleOfAddress(onTheHeap.get()), nullptr);
  EXPECT_EQ(detail::ModuleOfAddress(nullptr), nullptr);
}

TEST(Module, SearchesPathFoldersAndMapsWindowsPaths) {
  vyn::test::TempDir dir;
  fs::copy_file(kProbe, dir.path() / "CaseProbe.dll");
  const char* oldPath = std::getenv("PATH");
  ScopedEnv path("PATH", (dir.path().string() + ":" + (oldPath ? oldPath : "")).c_str());
  Loads load;
  HMODULE copy = load(u"caseprobe");
  ASSERT_NE(copy, nullptr) << GetLastError();
  EXPECT_EQ(FileName(copy), (dir.path() / "CaseProbe.dll").u16string());
  EXPECT_NE(load(u"Riched20.dll"), copy) << "a copy under another name is a module of its own";

  SetDriveRoot(u'Q', dir.path().c_str());
  EXPECT_EQ(load(u"Q:\\CASEPROBE.DLL"), copy);
  EXPECT_EQ(GetModuleHandleW(u"q:\\caseprobe"), copy);
  SetDriveRoot(u'Q', nullptr);
}

TEST(Module, AFailingLoaderCallIsReported) {
  sys::ScopedSyscalls calls;
  calls.table().dlopen = [](const char* path, int flags) -> void* {
    return path == nullptr ? sys::DefaultSyscalls().dlopen(path, flags) : nullptr;
  };
  EXPECT_EQ(LoadLibraryW(u"Riched20.dll"), nullptr);
  EXPECT_EQ(GetLastError(), ERROR_DLL_INIT_FAILED) << "found in the program's folder, not loaded";
  EXPECT_FALSE(IsLoaded(kProbe));
}
