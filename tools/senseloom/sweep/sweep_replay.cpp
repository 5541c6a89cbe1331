#include "sweep/sweep_replay.h"

#include <stdexcept>

#include "trace/recorded_engine.h"

namespace senseloom::tool {

void SweepReplay::replay(const SweepScript& script) {
  sessions.resize(script.clients);
  scorer.begin(script);
  for (const SweepStep& step : script.steps) perform(script, step);
  scorer.end();
  sessions.clear();
  twin.close();
  ctx_uninit();  // the next replay begins as the first one did
}

void SweepReplay::perform(const SweepScript& script, const SweepStep& step) {
  bool negotiates = false;
  switch (step.kind) {
    case CallKind::open:
      open(step.client);
      break;
    case CallKind::setOption:
      negotiates = setOption(step);
      break;
    case CallKind::dispatch:
      dispatch(script, step);
      break;
    case CallKind::close:
      negotiates = close(step.client);
      break;
    case CallKind::uninit:
      ctx_uninit();
      break;
  }
  if (negotiates && step.rebuilds) scorer.cutBatch();
}

void SweepReplay::open(size_t client) {
  sessions[client] = Session::open(sensor.name);
  if (client != 0) return;
  if (hasTwin()) twin = Session::open(sensor.name);
  if (!sessions[0]) throw std::runtime_error(std::string("no session of ") + sensor.name + " can be opened");
}

bool SweepReplay::setOption(const SweepStep& step) {
  if (step.client != 0) return sessions[step.client].setOption(step.text ? step.text->c_str() : nullptr).accepted;
  // Of two members with the same name the library takes the last one.
  if (hasTwin()) twin.setOption(step.head + members + ",\"mode\":0}");
  return sessions[0].setOption(step.head + members + '}').accepted;
}

void SweepReplay::dispatch(const SweepScript& script, const SweepStep& step) {
  const RecordedEngine engine(step.engine);
  if (step.client != 0) {
    static_cast<void>(sessions[step.client].dispatch(script.bytesAt(script.foreign[step.record])));
    return;
  }
  const auto record = script.bytesAt(script.records[step.record].bytes);
  const bool completes = !hasTwin() || twin.dispatch(record).outcome == DispatchOutcome::delivered;
  const DispatchResult dispatched = sessions[0].dispatch(record);
  if (dispatched.outcome == DispatchOutcome::delivered) {
    scorer.take(step.record, completes, dispatched.result);
  } else {
    scorer.take(step.record, completes, std::nullopt);
  }
}

bool SweepReplay::close(size_t client) {
  if (client == 0) twin.close();
  return sessions[client].close().outcome == CloseOutcome::sessionsRemain || client == 0;
}

}  // namespace senseloom::tool
