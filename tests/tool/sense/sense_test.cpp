#include <gtest/gtest.h>

#include <cmath>
#include <cstdlib>
#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include "recording.h"
#include "run_tool.h"

namespace senseloom::tool {
namespace {

constexpr char kHeading[] = "t_ms,ax_mm_s2,ay_mm_s2,az_mm_s2\n";

std::string row(int time, int az) {
  return std::to_string(time) + ",0,0," + std::to_string(az) + "\n";
}

// A phone that swings twice a second, in mm/s².
int swing(int milliseconds) {
  return 9807 + static_cast<int>(std::lround(2000 * std::sin(milliseconds * 2 * 2 * 3.14159265 / 1000)));
}

std::string rows(int from, int to, int interval) {
  std::string text;
  for (int time = from; time < to; time += interval) text += row(time, swing(time));
  return text;
}

ToolRun sense(const std::string& table, std::vector<std::string> more = {"--session", "a=PHYAC"},
              const std::string& file = "-") {
  more.insert(more.begin(), {"sense", file});
  return runTool(more, table);
}

size_t linesWith(const std::string& text, const std::string& part) {
  size_t count = 0;
  for (size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1)) ++count;
  return count;
}

constexpr char kStart[] =
    R"({"note":"sensed from -","timeUnit":"ms","classNames":["unknown","still","on foot","running"]}
{"call":"open","session":"a","sensor":"PHYAC"}
{"call":"set_option","session":"a","option":{}}
)";

