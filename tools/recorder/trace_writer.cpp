#include "trace_writer.h"

#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "trace/trace_form.h"
#include "trace/trace_line.h"

namespace senseloom::trace {

namespace member = tool::member;

TraceWriter::TraceWriter(const TraceOrder& given, const Summary& sharedSummary)
    : order(given), summary(sharedSummary), name(nameFor(given.file, getpid())), mostOfPart(given.maxSize) {
  const OpenedSink opened = openSink(name, order.replaces);
  sink.reset(opened.sink);
  noSink = opened.trouble;
  if (sink != nullptr) summary.opened(name);
}

bool TraceWriter::isFull() const {
  return sink != nullptr && mostOfPart != 0 && hasNewCalls && partSize >= mostOfPart;
}

bool TraceWriter::beginPart() {
  if (sink->takesAllParts()) {
    end();
  } else {
    std::string next = nextName();
    const OpenedSink opened = openNewFile(next);
    if (opened.sink == nullptr) {
      mostOfPart += order.maxSize;
      return false;
    }
    end();
    name = std::move(next);
    sink.reset(opened.sink);
    summary.opened(name);
  }
  ++parts;
  partSize = 0;
  mostOfPart = order.maxSize;
  calls = 0;
  hasNewCalls = false;
  isEnded = false;
  return true;
}

void TraceWriter::write(std::string_view line, LineKind kind) {
  const char* trouble = noSink;
  if (sink != nullptr && lost == 0) {
    trouble = append(line);
  } else if (sink != nullptr) {
    tool::TraceLine note;
    note.addText(member::kNote, "lines missing here: " + std::to_string(lost));
    note.addText(member::kWhy, why);
    trouble = append(std::string(note.finish()) + std::string(line));
    if (trouble == nullptr) lost = 0;
  }
  if (trouble != nullptr) {
    if (kind != LineKind::head) lose(trouble);
    return;
  }
  if (kind == LineKind::call || kind == LineKind::repeated) ++calls;
  if (kind == LineKind::call) {
    hasNewCalls = true;
    summary.recorded();
  }
  if (isEnded) writeEnd();
}

void TraceWriter::lose(const char* reason) {
  why = reason;
  ++lostInAll;
  summary.lost(reason);
  if (lost++ == 0) warning = std::string("calls are not recorded: ") + reason;
}

void TraceWriter::end() {
  if (sink == nullptr || isEnded) return;
  isEnded = true;
  writeEnd();
  sink->finish();
}

void TraceWriter::writeEnd() {
  tool::TraceLine line;
  line.addInteger(member::kEnd, static_cast<int64_t>(calls));
  line.addInteger(member::kLost, static_cast<int64_t>(lostInAll));
  if (lostInAll != 0) line.addText(member::kWhy, why);
  append(line.finish());
}

const char* TraceWriter::append(std::string_view line) {
  const char* trouble = sink->append(line);
  if (trouble == nullptr) partSize += line.size();
  return trouble;
}

// The first free one: parts of an earlier recording are left alone.
std::string TraceWriter::nextName() {
  const std::string first = nameFor(order.file, getpid());
  std::string next;
  do {
    next = numberedName(first, ++lastNumber);
  } while (access(next.c_str(), F_OK) == 0);
  return next;
}

std::string TraceWriter::takeWarning() {
  std::string taken;
  taken.swap(warning);
  return taken;
}

}  // namespace senseloom::trace
