#include "plot/svg_picture.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <string_view>
#include <utility>

#include "kinds/option_data.h"
#include "plot/palette.h"
#include "plot/svg_canvas.h"
#include "plot/svg_lane.h"
#include "plot/svg_text.h"
#include "trace/human_time.h"

namespace senseloom::tool {
namespace {

constexpr double kWidth = 1080;
constexpr double kLeft = 150;  // of the lanes: names stand before them
constexpr double kRight = 24;
constexpr double kMargin = 20;
constexpr double kRecordsHeight = 44;
constexpr double kClientHeight = 24;
constexpr double kNoteHeight = 18;  // above the lane of a client, for what it asks
constexpr double kClientGap = 8;
constexpr double kCharacter = 5.9;  // about the width of one, to keep texts apart
constexpr double kNoteGap = 12;     // between one text and the next
constexpr int kMostAxisMarks = 8;

// What a client asked for, in a place of its own above the lane.
struct PlacedNote {
  const PlotLane::Note* note;
  double x;
  double left;  // of its text
  size_t row;   // from the lane upwards
};

constexpr SvgColour kColours[] = {
    {".back", "fill", "#ffffff", "#0d1117"},   {"text", "fill", "#1f2328", "#e6edf3"},
    {".quiet", "fill", "#59636e", "#9198a1"},  {".note", "fill", "#59636e", "#9198a1"},
    {".note", "stroke", "#ffffff", "#0d1117"}, {".open", "fill", "#eff2f5", "#21262d"},
    {".tick", "stroke", "#1f2328", "#e6edf3"}, {".axis", "stroke", "#d1d9e0", "#3d444d"},
    {".cut", "stroke", "#1f2328", "#e6edf3"},  {".ask", "fill", "#8250df", "#bc8cff"},
    {".no", "stroke", "#d1242f", "#ff7b72"},
};

constexpr char kRules[] =
    ".axis,.cut,.tick,.no{fill:none}.cut{stroke-dasharray:2 3;stroke-opacity:.7}.no{stroke-width:1.6}"
    ".note{paint-order:stroke;stroke-width:4;stroke-linejoin:round}";

class Picture {
 public:
  Picture(const Plot& drawn, const PictureHead& pictureHead) : plot(drawn), head(pictureHead) {}

  std::string draw() {
    y = kMargin + 12;
    canvas.addText(kMargin, y, "head", head.title);
    canvas.addText(kWidth - kRight, y, "quiet", "the records of a sensor, and what each client received of them",
                   "end");
    y += 10;
    for (const Plot::Group& group : plot.sensorGroups()) addGroup(group);
    addAxis();
    addKey();
    y = std::ceil(y);
    return canvas.document(head.title, kWidth, y, kRules, colours());
  }

 private:
  static double laneWidth() { return kWidth - kLeft - kRight; }
  double xOf(size_t bin) const { return kLeft + laneWidth() * plot.time().placeOf(bin); }

  std::vector<SvgColour> colours() const {
    std::vector<SvgColour> all(std::begin(kColours), std::end(kColours));
    for (size_t hue = 0; hue < kHues; ++hue) {
      const HueColour& colour = kHueColours[hue];
      if (usedHues.counts[hue] > 0) all.push_back({colour.selector, "fill", colour.light, colour.dark});
    }
    return all;
  }

  void addGroup(const Plot::Group& group) {
    const Sensor& sensor = *group.sensor;
    y += 22;
    canvas.addText(kMargin, y, "name", group.sensor->name);
    canvas.addText(kMargin + 60, y, "quiet", findOptionDescription(group.sensor->name)->title);
    addLegend(group, sensor);
    y += 14;
    const double top = y;
    uint32_t most = 0;
    for (size_t bin = 0; bin < Timeline::kBins; ++bin) most = std::max(most, group.records.at(bin).received.height);
    for (const PlotLane& client : group.clients) {
      for (size_t bin = 0; bin < Timeline::kBins; ++bin) most = std::max(most, client.at(bin).received.height);
    }
    addNames("records", grouped(group.records.offered), y + kRecordsHeight / 2);
    canvas.add(SvgLane(plot.time(), sensor, {kLeft, y, laneWidth(), kRecordsHeight}).draw(group.records, most));
    y += kRecordsHeight + 4;
    std::vector<std::string> names;
    for (const PlotLane& client : group.clients) names.push_back(client.name);
    names = shortenedApart(names);
    std::vector<double> laneTops;
    for (size_t i = 0; i < names.size(); ++i) {
      const auto notes = place(group.clients[i]);
      y += kNoteHeight * static_cast<double>(rowsOf(notes));
      laneTops.push_back(y);
      addClient(group.clients[i], names[i], sensor, most);
    }
    addNegotiations(group.records, top, y);
    for (size_t i = 0; i < names.size(); ++i) addRequests(group.clients[i], laneTops[i]);
  }

