/**
 * \file
 * senseloom: one context sensor, many clients, each with its own view of it.
 *
 * A process loads libsenseloom, opens sessions on named context sensors, gives each session an option string, and
 * passes every record that a sensor produces to the sessions on it. The library merges the sessions' options into the
 * one list of properties that the sensor is to run with, and turns each record into what each session asked for.
 *
 * Conventions of this interface:
 *
 *  1. Threads: none are created and nothing is locked. All functions of a process are called from one thread at a time.
 *  2. Errors: functions that return int return -1 for every failure, functions that return a pointer return NULL. A
 *     failed allocation is such a failure: nothing is left half-changed, except that a session's option may keep what
 *     it had read. Nothing is ever thrown.
 *  3. Handles: a session handle is an opaque pointer. It is valid from ctx_open_session() until it is passed to
 *     ctx_close_session(); a closed handle is refused with -1, until a later session happens to get the same value.
 *  4. Records and results: integers are in the platform's byte order, little-endian on the target. Records need no
 *     alignment, and the library never writes to one. A result is either the caller's own record handed back or storage
 *     of the session: it is never freed by the caller, and stays valid until the next record of that session or until
 *     the session is closed.
 *  5. Log lines go to the Android log (liblog): tag "libsenseloom" for options and sessions, "Libsl" for negotiation,
 *     "STY" for the instant-activity option and "aware_audio" for the audio bridge.
 *  6. The end: nothing is destroyed when the process ends, so all functions can still be called in destructors and in
 *     functions that atexit() registered. Before the library is unloaded, close all sessions and call ctx_uninit();
 *     otherwise their memory is lost.
 */
#ifndef SENSELOOM_H
#define SENSELOOM_H

#include <stdbool.h>
#include <stdint.h>

/**
 * The version of this header, MAJOR.MINOR.PATCH. A program runs with libraries of the same major version, from the minor
 * version on that it was compiled with.
 */
#define SENSELOOM_VERSION_MAJOR 1
#define SENSELOOM_VERSION_MINOR 0 /**< goes up when something is added */
#define SENSELOOM_VERSION_PATCH 0 /**< goes up when faults are repaired and nothing is added */

/** Marks what the library exports. */
#define SENSELOOM_API __attribute__((visibility("default")))

