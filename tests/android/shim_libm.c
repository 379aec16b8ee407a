// The libm.so that belongs to shim_libc.c.
#include <math.h>

double shim_log(double x) { return log(x); }
__asm__(".symver shim_log,log@LIBC");
