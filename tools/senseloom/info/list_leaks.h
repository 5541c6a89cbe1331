#pragma once

#include <cstddef>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "trace/json.h"
#include "trace/trace_call.h"

namespace senseloom::tool {

// Which property lists of a trace are never released. Only a trace whose calls number the lists that they gave tells
// that: it has their releases, too.
class ListLeaks {
 public:
  void take(const TraceCall& call);
  void takeRelease(size_t line, const Json& release);

  // How many lists were given and released; empty if the trace does not tell.
  std::string counts() const;
  // What is released wrongly, each with its line in front.
  std::vector<std::string> wrongReleases() const;
  // What to print of the leaks: the first ones, and how many there are beyond.
  std::vector<std::string> texts() const;
  // An element for each leak; null if the trace does not tell.
  Json json() const;

 private:
  struct List {
    std::string session;
    CallKind call;
    size_t line;
    size_t releasedOn = 0;  // a line
  };
  struct Wrong {
    size_t count = 0;
    size_t line = 0;  // the first one's
    int64_t list = 0;

    void add(size_t onLine, int64_t released);
    std::string text(const std::string& what) const;
  };

  // Those that are not released, by their numbers.
  std::vector<std::pair<int64_t, const List*>> leaks() const;

  std::map<int64_t, List> lists;  // by their numbers
  Wrong twice;
  Wrong unknown;
};

}  // namespace senseloom::tool
