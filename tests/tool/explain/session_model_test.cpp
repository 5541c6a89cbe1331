#include "explain/session_model.h"

#include <gtest/gtest.h>

#include <string>

#include "explain/gesture_model.h"
#include "explain/option_reading.h"
#include "trace/json.h"

namespace senseloom::tool {
namespace {

// One session of a sensor.
class Client {
 public:
  explicit Client(const char* sensor, const std::string& option = "", GestureState* shared = nullptr)
      : layout(*findRecordLayout(sensor)),
        wishes(*findOptionDescription(sensor)),
        model(makeSessionModel(layout, shared == nullptr ? own : *shared)) {
    if (!option.empty()) set(option);
  }

  void set(const std::string& option, int32_t leastLogM = 0) {
    TemplateLengths templates{};
    wishes = readOption(wishes.kind(), option, templates).wishes.value();
    model->restart(wishes, leastLogM);
  }

  // What becomes of a record, given as in a trace.
  std::string judge(const std::string& record, const std::vector<LogLine>& log = {}) {
    const Json json(json_loads(record.c_str(), 0, nullptr));
    return model->judge(wishes, encodeRecord(layout, json.get()), log).text();
  }
  std::string judgeClasses(const std::vector<int>& classes) {
    std::string text = R"({"timestamp":1,"items":[)";
    const char* separator = "";
    for (const int classId : classes) {
      text.append(separator).append(R"({"class":)").append(std::to_string(classId)).append(R"(,"seq":0})");
      separator = ",";
    }
    return judge(text.append("]}"));
  }
  const SessionModel& state() const { return *model; }