  void addLegend(const Plot::Group& group, const Sensor& sensor) {
    RecordHues all;
    for (size_t bin = 0; bin < Timeline::kPlaces; ++bin) {
      all.add(group.records.at(bin).received);
      for (const PlotLane& client : group.clients) all.add(client.at(bin).received);
    }
    usedHues.add(all);
    const double left = kMargin + 260;
    double x = left;
    for (size_t hue = 0; hue < kHues; ++hue) {
      if (all.counts[hue] == 0) continue;
      const std::string text = hueText(sensor, hue, head.classNames);
      const double width = 16 + kCharacter * static_cast<double>(text.size()) + 16;
      if (x + width > kWidth - kRight + 16 && x > left) {
        x = left;
        y += 18;
      }
      canvas.add("<rect class=\"" + hueClass(hue) + "\" x=\"" + coordinate(x) + "\" y=\"" + coordinate(y - 10) +
                 "\" width=\"11\" height=\"11\" rx=\"2\"/>\n");
      canvas.addText(x + 16, y, "small", text);
      x += width;
    }
  }

  void addNames(const std::string& name, const std::string& detail, double middle) {
    canvas.addText(kMargin, middle - 2, "name", name);
    canvas.addText(kMargin, middle + 12, "quiet small", detail);
  }

  void addClient(const PlotLane& client, const std::string& name, const Sensor& sensor, uint32_t most) {
    addNames(name, grouped(client.results) + " of " + grouped(client.offered), y + kClientHeight / 2);
    addPresence(client);
    canvas.add(SvgLane(plot.time(), sensor, {kLeft, y, laneWidth(), kClientHeight}).draw(client, most));
    if (sensor.lasts) addResultTicks(client);
    y += kClientHeight + kClientGap;
  }

  // The times at which the client has a session.
  void addPresence(const PlotLane& client) {
    double from = -1;
    const auto end = [&](double to) {
      if (from >= 0 && to > from) {
        canvas.add("<rect class=\"open\" x=\"" + coordinate(from) + "\" y=\"" + coordinate(y) + "\" width=\"" +
                   coordinate(to - from) + "\" height=\"" + coordinate(kClientHeight) + "\"/>\n");
      }
      from = -1;
    };
    for (size_t bin = 0; bin < Timeline::kPlaces; ++bin) {
      const auto presence = client.at(bin).presence;
      if (presence == PlotLane::Presence::opens && from < 0) from = xOf(bin);
      if (presence == PlotLane::Presence::closes) end(xOf(bin));
    }
    end(kLeft + laneWidth());
  }

  void addResultTicks(const PlotLane& client) {
    std::string ticks;
    for (size_t bin = 0; bin < Timeline::kBins; ++bin) {
      if (client.at(bin).received.records == 0) continue;
      ticks += 'M' + coordinate(xOf(bin)) + ' ' + coordinate(y + kClientHeight + 1) + "v4";
    }
    canvas.addPath("tick", ticks);
  }

  // Places for what a client asks for, at the time it does. A text that would run into another one goes above it.
  std::vector<PlacedNote> place(const PlotLane& client) const {
    std::vector<PlacedNote> placed;
    std::vector<double> ends;  // by row
    for (const PlotLane::Note& note : client.allNotes()) {
      const double x = xOf(note.bin);
      const double width = kCharacter * static_cast<double>(note.text.size());
      const bool fits = x + 9 + width < kWidth - 4;
      const double left = fits ? x + 9 : std::max(x - 9 - width, 4.0);
      size_t row = 0;
      while (row < ends.size() && ends[row] > std::min(x - 5, left)) ++row;
      if (row == ends.size()) ends.emplace_back();
      ends[row] = std::max(x + 5, left + width) + kNoteGap;
      placed.push_back({.note = &note, .x = x, .left = left, .row = row});
    }
    return placed;
  }

  static size_t rowsOf(const std::vector<PlacedNote>& notes) {
    size_t rows = 1;
    for (const PlacedNote& placed : notes) rows = std::max(rows, placed.row + 1);
    return rows;
  }

  void addRequests(const PlotLane& client, double laneTop) {
    std::array<bool, Timeline::kPlaces> isNoted{};
    std::string taken;
    std::string refused;
    const auto mark = [&](double x, double baseline, bool isRefused) {
      if (isRefused) {
        refused += 'M' + coordinate(x - 4) + ' ' + coordinate(baseline - 8) + "l8 8m0-8l-8 8";
      } else {
        taken += 'M' + coordinate(x) + ' ' + coordinate(baseline - 9) + "l5 5-5 5-5-5z";
      }
    };
    for (const PlacedNote& placed : place(client)) {
      const double baseline = laneTop - 5 - kNoteHeight * static_cast<double>(placed.row);
      canvas.addText(placed.left, baseline, "note small", placed.note->text);
      mark(placed.x, baseline, placed.note->isRefused);
      isNoted[placed.note->bin] = true;
    }
    for (size_t bin = 0; bin < Timeline::kPlaces; ++bin) {
      const PlotLane::Bin& here = client.at(bin);
      if (here.asks && !isNoted[bin]) mark(xOf(bin), laneTop - 5, here.isRefused);
    }
    canvas.addPath("ask", taken);
    canvas.addPath("no", refused);
  }

