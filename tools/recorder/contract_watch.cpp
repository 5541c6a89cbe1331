#include "contract_watch.h"

#include <algorithm>

#include "in_force.h"

namespace senseloom::trace {
namespace {

constexpr size_t kMostTold = 1000;
constexpr size_t kMostClosed = 10000;

std::string inThread(int thread) {
  return " in thread " + std::to_string(thread);
}

}  // namespace

std::optional<Breach> ContractWatch::entered(int thread, const char* call) {
  const Inside* other = nullptr;
  for (Inside& one : inside) {
    if (one.thread == thread) continue;
    one.isAlone = false;
    if (other == nullptr) other = &one;
  }
  std::optional<Breach> breach;
  if (other != nullptr) {
    breach = onlyOnce({.kind = "two threads",
                       .text = "two threads are in the library at once: " + std::string(other->call) +
                               inThread(other->thread) + ", " + call + inThread(thread),
                       .threads = {other->thread, thread}});
  }
  inside.push_back({thread, call, other == nullptr});
  return breach;
}

bool ContractWatch::left(int thread) {
  const auto last = std::find_if(inside.rbegin(), inside.rend(), [=](auto& one) { return one.thread == thread; });
  if (last == inside.rend()) return true;
  const bool isAlone = last->isAlone;
  inside.erase(std::next(last).base());
  return isAlone;
}

void ContractWatch::closed(const void* handle, uint32_t session, int thread) {
  if (closedHandles.size() == kMostClosed) closedHandles.clear();
  closedHandles[handle] = {session, thread};
  resultForgotten(session);
}

std::optional<Breach> ContractWatch::usedClosed(const void* handle, const char* call, int thread) {
  const auto found = closedHandles.find(handle);
  if (found == closedHandles.end()) return std::nullopt;
  const Closed& closing = found->second;
  return onlyOnce({.kind = "closed session",
                   .text = "the handle of session " + sessionName(closing.session) + " is used after it was closed" +
                           inThread(closing.thread) + ": " + call + inThread(thread),
                   .threads = {closing.thread, thread}});
}

int64_t ContractWatch::listGiven(const void* list) {
  for (Released& one : released) {
    if (one.list == list) one = {};
  }
  return lists[list] = ++lastList;
}

ListRelease ContractWatch::listReleased(const void* list, int thread) {
  if (list == nullptr) return {};
  const auto* first = std::find_if(released.begin(), released.end(), [=](auto& one) { return one.list == list; });
  if (first == released.end()) {
    const auto given = lists.extract(list);
    const int64_t number = given.empty() ? 0 : given.mapped();
    released[nextReleased++ % released.size()] = {list, number, thread};
    return {number};
  }
  return {first->number, onlyOnce({.kind = "list released twice",
                                   .text = "a property list is released twice: first" + inThread(first->thread) +
                                           ", again" + inThread(thread),
                                   .threads = {first->thread, thread}})};
}

void ContractWatch::resultGiven(uint32_t session, const void* result, int size, const void* record, int thread) {
  if (result == nullptr || result == record || size <= 0) return;  // a record handed back is the caller's
  const auto* begin = static_cast<const uint8_t*>(result);
  results[session] = {session, begin, begin + size, thread};
  for (Result& old : ended) {
    if (old.begin < begin + size && begin < old.end) old = {};
  }
}

void ContractWatch::resultEnded(uint32_t session) {
  const auto found = results.find(session);
  if (found == results.end()) return;
  ended[nextEnded++ % ended.size()] = found->second;
  results.erase(found);
}

std::optional<Breach> ContractWatch::recordGiven(const void* record, int size, int thread) {
  const auto* begin = static_cast<const uint8_t*>(record);
  const auto* stale = std::find_if(ended.begin(), ended.end(),
                                   [=](const Result& one) { return one.begin < begin + size && begin < one.end; });
  if (stale == ended.end()) return std::nullopt;
  return onlyOnce({.kind = "result out of date",
                   .text = "a record is in the memory of a result of session " + sessionName(stale->session) +
                           ", which ended with the session's next record: given" + inThread(stale->thread) + ", used" +
                           inThread(thread),
                   .threads = {stale->thread, thread}});
}

void ContractWatch::resultForgotten(uint32_t session) {
  results.erase(session);
  for (Result& old : ended) {
    if (old.session == session) old = {};
  }
}

std::optional<Breach> ContractWatch::onlyOnce(Breach breach) {
  if (told.size() == kMostTold || !told.insert(breach.text).second) return std::nullopt;
  return breach;
}

}  // namespace senseloom::trace
