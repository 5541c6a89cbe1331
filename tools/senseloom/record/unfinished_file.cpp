#include "record/unfinished_file.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <cstddef>

#include "trace/trace_form.h"
#include "trace/trace_line.h"

namespace senseloom::tool {
namespace {

constexpr size_t kReadAtOnce = 1 << 16;
constexpr std::string_view kReleaseStart = R"({"call":"release")";  // it is not counted

bool beginsWithMember(std::string_view line, std::string_view name) {
  return line.substr(0, 2) == "{\"" && line.substr(2, name.size()) == name && line[2 + name.size()] == '"';
}

// The lines of a file, up to what was only reserved.
struct Lines {
  off_t size = 0;  // bytes
  uint64_t calls = 0;
  LineOfRecording last = LineOfRecording::other;
};

Lines linesOf(int file) {
  Lines lines;
  std::string buffer;
  std::string chunk(kReadAtOnce, '\0');
  while (true) {
    const ssize_t count = read(file, chunk.data(), chunk.size());
    if (count <= 0) return lines;
    buffer.append(chunk, 0, static_cast<size_t>(count));
    size_t start = 0;
    for (size_t feed; (feed = buffer.find('\n', start)) != std::string::npos; start = feed + 1) {
      if (buffer[start] == '\0') return lines;
      lines.last = kindOf(std::string_view(buffer).substr(start, feed + 1 - start));
      if (lines.last == LineOfRecording::call) ++lines.calls;
      lines.size += static_cast<off_t>(feed + 1 - start);
    }
    buffer.erase(0, start);
    if (!buffer.empty() && buffer[0] == '\0') return lines;
  }
}

}  // namespace

LineOfRecording kindOf(std::string_view line) {
  if (beginsWithMember(line, member::kFormat)) return LineOfRecording::head;
  if (line.starts_with(kReleaseStart)) return LineOfRecording::other;
  if (beginsWithMember(line, member::kCall)) return LineOfRecording::call;
  if (beginsWithMember(line, member::kEnd)) return LineOfRecording::end;
  return LineOfRecording::other;
}

std::string endLine(uint64_t calls, const UnfinishedEnd& end) {
  TraceLine line;
  line.addInteger(member::kEnd, static_cast<int64_t>(calls));
  line.addInteger(member::kLost, static_cast<int64_t>(end.lost));
  if (end.lost != 0) line.addText(member::kWhy, end.why);
  if (!end.cause.empty()) line.addText(member::kCause, end.cause);
  return std::string(line.finish());
}

void completeFile(const std::string& name, const UnfinishedEnd& end) {
  const int file = open(name.c_str(), O_RDWR | O_CLOEXEC | O_NONBLOCK | O_NOCTTY);
  if (file < 0) return;
  if (flock(file, LOCK_EX | LOCK_NB) == 0) {
    const Lines lines = linesOf(file);
    const std::string text = lines.last == LineOfRecording::end ? "" : endLine(lines.calls, end);
    // A disk that is full leaves the recording without an end, as it would be without this.
    if (lines.size != 0 && ftruncate(file, lines.size) == 0) {
      [[maybe_unused]] const ssize_t count = pwrite(file, text.data(), text.size(), lines.size);
    }
  }
  close(file);
}

}  // namespace senseloom::tool
