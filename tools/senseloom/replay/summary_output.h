#pragma once

#include <cstddef>
#include <cstdio>
#include <string>
#include <vector>

#include "trace/replayer.h"

namespace senseloom::tool {

// Prints, at the end, a row for each client: how often it was opened, the records it was given, the results it got, and
// how many of its calls failed. Sessions of the same name on the same sensor, one after the other, are one client. Rows
// are in the order of the first opening.
class SummaryOutput final : public ReplayObserver {
 public:
  explicit SummaryOutput(std::FILE* stream) : out(stream) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onEnd() override;

 private:
  struct Client {
    std::string session;
    const Sensor* sensor;
    size_t opened = 0;
    size_t records = 0;
    size_t results = 0;
    size_t failed = 0;
  };

  Client& clientOf(const CallOutcome& outcome);

  std::FILE* out;
  std::vector<Client> clients;
};

}  // namespace senseloom::tool
