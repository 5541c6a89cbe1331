#pragma once

namespace bench {

// Each checks its contenders and registers their measurements.
void filterContests();
void fanOutContests();
void deadReckoningContest();
void activityContests();
void optionContests();
void recordingContest();

}  // namespace bench