/** Tells C++ that nothing is ever thrown. */
#ifdef __cplusplus
#define SENSELOOM_NOEXCEPT noexcept
extern "C" {
#else
#define SENSELOOM_NOEXCEPT
#endif

/**
 * One setting that the sensor is to run with. The value belongs to the library: it stays as it is until the next
 * ctx_set_option() or ctx_close_session() on a session of the same sensor, or ctx_uninit(), and must not be read after
 * that.
 */
typedef struct ctx_property {
  int32_t id;   /**< property identifier; which ones a sensor has is listed by `senseloom sensors` */
  int32_t size; /**< length of the value in bytes: 4 (one int32_t), except for gesture template bytes (id 123) */
  void *value;  /**< the value; not owned by the list */
} ctx_property_t;

/** A property list: `count` entries, which may be 0. Released as a whole with ctx_option_release(). */
#ifdef __cplusplus /* C++ knows the flexible array member of C99 as an extension */
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wpedantic"
#ifdef __clang__
#pragma clang diagnostic ignored "-Wc99-extensions"
#endif
#endif
typedef struct ctx_option {
  int32_t count;               /**< number of entries */
  ctx_property_t properties[]; /**< the entries */
} ctx_option_t;
#ifdef __cplusplus
#pragma GCC diagnostic pop
#endif

/**
 * Opens a session on a context sensor. Sensor names are matched exactly, on their first 9 characters: "PHYAC", "STAP",
 * "GSFLK", "SHAKI", "ISACT", "SCOUN", "GSPX", "DTWGS", "GSETH", "LPE_P", "PDR", "LIFT". The first session of "LPE_P"
 * switches the platform's aware audio session on.
 *
 * Returns the handle of the new session, which has the sensor's default option, or NULL when the name is NULL, when no
 * sensor has it, when the sensor could not be started, or when memory ran out.
 */
SENSELOOM_API void *ctx_open_session(const char *sensor) SENSELOOM_NOEXCEPT;

/**
 * Gives a session its option, a NUL-terminated JSON object, and negotiates: the options of all sessions of the sensor
 * are merged again and each of these sessions starts over with the merged option (a batch that was being collected is
 * dropped). `reserved` is not read. Numbers are read as in the "C" locale, and the caller's locale stays as it is.
 *
 * Returns 0, with the sensor's new property list in `*out`, for the caller to release; or -1: for a NULL handle, option
 * or out (nothing is written then), an unknown handle, an option string that is not JSON or is refused by the sensor
 * (the sensor stays as it was), or merged options that exclude each other. `*out` is NULL then. When a session could
 * not start over the result is -1, too, but `*out` holds the new list. "ISACT" and "SCOUN" accept a string that is not
 * JSON, and their option stays as it was.
 *
 * A value out of range fails the call for "DTWGS" alone. For the other sensors it becomes the default, another fixed
 * value or the nearest bound, or is kept while the class mask is emptied; only some of these are logged.
 * `senseloom sensors` prints what happens for each key.
 */
SENSELOOM_API int ctx_set_option(void *handle, int32_t reserved, const char *option,
                                 ctx_option_t **out) SENSELOOM_NOEXCEPT;

/**
 * Passes one record of `len` bytes (0 is accepted) to a session.
 *
 * Returns 1 with the result in `*out` and its length in bytes in `*outlen`; 0 when there is nothing to deliver now
 * (`*out` and `*outlen` stay as they were); -1 for NULL arguments, a negative length, an unknown handle, or a record
 * that the sensor refuses.
 */
SENSELOOM_API int ctx_dispatch_data(void *handle, void *data, int len, void **out, int *outlen) SENSELOOM_NOEXCEPT;

/**
 * Closes a session. When others remain on the sensor their options are merged again, and each of them starts over with
 * the merged option; when it was the last, the sensor is stopped.
 *
 * Returns 1 when sessions remain, with the sensor's new property list (or NULL, when it could not be made) in
 * `*option`, for the caller to release; 0 when the sensor was stopped, with NULL in `*option`. Both are success.
 * Returns -1 with the session still open when `option` or `handle` is NULL, when the handle is unknown, and when there
 * is no memory for a copy of a remaining session's option; -1 with the session closed when the sensor could not be
 * stopped or a remaining session could not start over, which leaves the new list in `*option`.
 */
SENSELOOM_API int ctx_close_session(void *handle, ctx_option_t **option) SENSELOOM_NOEXCEPT;

/** Frees a property list, but not the values that it points at. NULL is harmless. Always returns 0. */
SENSELOOM_API int32_t ctx_option_release(ctx_option_t *list) SENSELOOM_NOEXCEPT;

/**
 * Deletes the twelve sensors. Sessions stay open: they still take records, and are closed as usual, but their options
 * are no longer merged with any other. No sensor is stopped, so the platform's aware audio session stays on. The next
 * call that needs the sensors makes new ones. Does nothing when there are none.
 */
SENSELOOM_API void ctx_uninit(void) SENSELOOM_NOEXCEPT;

/**
 * The sensor of that name as an opaque pointer; NULL for NULL, for any other name, and before the first call that makes
 * the sensors (this function never makes them). After ctx_uninit() it still returns the old pointers, which must not be
 * used, until there are new sensors.
 */
SENSELOOM_API void *getSensor(const char *name) SENSELOOM_NOEXCEPT;

/**
 * The audio bridge: the platform's "aware" audio session, which the "LPE_P" sensor switches on with its first session and
 * off with its last. The functions can also be used on their own. They load the module of class "aware" and instance
 * "primary" through the platform's hardware loader (hw_get_module_by_class() of libhardware) and open its device
 * "aware_hw_if", whose API version must be 2.0.
 */

struct aware_hw_device;

/**
 * The opened device: a structure that begins with the platform's hw_device_t. NULL while closed. What sets it to NULL,
 * as a device or a log function may, makes the library forget the device without closing it.
 */
SENSELOOM_API extern struct aware_hw_device *device;

/** Whether the aware session is on. */
SENSELOOM_API extern bool gIsActivated;

/** Opens the device if it is not open. Returns whether it is open now; a device of a wrong version counts as failure. */
SENSELOOM_API bool audio_hal_init(void) SENSELOOM_NOEXCEPT;

/** Opens the device if it is not open and switches the aware session on if it is off. Returns whether it is on now. */
SENSELOOM_API bool audio_hal_activate(void) SENSELOOM_NOEXCEPT;

/**
 * Opens the device if it is not open. If the aware session is on, switches it off and closes the device. Returns whether
 * the session is off now; false also when the device could not be opened.
 */
SENSELOOM_API bool audio_hal_deactivate(void) SENSELOOM_NOEXCEPT;

/**
 * A growable array of elements of one size. The structure belongs to the caller, who may read and write it; the storage
 * belongs to the array. Elements move when the array grows, so a pointer to one is valid until the next va_new().
 */
typedef struct varray {
  int32_t count;    /**< elements in use */
  int32_t capacity; /**< elements that the storage holds: 16, doubled as needed; it never shrinks */
  int32_t elemSize; /**< bytes of an element */
  void *data;       /**< the storage */
} varray_t;

/**
 * Makes the structure an empty array of elements of `elemSize` bytes. Storage that it held before is not freed. Returns
 * the storage; NULL with the structure untouched when `va` is NULL or `elemSize` is not positive, and NULL with an
 * array without storage when memory ran out.
 */
SENSELOOM_API void *_va_init(varray_t *va, int elemSize) SENSELOOM_NOEXCEPT;

/**
 * Appends an element and returns it for the caller to write: zero-filled, or with the bytes of a deleted element. NULL,
 * with the array as it was, when `va` is NULL or has no storage, memory ran out, or 2^30 elements are in use.
 */
SENSELOOM_API void *va_new(varray_t *va) SENSELOOM_NOEXCEPT;

/**
 * Copies element `index` to `out`, removes it and closes the gap. Returns `out`; NULL, with the array as it was, when
 * `va` or `out` is NULL or there is no such element.
 */
SENSELOOM_API void *_va_del(varray_t *va, int index, void *out) SENSELOOM_NOEXCEPT;

/** Frees the storage and zeroes the structure. NULL is harmless, and so is an array that was freed before. */
SENSELOOM_API void va_free(varray_t *va) SENSELOOM_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif
