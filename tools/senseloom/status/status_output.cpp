#include "status/status_output.h"

#include <algorithm>
#include <filesystem>
#include <string>
#include <system_error>
#include <utility>
#include <vector>

#include "record/process_control.h"
#include "status/in_force.h"
#include "terminal/text_table.h"

namespace senseloom::tool {
namespace {

TextRow rowOf(uint32_t number, const InForceNow::OpenSession& session, const ProcessControl& control) {
  const trace::SessionCounts* counts = control.countsOf(number);
  return {'s' + std::to_string(number), counts == nullptr ? "?" : std::to_string(counts->records),
          counts == nullptr ? "?" : std::to_string(counts->results), session.option.value_or("its default")};
}

}  // namespace

void printStatus(std::FILE* out, pid_t process) {
  const ProcessControl control(process);
  const InForceNow inForce(control.state());
  std::error_code error;
  const auto program = std::filesystem::read_symlink("/proc/" + std::to_string(process) + "/exe", error);
  std::fprintf(out, "process %d, %s, %s\n", process, error ? "?" : program.c_str(),
               control.isRecording() ? "being recorded" : "not recorded");
  if (inForce.sessions().empty()) std::fputs("no session is open\n", out);
  // One table a sensor, in the order in which they were first opened.
  std::vector<std::pair<const Sensor*, std::vector<TextRow>>> tables;
  for (const auto& [number, session] : inForce.sessions()) {
    auto table = std::find_if(tables.begin(), tables.end(),
                              [&sensor = session.sensor](auto& one) { return one.first == sensor; });
    if (table == tables.end()) {
      table = tables.insert(table, {session.sensor, {{"session", "records", "results", "asks for"}}});
    }
    table->second.push_back(rowOf(number, session, control));
  }
  for (const auto& [sensor, rows] : tables) {
    const std::string properties = inForce.properties(*sensor);
    std::fprintf(out, "\n%s: %s\n", sensor->name, properties.empty() ? "nothing negotiated" : properties.c_str());
    printTable(out, rows);
  }
}

}  // namespace senseloom::tool
