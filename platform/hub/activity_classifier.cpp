#include "activity_classifier.h"

namespace hub {

#include "activity_model.inc"

template <std::size_t kWindow>
std::optional<Activity> ActivityClassifier<kWindow>::take(const Axes& acceleration) {
  smoothed.add(magnitude(acceleration));
  if (!smoothed.isFull()) return std::nullopt;
  window.add(smoothed.sum());
  if (!window.isFull() || ++sinceDecision < kHop) return std::nullopt;
  sinceDecision = 0;
  const std::int64_t power = variance();
  if (power < model.onFoot) return Activity::still;
  if (power < model.running) return Activity::onFoot;
  return power < model.unknown ? Activity::running : Activity::unknown;
}

template class ActivityClassifier<128>;
template class ActivityClassifier<64>;

}  // namespace hub
