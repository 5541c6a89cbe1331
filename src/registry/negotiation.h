#pragma once

#include <memory>

#include "session/context_sensor.h"

namespace senseloom {

// Makes `merged`, a copy of the option of one of the sensor's sessions, the sensor's merged option: folds in the
// options of all its sessions in opening order (that one once more, so that where the last one wins it is the last
// session) and stores the property list for the outcome in `*out`; null when it could not be made.
void negotiate(ContextSensor& sensor, std::unique_ptr<Option> merged, ctx_option_t** out);

// Has every session of the sensor start over with the merged option. False when any of them could not; the others do.
bool rebuildSessions(const ContextSensor& sensor);

}  // namespace senseloom
