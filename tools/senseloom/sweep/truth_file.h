#pragma once

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace senseloom::tool {

// What a person really did, from a table with a time and a class a row: the class is the label of all records from that
// time on, up to the time of the next row. Class 0 and the time before the first row: not labelled.
class TruthFile {
 public:
  // Reads the file. A first row that does not start with a number is a heading. Throws InputError.
  TruthFile(const std::string& file, int64_t timeUnit);

  // The label of a record with that time, in nanoseconds.
  int32_t labelAt(int64_t time) const;

 private:
  std::vector<std::pair<int64_t, int32_t>> rows;  // by time
};

}  // namespace senseloom::tool
