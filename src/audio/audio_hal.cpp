#include "audio/audio_hal.h"

#include <android/log.h>
#include <hardware/aware.h>
#include <hardware/hardware.h>

#include <cstdio>
#include <cstring>

#include "audio/hardware_layout.h"
#include "senseloom.h"

// Every call of the platform, and the log is one, may clear what callers see, too: it is read anew after each.
constinit aware_hw_device* device = nullptr;
constinit bool gIsActivated = false;

namespace senseloom {
namespace {

constexpr const char* kTag = "aware_audio";
constexpr const char* kClass = AWARE_HARDWARE_MODULE_ID;
constexpr const char* kInstance = "primary";
constexpr const char* kInterface = AWARE_HARDWARE_INTERFACE;
constexpr uint32_t kVersion = AWARE_DEVICE_API_VERSION_2_0;

constexpr aware_parameters_t kParameters = {
    .word0 = 128,
    .half4 = 12,
    .half6 = 20,
    .half8 = 24,
    .word12 = 76,
    .word16 = -2,
    .word20 = -1,
    .word24 = 21,
    .word28 = 15564,  // 0.475 in Q15, truncated, as the next ones
    .word32 = 32112,  // 0.98
    .word36 = 6553,   // 0.2
    .word40 = 3276,   // 0.1
    .half44 = 64,
    .half46 = 4,
};

bool openOrLog() {
  if (openAudio()) return true;
  __android_log_print(ANDROID_LOG_ERROR, kTag, "init audio hal failed");
  return false;
}

}  // namespace

// A device of a wrong version stays open, and only the call that opened it fails, on purpose: the next one finds it
// open and goes on with it.
bool openAudio() {
  if (device != nullptr) {
    __android_log_print(ANDROID_LOG_DEBUG, kTag, "It is already inited!");
    return true;
  }
  const hw_module_t* module = nullptr;
  int rc = hw_get_module_by_class(kClass, kInstance, &module);
  // The first text names audio_hal_init() in all three functions, on purpose.
  __android_log_print(ANDROID_LOG_DEBUG, kTag, "%s load audio hw module %s.%s (%s)", "bool audio_hal_init()", kClass,
                      kInstance, std::strerror(static_cast<int>(0U - static_cast<unsigned>(rc))));
  if (rc != 0) return false;
  rc = module->methods->open(module, kInterface, reinterpret_cast<hw_device_t**>(&device));
  __android_log_print(ANDROID_LOG_DEBUG, kTag, "device open result %d\n", rc);
  if (rc != 0 || device == nullptr) return false;
  const uint32_t version = device->common.version;
  __android_log_print(ANDROID_LOG_DEBUG, kTag, "device version %d\n", static_cast<int>(version));
  return version == kVersion;
}

bool activateAudio() {
  if (!openOrLog()) return false;
  if (gIsActivated) {
    __android_log_print(ANDROID_LOG_DEBUG, kTag, "already activated, return");
    return true;
  }
  aware_parameters_t parameters = kParameters;  // built anew each time, in memory that the device may write to
  if (device == nullptr) return false;
  aware_hw_device* const opened = device;
  __android_log_print(ANDROID_LOG_DEBUG, kTag, "activating aware... %p\n", static_cast<void*>(opened));
  if (opened->activate(opened, &parameters) != 0) {
    __android_log_print(ANDROID_LOG_ERROR, kTag, "activated aware failed\n");
    return false;
  }
  __android_log_print(ANDROID_LOG_DEBUG, kTag, "activated aware successful...\n");
  gIsActivated = true;
  return true;
}

bool deactivateAudio() {
  if (!openOrLog()) return false;
  if (!gIsActivated) {
    __android_log_print(ANDROID_LOG_DEBUG, kTag, "already deactivated, return");
    return true;
  }
  if (device == nullptr) return true;
  aware_hw_device* const opened = device;
  std::puts("deactivating aware session...");  // this one goes to standard output instead of the log, on purpose
  if (opened->deactivate(opened) != 0) {
    __android_log_print(ANDROID_LOG_ERROR, kTag, "deactivated aware session failed \n");
    return false;
  }
  __android_log_print(ANDROID_LOG_DEBUG, kTag, "deactivated aware session successful... \n");
  gIsActivated = false;
  if (device != nullptr) device->common.close(&device->common);
  device = nullptr;
  return true;
}

}  // namespace senseloom
