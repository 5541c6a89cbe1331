#include <gtest/gtest.h>

#include <cstdlib>
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
  std::string sensors;
  for (const std::string& name : sensorNames()) sensors += name + '\n';
  EXPECT_EQ(offeredAfter("sensors"), sensors);
  EXPECT_EQ(offeredAfter("explain"), sensors);
}

}  // namespace
}  // namespace senseloom::tool
