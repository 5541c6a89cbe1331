#include "replay/summary_output.h"

#include <algorithm>

namespace senseloom::tool {

void SummaryOutput::onOutcome(const CallOutcome& outcome) {
  if (outcome.call.kind == CallKind::uninit) return;
  Client& client = clientOf(outcome);
  if (outcome.failed) ++client.failed;
  if (outcome.call.kind == CallKind::open && !outcome.failed) ++client.opened;
  if (outcome.call.kind == CallKind::dispatch) {
    ++client.records;
    if (outcome.result) ++client.results;
  }
}

void SummaryOutput::onEnd() {
  int width = 7;
  for (const Client& client : clients) width = std::max(width, static_cast<int>(client.session.size()));
  std::fprintf(out, "%-*s  sensor    opened   records   results    failed\n", width, "session");
  for (const Client& client : clients) {
    std::fprintf(out, "%-*s  %-6s  %8zu  %8zu  %8zu  %8zu\n", width, client.session.c_str(), client.sensor->name,
                 client.opened, client.records, client.results, client.failed);
  }
}

SummaryOutput::Client& SummaryOutput::clientOf(const CallOutcome& outcome) {
  const auto known = std::find_if(clients.begin(), clients.end(), [&outcome](const Client& client) {
    return client.session == outcome.session && client.sensor == outcome.sensor;
  });
  if (known != clients.end()) return *known;
  return clients.emplace_back(Client{.session = outcome.session, .sensor = outcome.sensor});
}

}  // namespace senseloom::tool
