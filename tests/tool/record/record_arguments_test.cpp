#include <gtest/gtest.h>

#include <string>

#include "recording.h"

namespace senseloom::tool {
namespace {

TEST(RecordArguments, PassesArgumentsUntouched) {
#ifdef SANITIZED
  GTEST_SKIP() << "the program does not have the sanitizer that the recording library needs";
#endif
  const ScratchFile trace("arguments");
  const std::string format = "%s|%s|%s|%s|%s|%s|%s|%s\\n";
  const ToolRun run = recordTo(trace.name, {"printf", format, "[1,2]", "[]", "", "{}", "--", "-x", "[", "a b"});
  EXPECT_EQ(run.out, "[1,2]|[]||{}|--|-x|[|a b\n");
}

TEST(RecordArguments, LeaveOptionStringsAsTheyAre) {
  const ToolRun run = runTool({"explain", "SCOUN", R"([{"logN":3}])"});
  EXPECT_EQ(run.out.rfind("session 1 on SCOUN sets [{\"logN\":3}]\n  not an object", 0), 0U) << run.out;
  EXPECT_EQ(run.err, "senseloom: the option of session 1 is no JSON object\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(runTool({"explain", "SCOUN", "{}"}).status, 0);
}

TEST(RecordArguments, NeedAProgramOrAProcess) {
  EXPECT_EQ(runTool({"record"}).status, 2);
  EXPECT_EQ(runTool({"record", "--attach", "0"}).status, 2);
  EXPECT_EQ(runTool({"record", "--attach", "1", "--", "true"}).status, 2);
  EXPECT_EQ(runTool({"record", "--max-size", "much", "--", "true"}).status, 2);
}

}  // namespace
}  // namespace senseloom::tool
