#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include "recording.h"
#include "run_tool.h"

namespace senseloom::tool {
namespace {

ToolRun convert(const std::string& table, std::vector<std::string> more = {}) {
  more.insert(more.begin(), {"convert", "--from", "csv", "-"});
  return runTool(more, table);
}

constexpr char kNote[] = R"({"note":"decisions from a table","timeUnit":"ms"})"
                         "\n";

std::string dispatchOf(const std::string& sensor, const std::string& record) {
  return R"({"call":"dispatch","sensor":")" + sensor + R"(","record":)" + record + "}\n";
}

TEST(Convert, MakesARecordOfEachRow) {
  const ToolRun run = convert("when,who,did,really\n0,7,3,0\n1.2345,7,15,2\n1.2355,7,0,\"1\"\n",
                              {"--columns", "time=when,class=did,truth=really"});
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(
      run.out,
      kNote + dispatchOf("PHYAC", R"({"timestamp":0,"items":[{"class":3,"seq":0}]})") +
          R"({"call":"dispatch","sensor":"PHYAC","record":{"timestamp":1235,"items":[{"class":15,"seq":1}]},"truth":2}
{"call":"dispatch","sensor":"PHYAC","record":{"timestamp":1236,"items":[{"class":0,"seq":2}]},"truth":1}
)");
}

TEST(Convert, KnowsTheColumnsByTheirUsualNames) {
  EXPECT_EQ(convert("class,time\n2,1\n").out,
            kNote + dispatchOf("PHYAC", R"({"timestamp":1000,"items":[{"class":2,"seq":0}]})"));
}

TEST(Convert, ReadsACompressedTable) {
  const ScratchFile plain("plain_table");
  const ScratchFile compressed("compressed_table");
  std::ofstream(plain.name) << "time,class\n1,2\n";
  ASSERT_EQ(std::system(("gzip -c '" + plain.name + "' >'" + compressed.name + "'").c_str()), 0);
  EXPECT_EQ(runTool({"convert", "--from", "csv", compressed.name}).out,
            kNote + dispatchOf("PHYAC", R"({"timestamp":1000,"items":[{"class":2,"seq":0}]})"));
}

TEST(Convert, KeepsUnitsThatAreShorterThanMilliseconds) {
  EXPECT_EQ(convert("time,class\n5.7,2\n", {"--time-unit", "us"}).out,
            R"({"note":"decisions from a table","timeUnit":"us"})"
            "\n" +
                dispatchOf("PHYAC", R"({"timestamp":6,"items":[{"class":2,"seq":0}]})"));
}

TEST(Convert, MakesRecordsOfOtherSensors) {
  EXPECT_EQ(convert("time,class\n1,2\n", {"--sensor", "GSFLK"}).out,
            kNote + dispatchOf("GSFLK", R"({"timestamp":1000,"class":2})"));
  EXPECT_EQ(convert("time,class\n", {"--sensor", "SCOUN"}).err, "senseloom: a record of SCOUN is not a class alone\n");
}

TEST(Convert, StartsSequenceNumbersOverAtTheirEnd) {
  std::string table = "time,class\n";
  for (int i = 0; i < 2049; ++i) table += "1,2\n";
  const std::string out = convert(table).out;
  EXPECT_NE(out.find(R"("seq":2047}]}})"
                     "\n" +
                     dispatchOf("PHYAC", R"({"timestamp":1000,"items":[{"class":2,"seq":0}]})")),
            std::string::npos);
}

TEST(Convert, ReadsTablesOfOtherSystems) {
  EXPECT_EQ(convert("\xEF\xBB\xBFtime,\"class\"\r\n\r\n1,2\r\n").out,
            kNote + dispatchOf("PHYAC", R"({"timestamp":1000,"items":[{"class":2,"seq":0}]})"));
}

class ConvertToFolder : public testing::Test {
 protected:
  ~ConvertToFolder() override { std::filesystem::remove_all(folder.name); }

  ToolRun convertTo(const std::string& table) {
    return convert(table, {"--columns", "recording=walk", "-o", folder.name});
  }

