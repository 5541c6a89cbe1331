// The reasons that the model gives. That what it does is what the library does is checked by the sequences.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <list>
#include <string>
#include <vector>

#include "model/model.h"

namespace senseloom::model {
namespace {

// Sessions "a", "b", ... in a model that explains.
class Reasons : public testing::Test {
 protected:
  Reasons() { model.explains = true; }

  const void* open(int kind) {
    const void* handle = &handles.emplace_back();
    EXPECT_EQ(model.open(rowOf(kind).sensor, handle).returned, 1);
    return handle;
  }
  Explanation set(const void* handle, const std::string& text) {
    return model.setOption(handle, text.c_str(), true).why;
  }
  // To a session of its own.
  Explanation set(int kind, const std::string& text) { return set(open(kind), text); }

  // What is told of an option string, each with the line that is logged about it.
  std::string remarks(int kind, const std::string& text) {
    std::string told;
    for (const Remark& remark : set(kind, text).remarks) {
      told += remark.text + '\n';
      if (!remark.logged.empty()) told += "  " + remark.logged + '\n';
    }
    return told;
  }
  // "KEY=VALUE by WHO" for each key.
  static std::string decided(const Explanation& why) {
    const Negotiation& negotiation = why.negotiation.value();
    std::vector<std::string> names;
    for (size_t i = 0; i < negotiation.participants.size(); ++i) names.emplace_back(1, static_cast<char>('a' + i));
    std::string text;
    for (size_t i = 0; i < negotiation.keys.size(); ++i) {
      const MergedKey& key = negotiation.keys[i];
      text += std::string(text.empty() ? "" : "; ") + keyOf(negotiation.participants[0].request.kind(), i).name + '=' +
              (key.value ? std::to_string(*key.value) : "") + " by " + key.deciders(names);
    }
    return text;
  }

  std::string judged(const void* handle, const Bytes& record) {
    const uint8_t nothing = 0;
    const Outcome outcome =
        model.dispatch(handle, record.empty() ? &nothing : record.data(), static_cast<int>(record.size()), true, true);
    items += outcome.why.items;
    return outcome.why.verdict.text();
  }
  // What is told of all items so far, a count a line.
  static std::string told(const ItemCounts& counts) {
    std::string text;
    for (const ItemCount& count : counts.told()) text += (count.isLoss ? "lost: " : "") + count.text + '\n';
    return text;
  }
  // A record with a little-endian value at byte 8, and zeros behind it if the size is more than the value's.
  static Bytes valued(int64_t value, size_t size, uint8_t timestamp = 1) {
    Bytes record(8 + size);
    record[0] = timestamp;
    for (size_t i = 0; i < std::min(size, sizeof value); ++i) {
      record[8 + i] = static_cast<uint8_t>(static_cast<uint64_t>(value) >> 8 * i);
    }
    return record;
  }
  static Bytes classes(const std::vector<uint8_t>& ids) {
    Bytes record = valued(static_cast<int64_t>(ids.size()), 2);
    for (const uint8_t id : ids) record.insert(record.end(), {id, 0});
    return record;
  }

