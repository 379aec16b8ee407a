# Debian packages: `cpack` in a build folder of the preset `package` makes libhaze-preview0,
# libhaze-preview-dev and dehaze. Names and places follow the habits of Debian 12.
set(library_package libhaze-preview${PROJECT_VERSION_MAJOR})
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME haze-preview)
set(CPACK_PACKAGE_VENDOR "the haze_preview authors")
# A domain that is reserved for addresses that do not exist.
set(CPACK_PACKAGE_CONTACT "the haze_preview authors <authors@haze-preview.invalid>")
# Empty, so that every package has a summary of its own.
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_ALL library development tool)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_PACKAGE_SOURCE haze-preview)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(package_version ${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE})
set(exact_library "${library_package} (= ${package_version})")

set(CPACK_DEBIAN_LIBRARY_PACKAGE_NAME ${library_package})
set(CPACK_DEBIAN_LIBRARY_PACKAGE_SECTION libs)
set(CPACK_DEBIAN_LIBRARY_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS_POLICY ">=")
set(CPACK_DEBIAN_LIBRARY_PACKAGE_CONTROL_EXTRA ${PROJECT_SOURCE_DIR}/packaging/triggers)
set(CPACK_COMPONENT_LIBRARY_DESCRIPTION "haze removal for camera preview frames - shared library
Takes haze, fog and smog out of camera preview frames in real time, in
place on 4:2:0 frames, after the dark-channel-prior method. This package
holds the shared library.")

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libhaze-preview-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS "${exact_library}")
set(CPACK_COMPONENT_DEVELOPMENT_DESCRIPTION "haze removal for camera preview frames - development files
Takes haze, fog and smog out of camera preview frames in real time, in
place on 4:2:0 frames, after the dark-channel-prior method. This package
holds the header, the CMake package and the pkg-config file.")

set(CPACK_DEBIAN_TOOL_PACKAGE_NAME dehaze)
set(CPACK_DEBIAN_TOOL_PACKAGE_SECTION video)
set(CPACK_DEBIAN_TOOL_PACKAGE_DEPENDS "${exact_library}")
set(CPACK_DEBIAN_TOOL_PACKAGE_SHLIBDEPS ON)
# The tool's library has no package on the building machine; it is in the line above.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${PROJECT_BINARY_DIR})
set(CPACK_COMPONENT_TOOL_DESCRIPTION "takes haze, fog and smog out of pictures and videos
Reads pictures, videos, folders of them and pipes; keeps sound, subtitles,
chapters, time stamps, colour profiles and camera data. The picture is
brightened and its contrast restored after the dark-channel-prior method.")

# Links cannot be changed after the start, as Debian builds its own packages.
add_link_options(-Wl,-z,relro -Wl,-z,now)

# gzip_file(TEXT PLACE NAME COMPONENT): the best compression and no time stamp, as Debian asks for.
function(gzip_file text place name component)
  set(copy ${PROJECT_BINARY_DIR}/packaging/${component}/${name})
  configure_file(${text} ${copy} COPYONLY)
  execute_process(COMMAND gzip -9nf ${copy} COMMAND_ERROR_IS_FATAL ANY)
  install(FILES ${copy}.gz DESTINATION ${place} COMPONENT ${component})
endfunction()

# SOURCE_DATE_EPOCH fixes the time.
string(TIMESTAMP package_date "%a, %d %b %Y %H:%M:%S +0000" UTC)
configure_file(packaging/changelog.in packaging/changelog @ONLY)
foreach(component IN LISTS CPACK_COMPONENTS_ALL)
  string(TOUPPER ${component} upper)
  set(doc share/doc/${CPACK_DEBIAN_${upper}_PACKAGE_NAME})
  install(FILES packaging/copyright DESTINATION ${doc} COMPONENT ${component})
  gzip_file(${PROJECT_SOURCE_DIR}/CHANGELOG.md ${doc} changelog ${component})
  gzip_file(${PROJECT_BINARY_DIR}/packaging/changelog ${doc} changelog.Debian ${component})
endforeach()

include(CPack)
