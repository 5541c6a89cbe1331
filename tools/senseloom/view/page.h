#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "terminal/output_sink.h"
#include "view/page_data.h"

namespace senseloom::tool {

struct PageHead {
  std::string title;
  std::optional<int64_t> timeUnit = {};      // of the timestamps, in nanoseconds, if the trace says it
  std::vector<std::string> classNames = {};  // from class 0 on
};

// Writes a page in one file, which needs no other and asks for none. Nothing of the trace is taken for markup.
void writePage(OutputSink& sink, const PageData& data, const PageHead& head);

}  // namespace senseloom::tool
