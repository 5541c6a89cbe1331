#pragma once

#include <sample.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "sense/recording_columns.h"

namespace senseloom::tool {

// What a phone's sensors said while a person carried it.
struct MotionRecording {
  struct Row {
    hub::Sample sample;
    int32_t label;  // what the person really did; 0: nobody knows
    size_t line;
    size_t part;  // of the table: one with recordings one after another has several
  };
  std::vector<Row> rows;             // in order of time
  std::vector<std::string> remarks;  // what is special about it, or was mended
};

// From the last sample of a recording to the first of the next, in microseconds. Nobody knows what happened in between,
// so this is a gap for the hub.
inline constexpr int64_t kBetweenRecordings = 1'000'000;

// Reads a table with a heading and a row a sample: numbers between commas, semicolons or tabs. Rows that are a little
// out of order are put in order. Throws InputError, with the file, the line and the column, for what is no recording
// that a hub can sense from; `needsRate`: without angular rates it cannot.
MotionRecording readMotionRecording(const std::string& file, const RecordingColumns& columns, bool needsRate);

}  // namespace senseloom::tool
