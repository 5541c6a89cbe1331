#pragma once

#include <cstdint>
#include <cstdio>
#include <map>
#include <string>
#include <vector>

#include "kinds/sensor_table.h"
#include "plot/replay_plot.h"
#include "sense/recording_columns.h"

namespace senseloom::tool {

// A client from the start on.
struct SensingClient {
  std::string name;
  const Sensor* sensor;
  std::string option;
};
// Reads "NAME=SENSOR" or "NAME=SENSOR:OPTION". Throws InputError.
SensingClient sensingClient(const std::string& text);

// What a client does later.
struct SensingChange {
  int64_t after;  // microseconds from the first sample on
  std::string session;
  std::string option;  // "close": it closes its session
};
// Reads a time such as "30s", a session and an option. Throws InputError.
SensingChange sensingChange(const std::string& time, const std::string& session, const std::string& option);

// What a label of a recording means as a class of the activity sensors. Reads "4=1,5=2"; a label that is not there
// means itself. Throws InputError.
std::map<int32_t, int32_t> labelClasses(const std::string& text);

struct SensingArguments {
  std::vector<std::string> recordings;  // one after another
  RecordingColumns columns;
  std::vector<SensingClient> clients;
  std::vector<SensingChange> changes;
  std::map<int32_t, int32_t> labels;
  std::string output;  // the trace; empty: standard output
  PlotArguments plot;
};

// Runs the hub, the library and the clients on recordings, and writes the trace of it. Throws InputError.
void sense(std::FILE* out, const SensingArguments& arguments);

}  // namespace senseloom::tool
