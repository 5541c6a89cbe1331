#include <gtest/gtest.h>

#include <cstdlib>
#include <sstream>
#include <string>

#include "recording.h"

namespace senseloom::tool {
namespace {

// What bash offers to complete an empty word behind a command of the tool with, one candidate a line.
std::string offeredAfter(const std::string& command) {
  const ScratchFile offered("offered_after_" + command);
  const std::string script = "bash -c '. \"" COMPLETION_FILE "\"; COMP_WORDS=(\"" TOOL_FILE "\" " + command +
                             " \"\"); COMP_CWORD=2; _senseloom; printf \"%s\\n\" \"${COMPREPLY[@]}\"' >'" +
                             offered.name + "'";
  EXPECT_EQ(std::system(script.c_str()), 0);
  return contentOf(offered.name);
}

TEST(Completion, OffersEverySensorOfTheTool) {
  std::istringstream objects(runTool({"sensors", "--json"}).out);
  std::string sensors;
  const std::string start = R"({"sensor":")";
  for (std::string object; std::getline(objects, object);) {
    const size_t end = object.find('"', start.size());
    sensors += object.substr(start.size(), end - start.size()) + '\n';
  }
  EXPECT_EQ(sensors.substr(0, 11), "PHYAC\nSTAP\n");
  EXPECT_EQ(offeredAfter("sensors"), sensors);
  EXPECT_EQ(offeredAfter("explain"), sensors);
}

}  // namespace
}  // namespace senseloom::tool
