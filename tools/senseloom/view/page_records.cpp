#include "view/page_records.h"

#include <charconv>
#include <utility>

namespace senseloom::tool {

void PageRecords::add(const PageRecord& record) {
  if (records == 0) firstTimestamp = lastTimestamp = record.timestamp;
  if (record.timestamp < lastTimestamp) isRising = false;
  const auto step = static_cast<int64_t>(record.timestamp - lastTimestamp);
  lastTimestamp = record.timestamp;
  // A block can be read without the one before.
  const bool isFirst = records % kRecordsInBlock == 0;
  block.addSigned(isFirst ? static_cast<int64_t>(record.timestamp - firstTimestamp) : step);
  block.add(isFirst ? record.line : record.line - lastLine);
  lastLine = record.line;
  block.add(contentOf(record.sensor, record.shown));
  countCells(record.lane, record.shown);
  std::vector<uint32_t> audience;
  for (const auto& reception : record.receptions) audience.push_back(reception.client);
  block.add(audiences.numberOf(audience));
  for (const auto& reception : record.receptions) {
    block.add(verdictOf(reception.verdict));
    block.add(reception.result ? contentOf(record.sensor, *reception.result) + 1 : 0);
    levels.count(reception.lane, kFateKey + reception.verdict.fate, 1);
    if (reception.result) countCells(reception.lane, *reception.result);
  }
  levels.endRecord(step);
  if (++records % kRecordsInBlock == 0) endBlock();
}

void PageRecords::end() {
  if (records % kRecordsInBlock != 0) endBlock();
  levels.end();
}

void PageRecords::describe(const Json& summary) const {
  addMember(summary, "records", Json(json_integer(static_cast<json_int_t>(records))));
  addMember(summary, "recordsInBlock", Json(json_integer(kRecordsInBlock)));
  addMember(summary, "isTime", Json(json_boolean(isRising && lastTimestamp > firstTimestamp)));
  addMember(summary, "firstTimestamp", textJson(std::to_string(firstTimestamp)));

  PackedNumbers packed;
  for (const Content* content : contents.values()) {
    packed.add(content->size());
    for (const uint32_t number : *content) packed.add(number);
  }
  addMember(summary, "contents", textJson(base64(packed.bytes())));
  packed.clear();
  for (const auto* verdict : verdicts.values()) {
    packed.add(verdict->size());
    for (const uint64_t number : *verdict) packed.add(number);
  }
  addMember(summary, "verdicts", textJson(base64(packed.bytes())));
  Json texts(json_array());
  for (const std::string* wording : wordings.values()) appendElement(texts, textJson(*wording));
  addMember(summary, "wordings", std::move(texts));
  Json lists(json_array());
  for (const auto* audience : audiences.values()) {
    Json list(json_array());
    for (const uint32_t client : *audience) json_array_append_new(list.get(), json_integer(client));
    json_array_append_new(lists.get(), list.release());
  }
  addMember(summary, "audiences", std::move(lists));
}

// Verdicts differ in their numbers more than in their words.
uint32_t PageRecords::verdictOf(const PageVerdict& verdict) {
  std::vector<uint64_t> parts{verdict.fate, 0};
  std::string wording;
  const char* const end = verdict.text.data() + verdict.text.size();
  for (const char* at = verdict.text.data(); at != end;) {
    uint64_t number = 0;
    const auto [next, error] = std::from_chars(at, end, number);
    if (error == std::errc()) parts.push_back(number);
    wording += error == std::errc() ? '#' : *at;
    at = error == std::errc() ? next : at + 1;
  }
  parts[1] = wordings.numberOf(wording);
  return verdicts.numberOf(parts);
}

uint32_t PageRecords::contentOf(uint32_t sensor, const RecordHues& hues) {
  Content content{sensor, hues.height};
  for (uint32_t hue = 0; hue < kHues; ++hue) {
    if (hues.counts[hue] > 0) content.insert(content.end(), {hue, hues.counts[hue]});
  }
  return contents.numberOf(content);
}

void PageRecords::countCells(uint32_t lane, const RecordHues& hues) {
  uint32_t last = 0;
  for (uint32_t hue = 0; hue < kHues; ++hue) {
    if (hues.counts[hue] == 0) continue;
    levels.count(lane, hue, hues.counts[hue]);
    if (last == 0 || hues.counts[hue] > hues.counts[last - 1]) last = hue + 1;
  }
  if (hues.height > 0) levels.count(lane, kGreatestKey, hues.height);
  if (last > 0) levels.count(lane, kLastKey, last);
}

void PageRecords::endBlock() {
  finished.push_back(base64(block.bytes()));
  block.clear();
}

}  // namespace senseloom::tool
