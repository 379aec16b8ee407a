// What the compiler's target offers.
#pragma once

// 1 where the NEON paths are compiled in. A build with HAZE_PREVIEW_PORTABLE has none.
#if defined(__ARM_NEON) && !defined(HAZE_PREVIEW_PORTABLE)
#define HAZE_NEON 1
#include <arm_neon.h>
#else
#define HAZE_NEON 0
#endif
