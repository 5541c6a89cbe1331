/*
 * Lets each allocation of each call of the library fail, that one alone and that one with all later ones: the process
 * must live, the call must fail, what comes after must go well, and no memory may be lost.
 */
#include <errno.h>
#include <stdbool.h>
#include <stdint.h>
#include <stdio.h>
#include <stdlib.h>

#include "library.h"

/* --- the heap: that of the C library, which the library and its C++ run-time reach through these functions */

static size_t until_failure = 0; /* allocations left, the one that fails included; 0: none fails */
static bool fails_for_ever = false;
static bool has_failed = false;
static long live_blocks = 0;

static bool fails(void) {
  if (until_failure == 0 || (until_failure > 1 && --until_failure > 0)) return false;
  if (!fails_for_ever) until_failure = 0;
  return has_failed = true;
}

static void* noted(void* block) {
  if (block != NULL) ++live_blocks;
  return block;
}

void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* block, size_t size);
void* __libc_memalign(size_t alignment, size_t size);
void __libc_free(void* block);

void* malloc(size_t size) {
  return fails() ? NULL : noted(__libc_malloc(size));
}

void* calloc(size_t count, size_t size) {
  return fails() ? NULL : noted(__libc_calloc(count, size));
}

void* realloc(void* block, size_t size) {
  if (fails()) return NULL;
  void* const moved = __libc_realloc(block, size);
  return block == NULL ? noted(moved) : moved;
}

void* aligned_alloc(size_t alignment, size_t size) {
  return fails() ? NULL : noted(__libc_memalign(alignment, size));
}

int posix_memalign(void** block, size_t alignment, size_t size) {
  *block = aligned_alloc(alignment, size);
  return *block != NULL ? 0 : ENOMEM;
}

void free(void* block) {
  if (block != NULL) --live_blocks;
  __libc_free(block);
}

/* --- the calls */

static struct library library;
static const struct sensor_calls* sensor;
static void* sessions[2];

static bool open_session(int i) {
  sessions[i] = library.ctx_open_session(sensor->name);
  return sessions[i] != NULL;
}

static bool set_option(int i) {
  ctx_option_t* list = NULL;
  const int result = library.ctx_set_option(sessions[i], 0, sensor->options[i], &list);
  library.ctx_option_release(list);
  return result == 0;
}

static bool dispatch(int i) {
  void* out = NULL;
  int length = 0;
  return library.ctx_dispatch_data(sessions[i], (void*)(uintptr_t)sensor->record, sensor->length, &out, &length) >= 0;
}

static bool close_session(int i) {
  ctx_option_t* list = NULL;
  const int result = library.ctx_close_session(sessions[i], &list);
  library.ctx_option_release(list);
  if (result >= 0) sessions[i] = NULL;
  return result >= 0;
}

static bool uninit(int i) {
  (void)i;
  library.ctx_uninit();
  return true;
}

static const struct {
  const char* name;
  bool (*make)(int session); /* whether it went well */
  int session;
  bool allocates; /* it can fail; ISACT takes a text that it cannot read for an empty one, but fails later */
} kCalls[] = {{"open", open_session, 0, true},   {"set_option", set_option, 0, true}, {"open", open_session, 1, true},
              {"dispatch", dispatch, 0, false},  {"set_option", set_option, 1, true}, {"close", close_session, 0, true},
              {"uninit", uninit, 0, false},      {"dispatch", dispatch, 1, true}, /* makes the sensors anew */
              {"close", close_session, 1, false}};
enum { CALLS = sizeof kCalls / sizeof *kCalls };

static size_t failed_calls = 0;

static void end(const char* what, int failing) {
  fprintf(stderr, "%s: allocations of call %d, %s, failed: %s\n", sensor->name, failing + 1, kCalls[failing].name,
          what);
  exit(1);
}

/* Makes all calls, one of them with a failing allocation. Returns whether it came to that allocation. */
static bool try_calls(int failing, size_t allocation, bool for_ever) {
  bool failed = false;
  for (int i = 0; i < CALLS; ++i) {
    if (i == failing) {
      until_failure = allocation;
      fails_for_ever = for_ever;
      has_failed = false;
    }
    const bool needs_session = kCalls[i].make != open_session && kCalls[i].make != uninit;
    if (needs_session && sessions[kCalls[i].session] == NULL) continue; /* opening it failed */
    const bool went_well = kCalls[i].make(kCalls[i].session);
    if (i == failing) {
      until_failure = 0;
      failed = has_failed;
      if (!went_well && !failed) end("it failed without reason", failing);
      if (!went_well) ++failed_calls;
    } else if (!went_well) {
      end("another call failed, too", failing);
    }
  }
  for (int i = 0; i < 2; ++i) {
    if (sessions[i] != NULL && (close_session(i), sessions[i]) != NULL) end("a session cannot be closed", failing);
  }
  uninit(0);
  return failed;
}

/* The growable array, which has no exception to catch, at its first storage and at a larger one. */
static bool array_fails(void) {
  varray_t array;
  fails_for_ever = false;
  until_failure = 1;
  if (library._va_init(&array, 8) != NULL || library._va_init(&array, 8) == NULL) return false;
  for (int i = 0; i < 16; ++i) library.va_new(&array);
  until_failure = 1;
  if (library.va_new(&array) != NULL || library.va_new(&array) == NULL) return false;
  library.va_free(&array);
  return true;
}

int main(int argc, char** argv) {
  if (argc != 2) {
    fprintf(stderr, "Usage: %s LIBRARY\n", argv[0]);
    return 2;
  }
  setvbuf(stdout, NULL, _IONBF, 0); /* the library prints, which is not to allocate */
  library = load_library(argv[1]);
  for (sensor = sensor_calls; sensor < sensor_calls + SENSORS; ++sensor) {
    try_calls(0, 1, false); /* the C++ run-time keeps something from the first exception on */
    const long blocks = live_blocks;
    for (int failing = 0; failing < CALLS; ++failing) {
      failed_calls = 0;
      for (int for_ever = 0; for_ever < 2; ++for_ever) {
        for (size_t allocation = 1; try_calls(failing, allocation, for_ever != 0); ++allocation) {
          if (live_blocks != blocks) end("memory is lost", failing);
        }
      }
      if ((failed_calls > 0) != kCalls[failing].allocates) end("nothing was tried, or too much", failing);
    }
  }
  if (!array_fails()) {
    fprintf(stderr, "The growable array does not fail, or does not recover.\n");
    return 1;
  }
  return 0;
}
