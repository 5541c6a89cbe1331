// The gesture engine of a Linux host: recognises digits, or follows the script that is named in the environment
// variable SENSELOOM_GESTURE_SCRIPT when the engine is started, or answers what it is told.

#include <gesture.h>
#include <gesture_answers.h>

#include <cstdlib>
#include <cstring>
#include <new>
#include <optional>
#include <utility>
#include <variant>

#include "recogniser.h"
#include "script.h"

namespace {

std::variant<std::monostate, gesture::Recogniser, gesture::Script> engine;  // the first while it is not started

struct {
  const char* const* names = nullptr;  // null: it is not told
  int count = 0;
  int nextGroup = 0;
} told;

const char* toldName() {
  const int group = told.nextGroup++;
  return group < told.count ? told.names[group] : nullptr;
}

const char* recognisedName(const int16_t* group, bool last) {
  if (auto* const recogniser = std::get_if<gesture::Recogniser>(&engine)) return recogniser->take(group, last);
  if (auto* const script = std::get_if<gesture::Script>(&engine)) return script->take(group, last);
  return nullptr;
}

}  // namespace

bool gesture_initial(int, int) try {
  gesture_close();
  const char* const path = std::getenv("SENSELOOM_GESTURE_SCRIPT");
  if (path == nullptr || *path == '\0') {
    engine.emplace<gesture::Recogniser>();
    return true;
  }
  auto script = gesture::Script::read(path);
  if (!script) return false;
  engine = *std::move(script);
  return true;
} catch (const std::bad_alloc&) {
  return false;
}

char* gesture_process_single_data(const int16_t* group, int, bool last) {
  const char* const name = told.names != nullptr ? toldName() : recognisedName(group, last);
  if (name == nullptr) return nullptr;

  const std::size_t size = std::strlen(name) + 1;
  auto* const copy = new (std::nothrow) char[size];
  if (copy != nullptr) std::memcpy(copy, name, size);
  return copy;
}

void gesture_close() {
  engine.emplace<std::monostate>();
}

void gesture_answer_with(const char* const* names, int count) {
  told = {.names = names, .count = count, .nextGroup = 0};
}
