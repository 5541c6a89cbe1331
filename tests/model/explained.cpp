#include "explained.h"

#include <fake_platform.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <set>
#include <utility>

#include "client.h"
#include "explain/explainer.h"
#include "explain/explanation_text.h"
#include "input_error.h"
#include "trace/hex.h"
#include "trace/replayer.h"

namespace oracle {
namespace {

namespace tool = senseloom::tool;

class FakeLog final : public tool::LogSource {
 public:
  model::Log take() override { return logged(); }
};

tool::CallKind kindOf(const Call& call) {
  switch (call.what) {
    case Call::open:
      return tool::CallKind::open;
    case Call::setOption:
      return tool::CallKind::setOption;
    case Call::close:
      return tool::CallKind::close;
    case Call::uninit:
      return tool::CallKind::uninit;
    default:
      return tool::CallKind::dispatch;
  }
}

tool::TraceCall traceCallOf(const Call& call, size_t line) {
  tool::TraceCall trace;
  trace.line = line;
  trace.kind = kindOf(call);
  trace.session = "s" + std::to_string(call.session);
  if (call.what == Call::open || call.what == Call::dispatchToSensor) {
    trace.sensor = tool::findSensor(kSensorNames[static_cast<size_t>(call.sensor)]);
  }
  if (call.what == Call::setOption && !call.option.isNull) trace.option = call.option.text();
  trace.record.reset(json_pack("{s:s}", "hex", tool::toHex(call.record).c_str()));
  return trace;
}

// Makes the calls, and then closes what they left open, as the tool does at the end of a trace.
void replay(const Sequence& sequence, std::FILE* out) {
  FakeLog log;
  tool::ExplanationText output(out, {.records = true, .all = true});
  tool::Explainer explainer(output, log);
  tool::Replayer replayer(explainer);
  const auto perform = [&](const Call& call, size_t line) {
    setAnswers(call.answers);
    try {
      replayer.perform(traceCallOf(call, line));
    } catch (const tool::InputError&) {
      // The session is not open, or already is: nothing was called.
    }
  };
  std::set<int> sessions;
  for (size_t i = 0; i < sequence.size(); ++i) {
    if (!isTraceable(sequence[i])) continue;
    sessions.insert(sequence[i].session);
    perform(sequence[i], i + 1);
  }
  Call close;
  close.what = Call::close;
  for (const int session : sessions) {
    close.session = session;
    perform(close, 0);
  }
  explainer.onEnd();
}

}  // namespace

std::string explained(const Sequence& sequence) {
  char* text = nullptr;
  size_t size = 0;
  std::FILE* stream = open_memstream(&text, &size);
  replay(sequence, stream);
  std::fclose(stream);
  const std::unique_ptr<char, decltype(&std::free)> owned(text, std::free);
  const auto any = [&sequence](auto predicate) { return std::any_of(sequence.begin(), sequence.end(), predicate); };
  restoreLibrary(any([](const Call& call) { return call.option.text().find("template") != std::string::npos; }),
                 any([](const Call& call) { return call.what == Call::open && call.sensor == gspx; }));
  return {text, size};
}

}  // namespace oracle
