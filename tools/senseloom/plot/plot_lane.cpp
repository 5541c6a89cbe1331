#include "plot/plot_lane.h"

#include <utility>

namespace senseloom::tool {
namespace {

constexpr size_t kMostNotes = 64;

PlotLane::Bin joined(PlotLane::Bin bin, const PlotLane::Bin& next) {
  bin.received.add(next.received);
  if (next.received.records > 0) bin.last = next.last;
  if (next.presence != PlotLane::Presence::same) bin.presence = next.presence;
  bin.asks |= next.asks;
  bin.isRefused |= next.isRefused;
  bin.negotiates |= next.negotiates;
  return bin;
}

}  // namespace

void PlotLane::receive(size_t bin, const RecordHues& record) {
  bins[bin].received.add(record);
  bins[bin].last = record;
}

void PlotLane::fold() {
  for (size_t i = 0; 2 * i + 1 < bins.size(); ++i) bins[i] = joined(bins[2 * i], bins[2 * i + 1]);
  const size_t half = bins.size() / 2;
  bins[half] = bins.back();  // what comes after the last record
  for (size_t i = half + 1; i < bins.size(); ++i) bins[i] = Bin();
  for (Note& note : notes) note.bin /= 2;
}

void PlotLane::addNote(size_t bin, Note note) {
  note.bin = bin;
  if (notes.size() < kMostNotes) notes.push_back(std::move(note));
}

}  // namespace senseloom::tool
