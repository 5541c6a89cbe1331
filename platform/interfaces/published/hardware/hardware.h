/*
 * The platform's hardware modules: how a module presents itself and its devices, and how it is found. The layouts are
 * the binary interface between loader, modules and callers, which may be built separately.
 */
#pragma once

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

#define MAKE_TAG_CONSTANT(A, B, C, D) (((A) << 24) | ((B) << 16) | ((C) << 8) | (D))

#define HARDWARE_MODULE_TAG MAKE_TAG_CONSTANT('H', 'W', 'M', 'T')
#define HARDWARE_DEVICE_TAG MAKE_TAG_CONSTANT('H', 'W', 'D', 'T')

#define HARDWARE_MAKE_API_VERSION(maj, min) ((((maj)&0xff) << 8) | ((min)&0xff))
#define HARDWARE_HAL_API_VERSION HARDWARE_MAKE_API_VERSION(1, 0)
#define HARDWARE_MODULE_API_VERSION(maj, min) HARDWARE_MAKE_API_VERSION(maj, min)
#define HARDWARE_DEVICE_API_VERSION(maj, min) HARDWARE_MAKE_API_VERSION(maj, min)

struct hw_module_t;
struct hw_module_methods_t;
struct hw_device_t;

/* What a module exports under the name HAL_MODULE_INFO_SYM. */
typedef struct hw_module_t {
  uint32_t tag;                        /* HARDWARE_MODULE_TAG */
  uint16_t module_api_version;         /* of the module, HARDWARE_MODULE_API_VERSION() */
  uint16_t hal_api_version;            /* of this structure, HARDWARE_HAL_API_VERSION */
  const char* id;                      /* the class of module, which the loader looks for */
  const char* name;                    /* for people to read */
  const char* author;                  /* for people to read */
  struct hw_module_methods_t* methods; /* what the module can do */
  void* dso;                           /* the loader's: the handle of the opened module */
#ifdef __LP64__
  uint64_t reserved[32 - 7]; /* 0 */
#else
  uint32_t reserved[32 - 7]; /* 0 */
#endif
} hw_module_t;

typedef struct hw_module_methods_t {
  /* Opens the device `id` of the module. Returns 0 with the device in `*device`, or a negative errno value. */
  int (*open)(const struct hw_module_t* module, const char* id, struct hw_device_t** device);
} hw_module_methods_t;

/* What the structure of every device begins with. */
typedef struct hw_device_t {
  uint32_t tag;               /* HARDWARE_DEVICE_TAG */
  uint32_t version;           /* of the device's own structure, HARDWARE_DEVICE_API_VERSION() */
  struct hw_module_t* module; /* the module that opened the device */
#ifdef __LP64__
  uint64_t reserved[12]; /* 0 */
#else
  uint32_t reserved[12];     /* 0 */
#endif
  /* Closes the device, which must not be used afterwards. Returns 0 or a negative errno value. */
  int (*close)(struct hw_device_t* device);
} hw_device_t;

#define HAL_MODULE_INFO_SYM HMI
#define HAL_MODULE_INFO_SYM_AS_STR "HMI"

#ifdef __cplusplus
static_assert(sizeof(hw_module_t) == (sizeof(void*) == 8 ? 248 : 128), "modules are exchanged in binary form");
static_assert(sizeof(hw_device_t) == (sizeof(void*) == 8 ? 120 : 64), "devices are exchanged in binary form");
#elif __STDC_VERSION__ >= 201112L /* C99 has no such assertion */
_Static_assert(sizeof(hw_module_t) == (sizeof(void*) == 8 ? 248 : 128), "modules are exchanged in binary form");
_Static_assert(sizeof(hw_device_t) == (sizeof(void*) == 8 ? 120 : 64), "devices are exchanged in binary form");
#endif

/*
 * Loads the module of that class: hw_get_module_by_class() without an instance.
 */
int hw_get_module(const char* id, const struct hw_module_t** module);

/*
 * Loads the module of that class and instance, "<class_id>.<inst>.default.so", or "<class_id>.default.so" when inst is
 * NULL, from the first of these directories that has it: those listed in the environment variable
 * SENSELOOM_HW_MODULE_PATH, separated by colons (empty entries are skipped), then the directory of this library.
 *
 * Returns 0 with the module in `*module`; it stays loaded. Otherwise NULL in `*module` and: -ENAMETOOLONG when no file
 * could have that name, -ENOENT when no directory has the module, -EINVAL when the file found is not a module of
 * that class.
 */
int hw_get_module_by_class(const char* class_id, const char* inst, const struct hw_module_t** module);

#ifdef __cplusplus
}
#endif
