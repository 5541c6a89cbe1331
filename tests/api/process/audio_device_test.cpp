#include <gtest/gtest.h>
#include <senseloom.h>

#include <cstdint>
#include <cstring>
#include <limits>
#include <string>
#include <vector>

#include "platform.h"

// A platform that writes where the library reads: the audio bridge looks again after each call of it.
namespace {

using platform::hooks;

aware_hw_device* theDevice() {
  return reinterpret_cast<aware_hw_device*>(&platform::aware_device);
}
void clearDevice() {
  device = nullptr;
}

// What the platform was called for.
std::vector<std::string> events;

void countDeviceCalls() {
  events.clear();
  hooks.activate = [](void*) { events.emplace_back("activate"); };
  hooks.deactivate = [] { events.emplace_back("deactivate"); };
  hooks.close = [] { events.emplace_back("close"); };
}

using Events = std::vector<std::string>;

// Has the log clear the device with the line that begins with this text.
std::string clearing_line;
void clearDeviceWith(const char* line) {
  clearing_line = line;
  hooks.logged = [](const char* text) {
    if (std::string(text).starts_with(clearing_line)) clearDevice();
  };
}

TEST(AudioDevice, ClearedBeforeItsActivationIsNotActivated) {
  countDeviceCalls();
  ASSERT_TRUE(audio_hal_init());
  clearDeviceWith("It is already inited!");
  EXPECT_FALSE(audio_hal_activate());
  EXPECT_FALSE(gIsActivated);
  EXPECT_EQ(events, Events{});
}

TEST(AudioDevice, ClearedByTheLineBeforeItsActivationIsActivatedAllTheSame) {
  countDeviceCalls();
  clearDeviceWith("activating aware...");
  EXPECT_TRUE(audio_hal_activate());
  EXPECT_TRUE(gIsActivated);
  EXPECT_EQ(events, Events{"activate"});
}

TEST(AudioDevice, ClearedBeforeItsDeactivationCountsAsDeactivated) {
  countDeviceCalls();
  ASSERT_TRUE(audio_hal_activate());
  clearDeviceWith("It is already inited!");
  EXPECT_TRUE(audio_hal_deactivate());
  EXPECT_TRUE(gIsActivated);
  EXPECT_EQ(events, Events{"activate"});
}

TEST(AudioDevice, ClearedByItsDeactivationIsNotClosed) {
  countDeviceCalls();
  ASSERT_TRUE(audio_hal_activate());
  hooks.deactivate = [] {
    events.emplace_back("deactivate");
    clearDevice();
  };
  EXPECT_TRUE(audio_hal_deactivate());
  EXPECT_FALSE(gIsActivated);
  EXPECT_EQ(events, (Events{"activate", "deactivate"}));
}

TEST(AudioDevice, ClearedByTheLineAfterItsDeactivationIsNotClosed) {
  countDeviceCalls();
  ASSERT_TRUE(audio_hal_activate());
  clearDeviceWith("deactivated aware session successful");
  EXPECT_TRUE(audio_hal_deactivate());
  EXPECT_FALSE(gIsActivated);
  EXPECT_EQ(events, (Events{"activate", "deactivate"}));
}

// Its result, that of "device open result", makes the log clear it.
TEST(AudioDevice, ClearedByTheLineAfterItsOpeningIsNotOpen) {
  clearDeviceWith("device open result");
  EXPECT_FALSE(audio_hal_init());
  EXPECT_FALSE(audio_hal_activate());
}

TEST(AudioDevice, ClearedWithTheLineOfItsVersionIsOpenedAndNotActivated) {
  countDeviceCalls();
  clearDeviceWith("device version");
  EXPECT_TRUE(audio_hal_init());
  EXPECT_EQ(device, nullptr);
  EXPECT_FALSE(audio_hal_activate());
  EXPECT_EQ(events, Events{});
}

// The loader keeps what an opening stored, also when it says that it failed: the next call finds a device.
TEST(AudioDevice, StoredByAnOpeningThatFailsIsKept) {
  countDeviceCalls();
  hooks.open = [](hw_device_t** opened) {
    *opened = &platform::aware_device.common;
    return -5;
  };
  EXPECT_FALSE(audio_hal_init());
  EXPECT_EQ(device, theDevice());
  EXPECT_TRUE(audio_hal_init());
  EXPECT_TRUE(audio_hal_activate());
  EXPECT_EQ(events, Events{"activate"});
}

TEST(AudioDevice, MayWriteToItsParametersAndGetsFreshOnes) {
  using Block = std::vector<uint8_t>;
  static std::vector<Block> blocks;
  hooks.activate = [](void* parameters) {
    auto* const bytes = static_cast<uint8_t*>(parameters);
    blocks.emplace_back(bytes, bytes + 48);
    std::memset(bytes, 0xEE, 48);
  };
  for (int round = 0; round < 2; ++round) {
    ASSERT_TRUE(audio_hal_activate());
    ASSERT_TRUE(audio_hal_deactivate());
  }
  for (Block& block : blocks) block[10] = block[11] = 0;  // padding
  EXPECT_EQ(blocks[1], blocks[0]);
  EXPECT_EQ(blocks[1][0], 128);
  EXPECT_EQ(blocks[1][44], 64);
}

TEST(AudioLoader, ItsMostNegativeResultIsLoggedAsAnError) {
  static std::string first;
  hooks.loaderResult = std::numeric_limits<int>::min();
  hooks.logged = [](const char* text) {
    if (first.empty()) first = text;
  };
  EXPECT_FALSE(audio_hal_init());
  EXPECT_EQ(first, "bool audio_hal_init() load audio hw module aware.primary (Unknown error -2147483648)");
}

}  // namespace
