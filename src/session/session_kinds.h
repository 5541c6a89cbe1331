#pragma once

#include "session/session_activity.h"
#include "session/session_filters.h"
#include "session/session_gesture_hmm.h"
#include "session/session_pdr.h"
#include "session/session_step_count.h"
