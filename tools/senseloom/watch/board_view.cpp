#include "watch/board_view.h"

#include <algorithm>
#include <cctype>
#include <cstdio>
#include <iterator>

#include "watch/screen_text.h"

namespace senseloom::tool {
namespace {

// --- columns

struct Column {
  const char* title;
  std::string (*text)(const BoardRow&);
  double (*number)(const BoardRow&) = nullptr;  // of a column of numbers; it is not shortened
};

std::string rateText(const BoardRow& row) {
  char text[32];
  std::snprintf(text, sizeof text, "%.1f", row.rate);
  return text;
}

constexpr Column kColumns[] = {
    {"session", [](const BoardRow& row) { return row.session; }},
    {"sensor", [](const BoardRow& row) { return row.sensor; }},
    {"request", [](const BoardRow& row) { return row.request; }},
    {"records", [](const BoardRow& row) { return std::to_string(row.records); },
     [](const BoardRow& row) { return static_cast<double>(row.records); }},
    {"results", [](const BoardRow& row) { return std::to_string(row.results); },
     [](const BoardRow& row) { return static_cast<double>(row.results); }},
    {"rate/s", rateText, [](const BoardRow& row) { return row.rate; }},
    {"last", [](const BoardRow& row) { return row.lastResult; }},
    {"reason", [](const BoardRow& row) { return row.reason; }},
};
constexpr size_t kColumnCount = std::size(kColumns);
constexpr size_t kGap = 2;         // between columns
constexpr size_t kLeastWidth = 4;  // of a column that is shortened

// --- keys

constexpr char kKeys[] = "s sort  r reverse  / filter  p pause  up/down move  q quit";

constexpr char kInterruptKey = '\x03';  // Ctrl-C
constexpr char kQuitKey = '\x1c';       // Ctrl-backslash
constexpr char kEscape = '\x1b';
constexpr char kUp = '\x10';    // Ctrl-P
constexpr char kDown = '\x0e';  // Ctrl-N

// Takes a key off the front: an arrow's several bytes as one, those of other such keys as 0.
char takeKey(std::string_view& keys) {
  const bool isSequence = keys.size() > 2 && keys[0] == kEscape && (keys[1] == '[' || keys[1] == 'O');
  const char last = isSequence ? keys[2] : keys[0];
  keys.remove_prefix(isSequence ? 3 : 1);
  if (!isSequence) return last;
  return last == 'A' ? kUp : last == 'B' ? kDown : '\0';
}

void typeInFilter(char key, BoardView& view) {
  if (key == '\r' || key == '\n') {
    view.isTypingFilter = false;
  } else if (key == kEscape) {
    view.isTypingFilter = false;
    view.filter.clear();
  } else if (key == '\b' || key == '\x7f') {
    removeLastCharacter(view.filter);
  } else if (static_cast<unsigned char>(key) >= ' ') {
    view.filter += key;
  }
}

void changeView(char key, BoardView& view) {
  switch (key) {
    case 's':
      view.sortedBy = (view.sortedBy + 1) % (kColumnCount + 1);
      break;
    case 'r':
      view.isReversed = !view.isReversed;
      break;
    case '/':
      view.isTypingFilter = true;
      break;
    case kEscape:
      view.filter.clear();
      break;
    case 'p':
    case ' ':
      view.isPaused = !view.isPaused;
      break;
    case kDown:
      ++view.firstRow;
      break;
    case kUp:
      view.firstRow -= std::min<size_t>(1, view.firstRow);
      break;
    default:
      break;
  }
}

// --- rows

std::string inLowerCase(std::string text) {
  for (char& c : text) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return text;
}

bool passes(const BoardRow& row, const std::string& filter) {
  return std::any_of(std::begin(kColumns), std::end(kColumns), [&](const Column& column) {
    return inLowerCase(column.text(row)).find(filter) != std::string::npos;
  });
}

// Texts from A on, numbers from the largest on.
bool isBefore(const Column& column, const BoardRow& one, const BoardRow& other) {
  return column.number == nullptr ? column.text(one) < column.text(other) : column.number(one) > column.number(other);
}

std::vector<BoardRow> shownRows(const std::vector<BoardRow>& rows, const BoardView& view) {
  std::vector<BoardRow> shown;
  const std::string filter = inLowerCase(view.filter);
  std::copy_if(rows.begin(), rows.end(), std::back_inserter(shown),
               [&](const BoardRow& row) { return passes(row, filter); });
  if (view.sortedBy != 0) {
    const Column& column = kColumns[view.sortedBy - 1];
    std::stable_sort(shown.begin(), shown.end(),
                     [&](const BoardRow& one, const BoardRow& other) { return isBefore(column, one, other); });
  }
  if (view.isReversed) std::reverse(shown.begin(), shown.end());
  return shown;
}

// --- lines

using Cells = std::vector<std::string>;

Cells headings(const BoardView& view) {
  Cells cells;
  for (const Column& column : kColumns) cells.emplace_back(column.title);
  if (view.sortedBy != 0) cells[view.sortedBy - 1] += view.isReversed ? " ^" : " v";
  return cells;
}

// As wide as their cells, or less where the screen has no room for that: the widest ones of texts are shortened.
std::vector<size_t> columnWidths(const std::vector<Cells>& table, size_t screenWidth) {
  std::vector<size_t> widths(kColumnCount);
  size_t total = kGap * (kColumnCount - 1);
  for (size_t i = 0; i < kColumnCount; ++i) {
    for (const Cells& cells : table) widths[i] = std::max(widths[i], std::min(widthOf(cells[i]), screenWidth));
    total += widths[i];
  }
  for (; total > screenWidth; --total) {
    size_t widest = kColumnCount;
    for (size_t i = 0; i < kColumnCount; ++i) {
      const bool canBeLess = kColumns[i].number == nullptr && widths[i] > kLeastWidth;
      if (canBeLess && (widest == kColumnCount || widths[i] > widths[widest])) widest = i;
    }
    if (widest == kColumnCount) break;
    --widths[widest];
  }
  return widths;
}

std::string lineOf(const Cells& cells, const std::vector<size_t>& widths) {
  std::string line;
  for (size_t i = 0; i < kColumnCount; ++i) {
    const std::string cell = shortenedTo(widths[i], cells[i]);
    line += kColumns[i].number == nullptr ? paddedBehind(widths[i], cell) : paddedInFront(widths[i], cell);
    line.append(kGap, ' ');
  }
  line.erase(line.find_last_not_of(' ') + 1);
  return line;
}

std::string titleLine(const std::string& title, size_t all, size_t left, const BoardView& view) {
  std::string line = title + ": " + std::to_string(all) + (all == 1 ? " session" : " sessions");
  if (!view.filter.empty()) line += ", " + std::to_string(left) + " with \"" + view.filter + '"';
  if (view.isPaused) line += ", paused";
  return line;
}

std::string lastLine(const BoardView& view) {
  return view.isTypingFilter ? "filter: " + view.filter + "_  (Enter keeps it, Esc removes it)" : kKeys;
}

}  // namespace

Leaving pressKeys(std::string_view keys, BoardView& view) {
  while (!keys.empty()) {
    const char key = takeKey(keys);
    if (key == kInterruptKey || key == kQuitKey) return Leaving::byInterrupt;
    if (view.isTypingFilter) {
      typeInFilter(key, view);
    } else if (key == 'q') {
      return Leaving::byQuitting;
    } else {
      changeView(key, view);
    }
  }
  return Leaving::no;
}

std::vector<std::string> screenLines(const std::string& title, const std::vector<BoardRow>& rows, BoardView& view,
                                     const ScreenSize& size) {
  constexpr size_t kOtherLines = 3;
  const std::vector<BoardRow> shown = shownRows(rows, view);
  const size_t room = size.height - std::min(size.height, kOtherLines);
  view.firstRow = std::min(view.firstRow, shown.size() - std::min(shown.size(), room));

  std::vector<Cells> table{headings(view)};
  for (size_t i = view.firstRow; i < std::min(shown.size(), view.firstRow + room); ++i) {
    table.emplace_back();
    for (const Column& column : kColumns) table.back().push_back(harmless(column.text(shown[i])));
  }
  const std::vector<size_t> widths = columnWidths(table, size.width);
  std::vector<std::string> lines{harmless(titleLine(title, rows.size(), shown.size(), view))};
  for (const Cells& cells : table) lines.push_back(lineOf(cells, widths));
  lines.resize(size.height - 1);
  lines.push_back(lastLine(view));
  for (std::string& line : lines) line = shortenedTo(size.width, line);
  return lines;
}

}  // namespace senseloom::tool
