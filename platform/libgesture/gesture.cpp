// The gesture engine of a Linux host. It does not look at the samples but follows a script: the text file named in the
// environment variable SENSELOOM_GESTURE_SCRIPT, read whenever the engine is started. Its lines are the names to
// return, one a record, at the record's last group. A line is the name to the letter (trailing blanks count, nothing is
// a comment); an empty line, and the end of the script, means that nothing is recognised.

#include <gesture.h>

#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <new>
#include <string>
#include <utility>
#include <vector>

namespace {

std::vector<std::string> script;  // empty while the engine is not started
std::size_t next_record = 0;

}  // namespace

bool gesture_initial(int, int) try {
  gesture_close();
  const char* const path = std::getenv("SENSELOOM_GESTURE_SCRIPT");
  if (path == nullptr || *path == '\0') return true;

  std::ifstream file(path);
  std::vector<std::string> lines;
  for (std::string line; std::getline(file, line);) lines.push_back(std::move(line));
  if (!file.eof()) return false;  // could not be opened, or not be read to its end
  script = std::move(lines);
  return true;
} catch (const std::bad_alloc&) {
  return false;
}

char* gesture_process_single_data(const int16_t*, int, bool last) {
  if (!last || next_record == script.size()) return nullptr;
  const std::string& name = script[next_record++];
  if (name.empty()) return nullptr;
  auto* const copy = new (std::nothrow) char[name.size() + 1];
  if (copy != nullptr) std::memcpy(copy, name.c_str(), name.size() + 1);
  return copy;
}

void gesture_close() {
  script.clear();
  next_record = 0;
}
