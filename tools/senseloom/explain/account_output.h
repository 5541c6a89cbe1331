#pragma once

#include <array>
#include <cstddef>
#include <cstdio>
#include <string>
#include <vector>

#include "model/reasons.h"
#include "trace/record_codec.h"

namespace senseloom::tool {

// What became of the records of one client: of the sessions that one name had on one sensor, one after the other.
struct Account {
  std::string session;
  const Sensor* sensor;
  std::array<size_t, model::kFates> fates{};  // by fate
  size_t unexplained = 0;
  std::string chain = {};  // of stages, as it was last built; empty: none

  size_t records() const;
};

// Prints a table with a row an account, and a column for each fate that any record had; then the chains.
// Nothing without records.
void printAccounts(std::FILE* out, const std::vector<Account>& accounts);

}  // namespace senseloom::tool