 private:
  const RecordLayout& layout;
  GestureState own;
  Wishes wishes;
  std::unique_ptr<SessionModel> model;
};

std::string record(const char* field, int value) {
  return std::string(R"({"timestamp":1,")") + field + "\":" + std::to_string(value) + '}';
}

TEST(FilterModels, ReadAClassNumberAsABitOfTheMask) {
  Client flick("GSFLK", R"({"classMask":3})");
  EXPECT_EQ(flick.judge(record("class", 2)), "delivered");
  EXPECT_EQ(flick.judge(record("class", 3)), "class not wanted: bits 4, mask 3");
  EXPECT_EQ(flick.judge(record("class", 33)), "delivered");
  EXPECT_EQ(flick.judge(record("class", 0)), "class not wanted: bits -2147483648, mask 3");
  EXPECT_EQ(flick.judge(R"({"hex":"00000000000000000100"})"), "delivered");
  EXPECT_EQ(flick.judge(R"({"hex":"000000000000000001"})"), "too short: ends before its class or count");
  Client activity("ISACT");
  EXPECT_EQ(activity.judge(R"({"hex":"00000000000000000100"})"), "too short: ends before its class or count");
  EXPECT_EQ(activity.judge(record("class", 65537)), "delivered");
}

TEST(FilterModels, ReadASetOfClassesWithItsSign) {
  Client tapping("STAP", R"({"classMask":2})");
  EXPECT_EQ(tapping.judge(record("classes", 3)), "delivered");
  EXPECT_EQ(tapping.judge(record("classes", 1)), "class not wanted: bits 1, mask 2");
  EXPECT_EQ(tapping.judge(record("classes", -1)), "delivered");
}

TEST(FilterModels, DeliverEverythingOfTheOtherSensors) {
  for (const char* sensor : {"SHAKI", "LPE_P", "LIFT"}) EXPECT_EQ(Client(sensor).judge(R"({"hex":""})"), "delivered");
}

TEST(StepCountModel, DeliversMultiplesOfHundreds) {
  Client each("SCOUN");
  EXPECT_EQ(each.judge(R"({"hex":""})"), "delivered");
  Client coach("SCOUN", R"({"mode":0,"logN":5})");
  EXPECT_EQ(coach.judge(record("steps", -500)), "delivered");
  EXPECT_EQ(coach.judge(record("steps", 501)), "step not a multiple: 501 is none of 500");
  EXPECT_EQ(coach.judge(R"({"hex":"0000000000000000000000"})"), "too short: ends before its class or count");
}

TEST(GatheringModel, CountsItemsAndKeepsThemOverAnOption) {
  std::string item(58, '0');
  item.front() = item.back() = '"';
  const std::string one = R"({"timestamp":1,"items":[)" + item + "]}";
  Client map("PDR", R"({"N":1})");
  EXPECT_EQ(map.judge(one), "batch filling: 1 of 2 items");
  map.set(R"({"N":2})");
  EXPECT_EQ(map.state().account(), "items gathered and not delivered: 1");
  EXPECT_EQ(map.judge(R"({"timestamp":1,"items":[)" + item + ',' + item + "]}"), "batch filling: 3 of 4 items");
  EXPECT_EQ(map.judge(one), "delivered");
  EXPECT_EQ(map.judge(R"({"hex":"0000000000000000ffff"})"), "refused");
  EXPECT_EQ(map.judge(R"({"hex":"00000000000000000100"})"), "refused");
  EXPECT_EQ(map.judge(R"({"hex":"000000000000000001"})"), "refused");
  EXPECT_EQ(map.state().account(), "");
}

std::string sample(int timestamp, int prx = 0) {
  std::string text = R"({"timestamp":)";
  text.append(std::to_string(timestamp)).append(R"(,"prx":)").append(std::to_string(prx));
  return text.append(R"(,"samples":[[0,0,0,0,0,0]]})");
}

TEST(GestureModel, TakesTheGestureFromTheLog) {
  Client letters("GSPX", R"({"classMask":1024})");
  EXPECT_EQ(letters.judge(sample(0)), "no gesture recognised");
  EXPECT_EQ(letters.judge(sample(1), {{3, "libsenseloom", "-- gesture: LetterA "}}), "delivered");
  EXPECT_EQ(letters.judge(sample(2), {{3, "libsenseloom", "-- gesture: LetterA"}}), "no gesture recognised");
  EXPECT_EQ(letters.judge(sample(3, 1), {{3, "libsenseloom", "-- gesture: LetterA "}}), "no gesture recognised");
  EXPECT_EQ(letters.judge(sample(4), {{3, "libsenseloom", "num 0: 0"}, {3, "libsenseloom", "-- gesture: LetterB "}}),
            "class not wanted: bits 2048, mask 1024");
  EXPECT_EQ(letters.judge(R"({"timestamp":5,"prx":0,"samples":[]})"), "refused");
}

TEST(GestureModel, SharesTheGestureOfOneRecord) {
  GestureState shared;
  Client dialer("GSPX", R"({"classMask":1023})", &shared);
  Client notes("GSPX", R"({"classMask":64512})", &shared);
  EXPECT_EQ(notes.judge(sample(7), {{3, "libsenseloom", "-- gesture: NumberOne "}}),
            "class not wanted: bits 1, mask 64512");
  EXPECT_EQ(dialer.judge(sample(7)), "delivered");
}

TEST(ActivityModel, PassesRecordsBeforeTheFirstNegotiation) {
  Client nav("PHYAC");
  EXPECT_EQ(nav.judge(R"({"hex":""})"), "delivered");
  EXPECT_EQ(nav.state().chain(), "none yet: records pass as they are");
}

TEST(ActivityModel, FillsBatchesAndDropsWhatIsBeyond) {
  Client nav("PHYAC", R"({"logN":2})");
  EXPECT_EQ(nav.judgeClasses({1, 1, 1}), "batch filling: 3 of 4 items");
  EXPECT_EQ(nav.judgeClasses({1, 2, 3}), "delivered");
  EXPECT_EQ(nav.judgeClasses({}), "no items");
  EXPECT_EQ(nav.judgeClasses({1}), "batch filling: 1 of 4 items");
  EXPECT_EQ(nav.state().account(),
            "items beyond a full batch: 2, items lost when a negotiation cut their batch off: 1");
}

TEST(ActivityModel, TakesTheSizeOfItsBatchesFromTheLeastLogM) {
  Client nav("PHYAC");
  nav.set(R"({"logN":3,"logM":2})", 1);
  EXPECT_EQ(nav.state().chain(), "batches of 4, voted (all weigh the same), all classes");
}

TEST(ActivityModel, DescribesItsChain) {
  EXPECT_EQ(Client("PHYAC", R"({"logN":2,"weightVar":1,"mode":1,"classMask":12})").state().chain(),
            "batches of 4, voted (weights 1024 1536 2304 3456), mask 12, on change");
  EXPECT_EQ(Client("PHYAC", R"({"logN":4,"weightVar":3})").state().chain(),
            "batches of 16, voted (weights 1024 1152 1296 1458 1640 1845 ... 5985), all classes");
  EXPECT_EQ(Client("PHYAC", R"({"summary":0,"weightVar":11})").state().chain(), "batches of 1, all classes");
}

TEST(ActivityModel, ReportsChangesOfTheVotedClass) {
  Client nav("PHYAC", R"({"mode":1,"logN":1,"weightVar":1})");
  EXPECT_EQ(nav.judgeClasses({2, 3}), "delivered");  // 3: 1536 of 2560
  EXPECT_EQ(nav.judgeClasses({2, 3}), "unchanged: class 3 as before");
  EXPECT_EQ(nav.judgeClasses({3, 2}), "delivered");
}

TEST(ActivityModel, CountsResultsWithoutAMajorityAndMaskedItems) {
  Client nav("PHYAC", R"({"logN":2,"classMask":64})");
  EXPECT_EQ(nav.judgeClasses({1, 1, 2, 3}), "delivered");
  EXPECT_EQ(nav.judgeClasses({1, 1, 1, 3}), "delivered");
  EXPECT_EQ(nav.judgeClasses({6, 6, 6, 6}), "delivered");
  EXPECT_EQ(nav.state().account(),
            "results without a majority (class 6): 1, items delivered as class 0 for the mask: 1");
}

TEST(ActivityModel, ForgetsWhatItReportedWhenANegotiationRestartsIt) {
  Client nav("PHYAC", R"({"mode":1})");
  EXPECT_EQ(nav.judgeClasses({2}), "delivered");
  EXPECT_EQ(nav.judgeClasses({2}), "unchanged: class 2 as before");
  nav.set(R"({"mode":1})");
  EXPECT_EQ(nav.judgeClasses({2}), "delivered");
}

TEST(ActivityModel, RepeatsTheLastRecordOrResultForARecordOfNoBytes) {
  Client nav("PHYAC", R"({"logN":1,"summary":0})");
  EXPECT_EQ(nav.judge(R"({"hex":""})"), "no items");
  EXPECT_EQ(nav.judgeClasses({4}), "batch filling: 1 of 2 items");
  EXPECT_EQ(nav.judge(R"({"hex":""})"), "delivered");
  EXPECT_EQ(nav.judge(R"({"hex":""})"), "delivered");  // the two items of that result
}

TEST(ActivityModel, RefusesRecordsThatEndBeforeTheirItems) {
  Client nav("PHYAC", "{}");
  EXPECT_EQ(nav.judge(R"({"hex":"00"})"), "refused");
  EXPECT_EQ(nav.judge(R"({"hex":"0000000000000000010000"})"), "refused");
}

}  // namespace
}  // namespace senseloom::tool