  const ScratchFile folder{"converted"};
};

TEST_F(ConvertToFolder, MakesATraceOfEachRecording) {
  const ToolRun run = convertTo("walk,time,class\nb,9,1\nb,10,2\na-1,3,3\n");
  EXPECT_EQ(run.err + run.out, "");
  EXPECT_EQ(contentOf(folder.name + "/b.jsonl"),
            kNote + dispatchOf("PHYAC", R"({"timestamp":9000,"items":[{"class":1,"seq":0}]})") +
                dispatchOf("PHYAC", R"({"timestamp":10000,"items":[{"class":2,"seq":1}]})"));
  EXPECT_EQ(contentOf(folder.name + "/a-1.jsonl"),
            kNote + dispatchOf("PHYAC", R"({"timestamp":3000,"items":[{"class":3,"seq":0}]})"));
}

TEST_F(ConvertToFolder, LeavesTheFolderToNoName) {
  EXPECT_EQ(convertTo("walk,time,class\n../b,9,1\n").err,
            "senseloom: standard input:2: \"../b\" cannot name a file: only letters, digits, _ and - can\n");
  EXPECT_EQ(
      convertTo("walk,time,class\nb,9,1\na,9,1\nb,10,1\n").err,
      "senseloom: standard input:4: recording \"b\" has other rows further up, with another recording in between\n");
}

TEST_F(ConvertToFolder, LeavesNoTraceThatIsNotComplete) {
  EXPECT_EQ(convertTo("walk,time,class\na,1,1\nb,9,1\nb,8,1\n").status, 2);
  EXPECT_TRUE(std::filesystem::exists(folder.name + "/a.jsonl"));
  EXPECT_FALSE(std::filesystem::exists(folder.name + "/b.jsonl"));
}

TEST(Convert, NamesTheLineOfBadInput) {
  const auto errorOf = [](const std::string& table, const std::vector<std::string>& more = {}) {
    const ToolRun run = convert(table, more);
    EXPECT_EQ(run.status, 2);
    return run.err;
  };
  const std::string start = "senseloom: standard input:";
  EXPECT_EQ(errorOf(""), "senseloom: standard input: holds no table\n");
  EXPECT_EQ(errorOf("time,decision\n1,2\n"),
            start + "1: no column \"class\" among time, decision: --columns says which is which\n");
  EXPECT_EQ(errorOf("time,class\n1,2,3\n"), start + "2: 3 cells in a table of 2\n");
  EXPECT_EQ(errorOf("time,class\n2,1\n1,1\n"), start + "3: the time is before that of the row above\n");
  EXPECT_EQ(errorOf("time,class\n-2,1\n"), start + "2: \"-2\" is not a time: a number such as 12 or 3.84\n");
  EXPECT_EQ(errorOf("time,class\n2,walk\n"), start + "2: column \"class\": \"walk\" is not the number of a class\n");
  EXPECT_EQ(errorOf("time,class\n2,16\n"), start + "2: record field \"class\" must be an integer from 0 to 15\n");
  EXPECT_EQ(errorOf("time,class\n2,\"1\n"), start + "2: a double quote is not closed\n");
  EXPECT_EQ(errorOf("time,class\n", {"--columns", "time=time,when=x"}),
            "senseloom: --columns time=time,when=x: must be time=NAME,class=NAME,truth=NAME,recording=NAME, or some of "
            "these\n");
  EXPECT_EQ(errorOf("time,class\n", {"--columns", "recording=class"}),
            "senseloom: --columns recording=NAME and --output FOLDER go together: a trace for each recording\n");
  EXPECT_EQ(errorOf("time,class\n", {"--time-unit", "h"}),
            "senseloom: unknown time unit \"h\": s, ms, us and ns are known\n");
  EXPECT_EQ(runTool({"convert", "--from", "csv", "none.csv"}).err, "senseloom: none.csv: No such file or directory\n");
}

constexpr char kTaps[] = R"({"note":"","timeUnit":"us"}
{"call":"open","session":"a, \"b\"","sensor":"STAP"}
{"call":"set_option","session":"a, \"b\"","option":{"classMask":1}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":1500000,"classes":3}}
{"call":"dispatch","sensor":"STAP","record":{"timestamp":2000000,"classes":2}}
{"call":"close","session":"a, \"b\""}
)";

TEST(ConvertToCsv, HasARowPerCallAndSession) {
  const ToolRun run = runTool({"convert", "--to", "csv", "-"}, kTaps);
  EXPECT_EQ(run.err, "");
  EXPECT_EQ(run.out,
            "line,call,session,sensor,returned,option,properties,timestamp,seconds,value,items,classes,fate,why,"
            "result_timestamp,result_value,result_items,result_classes\n"
            "2,open,\"a, \"\"b\"\"\",STAP,handle,,,,,,,,,,,,,\n"
            "3,set_option,\"a, \"\"b\"\"\",STAP,0,\"{\"\"classMask\"\":1}\",101=1 102=0,,,,,,,,,,,\n"
            "4,dispatch,\"a, \"\"b\"\"\",STAP,1,,,1500000,1.5,3,,,delivered,delivered,1500000,3,,\n"
            "5,dispatch,\"a, \"\"b\"\"\",STAP,0,,,2000000,2,2,,,class not wanted,"
            "\"class not wanted: bits 2, mask 1\",,,,\n"
            "6,close,\"a, \"\"b\"\"\",STAP,0,,,,,,,,,,,,,\n");
}

TEST(ConvertToPerfetto, HasAProcessForTheSensorAndATrackForTheSession) {
  const ToolRun run = runTool({"convert", "--to", "perfetto", "-"}, kTaps);
  EXPECT_EQ(run.err, "");
  const std::string head = R"({"displayTimeUnit":"ms","traceEvents":[
{"name":"process_name","ph":"M","pid":1,"tid":1,"args":{"name":"STAP tapping"}},
{"name":"thread_name","ph":"M","pid":1,"tid":1,"args":{"name":"records"}},
{"name":"thread_name","ph":"M","pid":1,"tid":2,"args":{"name":"a, \"b\""}},
)";
  EXPECT_EQ(run.out.substr(0, head.size()), head);
  for (const char* event : {
           R"("name":"a, \"b\" sets {\"classMask\":1}","cat":"negotiation","ph":"i","ts":1500000.0,"pid":1,"tid":2})",
           R"({"s":"t","name":"class 1 + 2","cat":"record","ph":"i","ts":1500000.0,"pid":1,"tid":1})",
           R"({"s":"t","name":"class 1 + 2","cat":"result","ph":"i","ts":1500000.0,"pid":1,"tid":2})",
           R"({"s":"t","name":"class 2","cat":"record","ph":"i","ts":2000000.0,"pid":1,"tid":1})",
           R"({"dur":500000.0,"name":"open","cat":"session","ph":"X","ts":1500000.0,"pid":1,"tid":2})",
       }) {
    EXPECT_NE(run.out.find(event), std::string::npos) << event << " in " << run.out;
  }
}

