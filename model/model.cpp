#include "model.h"

#include <formatted.h>
#include <jansson.h>

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <memory>
#include <utility>

namespace oracle {
namespace {

constexpr int kDebug = 3;
constexpr int kInfo = 4;
constexpr int kError = 6;
constexpr const char* kTag = "libsenseloom";
constexpr const char* kAudioTag = "aware_audio";
constexpr const char* kUnreadable = "invalid opton string %s, all set as default";

struct Release {
  void operator()(json_t* json) const { json_decref(json); }
};
using Json = std::unique_ptr<json_t, Release>;

int32_t read(const Json& root, const char* key, int32_t otherwise) {
  const json_t* value = json_object_get(root.get(), key);
  return json_is_integer(value) ? static_cast<int32_t>(json_integer_value(value)) : otherwise;
}

template <class Integer>
Integer at(const uint8_t* data, size_t offset) {
  Integer value;
  std::memcpy(&value, data + offset, sizeof value);
  return value;
}

bool bit(int32_t mask, int64_t position) {
  return (static_cast<uint32_t>(mask) >> (position & 31) & 1U) != 0;
}

int32_t shifted(int32_t value, int32_t count) {
  return static_cast<int32_t>(static_cast<uint32_t>(value) << (static_cast<uint32_t>(count) & 31U));
}

int kindNamed(const std::string& name) {
  for (int kind = 0; kind < kSensors; ++kind) {
    if (name == kSensorNames[kind]) return kind;
  }
  return -1;
}

Property property(int32_t id, int32_t value) {
  return {id, std::string(reinterpret_cast<const char*>(&value), sizeof value)};
}

}  // namespace

// --- sessions and negotiation

Outcome Model::open(const char* name, const void* handle) {
  if (!prepare() || name == nullptr) return std::exchange(outcome, {});
  const int kind = kindNamed(std::string(name).substr(0, 9));
  if (kind < 0 || shortage.room) return std::exchange(outcome, {});
  Sensor& sensor = sensors[static_cast<size_t>(kind)];
  if (sensor.queue.empty() && kind == lpe && !activate()) return std::exchange(outcome, {});
  if (shortage.session) return std::exchange(outcome, {});

  Session session;
  session.kind = kind;
  session.handle = handle;
  session.option = defaults(kind);
  if (kind == phyac) session.work.resize(10 + 2 * 256);
  if (kind == gspx && ++gestureSessions == 1) {
    ++outcome.engineStarts;
    if (!answers.starts) log(kError, kTag, "hmm gesture algorithm start return false");
  }
  sessions.push_back(session);
  sensor.queue.push_back(handle);
  outcome.returned = 1;
  return std::exchange(outcome, {});
}

Outcome Model::setOption(const void* handle, const char* text, bool hasOut) {
  outcome.returned = -1;
  if (text == nullptr || handle == nullptr || !hasOut) return std::exchange(outcome, {});
  outcome.storesList = true;
  if (!prepare()) return std::exchange(outcome, {});
  Session* found = session(handle);
  if (found == nullptr) return std::exchange(outcome, {});
  // What can not be read for want of memory is treated as what can not be read.
  const int kind = found->kind;
  const int parsed = parse(kind, found->option, text);
  if (kind != scoun && parsed != 0) return std::exchange(outcome, {});
  if (mistake == Mistake::optionDropsPendingItems) found->pending.clear();
  if (shortage.copy) return std::exchange(outcome, {});
  Option copy = found->option;
  copy.index = 0;
  negotiate(kind, copy);
  if (outcome.list && rebuild(kind)) outcome.returned = 0;
  return std::exchange(outcome, {});
}

Outcome Model::close(const void* handle, bool hasOut) {
  outcome.returned = -1;
  if (!hasOut || handle == nullptr) return std::exchange(outcome, {});
  outcome.storesList = true;
  if (!prepare()) return std::exchange(outcome, {});
  const Session* found = session(handle);
  if (found == nullptr) return std::exchange(outcome, {});
  const int kind = found->kind;
  auto& queue = sensors[static_cast<size_t>(kind)].queue;
  const auto remaining = std::find_if(queue.begin(), queue.end(), [&](auto* other) { return other != handle; });
  const bool isLast = remaining == queue.end();
  if (!isLast && shortage.copy) return std::exchange(outcome, {});

  Option copy;
  if (!isLast) copy = session(*remaining)->option;
  copy.index = 0;
  const Option closed = found->option;
  queue.erase(std::remove(queue.begin(), queue.end(), handle), queue.end());
  sessions.erase(std::find_if(sessions.begin(), sessions.end(), [&](auto& one) { return one.handle == handle; }));
  if (kind == gspx && --gestureSessions == 0) ++outcome.engineCloses;
  if (isLast) {
    outcome.returned = kind != lpe || deactivate() ? 0 : -1;
    return std::exchange(outcome, {});
  }
  if (mistake == Mistake::closedSessionStaysMerged) merge(kind, copy, closed);
  negotiate(kind, copy);
  if (rebuild(kind)) outcome.returned = 1;
  return std::exchange(outcome, {});
}

Outcome Model::uninit() {
  if (!inited) return {};
  inited = false;
  for (Sensor& sensor : sensors) sensor = {.queue = {}, .merged = {}, .negotiations = sensor.negotiations + 1};
  return {};
}

// The pointers of deleted sensors are found, too.
Outcome Model::find(const char* name) {
  outcome.returned = name != nullptr && kindNamed(name) >= 0 ? 1 : 0;
  return std::exchange(outcome, {});
}

bool Model::isLive(const void* handle) const {
  return std::any_of(sessions.begin(), sessions.end(), [&](auto& session) { return session.handle == handle; });
}

Model::Session* Model::session(const void* handle) {
  const auto found = std::find_if(sessions.begin(), sessions.end(), [&](auto& one) { return one.handle == handle; });
  return found == sessions.end() ? nullptr : &*found;
}

bool Model::prepare() {
  if (!inited && shortage.room) return false;
  inited = true;
  return true;
}

void Model::negotiate(int kind, Option merged) {
  Sensor& sensor = sensors[static_cast<size_t>(kind)];
  for (size_t i = 0; i < sensor.queue.size(); ++i) {
    log(kInfo, "Libsl", "The %d of %d session of sensor %s has %p option!\n", static_cast<int>(i),
        static_cast<int>(sensor.queue.size()), kSensorNames[kind], sensor.queue[i]);
    merge(kind, merged, session(sensor.queue[i])->option);
  }
  sensor.merged = merged;
  ++sensor.negotiations;
  outcome.list = render(kind, merged);
}

// Only activity sessions have anything to rebuild.
bool Model::rebuild(int kind) {
  const Sensor& sensor = sensors[static_cast<size_t>(kind)];
  if (kind != phyac) return true;
  bool all = true;
  for (size_t i = 0; i < sensor.queue.size(); ++i) {
    if (bit(static_cast<int32_t>(shortage.rebuild), static_cast<int64_t>(i))) {
      all = false;
      continue;
    }
    Session& one = *session(sensor.queue[i]);
    one.chain = Chain{};
    one.chain->batchSize = size_t{1} << ((one.option.logN - sensor.merged->logM) & 31);
    one.chain->votes = one.option.summary != 0;
    one.chain->weightVar = one.option.weightVar;
    one.chain->classMask = one.option.classMask;
    one.chain->onChange = one.option.mode == 1;
  }
  return all;
}

// --- options

Model::Option Model::defaults(int kind) {
  Option option;
  switch (kind) {
    case phyac:
      option.classMask = -1;
      option.summary = 1;
      option.weightVar = -1;
      break;
    case stap:
    case gseth:
    case lift:
      option.classMask = 3;
      break;
    case gsflk:
      option.classMask = 63;
      break;
    case shaki:
      option.sensitivity = 1;
      break;
    case isact:
      option.classMask = 15;
      break;
    case scoun:
      option.mode = 1;
      option.logN = 1;
      break;
    case gspx:
      option.classMask = 65535;
      break;
    case lpe:
      option.interval = 5000;
      break;
    case pdr:
      option.userHeight = 1000;
      option.floorHeight = 5000;
      option.initX = option.initY = option.initFloor = 32767;
      option.sixDof = 2;
      break;
    default:
      break;
  }
  return option;
}

int Model::parse(int kind, Option& option, const char* text) {
  if (kind == dtwgs) return parseTemplates(option, text);
  const Json root(shortage.text ? nullptr : json_loads(text, 0, nullptr));
  if (root == nullptr) {
    const char* prefix = kind == gsflk   ? "gestureflick: "
                         : kind == shaki ? "shaking: "
                         : kind == isact ? "instantactivity: "
                         : kind == gspx  ? "gesture hmm: "
                         : kind == gseth ? "gesture eartouch: "
                         : kind == lpe   ? "audio : "
                                         : nullptr;
    if (prefix != nullptr) log(kError, kind == isact ? "STY" : kTag, (std::string(prefix) + kUnreadable).c_str(), text);
    return kind == isact ? 0 : -1;
  }

  const Option otherwise = defaults(kind);
  const auto readMask = [&](int32_t most, const char* tag, const char* message) {
    option.classMask = read(root, "classMask", otherwise.classMask);
    if (option.classMask >= 1 && option.classMask <= most) return;
    log(kError, tag, message, option.classMask);
    option.classMask = otherwise.classMask;
  };
  // Takes a value of which the range is checked; the default, which can be out of range itself, replaces it.
  const auto readRange = [&](int32_t& field, const char* key, int32_t fallback, int32_t low, int32_t high,
                             const char* message) {
    field = read(root, key, fallback);
    if (field >= low && field <= high) return true;
    log(kError, kTag, message, field);
    return false;
  };

  switch (kind) {
    case phyac: {
      option.mode = read(root, "mode", 0);
      option.maxLogN = read(root, "logN", 0);
      option.logN = std::clamp(option.maxLogN, 0, 8);
      option.logM = std::clamp(read(root, "logM", 0), 0, option.logN);
      option.classMask = read(root, "classMask", -1);
      if (option.classMask < -1 || option.classMask > 255) option.classMask = -1;
      option.summary = read(root, "summary", 1);
      if (option.summary != 0) option.summary = 1;
      option.weightVar = std::max(read(root, "weightVar", -1), -1);
      option.continuous = read(root, "continuous", 0);
      if (option.continuous != 0) option.continuous = 1;
      break;
    }
    case stap:
      readMask(3, kTag, "tapping: invalid clsmask value %d");
      if (!readRange(option.level, "level", 0, -5, 5, "tapping: invalid level value %d")) option.classMask = 0;
      break;
    case gsflk:
      readMask(63, kTag, "gestureflick: invalid clsmask value %d");
      if (!readRange(option.level, "level", 0, -5, 5, "gestureflick: invalid level value %d")) option.level = 0;
      break;
    case shaki:
      if (!readRange(option.sensitivity, "sensitivity", 1, 0, 2, "shaking: invalid clsmask value %d")) {
        option.sensitivity = 1;
      }
      break;
    case isact:
      readMask(15, "STY", "instantactivity: invalid clsmask value %d");
      break;
    case scoun:
      option.mode = read(root, "mode", 1) == 0 ? 0 : 1;
      option.logN = std::clamp(read(root, "logN", 1), 1, 100);
      break;
    case gspx:
      readMask(65535, kTag, "gesture hmm: invalid clsmask value %d");
      break;
    case gseth:
      readMask(3, kTag, "gesture eartouch: invalid clsmask value %d");
      break;
    case lpe:
      option.interval = read(root, "interval", 5000);
      break;
    case pdr:
      if (!readRange(option.userHeight, "userHeight", 1000, 100, 300, "PDR: invalid user height value %d")) {
        option.userHeight = 1000;
      }
      if (!readRange(option.floorHeight, "floorHeight", 5000, 200, 800, "PDR: invalid floor height value %d")) {
        option.floorHeight = 5000;
      }
      option.initX = read(root, "initX", 32767);
      option.initY = read(root, "initY", 32767);
      option.initFloor = read(root, "initFloor", 32767);
      if (!readRange(option.n, "N", 0, 0, 6, "PDR: invalid N value %d")) option.n = 0;
      if (!readRange(option.sixDof, "6DOF", 2, 0, 1, "PDR: invalid 6DOF value %d")) option.sixDof = 2;
      break;
    case lift:
      log(kError, kTag, "tapping: invalid clsmask value %d", read(root, "classMask", 3));
      break;
    default:
      break;
  }
  return 0;
}

int Model::parseTemplates(Option& option, const char* text) {
  const Json root(shortage.text ? nullptr : json_loads(text, 0, nullptr));
  if (root == nullptr) return -1;
  bool stored = true;
  for (int slot = 0; slot < 2; ++slot) {
    const json_t* value = json_object_get(root.get(), slot == 0 ? "template1" : "template2");
    if (!json_is_string(value) || storeTemplate(slot, json_string_value(value))) continue;
    log(kError, kTag, "Invalid template%d value", slot + 1);
    stored = false;
  }
  if (!stored) return -1;

  Option given;
  given.mode = read(root, "mode", 0);
  given.classMask = read(root, "classMask", 0);
  given.level = read(root, "level", 0);
  given.index = read(root, "index", 0);
  if (given.mode != 1 && given.mode != 4) {
    log(kError, kTag, "Invalid mode value %d", given.mode);
    return -1;
  }
  const bool hasMask = given.classMask >= 1 && given.classMask <= 3;
  if (given.mode == 4 && hasMask && (given.level < -1 || given.level > 1)) {
    log(kError, kTag, "Invalid level value %d at match mode", given.level);
    return -1;
  }
  if (given.mode == 4 && !hasMask) {
    log(kError, kTag, "Invalid mask value %d at match mode", given.classMask);
    return -1;
  }
  if (given.mode == 1 && given.index != 0 && given.index != 1) {
    log(kError, kTag, "Invalid index value %d at enroll mode", given.index);
    return -1;
  }
  option = given;
  return 0;
}

bool Model::storeTemplate(int slot, const std::string& text) {
  const auto digit = [&](size_t i) { return text[i] >= 'a' && text[i] <= 'z' ? text[i] - 87 : text[i] - 48; };
  if (text.size() < 4) return false;
  const int length = digit(0) * 4096 + digit(1) * 256 + digit(2) * 16 + digit(3);
  const size_t bytes = (text.size() - 4) / 2;
  if (length < 0 || length > 900 || bytes > 900) return false;
  Template& stored = templates[static_cast<size_t>(slot)];
  stored.length = length;
  for (size_t i = 0; i < bytes; ++i) {
    stored.data[i] = static_cast<uint8_t>(digit(4 + 2 * i) * 16 + digit(5 + 2 * i));
  }
  return true;
}

std::string Model::templateBytes(int slot, size_t length) const {
  return std::string(reinterpret_cast<const char*>(templates[static_cast<size_t>(slot)].data.data()), length);
}

void Model::merge(int kind, Option& into, const Option& other) {
  switch (kind) {
    case phyac:
      into.mode = into.mode == 1 && other.mode == 1 && into.logN == other.logN ? 1 : 0;
      into.logN = std::min(into.logN, other.logN);
      into.logM = std::min(into.logM, other.logM);
      into.maxLogN = std::max(into.maxLogN, other.logN);
      into.classMask |= other.classMask;
      into.continuous = into.continuous != 0 || other.continuous != 0 ? 1 : 0;
      break;
    case stap:
    case gsflk:
      into.classMask |= other.classMask;
      into.level = std::min(into.level, other.level);
      break;
    case shaki:
      into.sensitivity = std::max(into.sensitivity, other.sensitivity);
      break;
    case scoun:
      into.mode = into.mode == 1 && other.mode == 1 ? 1 : 0;
      into.logN = std::min(into.logN, other.logN);
      break;
    case dtwgs:
      into.classMask |= other.classMask;
      into.level = std::min(into.level, other.level);
      if ((other.mode & 1) != 0) ++into.enrolling;
      into.mode |= other.mode;
      break;
    case lpe:
      into.interval = other.interval;
      break;
    case pdr:
      into.n = std::min(into.n, other.n);
      break;
    default:
      into.classMask |= other.classMask;
      break;
  }
}

std::optional<PropertyList> Model::render(int kind, const Option& option) {
  if (kind == dtwgs) return renderTemplates(option);
  if (shortage.list) return std::nullopt;
  switch (kind) {
    case phyac: {
      const int32_t spans = shifted(shifted(1, option.maxLogN), 16) | shifted(1, option.logN);
      return PropertyList{property(41, option.mode), property(43, spans),
                          property(44, shifted(1, option.logN) >> option.logM), property(42, option.classMask)};
    }
    case stap:
      return PropertyList{property(101, option.classMask), property(102, option.level)};
    case gsflk:
      return PropertyList{property(61, option.classMask), property(62, option.level)};
    case shaki:
      return PropertyList{property(81, option.sensitivity)};
    case isact:
      return PropertyList{property(151, option.classMask)};
    case scoun:
      return PropertyList{property(141, option.mode), property(142, option.logN)};
    case gseth:
      return PropertyList{property(161, option.classMask)};
    case lpe:
      return PropertyList{property(0, option.interval)};
    case pdr:
      return PropertyList{property(181, option.userHeight), property(182, option.floorHeight),
                          property(183, option.initX),      property(184, option.initY),
                          property(185, option.initFloor),  property(186, option.n),
                          property(187, option.sixDof)};
    case lift:
      return PropertyList{property(201, option.classMask)};
    default:
      return PropertyList{};
  }
}

std::optional<PropertyList> Model::renderTemplates(const Option& option) {
  if (option.enrolling > 1) {
    log(kDebug, kTag, "option invalid");
    return std::nullopt;
  }
  if (option.mode != 1 && option.mode != 4) {
    log(kDebug, kTag, "option mode incompatible: %d", option.mode);
    return std::nullopt;
  }
  if (shortage.list) return std::nullopt;
  PropertyList list;
  if (option.mode == 1) return list;
  list.push_back(property(121, option.level));
  for (int slot = 0; slot < 2; ++slot) {
    const int32_t length = templates[static_cast<size_t>(slot)].length;
    if (!bit(option.classMask, slot) || length <= 0) continue;
    list.push_back(property(122, slot));
    list.push_back({123, templateBytes(slot, static_cast<size_t>(length)), slot});
  }
  return list;
}

// --- records

Outcome Model::dispatch(const void* handle, const uint8_t* data, int len, bool hasOut, bool hasLength) {
  outcome.returned = -1;
  if (data == nullptr || handle == nullptr || len < 0 || !hasLength || !hasOut) return std::exchange(outcome, {});
  if (!prepare()) return std::exchange(outcome, {});
  Session* found = session(handle);
  if (found != nullptr) outcome.returned = deliver(*found, data, len);
  return std::exchange(outcome, {});
}

int Model::deliver(Session& session, const uint8_t* data, int len) {
  const Option& option = session.option;
  switch (session.kind) {
    case phyac:
      return deliverActivity(session, data, len);
    case gspx:
      return deliverGesture(session, data, len);
    case pdr:
      return deliverItems(session, data, len);
    case stap:
    case dtwgs:
      return deliverSame(len >= 10 && (at<int16_t>(data, 8) & option.classMask) != 0);
    case gsflk:
    case gseth:
      return deliverSame(len >= 10 && bit(option.classMask, int64_t{at<int16_t>(data, 8)} - 1));
    case isact:
      return deliverSame(len >= 12 && bit(option.classMask, int64_t{at<int32_t>(data, 8)} - 1));
    case scoun:
      return deliverSame(option.mode == 1 || (len >= 12 && at<int32_t>(data, 8) % (option.logN * 100) == 0));
    default:
      return deliverSame(true);
  }
}

int Model::deliverSame(bool wanted) {
  if (!wanted) return 0;
  outcome.delivers = Outcome::sameRecord;
  return 1;
}

int Model::deliverActivity(Session& session, const uint8_t* data, int len) {
  if (!session.chain) return deliverSame(true);
  Chain& chain = *session.chain;
  auto& work = session.work;
  if (len > 0) {
    if (len < 10) return -1;
    const int count = at<int16_t>(data, 8);
    if (count > 0 && 10 + 2 * count > len) return -1;
    std::copy(data, data + std::min<size_t>(static_cast<size_t>(len), work.size()), work.begin());
  }
  const int count = std::min<int>(at<int16_t>(work.data(), 8), 256);
  if (count < 0) return 0;
  for (int i = 0; i < count && chain.batch.size() < chain.batchSize; ++i) {
    chain.batch.push_back(at<uint16_t>(work.data(), 10 + 2 * static_cast<size_t>(i)));
  }
  if (chain.batch.size() < chain.batchSize) return 0;

  std::vector<uint16_t> items = chain.votes ? vote(chain) : chain.batch;
  chain.batch.clear();
  for (uint16_t& item : items) {
    if (!bit(chain.classMask, item & 15)) item = static_cast<uint16_t>(item & ~15);
  }
  if (chain.onChange) {
    const bool changed =
        std::any_of(items.begin(), items.end(), [&](uint16_t item) { return chain.lastClass != (item & 15); });
    if (!changed) return 0;
    chain.lastClass = items.back() & 15;
  }
  const auto number = static_cast<uint16_t>(items.size());
  std::memcpy(work.data() + 8, &number, sizeof number);
  std::memcpy(work.data() + 10, items.data(), 2 * items.size());
  outcome.delivers = Outcome::ownBuffer;
  outcome.result.assign(work.begin(), work.begin() + static_cast<std::ptrdiff_t>(10 + 2 * items.size()));
  return 1;
}

std::vector<uint16_t> Model::vote(const Chain& chain) const {
  // Weights and sums wrap around in 32 bits, which the conversions from 64 bits do.
  int32_t weight = 1024;
  int32_t total = 0;
  std::array<int32_t, 8> scores{};
  for (const uint16_t item : chain.batch) {
    const size_t voted = (item & 15) > 7 ? 0 : item & 15;
    scores[voted] = static_cast<int32_t>(int64_t{scores[voted]} + weight);
    total = static_cast<int32_t>(int64_t{total} + weight);
    if (chain.weightVar != -1) weight = static_cast<int32_t>(int64_t{weight} + (weight >> (chain.weightVar & 31)));
  }
  const auto winner = std::max_element(scores.begin(), scores.end());  // the first of several
  const int noMajority = mistake == Mistake::noMajorityIsClass0 ? 0 : 6;
  const int voted = *winner > total >> 1 ? static_cast<int>(winner - scores.begin()) : noMajority;
  return {static_cast<uint16_t>((chain.batch.front() & 0xFFF0) | voted)};
}

int Model::deliverGesture(const Session& session, const uint8_t* data, int len) {
  if (len < 24 || len > 2052 || 12 + at<uint16_t>(data, 10) > len) return -1;
  if (const auto timestamp = at<uint64_t>(data, 0); timestamp != lastTimestamp) {
    lastTimestamp = timestamp;
    lastGesture = 0;
    recognise(data, len);
  }
  if (!bit(session.option.classMask, lastGesture - 1)) return 0;
  outcome.delivers = Outcome::ownBuffer;
  outcome.result.assign(data, data + len);
  outcome.result[8] = static_cast<uint8_t>(lastGesture);
  outcome.result[9] = 0;
  return 1;
}

void Model::recognise(const uint8_t* data, int len) {
  constexpr const char* kNames[] = {"NumberOne ",  "NumberTwo ",  "NumberThree ", "NumberFour ",
                                    "NumberFive ", "NumberSix ",  "NumberSeven ", "NumberEight ",
                                    "NumberNine ", "NumberZero ", "LetterA ",     "LetterB ",
                                    "LetterC ",    "LetterD ",    "LetterE ",     "LetterF "};
  const int prx = at<int16_t>(data, 8);
  const int size = at<uint16_t>(data, 10);
  const int groups = std::max((size + 11) / 12, 1);
  for (int k = 0; k < groups; ++k) {
    fake::Platform::Group group{.samples = {}, .count = 1, .last = k == groups - 1};
    auto& s = group.samples;
    const int begin = 12 + 12 * k;
    std::memcpy(s.data(), data + begin, static_cast<size_t>(std::min(12, len - begin)));
    if (group.last) {
      log(kDebug, kTag, "num %d: %hd %hd %hd %hd %hd %hd: last %d, size %d, prx %d\n", k, s[0], s[1], s[2], s[3], s[4],
          s[5], 1, size, prx);
    }
    outcome.groups.push_back(group);
    const auto answer = static_cast<size_t>(k);
    if (answer >= answers.names.size() || !answers.names[answer]) continue;
    const std::string& name = *answers.names[answer];
    log(kDebug, kTag, "-- gesture: %s", name.c_str());
    for (int i = 0; i < 16 && prx == 0; ++i) {
      if (name == kNames[i]) lastGesture = i + 1;
    }
  }
}

int Model::deliverItems(Session& session, const uint8_t* data, int len) {
  if (len < 10) return -1;
  const int count = at<int16_t>(data, 8);
  const int pending = static_cast<int>(session.pending.size() / 28);
  if (count < 0 || 10 + 28 * count > len || pending + count > 64) return -1;
  session.pending.insert(session.pending.end(), data + 10, data + 10 + 28 * count);
  if (pending + count < 1 << session.option.n) return 0;
  outcome.delivers = Outcome::ownBuffer;
  outcome.result.assign(data, data + 8);
  outcome.result.push_back(static_cast<uint8_t>(pending + count));
  outcome.result.push_back(0);
  outcome.result.insert(outcome.result.end(), session.pending.begin(), session.pending.end());
  session.pending.clear();
  return 1;
}

// --- audio

Outcome Model::audioInit() {
  outcome.returned = openDevice() ? 1 : 0;
  return std::exchange(outcome, {});
}

Outcome Model::audioActivate() {
  outcome.returned = activate() ? 1 : 0;
  return std::exchange(outcome, {});
}

Outcome Model::audioDeactivate() {
  outcome.returned = deactivate() ? 1 : 0;
  return std::exchange(outcome, {});
}

bool Model::openDevice() {
  if (isOpen) {
    log(kDebug, kAudioTag, "It is already inited!");
    return true;
  }
  outcome.calls.push_back("get aware.primary");
  log(kDebug, kAudioTag, "bool audio_hal_init() load audio hw module aware.primary (%s)", std::strerror(-answers.get));
  if (answers.get != 0) return false;
  outcome.calls.push_back("open aware_hw_if");
  log(kDebug, kAudioTag, "device open result %d\n", answers.open);
  if (answers.open != 0 || !answers.gives) return false;
  isOpen = true;
  log(kDebug, kAudioTag, "device version %d\n", static_cast<int>(answers.version));
  return answers.version == 0x200;
}

bool Model::activate() {
  if (!openDevice()) {
    log(kError, kAudioTag, "init audio hal failed");
    return false;
  }
  if (isActive) {
    log(kDebug, kAudioTag, "already activated, return");
    return true;
  }
  log(kDebug, kAudioTag, "activating aware... %p\n", deviceAddress);
  outcome.calls.push_back("activate");
  isActive = answers.activate == 0;
  if (isActive) {
    log(kDebug, kAudioTag, "activated aware successful...\n");
  } else {
    log(kError, kAudioTag, "activated aware failed\n");
  }
  return isActive;
}

bool Model::deactivate() {
  if (!openDevice()) {
    log(kError, kAudioTag, "init audio hal failed");
    return false;
  }
  if (!isActive) {
    log(kDebug, kAudioTag, "already deactivated, return");
    return true;
  }
  outcome.calls.push_back("puts deactivating aware session...");
  outcome.calls.push_back("deactivate");
  if (answers.deactivate != 0) {
    log(kError, kAudioTag, "deactivated aware session failed \n");
    return false;
  }
  log(kDebug, kAudioTag, "deactivated aware session successful... \n");
  outcome.calls.push_back("close");
  isActive = isOpen = false;
  return true;
}

void Model::log(int priority, const char* tag, const char* format, ...) {
  va_list arguments;
  va_start(arguments, format);
  outcome.log.push_back({priority, tag, fake::formatted(format, arguments)});
  va_end(arguments);
}

}  // namespace oracle
