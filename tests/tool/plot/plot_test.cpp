#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <string>

#include "recording.h"

namespace senseloom::tool {
namespace {

class PlotOf : public testing::Test {
 protected:
  ~PlotOf() override { std::remove(file.c_str()); }

  std::string plot(const std::string& trace, const std::vector<std::string>& more = {}) {
    std::vector<std::string> arguments{"replay", "--quiet", "--plot", file, "-"};
    arguments.insert(arguments.end(), more.begin(), more.end());
    const ToolRun run = runTool(arguments, trace);
    EXPECT_EQ(run.err, trace.empty() ? "senseloom: standard input: the trace is empty: there is no call in it\n" : "");
    EXPECT_EQ(run.status, 0);
    return contentOf(file);
  }

  const std::string file = testing::TempDir() + "plot_" + std::to_string(getpid()) + ".svg";
};

size_t countOf(const std::string& part, const std::string& text) {
  size_t count = 0;
  for (size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1)) ++count;
  return count;
}

TEST_F(PlotOf, TheCommuteIsThePictureInTheDocumentation) {
  const ToolRun run = runTool({"replay", "--quiet", "--plot", file, "--class-names",
                               "unknown,sitting,walking,running,cycling,riding,no majority", "commute.jsonl"});
  EXPECT_EQ(run.status, 0);
  EXPECT_TRUE(contentOf(file) == contentOf(EXAMPLES_FOLDER "/../docs/commute.svg"));
  EXPECT_EQ(runTool({"explain", "--plot", file, "commute.jsonl"}).status, 0);
  EXPECT_NE(contentOf(file).find(">class 2</text>"), std::string::npos);
}

TEST_F(PlotOf, ATraceNeedsNothingButItself) {
  const std::string svg = contentOf(EXAMPLES_FOLDER "/../docs/commute.svg");
  for (const char* foreign : {"<script", "href", "url(", "@import", "<image", "<foreignObject"}) {
    EXPECT_EQ(svg.find(foreign), std::string::npos) << foreign;
  }
  EXPECT_EQ(countOf("http", svg), 1U);  // the namespace
  EXPECT_NE(svg.find("@media (prefers-color-scheme:dark)"), std::string::npos);
  EXPECT_NE(svg.find("<rect class=\"back\" width=\"100%\" height=\"100%\"/>"), std::string::npos);
}

constexpr char kTaps[] = R"({"call":"open","session":"lock","sensor":"STAP"}
{"call":"set_option","session":"lock","option":{"classMask":1}}
{"call":"open","session":"<&>","sensor":"STAP"}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":0,"classes":1}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":10,"classes":2}}
{"call":"set_option","session":"lock","option":"{"}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":20,"classes":2}}
{"call":"dispatch","session":"lock","record":{"timestamp":30,"classes":1}}
)";

TEST_F(PlotOf, TapsHasALaneForTheRecordsAndOneAClient) {
  const std::string svg = plot(kTaps);
  EXPECT_NE(svg.find(">lock</text>\n<text x=\"20\" y=\"168\" class=\"quiet small\">2 of 4</text>"), std::string::npos)
      << svg;
  EXPECT_NE(svg.find(">&lt;&amp;&gt;</text>"), std::string::npos);
  EXPECT_NE(svg.find(">classMask 1</text>"), std::string::npos);
  EXPECT_NE(svg.find(">refused: {</text>"), std::string::npos);
  // 906 units for 0 to 40, and each tap 7 wide: the records of class 1 at 0 and 30, and those of class 2 at 10 and 20.
  EXPECT_NE(svg.find(R"(<path class="h1" d="M150 122H157V78H150zM829.5 122H836.5V78H829.5z"/>)"), std::string::npos);
  EXPECT_NE(svg.find(R"(<path class="h2" d="M376.5 122H383.5V78H376.5zM603 122H610V78H603z"/>)"), std::string::npos);
}

