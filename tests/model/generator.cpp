#include "generator.h"

#include <algorithm>
#include <cstring>
#include <initializer_list>
#include <iterator>
#include <limits>

namespace oracle {
namespace {

// Values that mostly are in a key's range, from `low` to `high`.
struct Values {
  int64_t low;
  int64_t high;
};
Values usualValues(const model::Key& key) {
  constexpr int64_t kLeast = std::numeric_limits<int32_t>::min();
  constexpr int64_t kMost = std::numeric_limits<int32_t>::max();
  if (key.low > key.high) return {0, key.defaultValue};
  if (key.low == kLeast) return {0, 1};
  return {key.low, key.high == kMost ? key.low + 12 : key.high};
}

constexpr const char* kNotIntegers[] = {"\"3\"", "2.0", "true", "null", "[1]", "{}", "1e2"};
constexpr int64_t kOddIntegers[] = {-1,          31,
                                    32,          100,
                                    101,         255,
                                    256,         65535,
                                    65536,       2147483647,
                                    2147483648,  -2147483648,
                                    4294967295,  4294967296,
                                    4294967297,  -7,
                                    -2147483649, std::numeric_limits<int64_t>::max(),
                                    1000000,     std::numeric_limits<int64_t>::min()};
constexpr const char* kStrings[] = {"",
                                    "{",
                                    "{\"mode\":1,}",
                                    "sitting",
                                    "null",
                                    "[]",
                                    "[1]",
                                    "{\"logN\":1}}",
                                    "{\"mode\":1,\"mode\":4,\"classMask\":2,\"classMask\":3}",
                                    "{\"classMask\":99999999999999999999}",
                                    " {\"classMask\" : 1 }\n",
                                    "{\"classMask\":1}%s%n"};
constexpr const char* kNames[] = {"NumberOne ", "NumberTwo ", "NumberZero ", "LetterA ",  "LetterF ",
                                  "LetterA",    "",           "LetterG ",    "numberone "};
constexpr uint64_t kTimestamps[] = {0, 1, 2, 3, 4, 5, 0x100000001, 0xFFFFFFFFFFFFFFFF};
constexpr int kCounts[] = {1, 1, 1, 1, 1, 2, 2, 3, 4, 4, 7, 8, 16, 32, 64, 128, 256, 300, 0, -1};

class Generator {
 public:
  explicit Generator(Choices& source) : choices(source) {}

  Sequence sequence() {
    for (int& sensor : favourites) sensor = below(kSensors);
    const size_t length = 4 + choices.below(16);
    Sequence calls;
    // Begins with a session, so that what follows has something to do.
    calls.push_back(open());
    while (calls.size() < length && !choices.isExhausted()) calls.push_back(call());
    return calls;
  }

 private:
  struct Session {
    int sensor = 0;
    bool isOpen = false;
  };

  int below(int bound) { return static_cast<int>(choices.below(static_cast<uint32_t>(bound))); }
  template <class List>
  const auto& oneOf(const List& list) {
    return std::data(list)[choices.below(static_cast<uint32_t>(std::size(list)))];
  }
  template <class Value>
  Value oneOf(std::initializer_list<Value> list) {
    return std::data(list)[choices.below(static_cast<uint32_t>(list.size()))];
  }

  Call call() {
    if (choices.oneIn(25)) return oddCall();
    switch (below(20)) {
      case 0:
      case 1:
      case 2:
        return open();
      case 3:
      case 4:
      case 5:
      case 6:
        return setOption();
      case 7:
      case 8: {
        Call call = close();
        sessions[call.session].isOpen = false;
        return call;
      }
      case 9:
        if (!choices.oneIn(3)) return dispatch();
        return Call{};
      case 10:
      case 11: {
        Call call = dispatch();
        call.what = Call::dispatchToSensor;
        call.sensor = sessions[call.session].sensor;
        return call;
      }
      default:
        return dispatch();
    }
  }

