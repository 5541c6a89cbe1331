#include "explain/explain_command.h"

#include <cstddef>
#include <memory>
#include <utility>

#include "explain/explainer.h"
#include "explain/explanation_json.h"
#include "explain/explanation_text.h"
#include "explain/filtered_explanation.h"
#include "explain/log_capture.h"
#include "input_error.h"
#include "model/nearest_name.h"
#include "plot/replay_plot.h"
#include "replay/replay_progress.h"
#include "terminal/interrupt.h"
#include "terminal/shown_output.h"
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
TraceReader openTrace(const std::string& file, const TraceReading& reading) try {
  return TraceReader(file, TraceReader::printOnStandardError, reading);
} catch (const InputError& error) {
  const std::string nearest = nearestSensor(file);
  const bool isMistyped = model::editDistance(file, nearest) <= 2;
  throw InputError(std::string(error.what()) + ", and no sensor has that name" +
                   (isMistyped ? "; the nearest is \"" + nearest + '"' : ""));
}

std::unique_ptr<ExplanationOutput> makeOutput(std::FILE* out, const ExplanationForm& form) {
  if (form.json) return std::make_unique<ExplanationJson>(out, form.extent);
  return std::make_unique<ExplanationText>(out, form.extent);
}

std::string sessionName(size_t index) {
  return "session " + std::to_string(index + 1);
}

}  // namespace

void explainOptions(std::FILE* out, const std::string& sensor, const std::vector<std::string>& options,
                    const ExplanationForm& form) {
  const Sensor* layout = &sensorNamed(sensor);
  if (options.empty()) throw InputError("no option string for a session on " + sensor);
  LogCapture log;
  const auto output = makeOutput(out, form);
  Explainer explainer(*output, log);
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

void explainTrace(std::FILE* out, const std::string& file, const ExplanationForm& form, const PlotArguments& plot) {
  const InterruptMark mark;
  const auto show = [out, hasPicture = !plot.file.empty()] { showSoFar(out, hasPicture); };
  TraceReader trace = openTrace(file, {.follows = form.follows, .meanwhile = show});
  LogCapture log;
  const auto output = makeOutput(out, form);
  CallFilter filter(form.filter, trace);
  FilteredExplanation filtered(*output, filter);
  auto drawn = withPlot(std::make_unique<Explainer>(filtered, log), trace, plot, form.filter);
  const auto observer = withProgress(std::move(drawn), trace, out, !form.extent.problems);
  Replayer(*observer).replay(trace);
}

}  // namespace senseloom::tool
