#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "plot/record_hues.h"
#include "plot/timeline.h"

namespace senseloom::tool {

// What one lane of a picture shows, in the bins of a timeline: the records of a sensor, or what a client received.
class PlotLane {
 public:
  enum class Presence : uint8_t { same, opens, closes };
  struct Bin {
    RecordHues received;
    RecordHues last;                     // the last of the records received
    Presence presence = Presence::same;  // the last change within the bin
    bool asks = false;                   // an option was set
    bool isRefused = false;              // an option was set and refused
    bool negotiates = false;
  };
  // What a client asked for.
  struct Note {
    std::string text;
    bool isRefused = false;
    size_t bin = 0;
  };

  explicit PlotLane(std::string laneName) : name(std::move(laneName)) {}

  void receive(size_t bin, const RecordHues& record);
  void fold();
  // Keeps as many notes as a picture can show, and drops further ones.
  void addNote(size_t bin, Note note);
  Bin& at(size_t bin) { return bins[bin]; }
  const Bin& at(size_t bin) const { return bins[bin]; }
  const std::vector<Note>& allNotes() const { return notes; }

  const std::string name;
  size_t offered = 0;  // records
  size_t results = 0;

 private:
  std::vector<Bin> bins{Timeline::kPlaces};
  std::vector<Note> notes;
};

}  // namespace senseloom::tool
