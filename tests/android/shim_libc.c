// A libc.so by Android's names for a library that was linked for Android, on top of glibc: lets it
// run under an emulator without Android. Both pass floats in core registers.
#include <pthread.h>
#include <signal.h>
#include <stddef.h>
#include <stdint.h>
#include <stdlib.h>
#include <string.h>

// Under the version that Android's libraries have; glibc's own is LIBC-less.
#define EXPORT(name) __asm__(".symver shim_" #name "," #name "@LIBC")

#define FORWARD(result, name, parameters, arguments) \
  result shim_##name parameters { return name arguments; } \
  EXPORT(name)

FORWARD(void*, malloc, (size_t size), (size));
FORWARD(void*, calloc, (size_t count, size_t size), (count, size));
FORWARD(void*, memcpy, (void* to, const void* from, size_t size), (to, from, size));
FORWARD(void*, memmove, (void* to, const void* from, size_t size), (to, from, size));
FORWARD(void*, memset, (void* to, int value, size_t size), (to, value, size));
FORWARD(int, pthread_create,
        (pthread_t* thread, const pthread_attr_t* attributes, void* (*start)(void*), void* argument),
        (thread, attributes, start, argument));
FORWARD(int, pthread_join, (pthread_t thread, void** value), (thread, value));

FORWARD(int, raise, (int signal_number), (signal_number));

void shim_free(void* block) { free(block); }
EXPORT(free);

// The ARM run-time ABI's own: the value comes last.
#define AEABI(suffix) \
  void shim___aeabi_memcpy##suffix(void* to, const void* from, size_t size) { \
    memcpy(to, from, size); \
  } \
  EXPORT(__aeabi_memcpy##suffix); \
  void shim___aeabi_memmove##suffix(void* to, const void* from, size_t size) { \
    memmove(to, from, size); \
  } \
  EXPORT(__aeabi_memmove##suffix); \
  void shim___aeabi_memset##suffix(void* to, size_t size, int value) { memset(to, value, size); } \
  EXPORT(__aeabi_memset##suffix); \
  void shim___aeabi_memclr##suffix(void* to, size_t size) { memset(to, 0, size); } \
  EXPORT(__aeabi_memclr##suffix)

AEABI();
AEABI(4);
AEABI(8);

uintptr_t shim___stack_chk_guard = 0x00c0ffee;
EXPORT(__stack_chk_guard);
void shim___stack_chk_fail(void) { abort(); }
EXPORT(__stack_chk_fail);
