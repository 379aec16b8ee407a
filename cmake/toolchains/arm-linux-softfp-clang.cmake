# As arm-linux-softfp.cmake, compiled by Clang against Debian's armel system root.
include(${CMAKE_CURRENT_LIST_DIR}/arm-linux-softfp.cmake)
set(CMAKE_CXX_COMPILER clang++-16)
set(CMAKE_CXX_COMPILER_TARGET arm-linux-gnueabi)
