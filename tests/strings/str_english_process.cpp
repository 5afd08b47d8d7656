// The strings suite runs as an English-language process: CStr text is then in the active code
// page (which the test main pins to 1252). Tests that need another language run themselves in a
// child process with TAVLO_PLATFORM_LANGID set (support/child_process.h). A value already in the
// environment is kept.

#include <cstdlib>

namespace {
[[maybe_unused]] const int kEnglishLanguage = setenv("TAVLO_PLATFORM_LANGID", "0x0409", 0);
}  // namespace
