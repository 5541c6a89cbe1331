#pragma once

#include <hardware/hardware.h>

#include <cstddef>

// The layouts that the library, the platform's loader and its modules exchange, in either word size: the header that
// declares them is each platform's own.
namespace senseloom {

constexpr size_t kWord = sizeof(void*);

static_assert(offsetof(hw_module_t, tag) == 0 && sizeof(hw_module_t::tag) == 4);
static_assert(offsetof(hw_module_t, module_api_version) == 4 && sizeof(hw_module_t::module_api_version) == 2);
static_assert(offsetof(hw_module_t, hal_api_version) == 6 && sizeof(hw_module_t::hal_api_version) == 2);
static_assert(offsetof(hw_module_t, id) == 8);
static_assert(offsetof(hw_module_t, name) == 8 + kWord);
static_assert(offsetof(hw_module_t, author) == 8 + 2 * kWord);
static_assert(offsetof(hw_module_t, methods) == 8 + 3 * kWord);
static_assert(offsetof(hw_module_t, dso) == 8 + 4 * kWord);
static_assert(offsetof(hw_module_t, reserved) == 8 + 5 * kWord);
static_assert(sizeof(hw_module_t) == 8 + 30 * kWord);

static_assert(offsetof(hw_module_methods_t, open) == 0 && sizeof(hw_module_methods_t) == kWord);

static_assert(offsetof(hw_device_t, tag) == 0 && sizeof(hw_device_t::tag) == 4);
static_assert(offsetof(hw_device_t, version) == 4 && sizeof(hw_device_t::version) == 4);
static_assert(offsetof(hw_device_t, module) == 8);
static_assert(offsetof(hw_device_t, reserved) == 8 + kWord);
static_assert(offsetof(hw_device_t, close) == 8 + 13 * kWord);
static_assert(sizeof(hw_device_t) == 8 + 14 * kWord);

}  // namespace senseloom
