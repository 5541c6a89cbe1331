// Recognises what a script says, without a look at the samples: for tests.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace gesture {

// Its lines are the names to return, one a record, at the record's last group. A line is the name to the letter
// (trailing blanks count, nothing is a comment); an empty line, and the end of the script, means that nothing is
// recognised.
class Script {
 public:
  // Nothing if the file cannot be read to its end.
  static std::optional<Script> read(const char* path);

  const char* take(const std::int16_t* group, bool last);

 private:
  std::vector<std::string> lines;
  std::size_t nextRecord = 0;
};

}  // namespace gesture
