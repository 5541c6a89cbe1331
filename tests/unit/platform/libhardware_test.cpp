#include <android/log.h>
#include <dlfcn.h>
#include <gtest/gtest.h>
#include <hardware/hardware.h>

#include <cerrno>
#include <climits>
#include <cstddef>
#include <string>
#include <vector>

#include "headers_c99.h"
#include "support.h"

namespace {

const std::string kLibraries = LIBRARIES;
const std::string kModules = MODULES;

// The folder of the file that the module was loaded from.
std::string folderOf(const hw_module_t* module) {
  Dl_info file;
  if (module == nullptr || dladdr(module, &file) == 0) return "no module";
  const std::string path = file.dli_fname;
  return path.substr(0, path.rfind('/'));
}

class Loader : public ::testing::Test {
 protected:
  int get(const char* class_id, const char* inst) { return hw_get_module_by_class(class_id, inst, &module); }

  // What a failed call has to overwrite.
  const hw_module_t stale = {};
  const hw_module_t* module = &stale;
  ScopedLog log;

 private:
  const ScopedVariable modulePath{"SENSELOOM_HW_MODULE_PATH", nullptr};
};

TEST_F(Loader, FindsTheModuleBesideItselfWithNoEnvironment) {
  ASSERT_EQ(get("aware", "primary"), 0);
  EXPECT_EQ(folderOf(module), kLibraries);
  EXPECT_EQ(module->tag, 0x48574d54u);
  EXPECT_STREQ(module->id, "aware");
  EXPECT_EQ(log.take(), std::vector<LogLine>{});
}

TEST_F(Loader, KeepsTheHandleInTheModule) {
  ASSERT_EQ(get("aware", "primary"), 0);
  ASSERT_NE(module->dso, nullptr);
  EXPECT_EQ(dlsym(module->dso, "HMI"), module);
}

TEST_F(Loader, GivesTheSameModuleAgain) {
  ASSERT_EQ(get("aware", "primary"), 0);
  const hw_module_t* const first = module;
  ASSERT_EQ(get("aware", "primary"), 0);
  EXPECT_EQ(module, first);
}

TEST_F(Loader, PrefersTheDirectoriesOfTheVariable) {
  const ScopedVariable path("SENSELOOM_HW_MODULE_PATH", (kModules + "/other").c_str());
  ASSERT_EQ(get("aware", "primary"), 0);
  EXPECT_EQ(folderOf(module), kModules + "/other");
}

TEST_F(Loader, SearchesTheDirectoriesOfTheVariableInOrder) {
  const std::string absent = kModules + "/absent";
  const std::string tooLong(PATH_MAX, 'd');
  const std::string list = "::" + absent + ":" + tooLong + ":" + kModules + "/other:" + kLibraries + ":";
  const ScopedVariable path("SENSELOOM_HW_MODULE_PATH", list.c_str());
  ASSERT_EQ(get("aware", "primary"), 0);
  EXPECT_EQ(folderOf(module), kModules + "/other");
}

TEST_F(Loader, SearchesBesideItselfWhenNoDirectoryOfTheVariableHasTheModule) {
  const ScopedVariable path("SENSELOOM_HW_MODULE_PATH", (kModules + "/absent:" + kModules).c_str());
  ASSERT_EQ(get("aware", "primary"), 0);
  EXPECT_EQ(folderOf(module), kLibraries);
}

TEST_F(Loader, ReadsTheVariableAtEachCall) {
  ASSERT_EQ(get("aware", "primary"), 0);
  const ScopedVariable path("SENSELOOM_HW_MODULE_PATH", (kModules + "/other").c_str());
  ASSERT_EQ(get("aware", "primary"), 0);
  EXPECT_EQ(folderOf(module), kModules + "/other");
}

TEST_F(Loader, LeavesTheInstanceOutOfTheNameWhenThereIsNone) {
  const ScopedVariable path("SENSELOOM_HW_MODULE_PATH", (kModules + "/no_instance").c_str());
  ASSERT_EQ(get("aware", nullptr), 0);
  EXPECT_EQ(folderOf(module), kModules + "/no_instance");
}

TEST_F(Loader, ByClassAloneIsWithoutInstance) {
  EXPECT_EQ(hw_get_module("aware", &module), -ENOENT);
  const ScopedVariable path("SENSELOOM_HW_MODULE_PATH", (kModules + "/no_instance").c_str());
  ASSERT_EQ(hw_get_module("aware", &module), 0);
  EXPECT_EQ(folderOf(module), kModules + "/no_instance");
}

TEST_F(Loader, ReportsAModuleThatIsNowhere) {
  EXPECT_EQ(get("unaware", "primary"), -ENOENT);
  EXPECT_EQ(module, nullptr);
  EXPECT_EQ(log.take(), std::vector<LogLine>{});
}

TEST_F(Loader, RefusesAModuleOfAnotherId) {
  const ScopedVariable path("SENSELOOM_HW_MODULE_PATH", (kModules + "/wrong_id").c_str());
  EXPECT_EQ(get("aware", "primary"), -EINVAL);
  EXPECT_EQ(module, nullptr);
  const std::string file = kModules + "/wrong_id/aware.primary.default.so";
  EXPECT_EQ(log.take(),
            (std::vector<LogLine>{{ANDROID_LOG_ERROR, "libhardware", file + ": id is unaware, not aware"}}));
  EXPECT_EQ(dlopen(file.c_str(), RTLD_NOW | RTLD_NOLOAD), nullptr) << "it must not stay loaded";
}

TEST_F(Loader, RefusesALibraryThatIsNoModule) {
  const ScopedVariable path("SENSELOOM_HW_MODULE_PATH", (kModules + "/missing_hmi").c_str());
  EXPECT_EQ(get("aware", "primary"), -EINVAL);
  EXPECT_EQ(module, nullptr);
  const std::string file = kModules + "/missing_hmi/aware.primary.default.so";
  EXPECT_EQ(log.take(), (std::vector<LogLine>{{ANDROID_LOG_ERROR, "libhardware", file + ": no symbol HMI"}}));
  EXPECT_EQ(dlopen(file.c_str(), RTLD_NOW | RTLD_NOLOAD), nullptr) << "it must not stay loaded";
}

TEST_F(Loader, RefusesAFileThatIsNoLibrary) {
  const ScopedVariable path("SENSELOOM_HW_MODULE_PATH", (kModules + "/no_library").c_str());
  EXPECT_EQ(get("aware", "primary"), -EINVAL);
  EXPECT_EQ(module, nullptr);
  const std::vector<LogLine> lines = log.take();
  ASSERT_EQ(lines.size(), 1u);
  EXPECT_EQ(lines[0].priority, ANDROID_LOG_ERROR);
  EXPECT_EQ(lines[0].tag, "libhardware");
  // The rest is the dynamic loader's own words.
  EXPECT_EQ(lines[0].text.rfind(kModules + "/no_library/aware.primary.default.so: ", 0), 0u) << lines[0];
}

TEST_F(Loader, RefusesANameThatNoFileCanHave) {
  // ".primary.default.so" has 19 characters; a file name has at most 255.
  EXPECT_EQ(get(std::string(236, 'c').c_str(), "primary"), -ENOENT);
  module = &stale;
  EXPECT_EQ(get(std::string(237, 'c').c_str(), "primary"), -ENAMETOOLONG);
  EXPECT_EQ(module, nullptr);
  module = &stale;
  EXPECT_EQ(get(std::string(100000, 'c').c_str(), nullptr), -ENAMETOOLONG);
  EXPECT_EQ(module, nullptr);
}

// The sizes and offsets are those of the platform on 32-bit and 64-bit.
TEST(PlatformHeaders, HaveThePlatformsLayoutInC99AndInCpp) {
  const bool wide = sizeof(void*) == 8;
  const layout_t c99 = layoutInC99();

  EXPECT_EQ(sizeof(hw_device_t), wide ? 120u : 64u);
  EXPECT_EQ(offsetof(hw_device_t, version), 4u);
  EXPECT_EQ(offsetof(hw_device_t, module), 8u);
  EXPECT_EQ(offsetof(hw_device_t, close), wide ? 112u : 60u);
  EXPECT_EQ(c99.device_size, sizeof(hw_device_t));
  EXPECT_EQ(c99.device_version, offsetof(hw_device_t, version));
  EXPECT_EQ(c99.device_module, offsetof(hw_device_t, module));
  EXPECT_EQ(c99.device_close, offsetof(hw_device_t, close));

  EXPECT_EQ(sizeof(hw_module_t), wide ? 248u : 128u);
  EXPECT_EQ(offsetof(hw_module_t, module_api_version), 4u);
  EXPECT_EQ(offsetof(hw_module_t, hal_api_version), 6u);
  EXPECT_EQ(offsetof(hw_module_t, id), 8u);
  EXPECT_EQ(offsetof(hw_module_t, methods), wide ? 32u : 20u);
  EXPECT_EQ(offsetof(hw_module_t, dso), wide ? 40u : 24u);
  EXPECT_EQ(c99.module_size, sizeof(hw_module_t));
  EXPECT_EQ(c99.module_api_version, offsetof(hw_module_t, module_api_version));
  EXPECT_EQ(c99.module_id, offsetof(hw_module_t, id));
  EXPECT_EQ(c99.module_methods, offsetof(hw_module_t, methods));
  EXPECT_EQ(c99.module_dso, offsetof(hw_module_t, dso));

  EXPECT_EQ(c99.aware_activate, wide ? 120u : 64u);
  EXPECT_EQ(c99.aware_deactivate, wide ? 128u : 68u);
  EXPECT_EQ(c99.parameters_size, 48u);
}

TEST(PlatformHeaders, HaveThePlatformsConstants) {
  EXPECT_EQ(HARDWARE_MODULE_TAG, 0x48574d54);
  EXPECT_EQ(HARDWARE_DEVICE_TAG, 0x48574454);
  EXPECT_EQ(HARDWARE_DEVICE_API_VERSION(2, 0), 0x200);
  EXPECT_EQ(HARDWARE_DEVICE_API_VERSION(1, 3), 0x103);
  EXPECT_STREQ(HAL_MODULE_INFO_SYM_AS_STR, "HMI");
}

}  // namespace