  void addNegotiations(const PlotLane& records, double top, double bottom) {
    std::string lines;
    for (size_t bin = 0; bin < Timeline::kPlaces; ++bin) {
      if (!records.at(bin).negotiates) continue;
      lines += 'M' + coordinate(xOf(bin)) + ' ' + coordinate(top - 3) + 'V' + coordinate(bottom - 3);
    }
    canvas.addPath("cut", lines);
  }

  struct AxisMark {
    double value;
    std::string text;
  };

  std::vector<AxisMark> axisMarks() const {
    const Timeline& time = plot.time();
    std::vector<AxisMark> marks;
    if (time.isTime()) {
      const auto first = static_cast<uint64_t>(time.first());
      for (const uint64_t mark : timeMarks(first, static_cast<uint64_t>(time.last()), head.timeUnit, kMostAxisMarks)) {
        marks.push_back({static_cast<double>(mark), humanTime(mark, head.timeUnit)});
      }
      return marks;
    }
    const double step = std::max(axisStep(time.last() - time.first(), kMostAxisMarks), 1.0);
    for (double value = std::ceil(time.first() / step) * step; value <= time.last(); value += step) {
      marks.push_back({value, grouped(static_cast<uint64_t>(value))});
    }
    return marks;
  }

  // A text that would run into the one before it is left out.
  void addAxis() {
    const Timeline& time = plot.time();
    if (time.records() == 0) return;
    y += 8;
    std::string path = 'M' + coordinate(kLeft) + ' ' + coordinate(y) + 'h' + coordinate(laneWidth());
    double end = 0;
    for (const AxisMark& mark : axisMarks()) {
      const double x = kLeft + laneWidth() * (mark.value - time.first()) / (time.last() - time.first());
      path += 'M' + coordinate(x) + ' ' + coordinate(y) + "v5";
      const double half = kCharacter * static_cast<double>(mark.text.size()) / 2;
      const double middle = std::min(x, kWidth - 8 - half);
      if (middle - half < end) continue;
      canvas.addText(middle, y + 18, "quiet small", mark.text, "middle");
      end = middle + half + kNoteGap;
    }
    canvas.addPath("axis", path);
    canvas.addText(kMargin, y + 18, "quiet small", time.isTime() ? "time" : "record");
    y += 18;
  }

  template <class Predicate>
  bool anyBin(Predicate predicate) const {
    for (const Plot::Group& group : plot.sensorGroups()) {
      for (size_t bin = 0; bin < Timeline::kPlaces; ++bin) {
        if (predicate(group.records.at(bin))) return true;
        for (const PlotLane& client : group.clients) {
          if (predicate(client.at(bin))) return true;
        }
      }
    }
    return false;
  }

  // The meaning of the marks that the picture has.
  void addKey() {
    const auto& groups = plot.sensorGroups();
    y += 26;
    double x = kLeft;
    const auto explain = [&](const char* text) {
      canvas.addText(x + 12, y, "quiet small", text);
      x += 12 + kCharacter * static_cast<double>(std::string_view(text).size()) + 22;
    };
    if (anyBin([](const PlotLane::Bin& bin) { return bin.asks && !bin.isRefused; })) {
      canvas.addPath("ask", 'M' + coordinate(x + 2) + ' ' + coordinate(y - 9) + "l5 5-5 5-5-5z");
      explain("an option is set");
    }
    if (anyBin([](const PlotLane::Bin& bin) { return bin.isRefused; })) {
      canvas.addPath("no", 'M' + coordinate(x - 2) + ' ' + coordinate(y - 8) + "l8 8m0-8l-8 8");
      explain("an option is refused");
    }
    if (anyBin([](const PlotLane::Bin& bin) { return bin.negotiates; })) {
      canvas.addPath("cut", 'M' + coordinate(x + 2) + ' ' + coordinate(y - 11) + "v14");
      explain("the sensor negotiates");
    }
    if (std::any_of(groups.begin(), groups.end(), [](auto& group) { return group.sensor->lasts; })) {
      canvas.addPath("tick", 'M' + coordinate(x + 2) + ' ' + coordinate(y - 7) + "v5");
      explain("a result arrives");
    }
    canvas.add("<rect class=\"open\" x=\"" + coordinate(x - 4) + "\" y=\"" + coordinate(y - 9) +
               "\" width=\"12\" height=\"11\"/>\n");
    explain("the session is open");
    if (const size_t more = plot.clientsLeftOut(); more > 0) {
      const std::string text = grouped(more) + " more " + (more == 1 ? "client is" : "clients are");
      canvas.addText(kWidth - kRight, y, "quiet small", text + " not shown: --session chooses", "end");
    }
    y += kMargin;
  }

  const Plot& plot;
  const PictureHead& head;
  SvgCanvas canvas;
  RecordHues usedHues;
  double y = 0;  // down to where the picture is drawn
};

}  // namespace

std::string drawSvg(const Plot& plot, const PictureHead& head) {
  return Picture(plot, head).draw();
}

}  // namespace senseloom::tool
