#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "activity.h"
#include "audio.h"
#include "gestures.h"
#include "merging.h"
#include "outcome.h"
#include "records.h"
#include "request.h"
#include "templates.h"

// What the library must do, and why: a second, deliberately plain computation, which shares nothing with the library
// but the JSON parser. Tests compare the library with it, and `senseloom explain` prints what it says.
namespace senseloom::model {

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
  // Whether outcomes come with remarks about option strings and with negotiations.
  bool explains = false;

  // The state that callers see: the exported globals, and whether what a property list of a sensor points at is alive.
  bool deviceOpen() const { return audio.deviceOpen(); }
  bool active() const { return audio.active(); }
  int negotiations(int sensor) const { return sensors[static_cast<size_t>(sensor)].negotiations; }
  bool isLive(const void* handle) const;
  // The bytes that template property points at now.
  std::string templateBytes(int slot, size_t length) const {
    return templates.bytes(static_cast<size_t>(slot), length);
  }
  // The stages that the records of a session go through; empty when its sensor has none.
  std::string chain(const void* handle) const;

 private:
  struct Session {
    const void* handle = nullptr;
    Request request;
    std::optional<Activity> activity;  // of activity alone
    Gathering gathering;
    bool operator==(const Session&) const = default;

    int kind() const { return request.kind(); }
  };
  struct Sensor {
    std::vector<const void*> queue;  // its sessions, in opening order
    int32_t leastLogM = 0;           // of activity: as merged last
    int negotiations = 0;
    bool operator==(const Sensor&) const = default;
  };

  Session* session(const void* handle);
  const Session* session(const void* handle) const;
  Sensor& sensorOf(const Session& session) { return sensors[static_cast<size_t>(session.kind())]; }
  bool prepare();  // makes the sensors; false when there is no room
  void negotiate(Merged merged, const Session& first);
  void explainNegotiation(const Merged& merged, const Session& first, std::optional<Remark> conflict);
  bool rebuild(int kind);
  Verdict judge(Session& session, Record record);
  bool stop(int kind);
  void remove(const Session& session);

  Mistake mistake;
  Outcome outcome;  // of the call that is under way

  bool inited = false;
  std::array<Sensor, kKinds> sensors;
  std::vector<Session> sessions;  // in opening order
  Templates templates;
  Gestures gestures;
  Audio audio;
};

}  // namespace senseloom::model
