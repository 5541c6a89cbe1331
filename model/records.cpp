#include "records.h"

#include <cstdint>

namespace senseloom::model {
namespace {

Verdict judgeClassSet(int32_t mask, Record record) {
  if (!has<int16_t>(record, kValueOffset)) return {Fate::tooShort};
  const int32_t classes = at<int16_t>(record, kValueOffset);
  return {(classes & mask) != 0 ? Fate::delivered : Fate::classNotWanted, classes, mask};
}

template <class Number>
Verdict judgeClassNumber(int32_t mask, Record record) {
  if (!has<Number>(record, kValueOffset)) return {Fate::tooShort};
  const int64_t position = int64_t{at<Number>(record, kValueOffset)} - 1;
  return {bit(mask, position) ? Fate::delivered : Fate::classNotWanted, shifted(1, static_cast<int32_t>(position & 31)),
          mask};
}

Verdict judgeSteps(const Request& request, Record record) {
  if (request.value("mode") == 1) return {Fate::delivered};
  if (!has<int32_t>(record, kValueOffset)) return {Fate::tooShort};
  const auto steps = at<int32_t>(record, kValueOffset);
  const int32_t interval = request.value("logN") * 100;
  return {steps % interval == 0 ? Fate::delivered : Fate::notAMultiple, steps, interval};
}

Verdict judge(const Request& request, Record record) {
  switch (rowOf(request.kind()).judging) {
    case Judging::classSet:
      return judgeClassSet(request.value("classMask"), record);
    case Judging::classNumber16:
      return judgeClassNumber<int16_t>(request.value("classMask"), record);
    case Judging::classNumber32:
      return judgeClassNumber<int32_t>(request.value("classMask"), record);
    case Judging::stepMultiples:
      return judgeSteps(request, record);
    default:
      return {Fate::delivered};
  }
}

}  // namespace

Verdict judgeAlone(const Request& request, Record record, Outcome& outcome) {
  const Verdict verdict = judge(request, record);
  if (verdict.fate == Fate::delivered) outcome.delivers = Outcome::sameRecord;
  return verdict;
}

Verdict Gathering::judge(const Request& request, Record record, Outcome& outcome) {
  if (!has<int16_t>(record, kValueOffset)) return refused(Refusal::noCount);
  const auto declared = at<int16_t>(record, kValueOffset);
  if (declared < 0) return {Fate::refused, declared, 0, Refusal::negativeCount};
  const auto count = static_cast<size_t>(declared);
  const size_t room = (record.size() - kItemsOffset) / kItemSize;
  if (count > room) return refused(Refusal::itemsMissing, count, room);
  const size_t bytes = count * kItemSize;
  const size_t gathered = pending() + count;
  if (gathered > kMostItems) return refused(Refusal::tooManyItems, gathered, kMostItems);
  const auto given = record.subspan(kItemsOffset, bytes);
  items.insert(items.end(), given.begin(), given.end());
  const auto number = static_cast<int32_t>(gathered);
  const int32_t wanted = 1 << request.value("N");
  if (number < wanted) return {Fate::batchFilling, number, wanted};
  outcome.delivers = Outcome::ownBuffer;
  outcome.result.assign(record.begin(), record.begin() + kValueOffset);
  outcome.result.push_back(static_cast<uint8_t>(number));
  outcome.result.push_back(0);
  outcome.result.insert(outcome.result.end(), items.begin(), items.end());
  items.clear();
  return {Fate::delivered, number, wanted};
}

}  // namespace senseloom::model
