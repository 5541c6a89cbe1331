// The header stands alone in a C++ program, with the same layouts as in C, and nothing of it throws.
#include <senseloom.h>

#include <cstddef>

static_assert(sizeof(ctx_property_t) == 8 + sizeof(void*));
static_assert(offsetof(ctx_property_t, id) == 0 && offsetof(ctx_property_t, size) == 4 &&
              offsetof(ctx_property_t, value) == 8);
static_assert(offsetof(ctx_option_t, count) == 0 && offsetof(ctx_option_t, properties) == sizeof(void*));
static_assert(sizeof(varray_t) == 12 + sizeof(void*) + (sizeof(void*) - 4));
static_assert(offsetof(varray_t, count) == 0 && offsetof(varray_t, capacity) == 4 &&
              offsetof(varray_t, elemSize) == 8 && offsetof(varray_t, data) == 8 + sizeof(void*));
static_assert(sizeof(gIsActivated) == 1);

static_assert(noexcept(ctx_open_session(nullptr)) && noexcept(ctx_set_option(nullptr, 0, nullptr, nullptr)) && noexcept(ctx_dispatch_data(
    nullptr, nullptr, 0, nullptr,
    nullptr)) && noexcept(ctx_close_session(nullptr,
                                            nullptr)) && noexcept(ctx_option_release(nullptr)) && noexcept(ctx_uninit()) && noexcept(getSensor(nullptr)));
static_assert(noexcept(audio_hal_init()) && noexcept(audio_hal_activate()) && noexcept(audio_hal_deactivate()));
static_assert(noexcept(_va_init(nullptr, 0)) && noexcept(va_new(nullptr)) && noexcept(
    _va_del(nullptr, 0, nullptr)) && noexcept(va_free(nullptr)));
