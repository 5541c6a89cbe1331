#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <string>
#include <vector>

#include "recording.h"
#include "run_tool.h"

namespace senseloom::tool {
namespace {

constexpr char kClassNames[] = "unknown,sitting,walking,running,cycling,riding,no majority";

constexpr char kNoRecords[] = R"({"call":"open","session":"a","sensor":"LIFT"})";

size_t placesOf(const std::string& part, const std::string& text) {
  size_t count = 0;
  for (size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1)) ++count;
  return count;
}

std::string pageOf(const std::string& trace, const std::vector<std::string>& more = {}) {
  std::vector<std::string> arguments{"view", "-"};
  arguments.insert(arguments.end(), more.begin(), more.end());
  const ToolRun run = runTool(arguments, trace);
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.status, 0);
  return run.out;
}

// The part of a page that tells of its trace, as JSON.
std::string summaryOf(const std::string& page) {
  const std::string start = "id=\"summary\">";
  const size_t from = page.find(start) + start.size();
  return page.substr(from, page.find("</script>", from) - from);
}

TEST(View, TheCommuteIsThePageInTheDocumentation) {
  const ToolRun run = runTool({"view", "--class-names", kClassNames, "commute.jsonl"});
  EXPECT_EQ(run.status, 0);
  EXPECT_TRUE(run.out == contentOf(EXAMPLES_FOLDER "/../docs/commute.html"))
      << "senseloom view --class-names '" << kClassNames << "' examples/commute.jsonl -o docs/commute.html";
}

TEST(View, APageNeedsNothingButItself) {
  const std::string page = pageOf(kNoRecords);
  for (const char* foreign : {"http:", "https:", " src=", "@import", "url(", "fetch(", "XMLHttpRequest", "<link"}) {
    EXPECT_EQ(page.find(foreign), std::string::npos) << foreign;
  }
  EXPECT_NE(page.find("default-src 'none'; script-src 'sha256-"), std::string::npos);
}

TEST(View, TextsOfATraceAreNoMarkup) {
  const std::string page = pageOf(R"({"call":"open","session":"</script><b>","sensor":"STAP"}
{"call":"set_option","session":"</script><b>","option":"<!--</style>"}
)",
                                  {"--class-names", "<i>,<u>"});
  EXPECT_EQ(placesOf("</script", page), placesOf("</script", pageOf(kNoRecords)));
  for (const char* markup : {"<b>", "<!--", "<i>", "<u>"}) EXPECT_EQ(page.find(markup), std::string::npos) << markup;
  EXPECT_NE(summaryOf(page).find(R"("name":"\u003c/script>\u003cb>")"), std::string::npos) << summaryOf(page);
}

TEST(View, ShowsOptionsThatAreNotUtf8) {
  const std::string summary = summaryOf(pageOf(R"({"call":"open","session":"a","sensor":"STAP"}
{"call":"set_option","session":"a","optionHex":"7bffc3a4"}
)"));
  EXPECT_NE(summary.find(R"("says":"sets {\\xff\\xc3\\xa4")"), std::string::npos) << summary;
}

// A recording has a line for each session that a record went to.
TEST(View, JoinsARecordThatGoesToOneSessionAfterTheOther) {
  const std::string summary = summaryOf(pageOf(R"({"call":"open","session":"s1","sensor":"STAP"}
{"call":"open","session":"s2","sensor":"STAP"}
{"call":"dispatch","session":"s1","record":{"timestamp":1,"classes":1}}
{"call":"dispatch","session":"s2","record":{"timestamp":1,"classes":1}}
{"call":"dispatch","session":"s2","record":{"timestamp":1,"classes":1}}
{"call":"dispatch","session":"s1","record":{"timestamp":2,"classes":1}}
)"));
  EXPECT_NE(summary.find(R"("calls":6,"records":3,)"), std::string::npos) << summary;
  EXPECT_NE(summary.find(R"("audiences":[[0,1],[1],[0]])"), std::string::npos) << summary;
}

TEST(View, ShowsTheCallsThatAreWanted) {
  const std::string trace = R"({"call":"open","session":"s1","sensor":"STAP"}
{"call":"open","session":"s2","sensor":"STAP"}
{"call":"set_option","session":"s1","option":{}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":1000,"classes":1}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":9000,"classes":1}}
)";
  const std::string ofSession = summaryOf(pageOf(trace, {"--session", "s2"}));
  EXPECT_NE(ofSession.find(R"("calls":3,"records":2,)"), std::string::npos) << ofSession;
  EXPECT_EQ(ofSession.find(R"("name":"s1")"), std::string::npos) << ofSession;
  const std::string ofTime = summaryOf(pageOf(trace, {"--from", "8s", "--time-unit", "ms"}));
  EXPECT_NE(ofTime.find(R"("calls":1,"records":1,)"), std::string::npos) << ofTime;
  EXPECT_NE(ofTime.find(R"("firstTimestamp":"9000")"), std::string::npos) << ofTime;
}

TEST(View, TakesItsReasonsFromExplain) {
  const std::string summary = summaryOf(pageOf(contentOf(EXAMPLES_FOLDER "/tapping.jsonl")));
  const std::string explained = runTool({"explain", "--records", "tapping.jsonl"}).out;
  size_t compared = 0;
  for (const char* words : {"class not wanted: bits ", "bitwise or", "the bad \\\"level\\\" sets"}) {
    EXPECT_NE(summary.find(words), std::string::npos) << words;
    std::string plain = words;
    std::erase(plain, '\\');
    EXPECT_NE(explained.find(plain), std::string::npos) << words;
    ++compared;
  }
  EXPECT_EQ(compared, 3U);
}

TEST(View, ManyRecordsTakeFewBytesEach) {
  constexpr size_t kRecords = 20000;
  const std::string trace = runTool({"generate", "commute", "--seed", "5", "--records", std::to_string(kRecords)}).out;
  EXPECT_LT(pageOf(trace).size() - pageOf(kNoRecords).size(), 20 * kRecords);
}

class ViewIntoFile : public testing::Test {
 protected:
  ~ViewIntoFile() override { std::remove(file.name.c_str()); }
  const ScratchFile file{"page"};
};

TEST_F(ViewIntoFile, WritesThePage) {
  EXPECT_EQ(runTool({"view", "lift.jsonl", "-o", file.name}).out, "");
  EXPECT_TRUE(contentOf(file.name) == runTool({"view", "lift.jsonl"}).out);
}

TEST_F(ViewIntoFile, NeverReplacesTheTrace) {
  std::ofstream(file.name) << R"({"call":"open","session":"a","sensor":"STAP"})";
  const ToolRun run = runTool({"view", file.name, "-o", file.name});
  EXPECT_EQ(run.err, "senseloom: " + file.name + ": is the input, which would be lost\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(contentOf(file.name), R"({"call":"open","session":"a","sensor":"STAP"})");
}

TEST_F(ViewIntoFile, KeepsWhatThereIsWhenTheTraceStopsShort) {
  std::ofstream(file.name) << "as it was";
  const ToolRun run = runTool({"view", "-", "-o", file.name}, "stop\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(contentOf(file.name), "as it was");
}

TEST(View, NamesAFileThatCannotBeWritten) {
  const ToolRun run = runTool({"view", "lift.jsonl", "-o", "/dev/full"});
  EXPECT_EQ(run.err, "senseloom: /dev/full: cannot be written: No space left on device\n");
  EXPECT_EQ(run.status, 1);
}

}  // namespace
}  // namespace senseloom::tool
