// Runs files of cases on the built library and on the model of it.

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <string>
#include <vector>

#include "call.h"
#include "case_file.h"
#include "case_run.h"
#include "input_error.h"

namespace {

std::vector<oracle::Case> casesOf(const char* file) {
  std::ifstream stream(file);
  if (!stream) throw senseloom::tool::InputError(std::string(file) + ": " + std::strerror(errno));
  return oracle::readCases(stream, file);
}

// A case as a trace, for `senseloom replay` and `senseloom explain`.
int printTrace(const char* file, const std::string& name) {
  for (const oracle::Case& one : casesOf(file)) {
    if (one.name != name) continue;
    oracle::Sequence sequence;
    for (const oracle::Step& step : one.steps) {
      if (step.looksAt < 0) sequence.push_back(step.call);
    }
    std::fputs(oracle::toTrace(sequence).c_str(), stdout);
    return 0;
  }
  std::fprintf(stderr, "%s: no case \"%s\"\n", file, name.c_str());
  return 2;
}

// Returns the number of cases that failed.
int runFile(const char* file) {
  int failed = 0;
  const auto cases = casesOf(file);
  for (const oracle::Case& one : cases) {
    const std::string text = oracle::run(one, file);
    if (text.empty()) continue;
    ++failed;
    std::printf("%s\n", text.c_str());
  }
  std::printf("%s: %zu cases, %d failed\n", file, cases.size(), failed);
  return failed;
}

}  // namespace

int main(int count, char** arguments) {
  try {
    if (count == 4 && std::strcmp(arguments[1], "--trace") == 0) return printTrace(arguments[2], arguments[3]);
    if (count < 2) {
      std::fprintf(stderr, "usage: %s FILE...\n       %s --trace FILE CASE\n", arguments[0], arguments[0]);
      return 2;
    }
    int failed = 0;
    for (int i = 1; i < count; ++i) failed += runFile(arguments[i]);
    return failed == 0 ? 0 : 1;
  } catch (const senseloom::tool::InputError& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 2;
  }
}
