#include <benchmark/benchmark.h>

#include "contests.h"

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  bench::filterContests();
  bench::fanOutContests();
  bench::deadReckoningContest();
  bench::activityContests();
  bench::optionContests();
  bench::recordingContest();
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
}
