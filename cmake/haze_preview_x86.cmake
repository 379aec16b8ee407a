# Vector paths for x86-64, each compiled for its level alone. These files use intrinsics and include
# only constants and types: an inline function that they emitted could be taken by the linker for the
# whole library.
if(CMAKE_SYSTEM_PROCESSOR MATCHES "^(x86_64|AMD64)$" AND NOT HAZE_PREVIEW_PORTABLE)
  set(x86_kernels
    color/channel_maps
    color/convert
    color/max_min_nv21
    estimate/float_transmission
    estimate/transmission
    filter/box_float
    filter/box_integer
    filter/guided
    filter/window_extremum
    recover/brightness
    recover/frame_recovery
    recover/reciprocal)
  set(avx2_flags -mavx2)
  set(avx512_flags -mavx512f -mavx512bw -mavx512dq -mavx512vl -mavx512vbmi)
  if(CMAKE_CXX_COMPILER_ID STREQUAL GNU)
    # GCC 12 warns of the deliberately undefined operands in its own header.
    list(APPEND avx512_flags -Wno-uninitialized -Wno-maybe-uninitialized)
  endif()
  foreach(level avx2 avx512)
    list(TRANSFORM x86_kernels APPEND _${level}.cpp OUTPUT_VARIABLE sources)
    target_sources(haze_preview_objects PRIVATE ${sources})
    set_source_files_properties(${sources} PROPERTIES COMPILE_OPTIONS "${${level}_flags}")
  endforeach()
endif()
