// The aware audio module of a Linux host. There is no hardware behind it: it checks what a caller does with the device
// and logs it.
//
// To try out failures, each step can be made to fail by an environment variable that is not empty. The variables are
// read at each call:
//
//   SENSELOOM_AWARE_FAIL_OPEN        opening returns -EIO
//   SENSELOOM_AWARE_NULL_DEVICE      opening returns 0 and no device
//   SENSELOOM_AWARE_WRONG_VERSION    opening returns a device of version 1.0
//   SENSELOOM_AWARE_FAIL_ACTIVATE    activating returns -EIO, the session stays inactive
//   SENSELOOM_AWARE_FAIL_DEACTIVATE  deactivating returns -EIO, the session stays active
//   SENSELOOM_AWARE_FAIL_CLOSE       closing returns -EIO

#include <android/log.h>
#include <hardware/aware.h>
#include <hardware/hardware.h>

#include <cerrno>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <new>

namespace {

constexpr char kTag[] = "aware_hal";

// The parameters of the only session that this hardware has.
constexpr aware_parameters_t kParameters = {
    .word0 = 128,
    .half4 = 12,
    .half6 = 20,
    .half8 = 24,
    .word12 = 76,
    .word16 = -2,
    .word20 = -1,
    .word24 = 21,
    .word28 = 15564,  // 0.475 in Q15, truncated
    .word32 = 32112,  // 0.98
    .word36 = 6553,   // 0.2
    .word40 = 3276,   // 0.1
    .half44 = 64,
    .half46 = 4,
};
constexpr std::size_t kPaddingBegin = offsetof(aware_parameters_t, half8) + sizeof(aware_parameters_t::half8);
constexpr std::size_t kPaddingEnd = offsetof(aware_parameters_t, word12);

struct AwareDevice : aware_hw_device_t {
  bool active = false;
  aware_parameters_t parameters = {};  // of the active session
};

bool isDemanded(const char* failure) {
  const char* const value = std::getenv(failure);
  return value != nullptr && *value != '\0';
}

int refuse(int result, const char* step, const char* reason) {
  __android_log_print(ANDROID_LOG_ERROR, kTag, "%s: %s", step, reason);
  return result;
}

// The offset of the first byte that differs from what the hardware wants; the size of the block if none does.
std::size_t firstWrongByte(const aware_parameters_t& parameters) {
  const auto* const given = reinterpret_cast<const unsigned char*>(&parameters);
  const auto* const wanted = reinterpret_cast<const unsigned char*>(&kParameters);
  std::size_t offset = 0;
  while (offset < sizeof parameters &&
         (given[offset] == wanted[offset] || (offset >= kPaddingBegin && offset < kPaddingEnd))) {
    ++offset;
  }
  return offset;
}

int activate(aware_hw_device_t* base, const aware_parameters_t* parameters) {
  auto* const device = static_cast<AwareDevice*>(base);
  if (isDemanded("SENSELOOM_AWARE_FAIL_ACTIVATE")) return refuse(-EIO, "activate", "failure on demand");
  if (device->active) return refuse(-EBUSY, "activate", "already active");
  if (parameters == nullptr) return refuse(-EINVAL, "activate", "no parameters");
  if (const std::size_t offset = firstWrongByte(*parameters); offset < sizeof *parameters) {
    __android_log_print(ANDROID_LOG_ERROR, kTag, "activate: wrong parameter byte at offset %zu", offset);
    return -EINVAL;
  }
  device->parameters = *parameters;
  device->active = true;
  __android_log_print(ANDROID_LOG_DEBUG, kTag, "activate: active");
  return 0;
}

int deactivate(aware_hw_device_t* base) {
  auto* const device = static_cast<AwareDevice*>(base);
  if (isDemanded("SENSELOOM_AWARE_FAIL_DEACTIVATE")) return refuse(-EIO, "deactivate", "failure on demand");
  if (!device->active) return refuse(-EINVAL, "deactivate", "not active");
  device->active = false;
  __android_log_print(ANDROID_LOG_DEBUG, kTag, "deactivate: inactive");
  return 0;
}

int getParameters(const aware_hw_device_t* base, aware_parameters_t* parameters) {
  const auto* const device = static_cast<const AwareDevice*>(base);
  if (!device->active) return -EINVAL;
  *parameters = device->parameters;
  return 0;
}

int closeDevice(hw_device_t* common) {
  // The common header is the first member of the device.
  const auto* const device = static_cast<AwareDevice*>(reinterpret_cast<aware_hw_device_t*>(common));
  const bool wasActive = device->active;
  // Also when closing fails: a caller that is done with a device does not try again.
  delete device;
  if (isDemanded("SENSELOOM_AWARE_FAIL_CLOSE")) return refuse(-EIO, "close", "failure on demand");
  __android_log_print(ANDROID_LOG_DEBUG, kTag, wasActive ? "close: closed while active" : "close: closed");
  return 0;
}

int openDevice(const hw_module_t* module, const char* id, hw_device_t** out) {
  *out = nullptr;
  if (std::strcmp(id, AWARE_HARDWARE_INTERFACE) != 0) return refuse(-EINVAL, "open", "no such device");
  if (isDemanded("SENSELOOM_AWARE_FAIL_OPEN")) return refuse(-EIO, "open", "failure on demand");
  if (isDemanded("SENSELOOM_AWARE_NULL_DEVICE")) return refuse(0, "open", "no device on demand");

  auto* const device = new (std::nothrow) AwareDevice();
  if (device == nullptr) return refuse(-ENOMEM, "open", "out of memory");
  device->common.tag = HARDWARE_DEVICE_TAG;
  device->common.version =
      isDemanded("SENSELOOM_AWARE_WRONG_VERSION") ? HARDWARE_DEVICE_API_VERSION(1, 0) : AWARE_DEVICE_API_VERSION_2_0;
  device->common.module =
      const_cast<hw_module_t*>(module);  // the interface takes it as const but keeps it as not const
  device->common.close = closeDevice;
  device->activate = activate;
  device->deactivate = deactivate;
  device->get_parameters = getParameters;
  __android_log_print(ANDROID_LOG_DEBUG, kTag, "open: version 0x%x", device->common.version);
  *out = &device->common;
  return 0;
}

hw_module_methods_t methods = {.open = openDevice};

}  // namespace

// Not const, since the loader stores its handle in it.
extern "C" hw_module_t HAL_MODULE_INFO_SYM;
hw_module_t HAL_MODULE_INFO_SYM = {
    .tag = HARDWARE_MODULE_TAG,
    .module_api_version = HARDWARE_MODULE_API_VERSION(2, 0),
    .hal_api_version = HARDWARE_HAL_API_VERSION,
    .id = AWARE_HARDWARE_MODULE_ID,
    .name = "aware audio of a Linux host",
    .author = "senseloom",
    .methods = &methods,
    .dso = nullptr,
    .reserved = {},
};
