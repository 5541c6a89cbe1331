#pragma once

#include <hub.h>

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "plot/plot.h"
#include "sense/motion_recording.h"
#include "sense/sense.h"
#include "trace/class_names.h"
#include "trace/json.h"
#include "trace/replayer.h"

namespace senseloom::tool {

// One run of hub, library and clients. It makes the calls, which it writes as a trace; the hub gets the property lists
// that the library hands out, and the library the records that the hub makes.
class SensingRun final : private ReplayObserver {
 public:
  // Takes a line of the trace, with its line feed.
  using Write = std::function<void(std::string_view line)>;

  SensingRun(Write toTrace, const SensingArguments& given);

  // Throws InputError.
  void run(const std::vector<MotionRecording::Row>& rows);

 private:
  void start();
  ClassNames namesOfClasses() const;
  void change(const SensingChange& wanted);
  void dispatch(const hub::Record& record, int32_t label);
  void setOption(const std::string& session, const std::string& option);
  void close(const std::string& session);
  void write(const Json& line);
  void perform(TraceCall call, const Json& line);
  void onOutcome(const CallOutcome& outcome) override;

  const Write writeLine;
  const SensingArguments& arguments;
  hub::Hub hub;
  std::optional<Plot> plot;  // if a picture is wanted
  Replayer replayer;
  size_t lines = 0;               // of the trace so far
  std::vector<std::string> open;  // the sessions that are, in the order of their opening
};

}  // namespace senseloom::tool
