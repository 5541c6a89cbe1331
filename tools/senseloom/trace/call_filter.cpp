#include "trace/call_filter.h"

#include <algorithm>
#include <utility>

#include "input_error.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

bool isAmong(const std::vector<std::string>& names, const std::string& name) {
  return names.empty() || std::find(names.begin(), names.end(), name) != names.end();
}

class FilteredOutput final : public ReplayObserver {
 public:
  FilteredOutput(std::unique_ptr<ReplayObserver> replayOutput, const FilterArguments& arguments,
                 const TraceReader& trace)
      : output(std::move(replayOutput)), filter(arguments, trace) {}
  void onOutcome(const CallOutcome& outcome) override {
    if (filter.takes(outcome)) output->onOutcome(outcome);
  }
  void onEnd() override { output->onEnd(); }

 private:
  std::unique_ptr<ReplayObserver> output;
  CallFilter filter;
};

}  // namespace

bool FilterArguments::takesAll() const {
  return sessions.empty() && sensors.empty() && from.empty() && to.empty() && !failed;
}

std::optional<int64_t> FilterArguments::unit() const {
  return timeUnit.empty() ? std::nullopt : std::optional(timeUnitNamed(timeUnit));
}

CallFilter::CallFilter(const FilterArguments& filterArguments, const TraceReader& trace)
    : arguments(filterArguments),
      from(readEnd(arguments.from)),
      to(readEnd(arguments.to)),
      time(trace, arguments.unit()) {
  check(arguments);
}

void CallFilter::check(const FilterArguments& arguments) {
  for (const std::string& sensor : arguments.sensors) sensorNamed(sensor);
  readEnd(arguments.from);
  readEnd(arguments.to);
}

bool CallFilter::takes(const CallOutcome& outcome) {
  time.pass(outcome);
  if (!isWithin(outcome)) return false;
  if (arguments.failed && !outcome.failed) return false;
  return takes(outcome.session, outcome.sensor);
}

bool CallFilter::takes(const std::string& session, const Sensor* sensor) const {
  return isAmong(arguments.sessions, session) && isAmong(arguments.sensors, sensor == nullptr ? "" : sensor->name);
}

CallFilter::End CallFilter::readEnd(const std::string& text) {
  if (text.empty()) return {};
  const size_t unit = text.find_first_not_of("0123456789.");
  if (unit != std::string::npos) {
    return {.line = std::nullopt, .time = timeFromText(text.substr(0, unit), timeUnitNamed(text.substr(unit)))};
  }
  if (text.size() > 9 || text.find('.') != std::string::npos) {
    throw InputError('"' + text + "\" is neither a line, such as 120, nor a time with its unit, such as 5.2s");
  }
  return {.line = std::stoul(text), .time = std::nullopt};
}

int64_t CallFilter::compare(const CallOutcome& outcome, const End& end) const {
  if (end.line) {
    // What the tool closes at the end comes after all lines.
    if (outcome.call.line == 0) return 1;
    return static_cast<int64_t>(outcome.call.line) - static_cast<int64_t>(*end.line);
  }
  if (!end.time) return 0;
  if (time.sinceStart()) return *time.sinceStart() - *end.time;
  if (!outcome.record.empty()) throw InputError("the trace does not tell the unit of its timestamps: --time-unit does");
  return -1;  // before the first record
}

std::unique_ptr<ReplayObserver> withFilter(std::unique_ptr<ReplayObserver> output, const FilterArguments& arguments,
                                           const TraceReader& trace) {
  if (arguments.takesAll()) return output;
  return std::make_unique<FilteredOutput>(std::move(output), arguments, trace);
}

}  // namespace senseloom::tool
