# Installs the library, its exported headers and a CMake package so that other projects can
# find_package(vynutil) and link vynutil::vynutil.
include(GNUInstallDirs)
include(CMakePackageConfigHelpers)

install(TARGETS vynutil EXPORT vynutilTargets
        LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
        INCLUDES DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(DIRECTORY include/vynutil DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(EXPORT vynutilTargets NAMESPACE vynutil:: DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/vynutil)
write_basic_package_version_file(${CMAKE_CURRENT_BINARY_DIR}/vynutilConfigVersion.cmake
                                 COMPATIBILITY SameMajorVersion)
file(WRITE ${CMAKE_CURRENT_BINARY_DIR}/vynutilConfig.cmake
     "include(\${CMAKE_CURRENT_LIST_DIR}/vynutilTargets.cmake)\n")
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/vynutilConfig.cmake
              ${CMAKE_CURRENT_BINARY_DIR}/vynutilConfigVersion.cmake
        DESTINATION ${CMAKE_INSTALL_LIBDIR}/cmake/vynutil)
