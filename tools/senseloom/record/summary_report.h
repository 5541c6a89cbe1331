#pragma once

#include <string>
#include <vector>

#include "record/unfinished_file.h"

struct summary_memory;

namespace senseloom::tool {

// Memory that the recorded processes tell in what becomes of the recording, and what the user is told of it.
class SummaryReport {
 public:
  SummaryReport();
  ~SummaryReport();
  SummaryReport(const SummaryReport&) = delete;
  SummaryReport& operator=(const SummaryReport&) = delete;

  // The name by which other processes of the same user open the memory.
  const std::string& file() const { return name; }

  // The files that were written, as far as they are known.
  std::vector<std::string> files() const;

  // What is missing of them, and why.
  UnfinishedEnd unfinished(const std::string& cause) const;

  // Prints, on standard error, what was recorded where, and what went wrong. Returns whether anything was recorded.
  // `where` is for a recording that passes through the tool, else empty.
  bool print(const std::string& program, const std::string& where) const;

 private:
  bool printNothing(const std::string& program) const;

  summary_memory* memory = nullptr;
  int descriptor = -1;
  std::string name;
};

}  // namespace senseloom::tool