TEST(Sense, WritesTheCallsAsATrace) {
  const ToolRun run = sense(kHeading + rows(0, 2'900, 20));
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.out,
            std::string(kStart) +
                R"({"call":"dispatch","sensor":"PHYAC","record":{"timestamp":2560,"items":[{"class":2,"seq":0}]}}
{"call":"dispatch","sensor":"PHYAC","record":{"timestamp":2880,"items":[{"class":2,"seq":1}]}}
{"call":"close","session":"a"}
)");
  EXPECT_EQ(run.status, 0);
}

TEST(Sense, PassesLabelsOnAsTheTruthOfTheClassThatTheyMean) {
  std::string table = "class,t_ms,ax_mm_s2,ay_mm_s2,az_mm_s2\n";
  for (int time = 0; time < 3'300; time += 20) table += (time < 2'700 ? "5," : "0,") + row(time, swing(time));
  const std::string out = sense(table).out;
  EXPECT_NE(out.find(R"("timestamp":2560,"items":[{"class":2,"seq":0}]},"truth":2})"), std::string::npos);
  EXPECT_NE(out.find(R"("timestamp":2880,"items":[{"class":2,"seq":1}]}})"), std::string::npos);
  EXPECT_NE(sense(table, {"--session", "a=PHYAC", "--labels", "5=9"}).out.find(R"("truth":9)"), std::string::npos);
}

TEST(Sense, ConfiguresTheHubByWhatAllClientsAskFor) {
  // Clients with batches of 4 and of 8: four decisions a record.
  const ToolRun run = sense(kHeading + rows(0, 6'000, 20),
                            {"--session", R"(a=PHYAC:{"logN":2})", "--session", R"(b=PHYAC:{"logN":3})"});
  EXPECT_EQ(linesWith(run.out, "dispatch"), 2U);
  EXPECT_EQ(linesWith(run.out, R"("seq")"), 8U);
}

TEST(Sense, ChangesAndClosesSessionsAtTheirTimes) {
  const ToolRun run =
      sense(kHeading + rows(10'000, 20'000, 20), {"--session", "a=PHYAC", "--session", "b=PHYAC:{\"logN\":1}", "--at",
                                                  "8s", "b", "close", "--at", "3000ms", "a", R"({"logN":1})"});
  const size_t change = run.out.find(R"({"call":"set_option","session":"a","option":{"logN":1}})");
  const size_t close = run.out.find(R"({"call":"close","session":"b"})");
  ASSERT_NE(change, std::string::npos);
  ASSERT_NE(close, std::string::npos);
  EXPECT_LT(run.out.find(R"("timestamp":12880)"), change);
  EXPECT_LT(change, run.out.find(R"("timestamp":13520)"));
  EXPECT_LT(run.out.find(R"("timestamp":17360)"), close);
  EXPECT_LT(close, run.out.find(R"("timestamp":18640)"));
}

TEST(Sense, WritesATraceThatOtherCommandsTake) {
  const ScratchFile trace("sensed_trace");
  const ScratchFile picture("sensed_picture");
  const ToolRun run = sense(kHeading + rows(0, 8'000, 20),
                            {"--session", "a=PHYAC", "--session", "b=SCOUN", "-o", trace.name, "--plot", picture.name});
  EXPECT_EQ(run.status, 0);
  EXPECT_EQ(run.out, "");
  EXPECT_NE(contentOf(picture.name).find("<svg"), std::string::npos);
  const ToolRun replayed = runTool({"replay", "--quiet", trace.name});
  EXPECT_EQ(replayed.status, 0);
  EXPECT_NE(replayed.out.find("SCOUN"), std::string::npos);
  const ToolRun explained = runTool({"explain", trace.name});
  EXPECT_EQ(explained.status, 0);
  EXPECT_EQ(explained.out.find("unexplained"), std::string::npos);
}

TEST(Sense, ReadsOtherUnitsColumnsAndSeparators) {
  const std::string expected = sense(kHeading + rows(0, 6'000, 20)).out;
  std::string table = "\xEF\xBB\xBF\"seconds\";az_m_s2;\"x\";ay_m_s2\r\n";
  for (int time = 0; time < 6'000; time += 20) {
    table += std::to_string(time / 1000) + '.' + std::to_string(1000 + time % 1000).substr(1) + ';' +
             std::to_string(swing(time) / 1000) + '.' + std::to_string(1000 + swing(time) % 1000).substr(1) +
             ";0;-0.0\r\n";
  }
  const ToolRun run = sense(table, {"--session", "a=PHYAC", "--units", "si", "--columns", "time=seconds,ax=x"});
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.out, expected);
}

TEST(Sense, ReadsCompressedFiles) {
  const ScratchFile plain("sensed_plain");
  const std::string table = kHeading + rows(0, 6'000, 20);
  std::ofstream(plain.name) << table;
  const ScratchFile compressed("sensed_compressed");
  ASSERT_EQ(std::system(("gzip -c '" + plain.name + "' >'" + compressed.name + "'").c_str()), 0);
  const auto withoutNote = [](const ToolRun& run) { return run.out.substr(run.out.find('\n')); };
  const std::string expected = withoutNote(sense(table));
  EXPECT_EQ(withoutNote(sense("", {"--session", "a=PHYAC"}, plain.name)), expected);
  EXPECT_EQ(withoutNote(sense("", {"--session", "a=PHYAC"}, compressed.name)), expected);
  EXPECT_EQ(withoutNote(sense(contentOf(compressed.name))), expected);
}

TEST(Sense, PutsRecordingsOneBehindTheOtherWithAGapOfASecond) {
  const ScratchFile first("sensed_first");
  std::ofstream(first.name) << kHeading + rows(0, 2'600, 20);
  const ToolRun run = runTool({"sense", first.name, "-", "--session", "a=PHYAC"}, kHeading + rows(7'000, 9'800, 20));
  EXPECT_EQ(linesWith(run.out, "dispatch"), 2U);
  EXPECT_NE(run.out.find(R"("timestamp":2560)"), std::string::npos);
  EXPECT_NE(run.out.find(R"("timestamp":6140)"), std::string::npos);
  EXPECT_EQ(run.err, "");
}

TEST(Sense, TakesATableOfSeveralRecordingsApart) {
  std::string table = "walk," + std::string(kHeading);
  for (const std::string walk : {"a", "b"}) {
    for (int time = 0; time < 2'700; time += 20) table += walk + ',' + row(time, swing(time));
  }
  const std::string out = sense(table, {"--session", "a=PHYAC", "--columns", "recording=walk"}).out;
  EXPECT_EQ(linesWith(out, "dispatch"), 2U);
  EXPECT_NE(out.find(R"("timestamp":6240)"), std::string::npos) << out;  // 2.56 s behind 2.68 s and a gap of 1 s
  // Drawings have such a column. Each ends with its recording.
  const std::string drawings = sense("", {"--session", "a=GSPX"}, "../data/digits/digit_7.csv.gz").out;
  EXPECT_GE(linesWith(drawings, "dispatch"), 28U);
  EXPECT_LE(linesWith(drawings, "dispatch"), 36U);
}

TEST(Sense, SaysWhatItMended) {
  const std::string name = "senseloom: standard input: ";
  EXPECT_EQ(sense(kHeading + row(0, 0) + row(20, 0) + rows(40, 3'000, 20)).err,
            name + "2 rows of zeros are left out\n");
  EXPECT_EQ(sense(kHeading + rows(0, 2'000, 20) + row(2'020, 9'807) + row(2'000, 9'807) + row(2'000, 9'807) +
                  rows(2'040, 3'000, 20))
                .err,
            name + "2 rows out of order are put in order\n");
  EXPECT_EQ(sense(kHeading + rows(0, 2'000, 20) + rows(1'980, 3'000, 20)).err,
            name + "1 row with the time of another is left out\n");
  EXPECT_EQ(sense(kHeading + rows(0, 3'000, 5)).err, name + "200.0 samples a second become 50\n");
  EXPECT_EQ(sense(kHeading + rows(0, 3'000, 20) + rows(5'000, 6'000, 20)).err,
            name + "1 gap of up to 2.0 s: sensing starts over behind it\n");
}

TEST(Sense, DecidesTheSameAtEveryRate) {
  for (const int interval : {5, 10, 25, 40, 50}) {
    const std::string out =
        sense(kHeading + rows(0, 20'000, interval), {"--session", "a=PHYAC", "--session", "b=SCOUN"}).out;
    EXPECT_EQ(linesWith(out, R"("class":2)"), 55U) << interval;
    EXPECT_GE(linesWith(out, R"("steps")"), 37U) << interval;
    EXPECT_LE(linesWith(out, R"("steps")"), 40U) << interval;
  }
}

TEST(Sense, RefusesWhatIsNoRecording) {
  const struct {
    std::string table;
    std::string message;
  } cases[] = {
      {"", "standard input: holds no recording"},
      {kHeading, "standard input:1: holds a heading, but no samples"},
      {"t_ms,ax_mm_s2,az_mm_s2\n0,1,2\n", "standard input:1: no column \"ay_mm_s2\"; --columns says which is which"},
      {kHeading + row(0, 1) + "20,0,nan,3\n", "standard input:3: column \"ay_mm_s2\": \"nan\" is not a number"},
      {kHeading + row(0, 1) + "20,,0,3\n", "standard input:3: column \"ax_mm_s2\": \"\" is not a number"},
      {kHeading + row(0, 1) + "20,1,2\n", "standard input:3: 3 cells in a table of 4"},
      {kHeading + row(0, 1) + "20,1e7,2,3\n",
       "standard input:3: column \"ax_mm_s2\": \"1e7\" is more than a phone senses: see --units"},
      {kHeading + row(-1, 1), "standard input:2: column \"t_ms\" is negative"},
      {kHeading + row(7, 9'807), "standard input:2: column \"t_ms\": a single sample is no recording"},
      {kHeading + row(0, 0) + row(20, 0),
       "standard input:2: column \"ax_mm_s2\" is 0 from here on, and so are those of the other axes"},
      {kHeading + rows(0, 3'000, 100),
       "standard input:3: column \"t_ms\": 10.0 samples a second, and at least 20 are needed"},
      {kHeading + rows(0, 3'000, 20) + row(1'000, 1),
       "standard input:152: column \"t_ms\": 2.0 s before a row further up"},
  };
  for (const auto& [table, message] : cases) {
    const ToolRun run = sense(table);
    EXPECT_EQ(run.err, "senseloom: " + message + '\n');
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.status, 2);
  }
}

TEST(Sense, RefusesARecordingWithoutTheRatesThatASensorTakes) {
  EXPECT_EQ(sense(kHeading + rows(0, 3'000, 20), {"--session", "a=GSPX"}).err,
            "senseloom: standard input:1: no column \"gx_mrad_s\": a sensor that is asked for takes angular rates; "
            "--columns says which is which\n");
  std::string zeros = "t_ms,ax_mm_s2,ay_mm_s2,az_mm_s2,gx_mrad_s,gy_mrad_s,gz_mrad_s\n";
  for (int time = 0; time < 1'000; time += 20) zeros += std::to_string(time) + ",0,0,9807,0,0,0\n";
  const ToolRun run = sense(zeros, {"--session", "a=GSPX"});
  EXPECT_EQ(
      run.err,
      "senseloom: standard input:2: column \"gx_mrad_s\" is 0 from here on, and so are those of the other axes\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(sense(zeros, {"--session", "a=PHYAC"}).status, 0);
}

TEST(Sense, RefusesWhatCannotBeAskedFor) {
  const std::string table = kHeading + rows(0, 3'000, 20);
  const struct {
    std::vector<std::string> arguments;
    std::string message;
  } cases[] = {
      {{"--session", "tap=STAP"},
       "the hub cannot sense STAP: taps last a few milliseconds, less than lies between two samples"},
      {{"--session", "a=NONE"}, "unknown sensor \"NONE\": the nearest is \"STAP\"; `senseloom sensors` prints all"},
      {{"--session", "PHYAC"}, "--session PHYAC: must be NAME=SENSOR or NAME=SENSOR:OPTION"},
      {{"--session", "a=PHYAC", "--session", "a=SCOUN"}, "session \"a\" is already open"},
      {{"--session", "a=PHYAC:{"}, "the library refuses the option of session \"a\": {"},
      {{"--session", "a=PHYAC", "--at", "1s", "b", "{}"}, "--at: no --session is called \"b\""},
      {{"--session", "a=PHYAC", "--at", "1h", "a", "{}"}, "unknown time unit \"h\": s, ms, us and ns are known"},
      {{"--session", "a=PHYAC", "--at", "9s", "a", "{}"}, "--at: the recording ends before the time for \"a\""},
      {{"--session", "a=PHYAC", "--columns", "x=ax"},
       "--columns x=ax: must be some of "
       "time=NAME,ax=NAME,ay=NAME,az=NAME,gx=NAME,gy=NAME,gz=NAME,pressure=NAME,class=NAME,recording=NAME"},
      {{"--session", "a=PHYAC", "--units", "feet"}, "unknown units \"feet\": mm and si are known"},
      {{"--session", "a=PHYAC", "--labels", "5"}, "--labels 5: must be as in 4=1,5=2,7=2"},
  };
  for (const auto& [arguments, message] : cases) {
    const ToolRun run = sense(table, arguments);
    EXPECT_EQ(run.err, "senseloom: " + message + '\n');
    EXPECT_EQ(run.status, 2);
  }
  EXPECT_EQ(runTool({"sense", "/no/such/file", "--session", "a=PHYAC"}).err,
            "senseloom: /no/such/file: No such file or directory\n");
}

TEST(Sense, HandsATemplateToAClientThatGivesItBackToMatch) {
  const std::string drawing = "../data/demo/digit_3.csv.gz";
  const std::string enrolled = sense("", {"--session", R"(pen=DTWGS:{"mode":1,"classMask":1})"}, drawing).out;
  const std::string hex = R"("record":{"hex":")";
  const size_t record = enrolled.find(hex);
  ASSERT_NE(record, std::string::npos) << enrolled;
  const size_t text = record + hex.size() + 20;  // behind the timestamp and the classes
  const std::string given = enrolled.substr(text, enrolled.find('"', text) - text);
  EXPECT_EQ(given.substr(0, 4), "0090");
  EXPECT_EQ(given.size(), 4U + 2 * 144);

  const std::string option = R"({"mode":4,"classMask":3,"level":0,"template2":")" + given + "\"}";
  const std::string matched = sense("", {"--session", "pen=DTWGS:" + option}, drawing).out;
  EXPECT_NE(matched.find("0200\"}"), std::string::npos) << matched;
  const std::string walk =
      sense("", {"--session", "pen=DTWGS:" + option}, "../data/activity/continuous_09_person5.csv.gz").out;
  EXPECT_EQ(walk.find("dispatch"), std::string::npos);
  EXPECT_EQ(sense("", {"--session", R"(pen=DTWGS:{"mode":4,"classMask":1,"template1":"000101"})"}, drawing).err,
            "senseloom: ../data/demo/digit_3.csv.gz: 52.6 samples a second become 50\n"
            "senseloom: session \"pen\": the template is not one that the hub enrolled\n");
}

TEST(Sense, WalksForClientsOfDeadReckoning) {
  const ToolRun run = sense(
      "",
      {"--session", R"(way=PDR:{"userHeight":180,"floorHeight":300,"initX":0,"initY":0,"initFloor":1,"6DOF":1,"N":3})"},
      "../data/activity/continuous_09_person5.csv.gz");
  EXPECT_GE(linesWith(run.out, R"({"call":"dispatch","sensor":"PDR","record":{"timestamp":)"), 100U);
  EXPECT_EQ(run.status, 0);
}

// The same file for both word sizes: they decide the same.
TEST(Sense, MakesTheTraceAndThePictureOfTheDemo) {
  const ScratchFile picture("sensed_demo");
  const ToolRun run =
      runTool({"sense", "../data/activity/continuous_09_person5.csv.gz", "../data/demo/digit_3.csv.gz", "--session",
               R"(nav=PHYAC:{"mode":1,"logN":3,"weightVar":2})", "--session", R"(fitness=SCOUN:{"mode":0,"logN":1})",
               "--session", "dial=GSPX", "--plot", picture.name, "--class-names", "unknown,still,on foot,3"});
  EXPECT_EQ(run.err, "senseloom: ../data/demo/digit_3.csv.gz: 52.6 samples a second become 50\n");
  EXPECT_TRUE(run.out == contentOf(GOLDEN_FOLDER "/sense/demo.jsonl"));
  EXPECT_TRUE(contentOf(picture.name) == contentOf(EXAMPLES_FOLDER "/../docs/stairs.svg"));
}

TEST(Sense, WritesOverNoRecording) {
  const ScratchFile recording("sensed_recording");
  const std::string table = kHeading + rows(0, 3'000, 20);
  std::ofstream(recording.name) << table;
  const std::pair<std::string, std::string> refusals[] = {{"-o", "holds something already"},
                                                          {"--plot", "is the input, which would be lost"}};
  for (const auto& [option, refusal] : refusals) {
    const ToolRun run = sense("", {"--session", "a=PHYAC", option, recording.name}, recording.name);
    EXPECT_EQ(run.err, "senseloom: " + recording.name + ": " + refusal + '\n');
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(contentOf(recording.name), table);
  }
}

}  // namespace
}  // namespace senseloom::tool