  Model model;
  std::list<char> handles;
  ItemCounts items;
};

TEST_F(Reasons, AreNoneForAnOptionThatGivesAllKeys) {
  EXPECT_EQ(remarks(stap, R"({"classMask":1,"level":-5})"), "");
  EXPECT_EQ(remarks(stap, "{}"), "");
}

TEST_F(Reasons, TellWhichValueCountsForWhichWasAsked) {
  const Explanation why = set(stap, R"({"level":-6})");
  const Request& request = why.negotiation->participants[0].request;
  EXPECT_EQ(request[keyIndex(stap, "classMask")].text(), "0 for default 3");
  EXPECT_EQ(request[keyIndex(stap, "level")].text(), "-6");
  const Explanation other = set(phyac, R"({"logN":12})");
  EXPECT_EQ(other.negotiation->participants[0].request[keyIndex(phyac, "logN")].text(), "8 for 12");
  EXPECT_EQ(other.negotiation->participants[0].request[keyIndex(phyac, "logM")].text(), "0 default");
}

TEST_F(Reasons, NameTheNearestKeyForATypo) {
  EXPECT_EQ(remarks(dtwgs, R"({"mode":1,"template":"0000"})"),
            "unknown key \"template\" has no effect: the nearest known key is \"template1\"\n");
}

TEST_F(Reasons, TellOfValuesThatAreNotTakenAsTheyAre) {
  EXPECT_EQ(remarks(stap, R"({"classMask":"1","level":2.0})"),
            "\"classMask\" is no integer and counts as not given\n"
            "\"level\" is no integer and counts as not given\n");
  EXPECT_EQ(remarks(lpe, R"({"interval":4294967297})"), "\"interval\" 4294967297 is cut to 32 bits, 1\n");
  EXPECT_EQ(remarks(scoun, "[1]"), "not an object, so that every key has its default\n");
  EXPECT_EQ(remarks(stap, R"({"classMask":4,"level":6})"),
            "\"classMask\" 4 is not in 1..3: 3 is used\n"
            "  tapping: invalid clsmask value 4\n"
            "\"level\" 6 is not in -5..5: 6 is kept\n"
            "  tapping: invalid level value 6\n"
            "the bad \"level\" sets \"classMask\" to 0: no tap is delivered\n");
  EXPECT_EQ(remarks(phyac, R"({"logN":3,"logM":5,"weightVar":-5})"),
            "\"weightVar\" -5 is not in 0..: -1 is used\n"
            "\"logM\" is cut to \"logN\", 3\n");
}

TEST_F(Reasons, TellOfDefaultsThatAreLogged) {
  EXPECT_EQ(remarks(pdr, R"({"N":7,"floorHeight":300,"6DOF":0})"),
            "\"userHeight\" is not given: its default is kept, and logged as a bad value\n"
            "  PDR: invalid user height value 1000\n"
            "\"N\" 7 is not in 0..6: 0 is used\n"
            "  PDR: invalid N value 7\n");
  EXPECT_EQ(remarks(lift, R"({"classMask":1})"),
            "\"classMask\" 1 is not taken, as no value is: 3 is used\n"
            "  tapping: invalid clsmask value 1\n");
}

TEST_F(Reasons, TellWhetherTextThatIsNotJsonIsAccepted) {
  EXPECT_EQ(remarks(gsflk, "x"),
            "not JSON ('[' or '{' expected near 'x'): refused\n"
            "  gestureflick: invalid opton string x, all set as default\n");
  EXPECT_EQ(remarks(scoun, "x"),
            "not JSON ('[' or '{' expected near 'x'): accepted all the same, and the session keeps its option\n");
  EXPECT_EQ(model.setOption(open(isact), nullptr, true).why.remarks[0].text, "a null pointer is refused");
}

TEST_F(Reasons, TellWhyATemplateGestureIsRefused) {
  EXPECT_EQ(remarks(dtwgs, R"({"mode":2,"classMask":1})"),
            "\"mode\" must be 1 (enroll) or 4 (match): the whole option is refused\n"
            "  Invalid mode value 2\n");
  EXPECT_EQ(remarks(dtwgs, R"({"mode":4,"classMask":1,"level":2})"),
            "\"level\" 2 is not in -1..1: the whole option is refused\n"
            "  Invalid level value 2 at match mode\n");
  EXPECT_EQ(remarks(dtwgs, R"({"mode":1,"template1":5,"template2":"0385"})"),
            "\"template1\" is no string and counts as not given\n"
            "\"template2\" is no template of at most 900 bytes: the whole option is refused\n"
            "  Invalid template2 value\n");
}

TEST_F(Reasons, TellWhoDecidedEachKey) {
  set(gsflk, R"({"classMask":1,"level":2})");
  EXPECT_EQ(decided(set(gsflk, R"({"classMask":2,"level":-1})")), "classMask=3 by all; level=-1 by b");
  // One that has all bits decides alone; one that brings none does not.
  EXPECT_EQ(decided(set(gsflk, R"({"classMask":3,"level":5})")), "classMask=3 by c; level=-1 by b");
  set(stap, R"({"level":6})");
  set(stap, R"({"classMask":1})");
  EXPECT_EQ(decided(set(stap, R"({"classMask":2})")), "classMask=3 by b, c; level=0 by b, c");
  set(scoun, R"({"mode":1,"logN":3})");
  EXPECT_EQ(decided(set(scoun, R"({"mode":0,"logN":2})")), "mode=0 by b; logN=2 by b");
}

TEST_F(Reasons, NameTheSessionThatStartedTheMergeAndTheOneOpenedLast) {
  const void* first = open(lpe);
  open(lpe);
  EXPECT_EQ(decided(set(first, R"({"interval":1})")), "interval=5000 by b");
  model.uninit();
  const void* other = open(lpe);
  set(other, R"({"interval":7})");
  // A session of sensors that are gone negotiates with the new ones, but is not merged in.
  EXPECT_EQ(decided(set(first, R"({"interval":2})")), "interval=7 by b");
  model.close(other, true);
  EXPECT_EQ(decided(set(first, R"({"interval":2})")), "interval=2 by a");
}

TEST_F(Reasons, TellWhyActivityDoesNotReportChanges) {
  set(phyac, R"({"mode":1,"logN":3})");
  const std::string text = decided(set(phyac, R"({"mode":1,"logN":4,"continuous":1})"));
  EXPECT_EQ(text.substr(0, text.find(';')), "mode=0 by different \"logN\"");
  EXPECT_NE(text.find("summary=1 by b; weightVar=-1 by b; continuous=1 by b"), std::string::npos) << text;
}

TEST_F(Reasons, TellWhyThereIsNoList) {
  set(dtwgs, R"({"mode":1})");
  const Explanation both = set(dtwgs, R"({"mode":1})");
  EXPECT_EQ(*both.negotiation->conflict,
            (Remark{"no property list: several sessions enroll, and one can at a time", "option invalid"}));
  EXPECT_EQ(decided(both), "mode=1 by all; classMask=0 by all; level=0 by all; index= by not merged");
}

TEST_F(Reasons, TellWhyEnrollingAndMatchingExcludeEachOther) {
  set(dtwgs, R"({"mode":1})");
  EXPECT_EQ(*set(dtwgs, R"({"mode":4,"classMask":1})").negotiation->conflict,
            (Remark{"no property list: none can match while one enrolls", "option mode incompatible: 5"}));
}

TEST_F(Reasons, ShowTheClassesOfARecordAndTheMask) {
  const void* flick = open(gsflk);
  set(flick, R"({"classMask":3})");
  EXPECT_EQ(judged(flick, valued(2, 2)), "delivered");
  EXPECT_EQ(judged(flick, valued(3, 2)), "class not wanted: bits 4, mask 3");
  EXPECT_EQ(judged(flick, valued(0, 2)), "class not wanted: bits -2147483648, mask 3");
  EXPECT_EQ(judged(flick, valued(1, 1)), "too short: ends before its class or count");
  const void* tapping = open(stap);
  set(tapping, R"({"classMask":2})");
  EXPECT_EQ(judged(tapping, valued(1, 2)), "class not wanted: bits 1, mask 2");
  const void* coach = open(scoun);
  set(coach, R"({"mode":0,"logN":5})");
  EXPECT_EQ(judged(coach, valued(501, 4)), "step not a multiple: 501 is not a multiple of 500");
}

TEST_F(Reasons, CountGatheredItems) {
  const void* map = open(pdr);
  set(map, R"({"N":1})");
  Bytes one = valued(1, 2);
  one.resize(10 + 28);
  EXPECT_EQ(judged(map, one), "batch filling: 1 of 2 items");
  EXPECT_EQ(told(model.close(map, true).why.items), "lost: items gathered and not delivered: 1\n");
}

TEST_F(Reasons, TellWhetherAGestureWasRecognised) {
  const void* letters = open(gspx);
  set(letters, R"({"classMask":1024})");
  Bytes samples(24);
  samples[0] = 1;
  EXPECT_EQ(judged(letters, samples), "no gesture recognised");
  model.answers.names = {"LetterB "};
  samples[0] = 2;
  EXPECT_EQ(judged(letters, samples), "class not wanted: bits 2048, mask 1024");
}

TEST_F(Reasons, FollowTheBatchesOfActivity) {
  const void* nav = open(phyac);
  EXPECT_EQ(judged(nav, {}), "delivered");
  EXPECT_EQ(model.chain(nav), "none yet: records pass as they are");
  set(nav, R"({"logN":2,"mode":1,"classMask":64})");
  EXPECT_EQ(judged(nav, classes({1, 1, 1})), "batch filling: 3 of 4 items");
  EXPECT_EQ(judged(nav, classes({1, 2, 3})), "delivered");
  EXPECT_EQ(judged(nav, classes({1, 1, 1, 2})), "unchanged: class 0 as before");
  EXPECT_EQ(judged(nav, classes({1, 1, 2, 2})), "delivered");
  EXPECT_EQ(judged(nav, classes({})), "no items");
  EXPECT_EQ(judged(nav, classes({1})), "batch filling: 1 of 4 items");
  items += model.close(nav, true).why.items;
  EXPECT_EQ(told(items),
            "lost: items beyond a full batch: 2\n"
            "lost: items lost when a negotiation cut their batch off: 1\n"
            "results without a majority (class 6): 1\n"
            "items delivered as class 0 for the mask: 1\n");
}

TEST_F(Reasons, DescribeTheChainOfActivity) {
  const auto chain = [&](const char* text) { return set(phyac, text).negotiation->participants.back().chain; };
  EXPECT_EQ(chain(R"({"logN":2,"weightVar":1,"mode":1,"classMask":12})"),
            "batches of 4 = 2^(logN 2 - merged logM 0), voted (weights 1024 1536 2304 3456), mask 12, on change");
  EXPECT_EQ(chain(R"({"logN":4,"weightVar":3})"),
            "batches of 16 = 2^(logN 4 - merged logM 0), "
            "voted (weights 1024 1152 1296 1458 1640 1845 ... 5985), all classes");
  EXPECT_EQ(chain(R"({"summary":0,"weightVar":11})"), "batches of 1 = 2^(logN 0 - merged logM 0), all classes");
  EXPECT_EQ(chain(R"({"logN":3,"weightVar":11})"),
            "batches of 8 = 2^(logN 3 - merged logM 0), voted (all weigh the same), all classes");
}

TEST_F(Reasons, TellWhyABatchHasItsSize) {
  set(phyac, R"({"logN":5,"logM":2})");
  EXPECT_EQ(set(phyac, R"({"logN":3,"logM":1})").negotiation->participants[0].chain,
            "batches of 16 = 2^(logN 5 - merged logM 1), voted (all weigh the same), all classes");
}

TEST_F(Reasons, TellOfKeysThatAreGivenTwice) {
  EXPECT_EQ(remarks(stap, R"({"level":1, "classMask" :1,"level"
 :2,"l\u0065vel":3,"x":{"a":1,"a":2,"\"a\\":1},"classMask":2})"),
            "\"level\" is given more than once: the last value counts\n"
            "\"classMask\" is given more than once: the last value counts\n"
            "unknown key \"x\" has no effect: the nearest known key is \"level\"\n");
  EXPECT_EQ(remarks(stap, R"(["level","level"])"), "not an object, so that every key has its default\n");
}

TEST_F(Reasons, TellOfAKeyThatHasNoEffect) {
  EXPECT_EQ(remarks(phyac, R"({"continuous":1,"logN":1})"),
            "\"continuous\" has no effect: no property shows it, and no session uses it\n");
}

TEST_F(Reasons, TellWhyARecordIsRefused) {
  const void* map = open(pdr);
  set(map, R"({"N":6})");
  EXPECT_EQ(judged(map, valued(0, 1)), "refused: ends before its number of items");
  EXPECT_EQ(judged(map, valued(-1, 2)), "refused: says that it has -1 items");
  Bytes many = valued(40, 2);
  many.resize(10 + 39 * 28);
  EXPECT_EQ(judged(map, many), "refused: says that it has 40 items, and has room for 39");
  many.resize(10 + 40 * 28);
  EXPECT_EQ(judged(map, many), "batch filling: 40 of 64 items");
  EXPECT_EQ(judged(map, many), "refused: with it, 80 items would be gathered, where 64 have room");

  const void* nav = open(phyac);
  set(nav, "{}");
  EXPECT_EQ(judged(nav, valued(0, 1)), "refused: ends before its number of items");
  EXPECT_EQ(judged(nav, valued(3, 5)), "refused: says that it has 3 items, and has room for 1");

  const void* letters = open(gspx);
  EXPECT_EQ(judged(letters, valued(0, 2)), "refused: has 10 bytes, where 24 to 2052 are taken");
  EXPECT_EQ(judged(letters, valued(0x7fff0000, 16)),
            "refused: says that its samples have 32767 bytes, and has room for 12");
  EXPECT_EQ(judged(nullptr, {}), "refused: its session is not open");
}

TEST_F(Reasons, TellWhatThePlatformDoesNotDo) {
  const char handle = 0;
  model.answers.starts = false;
  EXPECT_EQ(model.open("GSPX", &handle).why.remarks,
            (std::vector{Remark{"the platform's gesture engine does not start: no gesture may be recognised",
                                "hmm gesture algorithm start return false"}}));
  const std::string cause = "the platform's audio session cannot be switched ";
  const auto told = [&] { return model.open("LPE_P", &handle).why.remarks.at(0); };
  model.answers.get = -1;
  EXPECT_EQ(told().text, cause + "on: no module is loaded");
  model.answers = {};
  model.answers.open = -2;
  EXPECT_EQ(told(), (Remark{cause + "on: the module opens no device", "device open result -2\n"}));
  model.answers = {};
  model.answers.activate = -1;
  EXPECT_EQ(told(), (Remark{cause + "on: the device refuses", "activated aware failed\n"}));
  model.answers = {};
  model.answers.deactivate = -1;
  const void* music = open(lpe);
  EXPECT_EQ(model.close(music, true).why.remarks.at(0).text, cause + "off: the device refuses");
}

TEST_F(Reasons, TellHowManyItemsANegotiationCutsOff) {
  const void* nav = open(phyac);
  set(nav, R"({"logN":3})");
  judged(nav, classes({1, 2, 3}));
  EXPECT_EQ(set(phyac, "{}").negotiation->participants[0].cutOff, 3);
}

}  // namespace
}  // namespace senseloom::model
