#include "fake_platform.h"

#include <cstdarg>
#include <cstring>
#include <ostream>
#include <utility>

#include "formatted.h"

namespace fake {
namespace {

// The aware device as the library requires it of the platform: the common header, then the two operations.
struct Device {
  hw_device_t common;
  int (*activate)(Device*, const void*);
  int (*deactivate)(Device*);
};

int activate(Device* device, const void* block) {
  platform().calls.push_back(device == platform().deviceAddress() ? "activate" : "activate of a wrong device");
  std::memcpy(platform().activationBlock.data(), block, platform().activationBlock.size());
  return platform().activateResult;
}

int deactivate(Device* device) {
  platform().calls.push_back(device == platform().deviceAddress() ? "deactivate" : "deactivate of a wrong device");
  return platform().deactivateResult;
}

int closeDevice(hw_device_t* device) {
  platform().calls.push_back(device == platform().deviceAddress() ? "close" : "close of a wrong device");
  return 0;
}

Device aware_device;

int openDevice(const hw_module_t* module, const char* id, hw_device_t** device);

hw_module_methods_t module_methods = {openDevice};
hw_module_t module_of_aware = [] {
  hw_module_t module{};
  module.methods = &module_methods;
  return module;
}();

int openDevice(const hw_module_t* module, const char* id, hw_device_t** device) {
  platform().calls.push_back((module == &module_of_aware ? "open " : "open of a wrong module ") + std::string(id));
  if (platform().openResult != 0) return platform().openResult;
  aware_device = {};
  aware_device.common.version = platform().deviceVersion;
  aware_device.common.close = closeDevice;
  aware_device.activate = activate;
  aware_device.deactivate = deactivate;
  *device = platform().openGivesDevice ? &aware_device.common : nullptr;
  return 0;
}

}  // namespace

const void* Platform::deviceAddress() const {
  return &aware_device;
}

std::vector<LogLine> Platform::takeLog() {
  return std::exchange(log, {});
}

Platform& platform() {
  static Platform one;
  return one;
}

void PrintTo(const LogLine& line, std::ostream* out) {
  *out << line.priority << ' ' << line.tag << ": \"" << line.text << '"';
}

}  // namespace fake

extern "C" {

int __android_log_print(int priority, const char* tag, const char* format, ...) {
  va_list arguments;
  va_start(arguments, format);
  const std::string text = fake::formatted(format, arguments);
  va_end(arguments);
  fake::platform().log.push_back({priority, tag, text});
  return static_cast<int>(text.size());
}

int hw_get_module_by_class(const char* class_id, const char* inst, const hw_module_t** module) {
  fake::platform().calls.push_back("get " + std::string(class_id) + "." + inst);
  if (fake::platform().getResult == 0) *module = &fake::module_of_aware;
  return fake::platform().getResult;
}

bool gesture_initial(int first, int second) {
  fake::platform().gestureInitials.push_back({first, second});
  return fake::platform().gestureStarts;
}

char* gesture_process_single_data(const int16_t* group, int count, bool last) {
  fake::Platform::Group fed{.samples = {}, .count = count, .last = last};
  std::memcpy(fed.samples.data(), group, sizeof fed.samples);
  auto& platform = fake::platform();
  platform.groups.push_back(fed);
  if (platform.gestureNames.empty()) return nullptr;
  const auto name = std::move(platform.gestureNames.front());
  platform.gestureNames.pop_front();
  if (!name) return nullptr;
  auto* copy = new char[name->size() + 1];
  std::memcpy(copy, name->c_str(), name->size() + 1);
  return copy;
}

void gesture_close() {
  ++fake::platform().gestureCloses;
}
}
