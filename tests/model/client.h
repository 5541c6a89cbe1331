#pragma once

#include <senseloom.h>

#include <map>
#include <string>
#include <vector>

#include "call.h"
#include "model/model.h"

// Both sides of a comparison: a client of the library, and the model in the same place.
namespace oracle {

using model::Mistake;
using model::Model;
using model::Outcome;
using model::Property;
using model::PropertyList;
using model::Shortage;

// What came of one call of the library. What `complaint` tells is wrong whatever was to be expected.
struct Observation {
  Outcome outcome;
  const void* opened = nullptr;  // handle of the new session
  ctx_option_t* list = nullptr;  // for the caller to release
  std::string complaint;         // empty: none
};

// Has the platform answer so from now on.
void setAnswers(const model::Answers& answers);
// The lines logged since the last call.
model::Log logged();
// Makes the library, in which no session is open, as it was when it was loaded; only getSensor() tells afterwards that
// there were any calls. Takes to be told whether templates were stored and whether gestures may have been recognised.
void restoreLibrary(bool gaveTemplates, bool openedGestures);

// Makes calls on the library, on fakes of the platform, and remembers the sessions by their names in the calls.
class Client {
 public:
  Client();

  // The handles that a call is made for, one after the other. A call for a session that is not open is made for none,
  // but with a stale handle if it is to be; calls for no session are made for a null handle.
  std::vector<void*> targets(const Call& call) const;
  Observation make(const Call& call, void* handle);
  // Told of each close that closed a session.
  void noteClosed(const Call& call, const void* handle);

  // The sessions that are open, by name, in opening order.
  const std::vector<int>& openSessions() const { return opened; }
  int sensorOf(int session) const { return sessions.at(session).sensor; }
  void* handleOf(int session) const { return sessions.at(session).handle; }

  // Makes the library as it was when it was loaded, whatever the calls made of it; only getSensor() tells afterwards
  // that there were any.
  void restore();

 private:
  struct Session {
    void* handle;
    int sensor;
    bool isOpen;  // an open that failed leaves an open session with a null handle
  };

  void noteOpened(const Call& call, void* handle);
  Observation open(const Call& call);
  Observation negotiate(const Call& call, void* handle);
  Observation dispatch(const Call& call, void* handle);

  std::map<int, Session> sessions;
  std::vector<int> opened;
  std::map<const void*, const void*> buffers;  // where a session delivers its results
  bool openedGestures = false;
  bool gaveTemplates = false;
};

// The entries of a list; a complaint when one of them has no value.
PropertyList propertiesOf(const ctx_option_t* list, std::string& complaint);

// The same call on the model. `opened` is the handle that the library gave the new session.
Outcome makeOnModel(Model& model, const Call& call, const void* handle, const void* opened);

// What is different, for people; empty when nothing is.
std::string difference(const Outcome& expected, const Outcome& actual);

}  // namespace oracle
