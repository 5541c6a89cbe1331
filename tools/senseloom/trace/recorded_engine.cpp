#include "trace/recorded_engine.h"

#include <dlfcn.h>
#include <gesture_answers.h>

namespace senseloom::tool {
namespace {

void answerWith(const char* const* names, int count) {
  // By name, since an engine need not have it.
  static auto* const answer =
      reinterpret_cast<decltype(&gesture_answer_with)>(dlsym(RTLD_DEFAULT, "gesture_answer_with"));
  if (answer != nullptr) answer(names, count);
}

}  // namespace

RecordedEngine::RecordedEngine(const std::optional<std::vector<EngineAnswer>>& answers) {
  if (!answers) return;
  names.resize(kMostGroups);
  for (const EngineAnswer& answer : *answers) names[static_cast<size_t>(answer.group)] = answer.name.c_str();
  answerWith(names.data(), kMostGroups);
}

RecordedEngine::~RecordedEngine() {
  if (!names.empty()) answerWith(nullptr, 0);
}

}  // namespace senseloom::tool
