#include "sweep/scorer.h"

#include <algorithm>

#include "trace/record_value.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

double seconds(double nanoseconds) {
  return nanoseconds / static_cast<double>(kSecond);
}

// The value at a place of the ordered values.
int64_t valueAt(std::vector<int64_t>& values, size_t place) {
  const auto at = values.begin() + static_cast<std::ptrdiff_t>(place);
  std::nth_element(values.begin(), at, values.end());
  return *at;
}

// The middle one, or the mean of the two in the middle.
double median(std::vector<int64_t>& values) {
  if (values.empty()) return kUnknown;
  const size_t count = values.size();
  const auto upper = static_cast<double>(valueAt(values, count / 2));
  if (count % 2 != 0) return seconds(upper);
  return seconds((static_cast<double>(valueAt(values, count / 2 - 1)) + upper) / 2);
}

// The least that at least nine tenths of the values do not exceed.
double nineTenths(std::vector<int64_t>& values) {
  if (values.empty()) return kUnknown;
  return seconds(static_cast<double>(valueAt(values, (9 * values.size() + 9) / 10 - 1)));
}

}  // namespace

SweepTotals::SweepTotals(const Sensor& sensor, std::span<const SweepScript> scripts) {
  for (const SweepScript& script : scripts) {
    for (const SweepRecord& record : script.records) {
      time += record.lasts;
      if (record.label != 0) labelled += record.lasts;
      if (record.label != 0 && hasClasses(sensor)) truthKnown = true;
      if (record.isChange) ++changes;
    }
  }
}

void Scorer::begin(const SweepScript& trace) {
  script = &trace;
  batchFirst.reset();
  held.reset();
  change.reset();
}

void Scorer::take(size_t index, bool completes, const std::optional<std::span<const uint8_t>>& result) {
  const SweepRecord& record = script->records[index];
  if (record.isChange) startChange(record);
  if (!batchFirst && (record.holdsItems || completes)) batchFirst = index;
  if (result) takeResult(index, *result);
  if (completes) batchFirst.reset();
  if (record.label != 0 && held == record.label) right += record.lasts;
}

// A client whose last result already had the class knows of the change at once.
void Scorer::startChange(const SweepRecord& record) {
  if (held == record.label) {
    delays.push_back(0);
    change.reset();
  } else {
    change = Change{record.time, record.label, record.labelEnds};
  }
}

void Scorer::takeResult(size_t index, std::span<const uint8_t> result) {
  ++results;
  const int64_t time = script->records[index].time;
  if (!totals.truthKnown) batchTimes.push_back(time - script->records[batchFirst.value_or(index)].time);
  const auto classNumber = classOf(result);
  if (!classNumber) return;
  if (*classNumber == sensor.noMajorityClass) ++noMajority;
  if (held && *held != *classNumber) {
    ++reports;
    if (isFalse(*classNumber, index)) ++falseReports;
  }
  held = classNumber;
  if (change && index <= change->labelEnds && *classNumber == change->label) {
    delays.push_back(time - change->time);
    change.reset();
  }
}

// Of several decisions the last one counts: it is the latest.
std::optional<int32_t> Scorer::classOf(std::span<const uint8_t> result) const {
  if (sensor.items != Items::decisions) return recordValue(sensor, result);
  const auto count = recordField<int16_t>(result, kValueOffset).value_or(0);
  if (count <= 0) return std::nullopt;
  const auto last = recordField<uint16_t>(result, kItemsOffset + 2 * static_cast<size_t>(count - 1));
  if (!last) return std::nullopt;
  return *last & 15;
}

bool Scorer::isFalse(int32_t classNumber, size_t lastRecord) const {
  if (classNumber == sensor.noMajorityClass) return false;
  for (size_t i = batchFirst.value_or(lastRecord); i <= lastRecord; ++i) {
    const SweepRecord& record = script->records[i];
    const bool isOfBatch = record.holdsItems || i == lastRecord;
    if (isOfBatch && (record.label == 0 || record.label == classNumber)) return false;
  }
  return true;
}

double Scorer::perHour(size_t count) const {
  if (totals.time == 0) return kUnknown;
  return static_cast<double>(count) / (seconds(static_cast<double>(totals.time)) / 3600);
}

Figures Scorer::figures() {
  Figures found;
  found.results = perHour(results);
  if (!totals.truthKnown) found.batchMedian = median(batchTimes);
  if (!hasClasses(sensor)) return found;
  found.reports = perHour(reports);
  found.noMajority = perHour(noMajority);
  if (!totals.truthKnown) return found;
  found.falseReports = perHour(falseReports);
  found.changes = static_cast<double>(totals.changes);
  found.missed = static_cast<double>(totals.changes - delays.size());
  found.delayMedian = median(delays);
  found.delayP90 = nineTenths(delays);
  if (totals.labelled > 0) found.right = static_cast<double>(right) / static_cast<double>(totals.labelled);
  return found;
}

}  // namespace senseloom::tool
