# 32-bit ARM as Android's armeabi-v7a has it: Thumb-2, floats passed in core registers. Debian's
# armel cross compiler; programs run under qemu-user as on a Cortex-A8, the oldest core with NEON.
# HAZE_PREVIEW_ARM_FPU names the floating-point unit: neon or vfpv3-d16.
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_SYSTEM_PROCESSOR armv7-a)
set(CMAKE_CXX_COMPILER arm-linux-gnueabi-g++)
set(CMAKE_TRY_COMPILE_PLATFORM_VARIABLES HAZE_PREVIEW_ARM_FPU)
set(HAZE_PREVIEW_ARM_FPU neon CACHE STRING "Floating-point unit of the ARM target")
set(CMAKE_CXX_FLAGS_INIT "-march=armv7-a -mthumb -mfpu=${HAZE_PREVIEW_ARM_FPU} -mfloat-abi=softfp")
set(CMAKE_CROSSCOMPILING_EMULATOR qemu-arm;-cpu;cortex-a8;-L;/usr/arm-linux-gnueabi)
if(HAZE_PREVIEW_SANITIZERS)
  # Stacks of 8 MB for each thread would not fit between the address sanitizer's own regions.
  list(PREPEND CMAKE_CROSSCOMPILING_EMULATOR prlimit --stack=262144)
endif()
set(CMAKE_FIND_ROOT_PATH /usr/arm-linux-gnueabi)
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)
