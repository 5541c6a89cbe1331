#pragma once

#include <senseloom.h>

/* A libsenseloom that was loaded at run time, and its functions. */

#define LIBRARY_FUNCTIONS(X) \
  X(ctx_open_session)        \
  X(ctx_set_option)          \
  X(ctx_dispatch_data)       \
  X(ctx_close_session)       \
  X(ctx_option_release)      \
  X(ctx_uninit)              \
  X(getSensor)               \
  X(audio_hal_init)          \
  X(audio_hal_activate)      \
  X(audio_hal_deactivate)    \
  X(_va_init)                \
  X(va_new)                  \
  X(_va_del)                 \
  X(va_free)

struct library {
  void* handle; /* of dlopen() */
#define LIBRARY_FUNCTION(name) __typeof__(name)* name;
  LIBRARY_FUNCTIONS(LIBRARY_FUNCTION)
#undef LIBRARY_FUNCTION
};

/* Loads the library; ends the program if it cannot. */
struct library load_library(const char* path);

/* What a sensor can be asked and told: two options that its clients can have, and a record. */
struct sensor_calls {
  const char* name;
  const char* options[2];
  uint8_t record[40];
  int length; /* of the record */
};
enum { SENSORS = 12 };
extern const struct sensor_calls sensor_calls[SENSORS];
