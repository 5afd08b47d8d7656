// Entry point of every test executable. The process code pages are pinned to Western European
// (1252 / 437) so that results do not depend on the machine's locale; tests that need another
// code page set it themselves and restore it.

#include <gtest/gtest.h>

#include <cstdlib>

// Impossible allocation requests must come back as null from malloc, as they do without
// AddressSanitizer, so that the library's own out-of-memory handling can be tested.
extern "C" const char* __asan_default_options() { return "allocator_may_return_null=1"; }
extern "C" const char* __tsan_default_options() { return "allocator_may_return_null=1"; }

int main(int argc, char** argv) {
  setenv("TAVLO_PLATFORM_ACP", "1252", 0);
  setenv("TAVLO_PLATFORM_OEMCP", "437", 0);
  testing::InitGoogleTest(&argc, argv);
  return RUN_ALL_TESTS();
}
