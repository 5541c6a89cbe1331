#include "sense/sense.h"

#include <android/log.h>
#include <hub.h>

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <cstring>
#include <filesystem>
#include <memory>
#include <stdexcept>

#include "input_error.h"
#include "sense/recording.h"
#include "sense/sensing_run.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};

// Nothing that was given as input is written over.
void requireOther(const std::string& output, const std::vector<std::string>& recordings) {
  std::error_code error;
  for (const std::string& recording : recordings) {
    if (!output.empty() && std::filesystem::equivalent(output, recording, error)) {
      throw InputError(output + " is one of the recordings, and would be written over");
    }
  }
}

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
std::vector<Recording::Row> readAll(const SensingArguments& arguments) {
  const bool takesRate = needsRate(arguments.clients);
  std::vector<Recording::Row> rows;
  for (const std::string& file : arguments.recordings) {
    Recording recording = readRecording(file, arguments.columns, takesRate);
    for (const std::string& remark : recording.remarks) std::fprintf(stderr, "senseloom: %s\n", remark.c_str());
    const int64_t shift =
        rows.empty() ? 0 : rows.back().sample.time + kBetweenRecordings - recording.rows.front().sample.time;
    for (Recording::Row& row : recording.rows) {
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
  requireOther(arguments.output, arguments.recordings);
  requireOther(arguments.plot.file, arguments.recordings);
  checkSessions(arguments);
  const auto rows = readAll(arguments);
  std::unique_ptr<std::FILE, CloseFile> file;
  if (!arguments.output.empty()) {
    file.reset(std::fopen(arguments.output.c_str(), "w"));
    if (file == nullptr) throw std::runtime_error(arguments.output + ": cannot be written: " + std::strerror(errno));
  }
  SensingRun(file ? file.get() : out, arguments).run(rows);
  if (!file) return;
  const bool isWritten = std::ferror(file.get()) == 0;
  if (std::fclose(file.release()) != 0 || !isWritten) {
    throw std::runtime_error(arguments.output + ": cannot be written: " + std::strerror(errno));
  }
}

}  // namespace senseloom::tool
