# Header, library, CMake package and pkg-config file.
include(CMakePackageConfigHelpers)
set(CMAKE_INSTALL_DEFAULT_COMPONENT_NAME development)

set(package_dir ${CMAKE_INSTALL_LIBDIR}/cmake/haze_preview)
install(TARGETS haze_preview EXPORT haze_previewTargets
  LIBRARY COMPONENT library NAMELINK_COMPONENT development)
install(FILES include/haze_preview.h TYPE INCLUDE)
install(EXPORT haze_previewTargets NAMESPACE haze_preview:: DESTINATION ${package_dir})

configure_package_config_file(cmake/haze_previewConfig.cmake.in haze_previewConfig.cmake
  INSTALL_DESTINATION ${package_dir})
write_basic_package_version_file(haze_previewConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(FILES
    ${PROJECT_BINARY_DIR}/haze_previewConfig.cmake
    ${PROJECT_BINARY_DIR}/haze_previewConfigVersion.cmake
  DESTINATION ${package_dir})

# Relative, so that the installed tree can be moved.
file(RELATIVE_PATH pc_prefix /${CMAKE_INSTALL_LIBDIR}/pkgconfig /)
configure_file(cmake/haze_preview.pc.in haze_preview.pc @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/haze_preview.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
