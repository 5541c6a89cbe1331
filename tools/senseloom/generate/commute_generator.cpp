#include "generate/commute_generator.h"

#include <array>
#include <string_view>

#include "trace/trace_form.h"

namespace senseloom::tool {
namespace {

// The classes, as this classifier numbers them.
enum Activity { unknown, sitting, walking, running, cycling, riding };

// The classes that an activity is easily mistaken for.
constexpr std::array<std::array<int, 3>, 6> kMistakes{{
    {unknown, unknown, unknown},
    {riding, unknown, walking},
    {running, cycling, unknown},
    {walking, cycling, walking},
    {walking, running, riding},
    {sitting, cycling, sitting},
}};

// A part of the day: what the clients do at its beginning, then what the person does, in thousandths of all records.
struct Phase {
  const char* calls;
  Activity activity;
  uint32_t share;
};

// "logger" keeps what the classifier says, 64 decisions at a time; "nav" wants to know when the mode of travel really
// changed, and looks more closely on the way home; "fitness" is interested in walking and running only.
constexpr Phase kDay[] = {
    {R"({"call":"open","session":"logger","sensor":"PHYAC"}
{"call":"set_option","session":"logger","option":{"logN":6,"summary":0}}
)",
     sitting, 60},
    {R"({"call":"open","session":"nav","sensor":"PHYAC"}
{"call":"set_option","session":"nav","option":{"mode":1,"logN":3,"weightVar":2}}
)",
     walking, 80},
    {"", running, 25},
    {R"({"call":"open","session":"fitness","sensor":"PHYAC"}
{"call":"set_option","session":"fitness","option":{"mode":1,"logN":4,"classMask":12}}
)",
     riding, 180},
    {"", walking, 60},
    {R"({"call":"close","session":"nav"}
)",
     sitting, 150},
    {"", walking, 50},
    {R"({"call":"set_option","session":"fitness","option":{"mode":0,"logN":5,"classMask":12}}
)",
     sitting, 120},
    {R"({"call":"open","session":"nav","sensor":"PHYAC"}
{"call":"set_option","session":"nav","option":{"mode":1,"logN":2,"weightVar":1}}
)",
     walking, 40},
    {"", riding, 150},
    {R"({"call":"close","session":"logger"}
)",
     cycling, 60},
    {R"({"call":"close","session":"nav"}
)",
     sitting, 25},
};
constexpr char kEnd[] = R"({"call":"close","session":"fitness"}
)";

}  // namespace

void CommuteGenerator::write() {
  uint64_t share = 0;
  uint64_t written = 0;
  for (const Phase& phase : kDay) {
    std::fputs(phase.calls, out);
    share += phase.share;
    for (; written < records * share / 1000; ++written) writeRecord(phase.activity);
  }
  std::fputs(kEnd, out);
}

// SplitMix64.
uint64_t CommuteGenerator::random() {
  randomState += 0x9e3779b97f4a7c15;
  uint64_t mixed = randomState;
  mixed = (mixed ^ (mixed >> 30)) * 0xbf58476d1ce4e5b9;
  mixed = (mixed ^ (mixed >> 27)) * 0x94d049bb133111eb;
  return mixed ^ (mixed >> 31);
}

uint32_t CommuteGenerator::randomBelow(uint32_t bound) {
  return static_cast<uint32_t>((random() >> 32) * bound >> 32);
}

// One decision of the classifier: now and then wrong, often for a few decisions in a row.
int CommuteGenerator::observe(int activity) {
  if (mistakes == 0 && randomBelow(18) == 0) {
    const auto& candidates = kMistakes[static_cast<size_t>(activity)];
    mistaken = candidates[randomBelow(static_cast<uint32_t>(candidates.size()))];
    mistakes = 1 + randomBelow(3);
  }
  if (mistakes == 0) return activity;
  --mistakes;
  return mistaken;
}

void CommuteGenerator::writeRecord(int activity) {
  timestamp += 12000 + randomBelow(6000);
  line.clear();
  line.addText(member::kCall, callName(CallKind::dispatch));
  line.addText(member::kSensor, "PHYAC");
  line.beginObject(member::kRecord);
  line.addInteger(member::kTimestamp, static_cast<int64_t>(timestamp));
  line.beginArray(member::kItems);
  const uint32_t items = randomBelow(10) == 0 ? 2 + randomBelow(3) : 1;
  for (uint32_t i = 0; i < items; ++i) {
    // Sequence numbers are signed and wrap around at 12 bits.
    const int wrapped = static_cast<int>((sequence + 2048) % 4096) - 2048;
    ++sequence;
    line.beginElement();
    line.addInteger(member::kClass, observe(activity));
    line.addInteger(member::kSequence, wrapped);
    line.endObject();
  }
  line.endArray();
  line.endObject();
  const std::string_view text = line.finish();
  std::fwrite(text.data(), 1, text.size(), out);
}

}  // namespace senseloom::tool
