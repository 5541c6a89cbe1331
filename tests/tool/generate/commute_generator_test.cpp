#include "generate/commute_generator.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "trace/json.h"

namespace senseloom::tool {
namespace {

std::string generated(uint64_t seed, uint32_t records) {
  char* text = nullptr;
  size_t size = 0;
  std::FILE* stream = open_memstream(&text, &size);
  CommuteGenerator(stream, seed, records).write();
  std::fclose(stream);
  std::string trace(text, size);
  std::free(text);
  return trace;
}

std::vector<Json> callsOf(const std::string& trace) {
  std::vector<Json> calls;
  std::istringstream lines(trace);
  for (std::string line; std::getline(lines, line);) calls.emplace_back(json_loads(line.c_str(), 0, nullptr));
  return calls;
}

bool isDispatch(const Json& call) {
  return std::string(json_string_value(json_object_get(call.get(), "call"))) == "dispatch";
}

json_t* recordOf(const Json& call) {
  return json_object_get(call.get(), "record");
}

TEST(CommuteGenerator, WritesTheSameTraceForTheSameSeed) {
  EXPECT_EQ(generated(7, 500), generated(7, 500));
}

TEST(CommuteGenerator, WritesAnotherTraceForAnotherSeed) {
  EXPECT_NE(generated(7, 500), generated(8, 500));
}

TEST(CommuteGenerator, WritesAsManyRecordsAsAskedFor) {
  for (const uint32_t records : {0U, 1U, 13U, 999U, 1000U, 1001U}) {
    uint32_t dispatched = 0;
    for (const Json& call : callsOf(generated(1, records))) dispatched += isDispatch(call) ? 1 : 0;
    EXPECT_EQ(dispatched, records);
  }
}

TEST(CommuteGenerator, LetsTheClientsJoinAndLeaveWhateverTheNumberOfRecords) {
  for (const uint32_t records : {0U, 1U, 2400U}) {
    std::map<std::string, int> counts;
    for (const Json& call : callsOf(generated(1, records))) {
      if (isDispatch(call)) continue;
      const std::string session = json_string_value(json_object_get(call.get(), "session"));
      ++counts[session + ' ' + json_string_value(json_object_get(call.get(), "call"))];
    }
    EXPECT_EQ(counts, (std::map<std::string, int>{{"logger open", 1},
                                                  {"logger set_option", 1},
                                                  {"logger close", 1},
                                                  {"nav open", 2},
                                                  {"nav set_option", 2},
                                                  {"nav close", 2},
                                                  {"fitness open", 1},
                                                  {"fitness set_option", 2},
                                                  {"fitness close", 1}}));
  }
}

TEST(CommuteGenerator, LetsTimeGoForwardAndSequenceNumbersWrapAround) {
  json_int_t timestamp = -1;
  json_int_t expected = 0;
  for (const Json& call : callsOf(generated(3, 5000))) {
    if (!isDispatch(call)) continue;
    const json_int_t next = json_integer_value(json_object_get(recordOf(call), "timestamp"));
    EXPECT_GT(next, timestamp);
    timestamp = next;
    size_t index;
    json_t* item;
    json_array_foreach(json_object_get(recordOf(call), "items"), index, item) {
      ASSERT_EQ(json_integer_value(json_object_get(item, "seq")), expected);
      expected = expected == 2047 ? -2048 : expected + 1;
    }
  }
}

TEST(CommuteGenerator, IsNoisyAndNowAndThenPutsSeveralDecisionsIntoARecord) {
  std::map<size_t, int> sizes;
  std::map<json_int_t, int> classes;
  int changes = 0;
  json_int_t last = -1;
  for (const Json& call : callsOf(generated(3, 5000))) {
    if (!isDispatch(call)) continue;
    const json_t* items = json_object_get(recordOf(call), "items");
    ++sizes[json_array_size(items)];
    size_t index;
    json_t* item;
    json_array_foreach(items, index, item) {
      const json_int_t activity = json_integer_value(json_object_get(item, "class"));
      ++classes[activity];
      changes += activity == last ? 0 : 1;
      last = activity;
    }
  }
  ASSERT_EQ(sizes.size(), 4U);  // 1 to 4
  EXPECT_GT(sizes[1], 4000);
  EXPECT_LT(sizes[1], 4900);
  ASSERT_EQ(classes.size(), 6U);  // 0 to 5
  for (const auto& [activity, count] : classes) EXPECT_GT(count, 20) << activity;
  // The day has twelve parts: all other changes are noise.
  EXPECT_GT(changes, 200);
}

}  // namespace
}  // namespace senseloom::tool
