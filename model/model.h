#pragma once

#include <fake_platform.h>

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "call.h"

// A second computation of all that the library does, for tests only. It is deliberately plain: one structure for the
// options of all kinds and one for the sessions of all kinds, kinds told apart where they differ, nothing shared with
// the library but the JSON parser and nothing done for speed.
namespace oracle {

struct Property {
  int32_t id;
  std::string value;  // its bytes
  int slot = -1;      // of template bytes: which template
  bool operator==(const Property&) const = default;
};
using PropertyList = std::vector<Property>;

// What a caller and the platform see of one call.
struct Outcome {
  int returned = 0;                  // of those that return a pointer or bool: 1 for non-null and true
  bool storesList = false;           // whether anything was stored through the list's address, null included
  std::optional<PropertyList> list;  // nothing: null
  enum { nothing, sameRecord, ownBuffer } delivers = nothing;
  Bytes result;  // of ownBuffer

  std::vector<fake::LogLine> log;
  std::vector<std::string> calls;             // of the hardware loader and the device
  std::vector<fake::Platform::Group> groups;  // fed to the gesture engine
  int engineStarts = 0;
  int engineCloses = 0;

  bool operator==(const Outcome&) const = default;
};

// Mistakes that the model makes on purpose, to see that a difference is found and shrunk.
enum class Mistake { none, noMajorityIsClass0, closedSessionStaysMerged, optionDropsPendingItems };

// Which allocations of a call fail; `rebuild` has a bit for each session of the sensor, in opening order. Room is what
// is needed before a sensor is started, be it for twelve new sensors or for one session more.
struct Shortage {
  bool room = false;
  bool session = false;
  bool text = false;
  bool copy = false;
  bool list = false;
  uint32_t rebuild = 0;

  bool operator==(const Shortage&) const = default;
};

// Begins as the library is when it was loaded, but for getSensor(), which then does not know any sensor yet.
class Model {
 public:
  explicit Model(Mistake makes = Mistake::none) : mistake(makes) {}
  bool operator==(const Model&) const = default;

  // The calls of the library. The handle of a new session is the library's to choose; it is ignored when the model
  // opens none.
  Outcome open(const char* name, const void* handle);
  Outcome setOption(const void* handle, const char* text, bool hasOut);
  Outcome dispatch(const void* handle, const uint8_t* data, int len, bool hasOut, bool hasLength);
  Outcome close(const void* handle, bool hasOut);
  Outcome uninit();
  Outcome find(const char* name);
  Outcome audioInit();
  Outcome audioActivate();
  Outcome audioDeactivate();

  // What the next call meets.
  Answers answers;
  Shortage shortage;
  const void* deviceAddress = nullptr;

  // The state that callers see: the exported globals, and whether what a property list of a sensor points at is alive.
  bool deviceOpen() const { return isOpen; }
  bool active() const { return isActive; }
  int negotiations(int sensor) const { return sensors[static_cast<size_t>(sensor)].negotiations; }
  bool isLive(const void* handle) const;
  // The bytes that template property points at now.
  std::string templateBytes(int slot, size_t length) const;

 private:
  // The settings of all kinds. A kind uses those that it has a key for.
  struct Option {
    int32_t mode = 0, logN = 0, maxLogN = 0, logM = 0, classMask = 0, summary = 0, weightVar = 0, continuous = 0;
    int32_t level = 0, sensitivity = 0, index = 0, interval = 0;
    int32_t userHeight = 0, floorHeight = 0, initX = 0, initY = 0, initFloor = 0, n = 0, sixDof = 0;
    int enrolling = 0;  // options merged in that enroll
    bool operator==(const Option&) const = default;
  };
  // What an activity session was rebuilt with, and what it gathered since.
  struct Chain {
    size_t batchSize = 0;
    bool votes = false;
    int32_t weightVar = 0;
    int32_t classMask = 0;
    bool onChange = false;
    std::vector<uint16_t> batch;
    std::optional<int> lastClass;
    bool operator==(const Chain&) const = default;
  };
  struct Session {
    int kind = 0;
    const void* handle = nullptr;
    Option option;
    std::optional<Chain> chain;
    std::vector<uint8_t> work;     // activity: the last record, or the result made of it
    std::vector<uint8_t> pending;  // dead reckoning: items not delivered yet
    bool operator==(const Session&) const = default;
  };
  struct Sensor {
    std::vector<const void*> queue;
    std::optional<Option> merged;
    int negotiations = 0;
    bool operator==(const Sensor&) const = default;
  };
  struct Template {
    std::array<uint8_t, 900> data{};
    int32_t length = 0;
    bool operator==(const Template&) const = default;
  };

  static Option defaults(int kind);
  Session* session(const void* handle);
  bool prepare();  // makes the sensors; false when there is no room
  int parse(int kind, Option& option, const char* text);
  int parseTemplates(Option& option, const char* text);
  bool storeTemplate(int slot, const std::string& text);
  static void merge(int kind, Option& into, const Option& other);
  std::optional<PropertyList> render(int kind, const Option& option);
  std::optional<PropertyList> renderTemplates(const Option& option);
  void negotiate(int kind, Option merged);
  bool rebuild(int kind);
  bool openDevice();
  bool activate();
  bool deactivate();

  int deliver(Session& session, const uint8_t* data, int len);
  int deliverActivity(Session& session, const uint8_t* data, int len);
  int deliverGesture(const Session& session, const uint8_t* data, int len);
  int deliverItems(Session& session, const uint8_t* data, int len);
  int deliverSame(bool wanted);
  std::vector<uint16_t> vote(const Chain& chain) const;
  void recognise(const uint8_t* data, int len);

  void log(int priority, const char* tag, const char* format, ...) __attribute__((format(printf, 4, 5)));

  Mistake mistake;
  Outcome outcome;  // of the call that is under way

  bool inited = false;
  std::array<Sensor, kSensors> sensors;
  std::vector<Session> sessions;
  std::array<Template, 2> templates;

  int gestureSessions = 0;
  uint64_t lastTimestamp = 0;
  int lastGesture = 0;

  bool isOpen = false;
  bool isActive = false;
};

}  // namespace oracle
