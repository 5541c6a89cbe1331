#include "trace_order.h"

#include <sys/stat.h>

#include <charconv>

#include "summary_memory.h"

namespace senseloom::trace {
namespace {

constexpr std::string_view kMaxSize = "max-size=";
constexpr std::string_view kFollowForks = "follow-forks=";
constexpr std::string_view kReplaces = "replaces=";
constexpr std::string_view kSummary = SENSELOOM_SUMMARY_WORD;

// Takes a word off the front of the text if it begins with `key`, and gives its value.
std::optional<std::string_view> takeWord(std::string_view& text, std::string_view key) {
  const size_t end = text.find(' ');
  if (text.substr(0, key.size()) != key || end == std::string_view::npos) return std::nullopt;
  const std::string_view value = text.substr(key.size(), end - key.size());
  text.remove_prefix(end + 1);
  return value;
}

bool takeAnyWord(std::string_view& text, TraceOrder& order) {
  if (const auto size = takeWord(text, kMaxSize)) {
    std::from_chars(size->data(), size->data() + size->size(), order.maxSize);
    return true;
  }
  if (takeWord(text, kFollowForks)) {
    order.followForks = true;
    return true;
  }
  if (const auto identity = takeWord(text, kReplaces)) {
    order.replaces = *identity;
    return true;
  }
  if (const auto file = takeWord(text, kSummary)) {
    order.summary = *file;
    return true;
  }
  return false;
}

void addWord(std::string& text, std::string_view key, const std::string& value) {
  text += key;
  text += value;
  text += ' ';
}

}  // namespace

std::string TraceOrder::text() const {
  std::string words;
  if (maxSize != 0) addWord(words, kMaxSize, std::to_string(maxSize));
  if (followForks) addWord(words, kFollowForks, "1");
  if (!replaces.empty()) addWord(words, kReplaces, replaces);
  if (!summary.empty()) addWord(words, kSummary, summary);
  return words + file;
}

std::optional<TraceOrder> readOrder(std::string_view text) {
  TraceOrder order;
  while (takeAnyWord(text, order)) {
  }
  if (text.empty()) return std::nullopt;
  order.file = text;
  return order;
}

std::string nameFor(std::string_view file, int process) {
  std::string name;
  for (size_t i = 0; i < file.size(); ++i) {
    if (file.substr(i, 2) == "%p") {
      name += std::to_string(process);
      ++i;
    } else {
      name += file[i];
    }
  }
  return name;
}

std::string numberedName(const std::string& file, unsigned number) {
  const size_t start = file.rfind('/') + 1;  // 0 without a folder
  size_t end = file.size();
  for (const std::string_view compression : {".gz", ".zst"}) {
    if (end - start > compression.size() && file.substr(end - compression.size()) == compression) {
      end -= compression.size();
      break;
    }
  }
  const size_t dot = file.rfind('.', end - 1);
  const size_t place = dot == std::string::npos || dot <= start ? end : dot;
  return file.substr(0, place) + '.' + std::to_string(number) + file.substr(place);
}

std::string identityOf(const std::string& file) {
  struct stat status {};
  if (stat(file.c_str(), &status) != 0) return "";
  std::string text;
  for (const auto number :
       {static_cast<int64_t>(status.st_dev), static_cast<int64_t>(status.st_ino), static_cast<int64_t>(status.st_size),
        static_cast<int64_t>(status.st_mtim.tv_sec), static_cast<int64_t>(status.st_mtim.tv_nsec)}) {
    text += std::to_string(number) + ':';
  }
  return text;
}

}  // namespace senseloom::trace
