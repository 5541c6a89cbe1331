#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>

#include "recording.h"
#include "run_tool.h"

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
  const std::string names = "unknown,sitting,walking,running,cycling,riding,no majority";
  const std::string picture = contentOf(EXAMPLES_FOLDER "/../docs/commute.svg");
  EXPECT_EQ(runTool({"explain", "commute.jsonl", "--plot", file, "--class-names", names}).status, 0);
  EXPECT_TRUE(contentOf(file) == picture);
  EXPECT_NE(contentOf(EXAMPLES_FOLDER "/../README.md")
                .find("\n    senseloom explain examples/commute.jsonl --plot /tmp/commute.svg --class-names \"" +
                      names + "\"\n"),
            std::string::npos);
  EXPECT_EQ(runTool({"replay", "--quiet", "--plot", file, "--class-names", names, "commute.jsonl"}).status, 0);
  EXPECT_TRUE(contentOf(file) == picture);
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

std::string traceOfClients(int count) {
  std::string trace;
  for (int i = 0; i < count; ++i) {
    trace.append(R"({"call":"open","session":"client)").append(std::to_string(i)).append(R"(","sensor":"LIFT"})");
    trace.append("\n");
  }
  return trace;
}

TEST_F(PlotOf, ManyClientsShowsTheFirst) {
  const std::string svg = plot(traceOfClients(30));
  EXPECT_NE(svg.find(">client23</text>"), std::string::npos);
  EXPECT_EQ(svg.find(">client24</text>"), std::string::npos);
  EXPECT_NE(svg.find(">6 more clients are not shown: --session chooses</text>"), std::string::npos);
}

TEST_F(PlotOf, ChosenClientsShowsThese) {
  const std::string svg = plot(traceOfClients(30), {"--session", "client29", "--session", "client2"});
  EXPECT_NE(svg.find(">client29</text>"), std::string::npos);
  EXPECT_NE(svg.find(">client2</text>"), std::string::npos);
  EXPECT_EQ(countOf(">client", svg), 2U);
  const ToolRun explained = runTool({"explain", "--plot", file, "--session", "client29", "-"}, traceOfClients(30));
  EXPECT_NE(contentOf(file).find(">client29</text>"), std::string::npos) << explained.err;
  EXPECT_EQ(countOf(">client", contentOf(file)), 1U);
}

TEST_F(PlotOf, SeveralRequestsBeforeARecordShowsThemAll) {
  const std::string svg = plot(R"({"call":"open","session":"a","sensor":"STAP"}
{"call":"set_option","session":"a","option":{"classMask":1}}
{"call":"set_option","session":"a","option":{"classMask":2,"clasMask":3}}
{"call":"set_option","session":"a","option":"["}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":1000,"classes":1}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":3000,"classes":1}}
)");
  // One above the other, each with its mark: a diamond, or a cross.
  EXPECT_NE(svg.find(R"(<text x="159" y="175" class="note small">classMask 1</text>)"), std::string::npos) << svg;
  EXPECT_NE(svg.find(R"(<text x="159" y="157" class="note small">classMask 2, clasMask 3 (unknown key)</text>)"),
            std::string::npos);
  EXPECT_NE(svg.find(R"(<text x="159" y="139" class="note small">refused: [</text>)"), std::string::npos);
  EXPECT_NE(svg.find(R"(<path class="ask" d="M150 166l5 5-5 5-5-5zM150 148l5 5-5 5-5-5z"/>)"), std::string::npos);
  EXPECT_NE(svg.find(R"(<path class="no" d="M146 131l8 8m0-8l-8 8"/>)"), std::string::npos);
}

TEST_F(PlotOf, RecordsInTimeHasAnAxisInHoursMinutesAndSeconds) {
  const std::string svg = plot(R"({"note":"","timeUnit":"s"}
{"call":"open","session":"a","sensor":"LIFT"}
{"call":"dispatch","sensor":"LIFT","record":{"timestamp":3600,"class":1}}
{"call":"dispatch","sensor":"LIFT","record":{"timestamp":10800,"class":1}}
)");
  for (const char* mark : {">1:00:00</text>", ">2:00:00</text>", ">5:00:00</text>", ">time</text>"}) {
    EXPECT_NE(svg.find(mark), std::string::npos) << mark << svg;
  }
}

// A recording has a line for each session that a record went to.
TEST_F(PlotOf, ARecordingCountsEachRecordOnce) {
  const std::string svg = plot(R"({"call":"open","session":"s1","sensor":"LIFT"}
{"call":"open","session":"s2","sensor":"LIFT"}
{"call":"dispatch","session":"s1","record":{"timestamp":1,"class":1}}
{"call":"dispatch","session":"s2","record":{"timestamp":1,"class":1}}
)");
  EXPECT_NE(svg.find(">records</text>\n<text x=\"20\" y=\"112\" class=\"quiet small\">1</text>"), std::string::npos)
      << svg;
}

TEST_F(PlotOf, APictureNamedPngIsOneWhereItCanBeDrawn) {
  const std::string png = file + ".png";
  const ToolRun run = runTool({"replay", "--quiet", "--plot", png, "lift.jsonl"});
  if (run.status == 0) {
    EXPECT_EQ(contentOf(png).substr(0, 8), "\x89PNG\r\n\x1A\n");
    std::remove(png.c_str());
  } else {
    EXPECT_EQ(run.status, 2);
  }
  const ToolRun without = runTool({"replay", "--plot", png, "lift.jsonl"}, "", {{"PATH", "/nowhere"}});
  EXPECT_EQ(without.err, "senseloom: " + png +
                             ": takes the program rsvg-convert, which is not here (Debian's package librsvg2-bin); "
                             "write an .svg instead\n");
  EXPECT_EQ(without.status, 2);
  EXPECT_FALSE(std::filesystem::exists(png));
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

TEST(PlotErrors, KeepTheTrace) {
  const ScratchFile file("trace.jsonl");
  std::ofstream(file.name) << kTaps;
  const ToolRun run = runTool({"replay", "--plot", file.name, file.name});
  EXPECT_EQ(run.err, "senseloom: " + file.name + ": is the input, which would be lost\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(contentOf(file.name), kTaps);
}

}  // namespace
}  // namespace senseloom::tool
