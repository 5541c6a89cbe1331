#pragma once

#include <cstddef>
#include <cstdio>
#include <string>
#include <string_view>

#include "trace/replayer.h"

namespace senseloom::tool {

// Prints a table for people, as the replay goes on: one row per call and session, with the outcome in words. Long lists
// are cut short.
class TableOutput final : public ReplayObserver {
 public:
  // Records that delivered nothing have rows only if `withAll` is set.
  TableOutput(std::FILE* stream, bool withAll) : out(stream), all(withAll) {}
  void onOutcome(const CallOutcome& outcome) override;

 private:
  void printRow(std::string_view line, std::string_view call, std::string_view session, std::string_view sensor,
                std::string_view returned, std::string_view text);

  std::FILE* out;
  bool all;
  bool headed = false;
  size_t sessionWidth = 8;  // grows with the longest name so far
};

}  // namespace senseloom::tool
