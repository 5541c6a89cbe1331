#include <android/log.h>
#include <gtest/gtest.h>
#include <hardware/aware.h>
#include <hardware/hardware.h>

#include <array>
#include <cerrno>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "support.h"

namespace {

using Bytes = std::array<unsigned char, 48>;

// The parameters as they cross the interface; the two bytes 0xa5 are padding.
constexpr Bytes kParameters = {
    0x80, 0x00, 0x00, 0x00,  // 128
    0x0c, 0x00, 0x14, 0x00,  // 12, 20
    0x18, 0x00, 0xa5, 0xa5,  // 24
    0x4c, 0x00, 0x00, 0x00,  // 76
    0xfe, 0xff, 0xff, 0xff,  // -2
    0xff, 0xff, 0xff, 0xff,  // -1
    0x15, 0x00, 0x00, 0x00,  // 21
    0xcc, 0x3c, 0x00, 0x00,  // 15564
    0x70, 0x7d, 0x00, 0x00,  // 32112
    0x99, 0x19, 0x00, 0x00,  // 6553
    0xcc, 0x0c, 0x00, 0x00,  // 3276
    0x40, 0x00, 0x04, 0x00,  // 64, 4
};

aware_parameters_t toParameters(const Bytes& bytes) {
  aware_parameters_t parameters;
  std::memcpy(&parameters, bytes.data(), sizeof parameters);
  return parameters;
}

LogLine debug(const std::string& text) {
  return {ANDROID_LOG_DEBUG, "aware_hal", text};
}
LogLine error(const std::string& text) {
  return {ANDROID_LOG_ERROR, "aware_hal", text};
}

class Aware : public ::testing::Test {
 protected:
  void SetUp() override { ASSERT_EQ(hw_get_module_by_class("aware", "primary", &module), 0); }

  void TearDown() override {
    if (device != nullptr) close();
  }

  int open(const char* id = "aware_hw_if") {
    hw_device_t* common = &stale;
    const int result = module->methods->open(module, id, &common);
    device = reinterpret_cast<aware_hw_device_t*>(common);
    return result;
  }

  int activate(const Bytes& bytes = kParameters) {
    const aware_parameters_t parameters = toParameters(bytes);
    return device->activate(device, &parameters);
  }

  int deactivate() { return device->deactivate(device); }

  bool isActive() {
    aware_parameters_t parameters;
    return device->get_parameters(device, &parameters) == 0;
  }

  int close() {
    const int result = device->common.close(&device->common);
    device = nullptr;
    return result;
  }

  // The lines of the steps since the last call; the loader has none.
  std::vector<LogLine> log() { return recorder.take(); }

  const hw_module_t* module = nullptr;
  aware_hw_device_t* device = nullptr;

