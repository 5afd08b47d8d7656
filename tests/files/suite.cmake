# The host's asset library, named as the path code looks for it, in a folder of its own that the
# module search does not reach until a test makes it the current folder.
add_library(vyn_test_asset_module SHARED ${CMAKE_CURRENT_SOURCE_DIR}/files/modules/asset_module.cpp)
target_link_libraries(vyn_test_asset_module PRIVATE vynutil)
set_target_properties(vyn_test_asset_module PROPERTIES
  OUTPUT_NAME AssetManagement PREFIX "" SUFFIX ".dll" NO_SONAME ON
  LIBRARY_OUTPUT_DIRECTORY ${CMAKE_CURRENT_BINARY_DIR}/asset_library)
add_dependencies(vyn_tests_files vyn_test_asset_module)
target_compile_definitions(vyn_tests_files PRIVATE
  VYN_TEST_ASSET_LIBRARY_DIR="${CMAKE_CURRENT_BINARY_DIR}/asset_library")
