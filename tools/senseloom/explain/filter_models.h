#pragma once

#include "explain/session_model.h"
#include "trace/record_field.h"

// The sessions that decide about each record by itself.
namespace senseloom::tool {

class EverythingModel final : public SessionModel {
 public:
  Verdict judge(const Wishes&, std::span<const uint8_t>, const std::vector<LogLine>&) override {
    return {Fate::delivered};
  }
};

// The record has the number of a class, from 1, which has a bit in the mask: number - 1, modulo 32.
template <class Number>
class ClassNumberModel final : public SessionModel {
 public:
  Verdict judge(const Wishes& wishes, std::span<const uint8_t> record, const std::vector<LogLine>&) override {
    const auto number = recordField<Number>(record, kValueOffset);
    if (!number) return {Fate::tooShort};
    const int32_t mask = wishes.valueOf("classMask");
    const auto bit = static_cast<int32_t>(uint32_t{1} << (static_cast<uint32_t>(int32_t{*number}) - 1) % 32);
    return {(bit & mask) != 0 ? Fate::delivered : Fate::classNotWanted, bit, mask};
  }
};

// The record has a set of classes, a bit each, widened with its sign.
class ClassSetModel final : public SessionModel {
 public:
  Verdict judge(const Wishes& wishes, std::span<const uint8_t> record, const std::vector<LogLine>&) override {
    const auto classes = recordField<int16_t>(record, kValueOffset);
    if (!classes) return {Fate::tooShort};
    const int32_t mask = wishes.valueOf("classMask");
    return {(*classes & mask) != 0 ? Fate::delivered : Fate::classNotWanted, *classes, mask};
  }
};

class StepCountModel final : public SessionModel {
 public:
  Verdict judge(const Wishes& wishes, std::span<const uint8_t> record, const std::vector<LogLine>&) override {
    if (wishes.valueOf("mode") == 1) return {Fate::delivered};
    const auto steps = recordField<int32_t>(record, kValueOffset);
    if (!steps) return {Fate::tooShort};
    const int32_t interval = wishes.valueOf("logN") * 100;
    return {*steps % interval == 0 ? Fate::delivered : Fate::notAMultiple, *steps, interval};
  }
};

}  // namespace senseloom::tool
