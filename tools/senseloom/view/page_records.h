#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "model/reasons.h"
#include "plot/record_hues.h"
#include "trace/json.h"
#include "view/levels.h"
#include "view/numbering.h"
#include "view/packed_numbers.h"

namespace senseloom::tool {

// What became of a record. Beside the fates of the model there is one more: unexplained.
struct PageVerdict {
  uint32_t fate;
  std::string text;
};
inline constexpr uint32_t kUnexplainedFate = model::kFates;

// One record of a sensor, and what became of it for each session that it went to.
struct PageRecord {
  struct Reception {
    uint32_t client;
    uint32_t lane;
    PageVerdict verdict;
    std::optional<RecordHues> result;
  };

  size_t line;
  uint32_t sensor;
  uint32_t lane;
  uint64_t timestamp;
  RecordHues shown;
  std::vector<Reception> receptions;
};

// The records of a page, packed: about 10 bytes for a record, and one for each session it went to. The page's side of
// this is view/page/records.js.
class PageRecords {
 public:
  // The keys of the cells in a level: what a record or a result shows, by hue; what became of a record; the greatest
  // height; and the last hue of a result, plus one.
  static constexpr uint32_t kFateKey = kHues;
  static constexpr uint32_t kGreatestKey = kFateKey + kUnexplainedFate + 1;
  static constexpr uint32_t kLastKey = kGreatestKey + 1;
  static constexpr size_t kRecordsInBlock = 4096;

  void add(const PageRecord& record);
  void end();

  size_t count() const { return records; }
  uint64_t firstTime() const { return firstTimestamp; }
  // The numbers that the blocks refer to, and what the times in them are based on.
  void describe(const Json& summary) const;
  // In base64. For each record: the time and the lines from the one before it in the block (of the first one: from the
  // first of all, and from 0), its content, the sessions that it went to,
  // and for each of them the verdict and the content of the result, plus one; 0 if there is none.
  const std::vector<std::string>& blocks() const { return finished; }
  std::vector<std::string> levelTexts() const { return levels.texts(); }

 private:
  using Content = std::vector<uint32_t>;  // sensor, height, and pairs of a hue and its count

  uint32_t verdictOf(const PageVerdict& verdict);
  uint32_t contentOf(uint32_t sensor, const RecordHues& hues);
  void countCells(uint32_t lane, const RecordHues& hues);
  void endBlock();

  size_t records = 0;
  bool isRising = true;
  uint64_t firstTimestamp = 0;
  uint64_t lastTimestamp = 0;
  size_t lastLine = 0;
  Numbering<Content> contents;
  Numbering<std::string> wordings;            // of verdicts, with "#" in place of each number
  Numbering<std::vector<uint64_t>> verdicts;  // fate, wording, and the numbers
  Numbering<std::vector<uint32_t>> audiences;
  PackedNumbers block;
  std::vector<std::string> finished;
  Levels levels{kGreatestKey, kLastKey};
};

}  // namespace senseloom::tool
