/*
 * Calls each function of the library with the stack at each place that callers on 32-bit x86 may have it: Android's
 * compilers keep it aligned to 4 bytes, others to 16.
 */
#include <dlfcn.h>
#include <stdint.h>
#include <stdio.h>
#include <string.h>

#include "library.h"
#include "platform.h"

/* Calls a function of up to 8 words of arguments, at the stack `offset` bytes above a multiple of 16. */
uintptr_t call_at(uintptr_t offset, const void* function, uintptr_t words, const uintptr_t* arguments);
__asm__(
    ".globl call_at\n"
    "call_at:\n"
    "  push %ebp\n"
    "  mov %esp, %ebp\n"
    "  push %esi\n"
    "  push %edi\n"
    "  and $-16, %esp\n"
    "  sub $48, %esp\n"
    "  add 8(%ebp), %esp\n"
    "  mov 16(%ebp), %ecx\n"
    "  mov 20(%ebp), %esi\n"
    "  mov %esp, %edi\n"
    "  rep movsl\n"
    "  call *12(%ebp)\n"
    "  lea -8(%ebp), %esp\n"
    "  pop %edi\n"
    "  pop %esi\n"
    "  pop %ebp\n"
    "  ret\n");

static uintptr_t offset;
static int failures = 0;

#define WORDS(...) (sizeof((const uintptr_t[]){__VA_ARGS__}) / sizeof(uintptr_t))
/* The function with these arguments, each a word. A bool is returned in the lowest byte alone. */
#define CALL(function, ...) call_at(offset, *(void**)&(function), WORDS(__VA_ARGS__), (const uintptr_t[]){__VA_ARGS__})
#define CALL_BOOL(function) ((uint8_t)call_at(offset, *(void**)&(function), 0, NULL) != 0)
#define WORD(pointer) ((uintptr_t)(pointer))
#define EXPECT(condition)                                                                   \
  do {                                                                                      \
    if (!(condition)) {                                                                     \
      ++failures;                                                                           \
      fprintf(stderr, "line %d, stack offset %d: " #condition "\n", __LINE__, (int)offset); \
    }                                                                                       \
  } while (0)

static void use_sensor(struct library* library, const struct sensor_calls* sensor) {
  void* sessions[2];
  for (int i = 0; i < 2; ++i) {
    sessions[i] = (void*)CALL(library->ctx_open_session, WORD(sensor->name));
    EXPECT(sessions[i] != NULL);
    ctx_option_t* list = NULL;
    EXPECT(CALL(library->ctx_set_option, WORD(sessions[i]), 0, WORD(sensor->options[i]), WORD(&list)) == 0);
    EXPECT(list != NULL);
    EXPECT(CALL(library->ctx_option_release, WORD(list)) == 0);
  }
  EXPECT(CALL(library->getSensor, WORD(sensor->name)) != 0);
  for (int round = 0; round < 20; ++round) {
    for (int i = 0; i < 2; ++i) {
      void* out = NULL;
      int length = 0;
      EXPECT((int)CALL(library->ctx_dispatch_data, WORD(sessions[i]), WORD(sensor->record), WORD(sensor->length),
                       WORD(&out), WORD(&length)) >= 0);
    }
  }
  for (int i = 0; i < 2; ++i) {
    ctx_option_t* list = NULL;
    EXPECT(CALL(library->ctx_close_session, WORD(sessions[i]), WORD(&list)) == 1U - (unsigned)i);
    CALL(library->ctx_option_release, WORD(list));
  }
}

static void use_audio_bridge(struct library* library) {
  EXPECT(CALL_BOOL(library->audio_hal_init));
  EXPECT(CALL_BOOL(library->audio_hal_activate));
  EXPECT(CALL_BOOL(library->audio_hal_deactivate));
}

static void use_array(struct library* library) {
  varray_t array;
  double removed = 0;
  EXPECT(CALL(library->_va_init, WORD(&array), sizeof(double)) != 0);
  for (int i = 0; i < 17; ++i) {
    double* const slot = (double*)CALL(library->va_new, WORD(&array));
    EXPECT(slot != NULL);
    if (slot != NULL) *slot = i;
  }
  EXPECT(CALL(library->_va_del, WORD(&array), 3, WORD(&removed)) == WORD(&removed) && removed == 3);
  CALL(library->va_free, WORD(&array));
}

static void use_library(const char* path) {
  struct library library = load_library(path);
  for (int i = 0; i < SENSORS; ++i) use_sensor(&library, &sensor_calls[i]);
  call_at(offset, *(void**)&library.ctx_uninit, 0, NULL);
  use_audio_bridge(&library);
  use_array(&library);

  int (*const unload)(void*) = dlclose;
  EXPECT(CALL(unload, WORD(library.handle)) == 0);
  EXPECT(dlopen(path, RTLD_NOW | RTLD_NOLOAD) == NULL);
}

int main(int argc, char** argv) {
  if (argc != 2) {
    fprintf(stderr, "Usage: %s LIBRARY\n", argv[0]);
    return 2;
  }
  for (offset = 0; offset < 16; offset += 4) {
    platform_calls = misaligned_calls = 0;
    use_library(argv[1]);
    EXPECT(platform_calls > 0);
    EXPECT(misaligned_calls == 0);
  }
  return failures == 0 ? 0 : 1;
}
