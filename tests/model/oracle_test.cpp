#include <gtest/gtest.h>
#include <senseloom.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <random>
#include <string>
#include <utility>

#include "comparison.h"
#include "explained.h"
#include "generator.h"
#include "shrinker.h"

namespace oracle {
namespace {

// Printed: a new one each time, or SENSELOOM_TEST_SEED of the environment, to repeat a failure.
uint32_t randomSeed() {
  const char* given = std::getenv("SENSELOOM_TEST_SEED");
  const uint32_t seed =
      given != nullptr ? static_cast<uint32_t>(std::strtoul(given, nullptr, 10)) : std::random_device{}();
  std::printf("SENSELOOM_TEST_SEED=%lu\n", static_cast<unsigned long>(seed));
  return seed;
}

Sequence sequenceOf(uint64_t seed) {
  RandomChoices choices(seed);
  return makeSequence(choices);
}

Sequence minimal(const Sequence& sequence, Mistake mistake = Mistake::none) {
  return shrink(sequence, [mistake](const Sequence& other) { return compare(other, mistake).has_value(); });
}

// The least of several sequences that show a mistake, since one alone can end a step away from the least there is.
Sequence minimalFor(Mistake mistake) {
  Sequence least;
  int found = 0;
  for (uint64_t seed = 0; found < 4; ++seed) {
    const Sequence sequence = sequenceOf(seed);
    if (!compare(sequence, mistake)) continue;
    Sequence one = minimal(sequence, mistake);
    if (found++ == 0 || toTrace(one).size() < toTrace(least).size()) least = std::move(one);
  }
  return least;
}

TEST(Oracle, LibraryDoesWhatTheModelDoesInRandomSequencesOfCalls) {
  const uint64_t seed = uint64_t{randomSeed()} << 32;
  Tallies tallies{};
  for (uint64_t i = 0; i < SEQUENCES; ++i) {
    const Sequence sequence = sequenceOf(seed + i);
    if (!compare(sequence, Mistake::none, &tallies)) continue;

    const Sequence least = minimal(sequence);
    const auto found = compare(least);
    const std::string trace = toTrace(least);
    std::ofstream("oracle-failure.jsonl") << trace;
    FAIL() << "sequence " << i << " of " << SEQUENCES << "; the least of it that fails, in oracle-failure.jsonl for\n"
           << "`senseloom replay`, at its call " << found->call + 1 << ": " << found->text << '\n'
           << trace;
  }
  // All of it happened, on every sensor where it can.
  for (int sensor = 0; sensor < kSensors; ++sensor) {
    SCOPED_TRACE(kSensorNames[sensor]);
    const Tally& tally = tallies[static_cast<size_t>(sensor)];
    EXPECT_GT(tally.opened, SEQUENCES / 50);
    EXPECT_EQ(tally.notOpened > SEQUENCES / 500, sensor == lpe);
    EXPECT_GT(tally.lists, SEQUENCES / 50);
    EXPECT_GT(tally.refusedOptions, SEQUENCES / 2500);
    EXPECT_GT(tally.results, SEQUENCES / 50);
    const bool deliversAll = sensor == shaki || sensor == lpe || sensor == lift;
    EXPECT_EQ(tally.nothings > SEQUENCES / 100, !deliversAll);
    EXPECT_EQ(tally.refusedRecords > SEQUENCES / 500, sensor == phyac || sensor == gspx || sensor == pdr);
  }
}

// The tool explains what the library does by the same model, which there sees no more than a trace and the log tell.
TEST(Oracle, ExplainLeavesNothingUnexplainedInRandomSequencesOfCalls) {
  const auto isUnexplained = [](const Sequence& sequence) {
    return explained(sequence).find("unexplained") != std::string::npos;
  };
  const uint64_t seed = uint64_t{randomSeed()} << 32;
  size_t printed = 0;
  for (uint64_t i = 0; i < EXPLAINED; ++i) {
    const std::string text = explained(sequenceOf(seed + i));
    printed += text.size();
    if (text.find("unexplained") == std::string::npos) continue;
    const Sequence least = shrink(sequenceOf(seed + i), isUnexplained);
    FAIL() << "sequence " << i << " of " << EXPLAINED << "; the least of it that fails:\n"
           << toTrace(least) << explained(least);
  }
  EXPECT_GT(printed, EXPLAINED * size_t{500});  // nothing is unexplained of what is not explained at all
}

int countOf(const Sequence& sequence, Call::What what) {
  return static_cast<int>(
      std::count_if(sequence.begin(), sequence.end(), [what](const Call& call) { return call.what == what; }));
}

TEST(Oracle, MistakenVoteIsShrunkToOneSessionItsOptionAndOneRecord) {
  const Sequence least = minimalFor(Mistake::noMajorityIsClass0);
  SCOPED_TRACE(toTrace(least));
  ASSERT_EQ(least.size(), 3);
  EXPECT_EQ(least[0].what, Call::open);
  EXPECT_EQ(least[0].sensor, phyac);
  EXPECT_EQ(least[1].what, Call::setOption);
  EXPECT_EQ(least[1].option.text(), R"({"logN":1})");
  EXPECT_EQ(least[2].what, Call::dispatch);
  EXPECT_EQ(least[2].record.size(), 14);  // with two items, the least that can have no majority
}

TEST(Oracle, MistakenRemergeIsShrunkToTwoSessionsAndTheOptionOfOne) {
  const Sequence least = minimalFor(Mistake::closedSessionStaysMerged);
  SCOPED_TRACE(toTrace(least));
  ASSERT_EQ(least.size(), 3);  // the closing comes by itself
  EXPECT_EQ(countOf(least, Call::open), 2);
  EXPECT_EQ(countOf(least, Call::setOption), 1);
}

TEST(Oracle, MistakenBatchingIsShrunkToTwoOptionsAndTwoRecords) {
  const Sequence least = minimalFor(Mistake::optionDropsPendingItems);
  SCOPED_TRACE(toTrace(least));
  ASSERT_EQ(least.size(), 5);
  EXPECT_EQ(least[0].what, Call::open);
  EXPECT_EQ(least[0].sensor, pdr);
  EXPECT_EQ(countOf(least, Call::setOption), 2);
  EXPECT_EQ(countOf(least, Call::dispatch), 2);
}

TEST(Oracle, MinimalTraceIsRunByTheTool) {
  const std::string trace = toTrace(minimalFor(Mistake::closedSessionStaysMerged));
  std::ofstream("oracle-minimal.jsonl") << trace;
  std::FILE* tool = popen(SENSELOOM_TOOL " replay --json oracle-minimal.jsonl 2>&1", "r");
  ASSERT_NE(tool, nullptr);
  std::string output;
  for (int c = std::fgetc(tool); c != EOF; c = std::fgetc(tool)) output += static_cast<char>(c);
  EXPECT_EQ(pclose(tool), 0) << output;
  // A line for each of the three calls, and one for the closing of each of the two sessions.
  EXPECT_EQ(std::count(output.begin(), output.end(), '\n'), 5) << output;
}

TEST(Oracle, CallsThatNoTraceCanExpressAreNotesOfTheNextOne) {
  Call audio;
  audio.what = Call::audioActivate;
  audio.answers.activate = -5;
  Call open;
  open.what = Call::open;
  open.session = 2;
  open.sensor = lpe;
  Call dispatch;
  dispatch.what = Call::dispatch;
  dispatch.session = 2;
  dispatch.record = {0x00, 0xA5};
  dispatch.misuse = Call::nullData;
  EXPECT_EQ(toTrace({audio, open, dispatch}),
            R"({"call":"open","session":"s2","sensor":"LPE_P","before":[)"
            R"({"call":"audio_hal_activate","platform":{"activate":-5}}]})"
            "\n"
            R"({"call":"uninit","before":[)"
            R"({"call":"dispatch","session":"s2","record":{"hex":"00a5"},"misuse":"null data"}]})"
            "\n");
}

TEST(Oracle, ShrinkingTakesAwayAllButWhatFails) {
  Sequence sequence(100);
  for (size_t i = 0; i < sequence.size(); ++i) sequence[i].session = static_cast<int>(i);
  sequence[70].what = Call::dispatch;
  sequence[70].record = Bytes(2000, 0xFF);
  // Fails with session 30 somewhere before a record of 9 bytes or more whose eighth byte is not 0.
  const auto fails = [](const Sequence& other) {
    bool before = false;
    for (const Call& call : other) {
      before = before || call.session == 30;
      if (before && call.record.size() > 8 && call.record[7] != 0) return true;
    }
    return false;
  };
  const Sequence least = shrink(sequence, fails);
  ASSERT_EQ(least.size(), 2);
  EXPECT_EQ(least[0].session, 30);
  EXPECT_EQ(least[1].record, (Bytes{0, 0, 0, 0, 0, 0, 0, 1, 0}));
}

// The growable array is not part of any session: its model is a vector.
TEST(Oracle, GrowableArrayDoesWhatAVectorDoes) {
  RandomChoices choices(randomSeed());
  for (int round = 0; round < 200; ++round) {
    varray_t array{};
    const size_t size = 1 + choices.below(40);
    ASSERT_NE(_va_init(&array, static_cast<int>(size)), nullptr);
    std::vector<std::string> model;
    for (int i = 0; i < 300; ++i) {
      if (!choices.oneIn(3)) {
        const std::string element(size, static_cast<char>(choices.below(256)));
        void* slot = va_new(&array);
        ASSERT_NE(slot, nullptr);
        element.copy(static_cast<char*>(slot), size);
        model.push_back(element);
      } else {
        const auto index = choices.below(static_cast<uint32_t>(model.size()) + 2);
        std::string removed(size, '\0');
        void* const out = _va_del(&array, static_cast<int>(index), removed.data());
        ASSERT_EQ(out != nullptr, index < model.size());
        if (out == nullptr) continue;
        ASSERT_EQ(removed, model[index]);
        model.erase(model.begin() + static_cast<std::ptrdiff_t>(index));
      }
      ASSERT_EQ(static_cast<size_t>(array.count), model.size());
    }
    std::string all;
    for (const std::string& element : model) all += element;
    EXPECT_EQ(std::string(static_cast<const char*>(array.data), all.size()), all);
    va_free(&array);
  }
}

}  // namespace
}  // namespace oracle
