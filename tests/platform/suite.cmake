# The platform tests load a real module by name: "Riched20.dll", built next to the test programs
# (the program's folder is where the loader looks first). It links the library for its resource
# registration. No soname, so that copies of it under other names load as modules of their own;
# no GNU-unique symbols, so that it really unloads with its last FreeLibrary.
add_library(vyn_test_riched20 SHARED ${CMAKE_CURRENT_SOURCE_DIR}/platform/modules/riched20_module.cpp)
target_link_libraries(vyn_test_riched20 PRIVATE vynutil)
target_compile_options(vyn_test_riched20 PRIVATE -fno-gnu-unique)
set_target_properties(vyn_test_riched20 PROPERTIES
  OUTPUT_NAME Riched20 PREFIX "" SUFFIX ".dll" NO_SONAME ON
  LIBRARY_OUTPUT_DIRECTORY ${CMAKE_CURRENT_BINARY_DIR})
add_dependencies(vyn_tests_platform vyn_test_riched20)

# The tests of the graphics stand-in build their images with Qt Gui.
find_package(Qt6 REQUIRED COMPONENTS Gui)
target_link_libraries(vyn_tests_platform PRIVATE Qt6::Gui)
