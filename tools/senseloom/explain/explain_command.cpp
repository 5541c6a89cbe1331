#include "explain/explain_command.h"

#include <cstddef>
#include <memory>
#include <utility>

#include "explain/explainer.h"
#include "explain/log_capture.h"
#include "input_error.h"
#include "plot/replay_plot.h"
#include "replay/replay_progress.h"
#include "terminal/interrupt.h"
#include "trace/json.h"
#include "trace/replayer.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {
namespace {

void requireObject(const std::string& session, const std::string& option) {
  json_error_t error;
  const Json root(json_loads(option.c_str(), 0, &error));
  if (root == nullptr) throw InputError("the option of " + session + " is no JSON: " + error.text);
  if (!json_is_object(root.get())) throw InputError("the option of " + session + " is no JSON object");
}

// A mistyped sensor looks like the name of a file.
TraceReader openTrace(const std::string& file) try { return TraceReader(file); } catch (const InputError& error) {
  throw InputError(std::string(error.what()) + ", and no sensor has that name");
}

std::string sessionName(size_t index) {
  return "session " + std::to_string(index + 1);
}

}  // namespace

void explainOptions(std::FILE* out, const std::string& sensor, const std::vector<std::string>& options) {
  const Sensor* layout = &sensorNamed(sensor);
  if (options.empty()) throw InputError("no option string for a session on " + sensor);
  LogCapture log;
  Explainer explainer(out, log, false);
  Replayer replayer(explainer);
  for (size_t i = 0; i < options.size(); ++i) {
    TraceCall call;
    call.kind = CallKind::open;
    call.session = sessionName(i);
    call.sensor = layout;
    replayer.perform(call);
    call.kind = CallKind::setOption;
    call.option = options[i];
    replayer.perform(call);
  }
  for (size_t i = 0; i < options.size(); ++i) requireObject(sessionName(i), options[i]);
}

void explainTrace(std::FILE* out, const std::string& file, bool withRecords, const PlotArguments& plot) {
  const InterruptMark mark;
  TraceReader trace = openTrace(file);
  LogCapture log;
  auto explainer = std::make_unique<Explainer>(out, log, withRecords);
  const auto output = withProgress(withPlot(std::move(explainer), file, plot), trace, out, true);
  Replayer(*output).replay(trace);
}

}  // namespace senseloom::tool
