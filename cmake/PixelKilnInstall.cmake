# Install rules: library, headers, CMake package and pkg-config file.

include(CMakePackageConfigHelpers)

set(package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/PixelKiln)
install(TARGETS PixelKiln EXPORT PixelKilnTargets LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/PixelKiln DESTINATION ${CMAKE_INSTALL_INCLUDEDIR})
install(FILES ${PROJECT_SOURCE_DIR}/host/zebmediatypes/PixelFormat.h
        DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/zebmediatypes)
install(EXPORT PixelKilnTargets NAMESPACE PixelKiln:: DESTINATION ${package_dir})

configure_package_config_file(${CMAKE_CURRENT_LIST_DIR}/PixelKilnConfig.cmake.in
                              ${CMAKE_CURRENT_BINARY_DIR}/PixelKilnConfig.cmake INSTALL_DESTINATION ${package_dir})
write_basic_package_version_file(${CMAKE_CURRENT_BINARY_DIR}/PixelKilnConfigVersion.cmake
                                 COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/PixelKilnConfig.cmake
              ${CMAKE_CURRENT_BINARY_DIR}/PixelKilnConfigVersion.cmake DESTINATION ${package_dir})

# Relative to the file itself, so that the installed tree can be moved.
file(RELATIVE_PATH pkgconfig_prefix /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
configure_file(${CMAKE_CURRENT_LIST_DIR}/pixelkiln.pc.in ${CMAKE_CURRENT_BINARY_DIR}/pixelkiln.pc @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/pixelkiln.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
