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

// The descriptions of all kinds of option, in the registry's order.
inline constexpr const OptionDescription* kOptionDescriptions[] = {
#define SENSOR_KIND(SensorClass, SessionClass, OptionClass, BaseClass) &OptionClass::kind,
#include "sensor_kinds.def"
#undef SENSOR_KIND
};

}  // namespace senseloom
