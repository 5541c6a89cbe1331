// What a C99 caller of the platform's headers sees.
#pragma once

#include <stddef.h>

#ifdef __cplusplus
extern "C" {
#endif

typedef struct layout {
  size_t device_size;
  size_t device_version;
  size_t device_module;
  size_t device_close;
  size_t module_size;
  size_t module_api_version;
  size_t module_id;
  size_t module_methods;
  size_t module_dso;
  size_t aware_activate;
  size_t aware_deactivate;
  size_t parameters_size;
} layout_t;

layout_t layoutInC99(void);

#ifdef __cplusplus
}
#endif