TEST_F(PlotOf, ActivityMergesRunsOfOneClass) {
  std::string trace = R"({"call":"open","session":"a","sensor":"PHYAC"})"
                      "\n";
  for (int i = 0; i < 10; ++i) {
    trace.append(R"({"call":"dispatch","sensor":"PHYAC","record":{"timestamp":)").append(std::to_string(i));
    trace.append(R"(,"items":[{"class":)").append(i < 5 ? "1" : "2").append(R"(,"seq":0}]}})").append("\n");
  }
  const std::string svg = plot(trace);
  // 0 to 10: class 1 to 5, then class 2.
  EXPECT_NE(svg.find(R"(<path class="h1" d="M150 122H603V78H150z"/>)"), std::string::npos) << svg;
  EXPECT_NE(svg.find(R"(<path class="h2" d="M603 122H1056V78H603z"/>)"), std::string::npos) << svg;
}

TEST_F(PlotOf, ThousandsOfRecordsIsOfABoundedSize) {
  const std::string trace = runTool({"generate", "commute", "--seed", "5", "--records", "40000"}).out;
  EXPECT_GT(trace.size(), 4000000U);
  EXPECT_LT(plot(trace).size(), 300000U);
}

TEST_F(PlotOf, ManyClientsShowsTheFirst) {
  std::string trace;
  for (int i = 0; i < 30; ++i) {
    trace.append(R"({"call":"open","session":"client)").append(std::to_string(i)).append(R"(","sensor":"LIFT"})");
    trace.append("\n");
  }
  const std::string svg = plot(trace);
  EXPECT_NE(svg.find(">client23</text>"), std::string::npos);
  EXPECT_EQ(svg.find(">client24</text>"), std::string::npos);
  EXPECT_NE(svg.find(">more clients are not shown</text>"), std::string::npos);
}

TEST_F(PlotOf, AnEmptyTraceIsAPictureAllTheSame) {
  EXPECT_NE(plot("").find("</svg>"), std::string::npos);
}

TEST_F(PlotOf, EverySensorIsDrawn) {
  for (const char* name : {"tapping", "gesture_flick", "shaking", "instant_activity", "step_count", "gesture_hmm",
                           "dtwgs", "gesture_eartouch", "audio_classification", "pdr", "lift"}) {
    const ToolRun run = runTool({"explain", "--plot", file, std::string(name) + ".jsonl"}, "",
                                {{"SENSELOOM_GESTURE_SCRIPT", "gesture_hmm.script"}});
    EXPECT_EQ(run.status, 0);
    EXPECT_NE(contentOf(file).find("<g shape-rendering"), std::string::npos) << name;
  }
}

TEST_F(PlotOf, ATraceThatStopsShortIsNotDrawn) {
  std::ofstream(file) << "as it was";
  const ToolRun run = runTool({"replay", "--plot", file, "-"}, "stop\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(contentOf(file), "as it was");
}

TEST(PlotErrors, NameAFileThatCannotBeWritten) {
  for (const char* command : {"replay", "explain"}) {
    const ToolRun run = runTool({command, "lift.jsonl", "--plot", "/no-such-folder/x.svg"});
    EXPECT_EQ(run.err, "senseloom: /no-such-folder/x.svg: cannot be written: No such file or directory\n");
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.status, 1);
    const ToolRun full = runTool({command, "lift.jsonl", "--plot", "/dev/full"});
    EXPECT_EQ(full.err, "senseloom: /dev/full: cannot be written: No space left on device\n");
    EXPECT_EQ(full.status, 1);
  }
}

TEST(Plot, HasTheNamesOfClassesThatTheTraceHas) {
  const ScratchFile picture("named_classes");
  EXPECT_EQ(runTool({"replay", "-", "--plot", picture.name}, R"({"note":"classes","classNames":["none","raised"]}
{"call":"open","session":"a","sensor":"LIFT"}
{"call":"dispatch","session":"a","record":{"timestamp":1,"class":1}}
)")
                .status,
            0);
  EXPECT_NE(contentOf(picture.name).find(">raised<"), std::string::npos);
}

}  // namespace
}  // namespace senseloom::tool