 private:
  const ScopedVariable modulePath{"SENSELOOM_HW_MODULE_PATH", nullptr};
  hw_device_t stale = {};  // what opening has to overwrite
  ScopedLog recorder;
};

TEST_F(Aware, PresentsItsModule) {
  EXPECT_EQ(module->tag, 0x48574d54u);
  EXPECT_EQ(module->module_api_version, 0x200u);
  EXPECT_EQ(module->hal_api_version, 0x100u);
  EXPECT_STREQ(module->id, "aware");
}

TEST_F(Aware, OpensADeviceOfVersion2) {
  ASSERT_EQ(open(), 0);
  ASSERT_NE(device, nullptr);
  EXPECT_EQ(device->common.tag, 0x48574454u);
  EXPECT_EQ(device->common.version, 0x200u);
  EXPECT_EQ(device->common.module, module);
  EXPECT_EQ(log(), std::vector{debug("open: version 0x200")});
}

TEST_F(Aware, RefusesToOpenAnotherDevice) {
  EXPECT_EQ(open("aware_hw"), -EINVAL);
  EXPECT_EQ(device, nullptr);
  EXPECT_EQ(log(), std::vector{error("open: no such device")});
}

TEST_F(Aware, SwitchesItsSessionOnAndOffAndOnAgain) {
  ASSERT_EQ(open(), 0);
  EXPECT_FALSE(isActive());
  EXPECT_EQ(activate(), 0);
  EXPECT_TRUE(isActive());
  EXPECT_EQ(deactivate(), 0);
  EXPECT_FALSE(isActive());
  EXPECT_EQ(activate(), 0);
  EXPECT_EQ(deactivate(), 0);
  EXPECT_EQ(close(), 0);
  EXPECT_EQ(log(), (std::vector{debug("open: version 0x200"), debug("activate: active"), debug("deactivate: inactive"),
                                debug("activate: active"), debug("deactivate: inactive"), debug("close: closed")}));
}

TEST_F(Aware, KeepsTheParametersItWasActivatedWithByteForByte) {
  ASSERT_EQ(open(), 0);
  ASSERT_EQ(activate(), 0);
  aware_parameters_t kept;
  ASSERT_EQ(device->get_parameters(device, &kept), 0);
  EXPECT_EQ(std::memcmp(&kept, kParameters.data(), 10), 0);
  EXPECT_EQ(std::memcmp(reinterpret_cast<const char*>(&kept) + 12, kParameters.data() + 12, 36), 0);
}

TEST_F(Aware, HasNoParametersWhileInactive) {
  ASSERT_EQ(open(), 0);
  aware_parameters_t kept;
  EXPECT_EQ(device->get_parameters(device, &kept), -EINVAL);
}

TEST_F(Aware, RefusesEveryWrongByteButThePadding) {
  ASSERT_EQ(open(), 0);
  log();
  for (std::size_t offset = 0; offset < kParameters.size(); ++offset) {
    SCOPED_TRACE(offset);
    Bytes bytes = kParameters;
    bytes[offset] ^= 0x01;
    if (offset == 10 || offset == 11) {
      EXPECT_EQ(activate(bytes), 0);
      EXPECT_EQ(deactivate(), 0);
      log();
    } else {
      EXPECT_EQ(activate(bytes), -EINVAL);
      EXPECT_FALSE(isActive());
      EXPECT_EQ(log(), std::vector{error("activate: wrong parameter byte at offset " + std::to_string(offset))});
    }
  }
}

TEST_F(Aware, RefusesActivationWithoutParameters) {
  ASSERT_EQ(open(), 0);
  log();
  EXPECT_EQ(device->activate(device, nullptr), -EINVAL);
  EXPECT_FALSE(isActive());
  EXPECT_EQ(log(), std::vector{error("activate: no parameters")});
}

TEST_F(Aware, RefusesActivationWhileActive) {
  ASSERT_EQ(open(), 0);
  ASSERT_EQ(activate(), 0);
  log();
  EXPECT_EQ(activate(), -EBUSY);
  EXPECT_TRUE(isActive());
  EXPECT_EQ(log(), std::vector{error("activate: already active")});
}

TEST_F(Aware, RefusesDeactivationWhileInactive) {
  ASSERT_EQ(open(), 0);
  log();
  EXPECT_EQ(deactivate(), -EINVAL);
  EXPECT_EQ(log(), std::vector{error("deactivate: not active")});
}

TEST_F(Aware, ClosesWhileActive) {
  ASSERT_EQ(open(), 0);
  ASSERT_EQ(activate(), 0);
  log();
  EXPECT_EQ(close(), 0);
  EXPECT_EQ(log(), std::vector{debug("close: closed while active")});
}

TEST_F(Aware, OpensInactiveAfterClosingWhileActive) {
  ASSERT_EQ(open(), 0);
  ASSERT_EQ(activate(), 0);
  ASSERT_EQ(close(), 0);
  ASSERT_EQ(open(), 0);
  EXPECT_FALSE(isActive());
}

TEST_F(Aware, FailsToOpenOnDemand) {
  const ScopedVariable demand("SENSELOOM_AWARE_FAIL_OPEN", "1");
  EXPECT_EQ(open(), -EIO);
  EXPECT_EQ(device, nullptr);
  EXPECT_EQ(log(), std::vector{error("open: failure on demand")});
}

TEST_F(Aware, OpensNoDeviceOnDemand) {
  const ScopedVariable demand("SENSELOOM_AWARE_NULL_DEVICE", "1");
  EXPECT_EQ(open(), 0);
  EXPECT_EQ(device, nullptr);
  EXPECT_EQ(log(), std::vector{error("open: no device on demand")});
}

TEST_F(Aware, OpensAnOldDeviceOnDemandThatWorksAllTheSame) {
  const ScopedVariable demand("SENSELOOM_AWARE_WRONG_VERSION", "1");
  ASSERT_EQ(open(), 0);
  EXPECT_EQ(device->common.version, 0x100u);
  EXPECT_EQ(log(), std::vector{debug("open: version 0x100")});
  EXPECT_EQ(activate(), 0);
  EXPECT_EQ(deactivate(), 0);
}

TEST_F(Aware, FailsToActivateOnDemandAndStaysInactive) {
  ASSERT_EQ(open(), 0);
  log();
  {
    const ScopedVariable demand("SENSELOOM_AWARE_FAIL_ACTIVATE", "1");
    EXPECT_EQ(activate(), -EIO);
    EXPECT_FALSE(isActive());
    EXPECT_EQ(log(), std::vector{error("activate: failure on demand")});
  }
  EXPECT_EQ(activate(), 0);
}

TEST_F(Aware, FailsToDeactivateOnDemandAndStaysActive) {
  ASSERT_EQ(open(), 0);
  ASSERT_EQ(activate(), 0);
  log();
  {
    const ScopedVariable demand("SENSELOOM_AWARE_FAIL_DEACTIVATE", "1");
    EXPECT_EQ(deactivate(), -EIO);
    EXPECT_TRUE(isActive());
    EXPECT_EQ(log(), std::vector{error("deactivate: failure on demand")});
  }
  EXPECT_EQ(deactivate(), 0);
}

// That the device is gone all the same is for the leak check to see.
TEST_F(Aware, FailsToCloseOnDemand) {
  ASSERT_EQ(open(), 0);
  log();
  const ScopedVariable demand("SENSELOOM_AWARE_FAIL_CLOSE", "1");
  EXPECT_EQ(close(), -EIO);
  EXPECT_EQ(log(), std::vector{error("close: failure on demand")});
}

TEST_F(Aware, TakesAnEmptyVariableForNone) {
  const ScopedVariable openDemand("SENSELOOM_AWARE_FAIL_OPEN", "");
  const ScopedVariable nullDemand("SENSELOOM_AWARE_NULL_DEVICE", "");
  const ScopedVariable versionDemand("SENSELOOM_AWARE_WRONG_VERSION", "");
  ASSERT_EQ(open(), 0);
  ASSERT_NE(device, nullptr);
  EXPECT_EQ(device->common.version, 0x200u);
}

}  // namespace
