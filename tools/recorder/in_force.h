#pragma once

#include <cstdint>
#include <functional>
#include <list>
#include <map>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace senseloom::trace {

// What is open and asked for in a process: the calls that made it so, in their order, without those that left no mark.
// Made again, they bring a fresh library to the same sessions with the same options. Of the option strings of a session
// each different one is kept where it was last given, since a string need not set everything.
//
// One thing is not kept: the gesture templates that a session stored which is closed by now.
class InForce {
 public:
  void opened(uint32_t session, const char* sensor);
  void optionSet(uint32_t session, const char* option, bool wasAccepted);
  void closed(uint32_t session, bool othersRemain);
  void uninitialised();
  // The last property list of a session's sensor, as a line for readers.
  void listed(uint32_t session, std::string note);

  // The sessions on the sensor of one, itself included.
  std::vector<uint32_t> sessionsBeside(uint32_t session) const;
  std::string sensorOf(uint32_t session) const;

  using Tell = std::function<void(std::string_view line, bool isCall)>;
  // Gives the lines. `isResumed` says of a session whether it may be in the middle of something.
  void tell(const Tell& line, const std::function<bool(uint32_t session)>& isResumed) const;

 private:
  enum class Kind { open, option, renegotiation, uninit };
  struct Event {
    Kind kind;
    uint32_t session;    // of an open, an option
    std::string text;    // the option; the sensor of a renegotiation
    bool wasAccepted;    // the option
    uint32_t openUntil;  // of an uninit: the last session that was opened before
  };
  using EventPlace = std::list<Event>::iterator;
  struct OpenSession {
    std::string sensor;
    EventPlace opening;
    std::vector<EventPlace> options;
  };

  void tellRenegotiation(const Tell& line, const std::string& sensor) const;
  void forgetRenegotiation(const std::string& sensor);
  bool isAnyOpen(const std::string& sensor) const;

  std::list<Event> events;
  std::map<uint32_t, OpenSession> sessions;
  std::unordered_map<std::string, EventPlace> renegotiations;  // by sensor
  std::unordered_map<std::string, std::string> lists;          // by sensor
  uint32_t lastOpened = 0;
};

// How a trace names a session.
std::string sessionName(uint32_t number);

}  // namespace senseloom::trace
