#include "compare/trace_diff.h"

#include <algorithm>
#include <stdexcept>
#include <utility>

#include "input_error.h"

namespace senseloom::tool {
namespace {

// The name under which calls are matched: of a dispatch to a whole sensor, that of the sensor.
std::string nameOf(const TraceCall& call) {
  if (!call.session.empty()) return call.session;
  return call.sensor == nullptr ? "" : std::string("all of ") + call.sensor->name;
}

std::string subjectOf(const std::string& name, const TraceCall& call) {
  const std::string what = callName(call.kind);
  return name.empty() ? what : what + (call.session.empty() ? " to " + name : " of session \"" + name + '"');
}

}  // namespace

TraceDiff::TraceDiff(std::FILE* stream, const DiffArguments& diffArguments)
    : out(stream),
      arguments(diffArguments),
      sides{{arguments.left, arguments.filter}, {arguments.right, arguments.filter}} {}

void TraceDiff::run() {
  while (!sides[0].isAtEnd || !sides[1].isAtEnd) {
    step(0);
    step(1);
  }
  for (const Side& side : sides) side.calls.requireOutcomes();
  for (const auto& [name, session] : sessions) {
    for (size_t side = 0; side < 2; ++side) {
      for (const TraceCall& call : session.waiting[side]) tellAlone(name, call, side);
    }
  }
  const size_t printed = std::min(different, arguments.most);
  if (printed < different && !arguments.json) std::fprintf(out, "%zu more calls differ\n", different - printed);
  std::fflush(out);
  if (different != 0) {
    throw std::runtime_error(std::to_string(different) + " of " + std::to_string(compared) + " calls compared differ");
  }
  if (!arguments.json) std::fprintf(out, "%zu calls compared, all alike\n", compared);
}

void TraceDiff::step(size_t side) {
  Side& mine = sides[side];
  if (mine.isAtEnd) return;
  try {
    auto call = mine.reader.next();
    if (!call) {
      mine.isAtEnd = true;
      return;
    }
    const std::string name = nameOf(*call);
    if (!mine.calls.takes(*call)) return;
    Session& session = sessions[name];
    session.sensor = mine.calls.sensor();
    auto& others = session.waiting[1 - side];
    if (others.empty()) {
      session.waiting[side].push_back(std::move(*call));
      return;
    }
    const TraceCall other = std::move(others.front());
    others.pop_front();
    compare(name, session, side == 0 ? *call : other, side == 0 ? other : *call);
  } catch (const InputError& error) {
    throw InputError(mine.reader.position() + ": " + error.what());
  }
}

void TraceDiff::compare(const std::string& name, Session& session, const TraceCall& left, const TraceCall& right) {
  ++compared;
  const Differences differences = callDifferences(session.sensor, left, right);
  if (differences.empty()) return;
  const bool isFirst = !std::exchange(session.differs, true);
  if (!isPrinted()) return;
  if (arguments.json) {
    Json object(json_object());
    addMember(object, member::kSession, Json(json_string(name.c_str())));
    addMember(object, member::kCall, Json(json_string(callName(left.kind))));
    addMember(object, "leftLine", Json(json_integer(static_cast<json_int_t>(left.line))));
    addMember(object, "rightLine", Json(json_integer(static_cast<json_int_t>(right.line))));
    addMember(object, "isFirst", Json(json_boolean(isFirst)));
    addMember(object, "differences", differencesJson("left", "right", differences));
    std::fprintf(out, "%s\n", compactText(object.get()).c_str());
    return;
  }
  std::fprintf(out, "%s and %s: %s differs\n", where(left, 0).c_str(), where(right, 1).c_str(),
               subjectOf(name, left).c_str());
  printDifferences(out, "left", "right", differences);
  if (isFirst) std::fputs("  the first difference of this session: what follows may come of it\n", out);
}

void TraceDiff::tellAlone(const std::string& name, const TraceCall& call, size_t side) {
  ++compared;
  if (!isPrinted()) return;
  if (arguments.json) {
    Json object(json_object());
    addMember(object, member::kSession, Json(json_string(name.c_str())));
    addMember(object, member::kCall, Json(json_string(callName(call.kind))));
    addMember(object, side == 0 ? "leftLine" : "rightLine", Json(json_integer(static_cast<json_int_t>(call.line))));
    std::fprintf(out, "%s\n", compactText(object.get()).c_str());
    return;
  }
  std::fprintf(out, "%s: %s is only there\n", where(call, side).c_str(), subjectOf(name, call).c_str());
}

bool TraceDiff::isPrinted() {
  return ++different <= arguments.most;
}

std::string TraceDiff::where(const TraceCall& call, size_t side) const {
  return sides[side].reader.fileName() + ':' + std::to_string(call.line);
}

}  // namespace senseloom::tool
