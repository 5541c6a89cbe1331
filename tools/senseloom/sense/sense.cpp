#include "sense/sense.h"

#include <android/log.h>
#include <hub.h>

#include <algorithm>
#include <charconv>
#include <string_view>

#include "input_error.h"
#include "sense/motion_recording.h"
#include "sense/sensing_run.h"
#include "terminal/new_file.h"
#include "terminal/output_sink.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

bool needsRate(const std::vector<SensingClient>& clients) {
  try {
    return std::ranges::any_of(clients,
                               [](const SensingClient& client) { return hub::Hub::needsOf(client.sensor->name).rate; });
  } catch (const hub::Refused& refused) {
    throw InputError(refused.what());
  }
}

void checkSessions(const SensingArguments& arguments) {
  for (const SensingChange& change : arguments.changes) {
    if (std::ranges::find(arguments.clients, change.session, &SensingClient::name) == arguments.clients.end()) {
      throw InputError("--at: no --session is called \"" + change.session + '"');
    }
  }
}

// The rows of all recordings, one after another.
std::vector<MotionRecording::Row> readAll(const SensingArguments& arguments) {
  const bool takesRate = needsRate(arguments.clients);
  std::vector<MotionRecording::Row> rows;
  for (const std::string& file : arguments.recordings) {
    MotionRecording recording = readMotionRecording(file, arguments.columns, takesRate);
    for (const std::string& remark : recording.remarks) std::fprintf(stderr, "senseloom: %s\n", remark.c_str());
    const int64_t shift =
        rows.empty() ? 0 : rows.back().sample.time + kBetweenRecordings - recording.rows.front().sample.time;
    for (MotionRecording::Row& row : recording.rows) {
      row.sample.time += shift;
      rows.push_back(row);
    }
  }
  return rows;
}

int32_t numberFrom(std::string_view text) {
  int32_t number = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || end != text.data() + text.size()) {
    throw InputError("\"" + std::string(text) + "\" is not the number of a class");
  }
  return number;
}

}  // namespace

SensingClient sensingClient(const std::string& text) {
  const size_t equals = text.find('=');
  const size_t colon = text.find(':', equals == std::string::npos ? 0 : equals);
  if (equals == std::string::npos || equals == 0) {
    throw InputError("--session " + text + ": must be NAME=SENSOR or NAME=SENSOR:OPTION");
  }
  return {.name = text.substr(0, equals),
          .sensor = &sensorNamed(text.substr(equals + 1, colon == std::string::npos ? colon : colon - equals - 1)),
          .option = colon == std::string::npos ? "{}" : text.substr(colon + 1)};
}

SensingChange sensingChange(const std::string& time, const std::string& session, const std::string& option) {
  const size_t digits = std::min(time.find_first_not_of("0123456789."), time.size());
  const int64_t unit = digits == time.size() ? kSecond : timeUnitNamed(time.substr(digits));
  return {.after = timeFromText(time.substr(0, digits), unit) / 1000, .session = session, .option = option};
}

std::map<int32_t, int32_t> labelClasses(const std::string& text) {
  std::map<int32_t, int32_t> classes;
  for (size_t from = 0; from < text.size();) {
    const size_t to = std::min(text.find(',', from), text.size());
    const std::string_view part = std::string_view(text).substr(from, to - from);
    from = to + 1;
    const size_t equals = part.find('=');
    if (equals == std::string_view::npos) throw InputError("--labels " + text + ": must be as in 4=1,5=2,7=2");
    classes[numberFrom(part.substr(0, equals))] = numberFrom(part.substr(equals + 1));
  }
  return classes;
}

void sense(std::FILE* out, const SensingArguments& arguments) {
  __android_log_set_minimum_priority(ANDROID_LOG_WARN);  // not each negotiation
  requireEmpty(arguments.output);
  checkSessions(arguments);
  const auto rows = readAll(arguments);
  if (arguments.output.empty()) {
    SensingRun([out](std::string_view line) { std::fwrite(line.data(), 1, line.size(), out); }, arguments).run(rows);
    return;
  }
  constexpr mode_t kOwnerAlone = 0600;  // a trace holds what the sensors saw
  NewFile file(arguments.output, kOwnerAlone, NewFile::Rest::removed);
  SensingRun([&file](std::string_view line) { file.write(line); }, arguments).run(rows);
  file.commit();
}

}  // namespace senseloom::tool
