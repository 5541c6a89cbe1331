#include "explain/explanation.h"

#include <algorithm>
#include <numeric>

namespace senseloom::tool {
namespace {

bool hasProblem(const std::vector<Told>& told) {
  return std::any_of(told.begin(), told.end(), [](const Told& one) { return one.isProblem(); });
}

}  // namespace

std::vector<size_t> ExplainedNegotiation::keysToShow(bool whole) const {
  std::vector<size_t> keys;
  for (size_t key = 0; key < derived->keys.size(); ++key) {
    if (whole || before == nullptr || (*before)[key].value != derived->keys[key].value) keys.push_back(key);
  }
  return keys;
}

std::vector<size_t> ExplainedNegotiation::sessionsToShow(const std::vector<size_t>& keys, bool whole) const {
  constexpr size_t kMostShown = 5;
  std::vector<size_t> sessions;
  if (whole) {
    sessions.resize(names.size());
    std::iota(sessions.begin(), sessions.end(), size_t{0});
    return sessions;
  }
  if (caller < names.size()) sessions.push_back(caller);
  for (const size_t key : keys) {
    for (const size_t decider : derived->keys[key].decidedBy) {
      const bool isShown = std::find(sessions.begin(), sessions.end(), decider) != sessions.end();
      if (!isShown && sessions.size() < kMostShown) sessions.push_back(decider);
    }
  }
  return sessions;
}

bool ExplainedCall::isProblem() const {
  return hasProblem(told) || hasProblem(toldAfter);
}

bool ExplainedRecord::isProblem() const {
  return !unexplained.empty() || verdict.fate == model::Fate::refused || verdict.fate == model::Fate::tooShort;
}

}  // namespace senseloom::tool
