# Clang's Android target without the NDK, to check symbols, relocations and generated code: compiles
# against Debian's cross headers and links against empty libraries that tests/android/make-stubs
# makes. What it builds is not to be shipped. scripts/android-check uses it.
#
#   HAZE_PREVIEW_ANDROID_ABI     armeabi-v7a or arm64-v8a
#   HAZE_PREVIEW_ANDROID_STUBS   folder of the stub libraries
set(CMAKE_SYSTEM_NAME Linux)
set(ANDROID TRUE)
# Android's loader knows no versions of libraries.
set(CMAKE_PLATFORM_NO_VERSIONED_SONAME TRUE)
set(CMAKE_TRY_COMPILE_TARGET_TYPE STATIC_LIBRARY)
set(CMAKE_TRY_COMPILE_PLATFORM_VARIABLES HAZE_PREVIEW_ANDROID_ABI HAZE_PREVIEW_ANDROID_STUBS)

set(CMAKE_CXX_COMPILER clang++-16)
if(HAZE_PREVIEW_ANDROID_ABI STREQUAL "armeabi-v7a")
  set(CMAKE_SYSTEM_PROCESSOR armv7-a)
  set(CMAKE_CXX_COMPILER_TARGET armv7a-linux-androideabi21)
  set(target_flags "-march=armv7-a -mthumb")
  set(headers arm-linux-gnueabi)
  # ARMv7-A divides no integers: the helpers come with the compiler, from the NDK's built-ins there
  # and from GCC's here.
  set(compiler_helpers "/usr/lib/gcc-cross/arm-linux-gnueabi/12/libgcc.a")
else()
  set(CMAKE_SYSTEM_PROCESSOR aarch64)
  set(CMAKE_CXX_COMPILER_TARGET aarch64-linux-android21)
  set(target_flags "")
  set(headers aarch64-linux-gnu)
  set(compiler_helpers "")
endif()
# The flags that the NDK adds for a release.
set(CMAKE_CXX_FLAGS_INIT "${target_flags} -fstack-protector-strong -ffunction-sections \
-fdata-sections -Wno-unused-command-line-argument -nostdinc++ -nostdlibinc -isystem /usr/${headers}/include/c++/12 \
-isystem /usr/${headers}/include/c++/12/${headers} -isystem /usr/${headers}/include")
set(CMAKE_SHARED_LINKER_FLAGS_INIT "-fuse-ld=lld -nostdlib -L${HAZE_PREVIEW_ANDROID_STUBS} \
-Wl,--no-undefined -Wl,--no-undefined-version -Wl,--fatal-warnings -Wl,-z,text -Wl,--gc-sections \
-Wl,--no-rosegment -Wl,--hash-style=both -Wl,--build-id=sha1")
set(CMAKE_CXX_STANDARD_LIBRARIES "-lc -lm ${compiler_helpers}")
