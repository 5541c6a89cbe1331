#pragma once

#include <hub.h>

#include <cstddef>
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

#include "sense/recording.h"
#include "sense/sense.h"
#include "trace/json.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// One run of hub, library and clients. It makes the calls, which it writes as a trace; the hub gets the property lists
// that the library hands out, and the library the records that the hub makes.
class SensingRun final : private ReplayObserver {
 public:
  SensingRun(std::FILE* stream, const SensingArguments& given);

  // Throws InputError.
  void run(const std::vector<Recording::Row>& rows);

 private:
  void start();
  void change(const SensingChange& wanted);
  void dispatch(const hub::Record& record, int32_t label);
  void setOption(const std::string& session, const std::string& option);
  void close(const std::string& session);
  void write(const Json& line);
  void perform(TraceCall call, const Json& line);
  void onOutcome(const CallOutcome& outcome) override;

  std::FILE* const out;
  const SensingArguments& arguments;
  hub::Hub hub;
  std::unique_ptr<ReplayObserver> listener;  // a picture, if one is wanted
  Replayer replayer;
  size_t lines = 0;               // of the trace so far
  std::vector<std::string> open;  // the sessions that are, in the order of their opening
};

}  // namespace senseloom::tool