TEST(ConvertToPerfetto, CountsTheItemsInABatch) {
  const ToolRun run = runTool({"convert", "--to", "perfetto", "-"}, R"({"call":"open","session":"a","sensor":"PHYAC"}
{"call":"set_option","session":"a","option":{"logN":1}}
{"call":"dispatch","sensor":"PHYAC","record":{"timestamp":1,"items":[{"class":3,"seq":0}]}}
{"call":"dispatch","sensor":"PHYAC","record":{"timestamp":2,"items":[{"class":3,"seq":1}]}}
{"call":"dispatch","session":"a","record":{"hex":"00"}}
)");
  const std::string rest = R"(,"name":"batch of a","cat":"batch","ph":"C","ts":)";
  EXPECT_NE(run.out.find(R"({"args":{"items":1})" + rest + "1000.0,"), std::string::npos) << run.out;
  EXPECT_NE(run.out.find(R"({"args":{"items":0})" + rest + "2000.0,"), std::string::npos) << run.out;
  EXPECT_NE(run.out.find(R"("cat":"refused","ph":"i","ts":2000.0)"), std::string::npos) << run.out;
}

TEST(ConvertTrace, WritesAFile) {
  const ScratchFile file("converted");
  EXPECT_EQ(runTool({"convert", "--to", "csv", "-o", file.name, "lift.jsonl"}).out, "");
  EXPECT_EQ(contentOf(file.name), runTool({"convert", "--to", "csv", "lift.jsonl"}).out);
}

TEST(ConvertTrace, NeverReplacesTheTrace) {
  const ScratchFile file("trace");
  std::ofstream(file.name) << kTaps;
  const ToolRun run = runTool({"convert", "--to", "csv", "-o", file.name, file.name});
  EXPECT_EQ(run.err, "senseloom: " + file.name + ": is the input, which would be lost\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(contentOf(file.name), kTaps);
}

TEST(ConvertErrors, SayWhichWayToConvert) {
  EXPECT_EQ(runTool({"convert", "lift.jsonl"}).err, "senseloom: --from or --to says what to convert FILE from or to\n");
  EXPECT_EQ(runTool({"convert", "--from", "csv", "--to", "csv", "lift.jsonl"}).status, 2);
  EXPECT_EQ(runTool({"convert", "--to", "csv", "--columns", "time=t", "lift.jsonl"}).status, 2);
  EXPECT_EQ(runTool({"convert", "--to", "csv", "-"}, "stop\n").status, 2);
}

}  // namespace
}  // namespace senseloom::tool
