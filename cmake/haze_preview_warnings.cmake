# Warnings that our own code compiles without. The presets turn them into errors.
function(haze_preview_strict_warnings target)
  target_compile_options(${target} PRIVATE
    -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Wcast-qual -Wundef
    -Wnon-virtual-dtor
    # Macros of FFmpeg's headers are compound literals, which GCC takes for C++ of its own.
    $<$<CXX_COMPILER_ID:Clang>:-Wno-c99-extensions>)
endfunction()
