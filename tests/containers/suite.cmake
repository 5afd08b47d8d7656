# A second shared object with its own instantiation of the Tab template.
add_library(vyn_test_tab_module SHARED ${CMAKE_CURRENT_SOURCE_DIR}/containers/modules/tab_module.cpp)
target_link_libraries(vyn_test_tab_module PRIVATE vynutil)
set_target_properties(vyn_test_tab_module PROPERTIES CXX_VISIBILITY_PRESET hidden)
target_link_libraries(vyn_tests_containers PRIVATE vyn_test_tab_module)
