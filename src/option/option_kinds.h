#pragma once

#include "option/option_activity.h"
#include "option/option_audio_classification.h"
#include "option/option_class_masks.h"
#include "option/option_description.h"
#include "option/option_dtwgs.h"
#include "option/option_pdr.h"
#include "option/option_step_count.h"
#include "option/option_tapping.h"

namespace senseloom {

// The descriptions of all option kinds, in the registry's order.
inline constexpr const OptionDescription* kOptionKinds[] = {
#define SENSOR_KIND(Kind) &Option##Kind::kind,
#include "sensor_kinds.def"
#undef SENSOR_KIND
};

}  // namespace senseloom