  // What no trace can express.
  Call oddCall() {
    Call call;
    switch (below(8)) {
      case 0:
        call.what = oneOf({Call::audioInit, Call::audioActivate, Call::audioDeactivate});
        call.answers = answers();
        return call;
      case 1:
        call.what = Call::find;
        call.sensor = below(kSensors);
        call.misuse = oneOf({Call::none, Call::nullName, Call::longName});
        return call;
      case 2:
        call = open();
        sessions[call.session].isOpen = false;
        call.misuse = oneOf({Call::nullName, Call::longName});
        return call;
      case 3:
        call = dispatch();
        call.misuse = oneOf({Call::nullOut, Call::nullLength, Call::nullData, Call::negativeLength});
        return call;
      case 4:
        call = choices.oneIn(2) ? setOption() : close();
        call.misuse = Call::nullOut;
        return call;
      default: {
        const int kind = below(3);
        call = kind == 0 ? setOption() : kind == 1 ? dispatch() : close();
        call.session = below(kSessions);
        call.misuse = Call::staleHandle;
        return call;
      }
    }
  }

  Call open() {
    Call call;
    call.what = Call::open;
    call.session = below(kSessions);
    for (int i = 0; i < kSessions && sessions[call.session].isOpen; ++i) call.session = (call.session + 1) % kSessions;
    call.sensor = oneOf(favourites);
    call.answers = answers();
    sessions[call.session] = {call.sensor, true};
    return call;
  }

  // A call for a session, mostly one that is open.
  Call forSession(Call::What what) {
    Call call;
    call.what = what;
    call.session = below(kSessions);
    for (int i = 0; i < kSessions && !sessions[call.session].isOpen; ++i) call.session = (call.session + 1) % kSessions;
    return call;
  }

  Call close() {
    Call call = forSession(Call::close);
    call.answers = answers();
    return call;
  }

  Call setOption() {
    Call call = forSession(Call::setOption);
    const int sensor = sessions[call.session].sensor;
    if (choices.oneIn(20)) {
      call.option.verbatim = oneOf(kStrings);
      call.option.isNull = choices.oneIn(3);
      return call;
    }
    auto& members = call.option.members;
    const model::KindRow& row = model::rowOf(sensor);
    for (const model::Key& key : row.keys) {
      if (!choices.oneIn(3) || (sensor == dtwgs && !choices.oneIn(6))) members.emplace_back(key.name, value(key));
    }
    for (const model::StringKey& key : row.stringKeys) {
      if (choices.oneIn(4)) members.emplace_back(key.name, choices.oneIn(8) ? oneOf(kNotIntegers) : templateText());
    }
    if (choices.oneIn(20)) members.emplace_back("colour", value({.name = "colour", .low = 0, .high = 9}));
    return call;
  }

  std::string value(const model::Key& key) {
    const auto [low, high] = usualValues(key);
    const int kind = below(20);
    if (kind == 0) return oneOf(kNotIntegers);
    if (kind == 1) return std::to_string(oneOf(kOddIntegers));
    if (kind == 2) return std::to_string(low - 1);
    if (kind == 3) return std::to_string(high + 1);
    if (std::strcmp(key.name, "mode") == 0 && high == 4) return choices.oneIn(3) ? "1" : "4";
    return std::to_string(low + choices.below(static_cast<uint32_t>(high - low + 1)));
  }

  std::string templateText() {
    constexpr const char* kDigits = "0123456789abcdef";
    const int kind = below(12);
    if (kind == 0) return "\"\"";
    if (kind == 1) return "\"0ZA9\xC3\xA9zA\"";
    if (kind == 2) return "\"0384" + std::string(2 * 900 + choices.below(4), '7') + '"';
    if (kind == 3) return "\"0385\"";
    const uint32_t bytes = choices.below(6);
    std::string text = std::string("\"000") + kDigits[choices.oneIn(4) ? choices.below(16) : bytes];
    for (uint32_t i = 0; i < 2 * bytes; ++i) text += kDigits[choices.below(16)];
    if (choices.oneIn(6)) text += 'f';
    return text + '"';
  }

