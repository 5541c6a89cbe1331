#include <gtest/gtest.h>

#include <fstream>
#include <regex>
#include <string>
#include <vector>

#include "recording.h"

namespace senseloom::tool {
namespace {

// The calls of a recording that gave a property list or released one, each with the list.
std::string listsIn(const std::string& file) {
  static const std::regex kCall(R"re("call":"(\w+)"[^\n]*"list":([^,}]+))re");
  const std::string content = contentOf(file);
  std::string found;
  for (std::sregex_iterator call(content.begin(), content.end(), kCall), end; call != end; ++call) {
    found += (*call)[1].str() + ' ' + (*call)[2].str() + '\n';
  }
  return found;
}

bool hasLine(const std::string& text, const std::string& line) {
  return text.find(line + '\n') != std::string::npos;
}

TEST(RecordedLists, HaveANumberThatTheirReleaseNamesInItsPlace) {
  const ScratchFile trace("lists");
  recordDriven(
      trace.name,
      "open a STAP\nopen b STAP\nkeep a {}\nkeep b {}\nkeep a [\ndrop 2\ndrop 0\ndrop 9\nset a {}\nclose b\nclose a\n");
  EXPECT_EQ(listsIn(trace.name),
            "set_option 1\nset_option 2\nrelease 2\nrelease null\nrelease \"unknown\"\nset_option 3\nrelease 3\n"
            "close 4\nrelease 4\nrelease null\n");
  EXPECT_TRUE(std::regex_search(contentOf(trace.name),
                                std::regex(R"re(\n\{"call":"release","list":2,"atUs":\d+,"thread":\d+\}\n)re")));
  const ToolRun info = runTool({"info", trace.name});
  EXPECT_TRUE(hasLine(info.out, "lists: 4 given, 3 released")) << info.out;
  EXPECT_TRUE(hasLine(info.out, "leak: list 1, given to session \"s1\" by set_option on line 4, is never released"))
      << info.out;
  EXPECT_TRUE(hasLine(info.out, trace.name + ":9: a list is released that no recorded call gave")) << info.out;
  const ToolRun checked = check(trace.name);
  EXPECT_EQ(checked.out, "8 calls compared, all as recorded\n") << checked.err;
}

TEST(RecordedLists, AreAllReleasedByTheToolItself) {
  const ScratchFile trace("tool_lists");
  recordTo(trace.name, {TOOL_FILE, "replay", "--quiet", "commute.jsonl"});
  const std::string told = runTool({"info", trace.name}).out;
  EXPECT_TRUE(std::regex_search(told, std::regex("\nlists: ([1-9]\\d*) given, \\1 released\n"))) << told;
  EXPECT_EQ(told.find("leak"), std::string::npos) << told;
}

TEST(RecordedLists, AreKnownAfterACallThatAnotherThreadDisturbed) {
  const ScratchFile trace("raced_lists");
  recordDriven(trace.name, "open a PHYAC\nrace a {}\n");
  EXPECT_EQ(listsIn(trace.name), "set_option 1\nrelease 1\n");
}

TEST(RecordedLists, ThatAreReleasedTwiceAreNamedTwice) {
#ifdef SANITIZED
  GTEST_SKIP() << "the sanitizer ends the program in its own way";
#endif
  const ScratchFile trace("twice");
  recordDriven(trace.name, "open a LIFT\nrelease a {}\n");
  EXPECT_EQ(listsIn(trace.name), "set_option 1\nrelease 1\nrelease 1\n");
  EXPECT_TRUE(hasLine(runTool({"info", trace.name}).out, trace.name + ":6: list 1 is released once more"));
}

TEST(RecordedLists, OfTheParentAreKnownInAChild) {
  const ScratchFolder folder("forked_lists");
  recordDriven(folder.file("%p"), "open a LIFT\nkeep a {}\nfork\nkeep a {}\ndrop 1\n", {"--follow-forks"});
  std::string all;
  for (const std::string& file : folder.files()) all += listsIn(folder.file(file)) + '-';
  EXPECT_TRUE(all == "set_option 1\n-set_option 2\nrelease 1\n-" || all == "set_option 2\nrelease 1\n-set_option 1\n-")
      << all;
}

// The tool counts the calls itself where the program did not come to its end.
TEST(RecordedLists, AreNotCountedAsCallsWhenTheyAreReleased) {
  for (const char* extension : {"", ".gz"}) {
    const ScratchFile trace("killed" + std::string(extension));
    const std::string file = trace.name + extension;
    recordDriven(file, "open a LIFT\nset a {}\nset a {}\nsignal 9\n");
    const ToolRun info = runTool({"info", file});
    EXPECT_EQ(info.out.find("the recording ended with"), std::string::npos) << info.out;
    EXPECT_TRUE(hasLine(info.out, "lists: 2 given, 2 released")) << info.out;
    std::remove(file.c_str());
  }
}

// A replay has nothing to release: it copies each list and is done with it.
TEST(RecordedLists, AreNothingForAReplayHoweverTheyAreReleased) {
  const std::string trace = R"({"call":"open","session":"a","sensor":"PHYAC"}
{"call":"set_option","session":"a","option":{"logN":1},"list":1}
{"call":"dispatch","session":"a","record":{"timestamp":7,"items":[{"class":1,"seq":1}]}}
{"call":"close","session":"a","returned":0}
)";
  std::string releases;
  for (const char* list : {"1", "1", "2", "null", "\"unknown\""}) {
    releases += R"({"call":"release","list":)" + std::string(list) + "}\n";
  }
  for (const std::vector<std::string>& command : {std::vector<std::string>{"replay", "--json", "-"},
                                                  {"replay", "--check", "-"},
                                                  {"explain", "--json", "-"},
                                                  {"convert", "--to", "csv", "-"},
                                                  {"convert", "--to", "perfetto", "-"},
                                                  {"view", "-"},
                                                  {"sweep", "--session", "a", "--set", "logN=1,2", "-"}}) {
    const ToolRun without = runTool(command, trace);
    const ToolRun with = runTool(command, trace + releases);
    EXPECT_EQ(with.out, without.out) << command[0];
    EXPECT_EQ(with.err, without.err) << command[0];
    EXPECT_EQ(with.status, 0) << command[0] << with.err;
  }
  const ScratchFile file("released");
  std::ofstream(file.name) << trace + releases;
  EXPECT_EQ(runTool({"diff", file.name, "-"}, trace).status, 0);
}

}  // namespace
}  // namespace senseloom::tool
