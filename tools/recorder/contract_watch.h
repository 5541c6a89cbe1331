#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace senseloom::trace {

// What a program did that the library's contract forbids.
struct Breach {
  const char* kind;
  std::string text;
  std::array<int, 2> threads;  // the one that was first, and the one that breaks the contract
};

// The release of a property list.
struct ListRelease {
  int64_t list = 0;  // its number; 0: NULL, or a list that no call gave
  std::optional<Breach> breach = std::nullopt;
};

// Sees what can be seen of breaches of the library's contract, from the arguments and results of all calls. Each is
// told once: a program that does it does it often.
class ContractWatch {
 public:
  // A thread is in the library from one to the other. The second returns whether it was alone there all the time.
  std::optional<Breach> entered(int thread, const char* call);
  bool left(int thread);

  // What was told before is told again, since it is for another recording.
  void tellAnew() { told.clear(); }
  // The threads that were in the library are the parent's.
  void inChild() { inside.clear(); }

  void opened(const void* handle) { closedHandles.erase(handle); }
  void closed(const void* handle, uint32_t session, int thread);
  std::optional<Breach> usedClosed(const void* handle, const char* call, int thread);

  // Returns the number of the list: how many the process was given up to it. What is kept of a list that is not
  // released is the one thing that grows.
  int64_t listGiven(const void* list);
  // Before the library frees it: from then on its memory may be another list's.
  ListRelease listReleased(const void* list, int thread);

  // A session's result is gone with its next record.
  void resultGiven(uint32_t session, const void* result, int size, const void* record, int thread);
  void resultEnded(uint32_t session);
  std::optional<Breach> recordGiven(const void* record, int size, int thread);
  // Its storage may be anybody's.
  void resultForgotten(uint32_t session);

 private:
  struct Inside {
    int thread;
    const char* call;
    bool isAlone;
  };
  struct Closed {
    uint32_t session;
    int thread;
  };
  struct Result {
    uint32_t session;
    const uint8_t* begin;
    const uint8_t* end;
    int thread;
  };
  struct Released {
    const void* list;
    int64_t number;
    int thread;
  };

  std::optional<Breach> onlyOnce(Breach breach);

  std::vector<Inside> inside;
  std::unordered_map<const void*, Closed> closedHandles;
  std::unordered_map<const void*, int64_t> lists;  // not released, with their numbers
  int64_t lastList = 0;
  std::array<Released, 64> released{};
  size_t nextReleased = 0;
  std::unordered_map<uint32_t, Result> results;  // by session
  std::array<Result, 16> ended{};
  size_t nextEnded = 0;
  std::unordered_set<std::string> told;
};

}  // namespace senseloom::trace
