# The shared library uses nothing of the C++ run time: a symbol of it that slips in stays private or
# is missed by the tests' symbol lists, and the library is not loaded for nothing.
if(BUILD_SHARED_LIBS AND NOT HAZE_PREVIEW_SANITIZERS)
  target_link_options(haze_preview PRIVATE -Wl,--as-needed -Wl,--no-undefined)
endif()
# Pages of 64-bit Android may have 16 KB.
if(ANDROID AND CMAKE_SYSTEM_PROCESSOR MATCHES "^(aarch64|x86_64)$")
  target_link_options(haze_preview PRIVATE -Wl,-z,max-page-size=16384)
endif()
