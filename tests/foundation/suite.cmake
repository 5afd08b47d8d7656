# The entry-point tests load the "Riched20.dll" test module that the platform suite builds next
# to the test programs.
add_dependencies(vyn_tests_foundation vyn_test_riched20)
