#include "info/list_leaks.h"

#include <algorithm>

namespace senseloom::tool {
namespace {

constexpr size_t kMostTold = 5;

}  // namespace

void ListLeaks::take(const TraceCall& call) {
  if (call.list > 0) lists.try_emplace(call.list, List{call.session, call.kind, call.line});
}

void ListLeaks::takeRelease(size_t line, const Json& release) {
  const auto number = releasedList(release);
  if (!number) return;
  if (*number == 0) return unknown.add(line, 0);
  const auto list = lists.find(*number);
  if (list == lists.end()) return;  // it was given before the trace
  if (list->second.releasedOn != 0) return twice.add(line, *number);
  list->second.releasedOn = line;
}

std::string ListLeaks::counts() const {
  if (lists.empty()) return "";
  return std::to_string(lists.size()) + " given, " + std::to_string(lists.size() - leaks().size()) + " released";
}

std::vector<std::string> ListLeaks::wrongReleases() const {
  std::vector<std::string> texts;
  if (twice.count > 0) texts.push_back(twice.text("list " + std::to_string(twice.list) + " is released once more"));
  if (unknown.count > 0) texts.push_back(unknown.text("a list is released that no recorded call gave"));
  return texts;
}

std::vector<std::string> ListLeaks::texts() const {
  std::vector<std::string> told;
  const auto all = leaks();
  for (size_t i = 0; i < std::min(all.size(), kMostTold); ++i) {
    const auto& [number, list] = all[i];
    told.push_back("list " + std::to_string(number) + ", given to session \"" + list->session + "\" by " +
                   callName(list->call) + " on line " + std::to_string(list->line) + ", is never released");
  }
  if (all.size() > kMostTold) told.push_back(std::to_string(all.size() - kMostTold) + " more lists are never released");
  return told;
}

Json ListLeaks::json() const {
  if (lists.empty()) return nullptr;
  Json array(json_array());
  for (const auto& [number, list] : leaks()) {
    appendElement(array, Json(json_pack("{s:I,s:s,s:s,s:I}", "list", static_cast<json_int_t>(number), "session",
                                        list->session.c_str(), "call", callName(list->call), "line",
                                        static_cast<json_int_t>(list->line))));
  }
  return array;
}

std::vector<std::pair<int64_t, const ListLeaks::List*>> ListLeaks::leaks() const {
  std::vector<std::pair<int64_t, const List*>> found;
  for (const auto& [number, list] : lists) {
    if (list.releasedOn == 0) found.emplace_back(number, &list);
  }
  return found;
}

void ListLeaks::Wrong::add(size_t onLine, int64_t released) {
  if (count++ > 0) return;
  line = onLine;
  list = released;
}

std::string ListLeaks::Wrong::text(const std::string& what) const {
  const std::string more = count == 1 ? "" : ", the first of " + std::to_string(count) + " such releases";
  return std::to_string(line) + ": " + what + more;
}

}  // namespace senseloom::tool
