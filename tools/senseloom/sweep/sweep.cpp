#include "sweep/sweep.h"

#include <unistd.h>

#include <algorithm>
#include <memory>
#include <new>
#include <span>

#include "input_error.h"
#include "plot/picture_file.h"
#include "sweep/scorer.h"
#include "sweep/script_reader.h"
#include "sweep/sweep_output.h"
#include "sweep/sweep_plot.h"
#include "sweep/sweep_replay.h"
#include "sweep/workers.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

constexpr size_t kMostRemarks = 5;

void check(const SweepArguments& arguments) {
  if (!arguments.truthFiles.empty() && arguments.truthFiles.size() != arguments.traces.size()) {
    throw InputError("--truth is needed once for each trace: " + std::to_string(arguments.traces.size()) +
                     " times, not " + std::to_string(arguments.truthFiles.size()));
  }
  if (!arguments.rows.sortedBy.empty()) figureNamed(arguments.rows.sortedBy);
  if (!arguments.plot.empty()) requireWritable(arguments.plot, arguments.traces);
}

std::vector<SweepScript> readScripts(const SweepArguments& arguments, SweptClient& client) {
  const int64_t unit = arguments.timeUnit.empty() ? 0 : timeUnitNamed(arguments.timeUnit);
  std::vector<SweepScript> scripts;
  for (size_t i = 0; i < arguments.traces.size(); ++i) {
    const std::string truth = arguments.truthFiles.empty() ? "" : arguments.truthFiles[i];
    scripts.push_back(ScriptReader(client, truth, unit).read(arguments.traces[i]));
  }
  return scripts;
}

// What the client's options begin with, each once.
std::vector<std::string> headsOf(std::span<const SweepScript> scripts) {
  std::vector<std::string> heads;
  for (const SweepScript& script : scripts) {
    for (const SweepStep& step : script.steps) {
      const bool isOwn = step.kind == CallKind::setOption && step.client == 0;
      if (isOwn && std::ranges::find(heads, step.head) == heads.end()) heads.push_back(step.head);
    }
  }
  return heads;
}

Figures replayAll(const SweepOutcome& outcome, std::span<const SweepScript> scripts, const SweepTotals& totals,
                  size_t combination) {
  const std::string members = outcome.grid.members(combination);
  Scorer scorer(outcome.sensor, totals);
  SweepReplay replay(outcome.sensor, members, scorer);
  for (const SweepScript& script : scripts) replay.replay(script);
  Figures figures = scorer.figures();
  figures.isReplaced = !outcome.remarks(combination).empty();
  return figures;
}

void print(std::FILE* out, const SweepOutcome& outcome, const SweepArguments& arguments) {
  const auto rows = chooseRows(outcome, arguments.rows);
  (arguments.json ? printSweepJson : printSweepTable)(out, outcome, rows);
  if (!arguments.plot.empty()) {
    writePicture(arguments.plot, drawSweep(outcome, outcome.sensor.name + std::string(": ") +
                                                        std::to_string(outcome.grid.size()) + " combinations"));
  }
  if (!arguments.limits.falsePerHour && !arguments.limits.delay) return;
  // Among lines of JSON a sentence would be in the way.
  std::fprintf(arguments.json ? stderr : out, "%s\n", recommendation(outcome, arguments.limits).c_str());
}

// Fails if the library does not take all values as they are.
void reportReplaced(const SweepOutcome& outcome) {
  size_t count = 0;
  std::vector<std::string> remarks;
  for (size_t row = 0; row < outcome.figures.size(); ++row) {
    if (!outcome.figures[row].isReplaced) continue;
    ++count;
    if (remarks.size() > kMostRemarks) continue;
    for (const std::string& remark : outcome.remarks(row)) {
      if (std::ranges::find(remarks, remark) == remarks.end()) remarks.push_back(remark);
    }
  }
  if (count == 0) return;
  std::string text = std::to_string(count) + " of " + std::to_string(outcome.figures.size()) +
                     " combinations have a value that is replaced or refused:";
  for (size_t i = 0; i < std::min(remarks.size(), kMostRemarks); ++i) text += "\n  " + remarks[i];
  throw InputError(text + (remarks.size() > kMostRemarks ? "\n  and more" : ""));
}

}  // namespace

void sweep(std::FILE* out, const SweepArguments& arguments) {
  check(arguments);
  std::vector<SweepAxis> axes;
  for (const std::string& set : arguments.sets) axes.push_back(readAxis(set));
  SweptClient client{.session = arguments.session, .option = arguments.option};
  if (client.session.empty()) client.sensor = &sensorNamed(arguments.sensor);
  for (const SweepAxis& axis : axes) client.keys.push_back(axis.key);

  const auto scripts = readScripts(arguments, client);
  const SweepGrid grid(*client.sensor, axes);
  const SweepTotals totals(*client.sensor, scripts);
  const bool hasLimits = arguments.limits.falsePerHour || arguments.limits.delay;
  if (hasLimits && !totals.truthKnown) {
    throw InputError("a recommendation takes true classes, which neither the traces nor --truth tell");
  }
  if (!arguments.plot.empty() && !hasClasses(*client.sensor)) {
    throw InputError(std::string("the results of ") + client.sensor->name + " have no classes to draw reports of");
  }

  const SharedMemory memory(grid.size() * sizeof(Figures));
  const std::span figures(static_cast<Figures*>(memory.data()), grid.size());
  const SweepOutcome outcome{*client.sensor, grid, headsOf(scripts), totals.truthKnown, figures};
  const WorkPlan plan{.count = grid.size(),
                      .isolated = client.sensor->items == Items::samples,
                      .bar = isatty(STDERR_FILENO) != 0 ? stderr : nullptr};
  workInProcesses(plan, [&](size_t combination) {
    new (&figures[combination]) Figures(replayAll(outcome, scripts, totals, combination));
  });
  print(out, outcome, arguments);
  reportReplaced(outcome);
}

}  // namespace senseloom::tool
