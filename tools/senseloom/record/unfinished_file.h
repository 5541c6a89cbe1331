#pragma once

#include <cstdint>
#include <string>
#include <string_view>

// Recordings of programs that did not come to their end.
namespace senseloom::tool {

enum class LineOfRecording { head, call, end, other };

// What a line is, as the recording library writes it.
LineOfRecording kindOf(std::string_view line);

// What is said at the end that the program did not write itself.
struct UnfinishedEnd {
  std::string cause;  // why it did not; empty: it ended by itself
  uint64_t lost = 0;  // lines that could not be written
  std::string why = {};
};
std::string endLine(uint64_t calls, const UnfinishedEnd& end);

// Cuts off what was reserved beyond the lines, and adds an end line, unless a process still writes the file, or it has
// its end.
void completeFile(const std::string& file, const UnfinishedEnd& end);

}  // namespace senseloom::tool
