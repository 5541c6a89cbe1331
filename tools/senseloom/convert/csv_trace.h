#pragma once

#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

#include "kinds/sensor_table.h"
#include "trace/csv_reader.h"

namespace senseloom::tool {

// The names of the columns that a table of decisions has for each thing.
struct DecisionColumns {
  std::string time = "time";
  std::string classNumber = "class";
  std::string truth;      // empty: what is true is not known
  std::string recording;  // empty: the whole table is one recording
};
// Reads "time=t_s,class=decision"; names that are left out stay as they are. Throws InputError.
DecisionColumns readColumns(const std::string& text);

// What is converted to a trace, and where it goes.
struct CsvConversion {
  std::string file;
  DecisionColumns columns;
  const Sensor& sensor;
  int64_t timeUnit;  // of the table
  std::string
      folder;  // for a trace each recording, named after it, made if need be; empty: one trace, on standard output
};

// Writes the trace of a table of decisions: a record a row. Throws InputError, with the position in the table.
void convertCsv(std::FILE* out, const CsvConversion& conversion);

}  // namespace senseloom::tool
