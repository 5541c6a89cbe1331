#pragma once

#include <cstdint>
#include <limits>
#include <span>
#include <string_view>

namespace senseloom::tool {

inline constexpr double kUnknown = std::numeric_limits<double>::quiet_NaN();

// What a sweep tells of one combination. docs/choosing-options.md defines the figures. Plain data, which processes can
// share.
struct Figures {
  double results = kUnknown;  // an hour, and so are the next three
  double reports = kUnknown;
  double noMajority = kUnknown;
  double falseReports = kUnknown;
  double changes = kUnknown;
  double missed = kUnknown;
  double delayMedian = kUnknown;  // in seconds, and so are the next two
  double delayP90 = kUnknown;
  double batchMedian = kUnknown;  // from the first record of a result's batch to the result; only without truth
  double right = kUnknown;        // a share of 1
  bool isReplaced = false;        // the library does not take a value as it is
};

// One figure: a column of the table, a member of the JSON.
struct FigureColumn {
  const char* name;
  const char* heading;
  int decimals;
  double Figures::*figure;
  enum Truth : uint8_t { either, known, unknown } truth;  // where the figure exists
};

// In the order of the table.
std::span<const FigureColumn> figureColumns();
// Throws InputError if there is no such figure.
const FigureColumn& figureNamed(std::string_view name);

}  // namespace senseloom::tool