  Answers answers() {
    Answers answers;
    if (!choices.oneIn(8)) return answers;
    switch (below(7)) {
      case 0:
        answers.get = -2;
        break;
      case 1:
        answers.open = -22;
        break;
      case 2:
        answers.gives = false;
        break;
      case 3:
        answers.version = 0x100;
        break;
      case 4:
        answers.activate = -5;
        break;
      case 5:
        answers.deactivate = -5;
        break;
      default:
        answers.starts = false;
        break;
    }
    return answers;
  }

  Call dispatch() {
    Call call = forSession(Call::dispatch);
    const int sensor = sessions[call.session].sensor;
    call.record = record(sensor);
    if (sensor == gspx) {
      for (int i = below(4); i > 0; --i) {
        call.answers.names.push_back(choices.oneIn(3) ? std::nullopt : std::optional<std::string>(oneOf(kNames)));
      }
    }
    if (choices.oneIn(16)) call.record.resize(choices.below(static_cast<uint32_t>(call.record.size()) + 16));
    return call;
  }

  template <class Integer>
  static void append(Bytes& bytes, Integer value) {
    bytes.resize(bytes.size() + sizeof value);
    std::memcpy(bytes.data() + bytes.size() - sizeof value, &value, sizeof value);
  }
  uint8_t byte() { return static_cast<uint8_t>(choices.below(256)); }

  Bytes record(int sensor) {
    Bytes bytes;
    append(bytes, oneOf(kTimestamps));
    switch (sensor) {
      case phyac:
        addItems(bytes, oneOf(kCounts));
        break;
      case isact:
        append(bytes, choices.oneIn(8) ? static_cast<int32_t>(byte() * 0x1010101U) : below(6));
        break;
      case scoun:
        append(bytes, (below(21) - 10) * (choices.oneIn(4) ? 50 : 100));
        break;
      case gspx:
        addSamples(bytes);
        break;
      case pdr: {
        const int count = choices.oneIn(6) ? oneOf(kCounts) : 1;
        append(bytes, static_cast<int16_t>(count));
        const uint8_t first = byte();
        for (int i = 0; i < 28 * std::min(count, 65); ++i) bytes.push_back(static_cast<uint8_t>(first + i));
        break;
      }
      default:
        append(bytes, static_cast<int16_t>(choices.oneIn(8) ? byte() * 0x101 : below(7)));
        for (int i = below(3); i > 0; --i) bytes.push_back(byte());
        break;
    }
    return bytes;
  }

  // Items of few classes, so that some of them have a majority.
  void addItems(Bytes& bytes, int count) {
    append(bytes, static_cast<int16_t>(count));
    const uint32_t classes = choices.oneIn(8) ? 16 : 1 + choices.below(3);
    const uint32_t first = choices.oneIn(8) ? choices.below(16) : choices.below(8);
    uint32_t sequence = choices.below(4096);
    for (int i = 0; i < count; ++i) {
      append(bytes, static_cast<uint16_t>(sequence++ << 4 | ((first + choices.below(classes)) & 15)));
    }
  }

  void addSamples(Bytes& bytes) {
    append(bytes, static_cast<int16_t>(choices.oneIn(8) ? byte() * 0x101 : 0));
    int size = 12 * below(4);
    if (choices.oneIn(8)) size = below(60);
    if (choices.oneIn(32)) size = 2040 + below(12);
    append(bytes, static_cast<uint16_t>(choices.oneIn(32) ? 65535 : size));
    for (int i = 0; i < std::max(size, 12); ++i) bytes.push_back(static_cast<uint8_t>(byte() + i));
  }

  static constexpr int kSessions = 6;

  Choices& choices;
  int favourites[2] = {};
  Session sessions[kSessions];
};

}  // namespace

uint32_t RandomChoices::below(uint32_t bound) {
  state += 0x9E3779B97F4A7C15;
  uint64_t mixed = state;
  mixed = (mixed ^ mixed >> 30) * 0xBF58476D1CE4E5B9;
  mixed = (mixed ^ mixed >> 27) * 0x94D049BB133111EB;
  return static_cast<uint32_t>((mixed ^ mixed >> 31) >> 32) % bound;
}

Sequence makeSequence(Choices& choices) {
  return Generator(choices).sequence();
}

}  // namespace oracle
