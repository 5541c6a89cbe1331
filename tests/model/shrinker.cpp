#include "shrinker.h"

#include <algorithm>
#include <utility>

namespace oracle {
namespace {

class Shrinker {
 public:
  Shrinker(Sequence failing, const std::function<bool(const Sequence&)>& predicate)
      : sequence(std::move(failing)), fails(predicate) {}

  Sequence shrink() {
    do {
      changed = false;
      shorten(sequence);
      for (size_t i = 0; i < sequence.size(); ++i) simplify(sequence[i]);
    } while (changed);
    return sequence;
  }

 private:
  // Keeps what was made of the sequence if it still fails; otherwise `old` becomes part of it again.
  template <class Part>
  bool keep(Part& part, Part old) {
    if (fails(sequence)) return changed = true;
    part = std::move(old);
    return false;
  }

  // Takes elements of a part of the sequence away, many at once as long as that goes.
  template <class List>
  void shorten(List& list) {
    for (size_t size = std::max<size_t>(list.size() / 2, 1); size > 0; size /= 2) {
      for (size_t begin = 0; begin + size <= list.size();) {
        List old = list;
        const auto from = list.begin() + static_cast<std::ptrdiff_t>(begin);
        list.erase(from, from + static_cast<std::ptrdiff_t>(size));
        if (!keep(list, std::move(old))) begin += size;
      }
    }
  }

  // Puts values in place of a part of the sequence, until one will do. It comes to an end because they are less.
  template <class Value>
  void replace(Value& part, const std::vector<Value>& values) {
    for (const Value& value : values) {
      if (value < part && keep(part, std::exchange(part, value))) return;
    }
  }

  void simplify(Call& call) {
    if (call.misuse != Call::none) keep(call.misuse, std::exchange(call.misuse, Call::none));
    if (call.answers != Answers{}) keep(call.answers, std::exchange(call.answers, {}));
    shorten(call.answers.names);
    if (call.what == Call::dispatchToSensor) {
      for (int session = 0; session < kMostSessions; ++session) {
        Call one = call;
        one.what = Call::dispatch;
        one.session = session;
        if (keep(call, std::exchange(call, one))) break;
      }
    }
    shorten(call.option.members);
    for (auto& [key, value] : call.option.members) replace(value, {"0", "1", "2", "3", "4"});
    if (call.option.verbatim) shorten(*call.option.verbatim);
    shortenItems(call.record);
    shorten(call.record);
    for (uint8_t& byte : call.record) replace(byte, {0, 1});
  }

  // Where items are counted, their number has to go down with the length.
  void shortenItems(Bytes& record) {
    for (const size_t itemSize : {size_t{2}, size_t{28}}) {
      for (uint8_t count = 0; count < 5; ++count) {
        const size_t size = 10 + count * itemSize;
        if (size >= record.size()) continue;
        Bytes old = record;
        record.resize(size);
        record[8] = count;
        record[9] = 0;
        if (keep(record, std::move(old))) return;
      }
    }
  }

  static constexpr int kMostSessions = 10;

  Sequence sequence;
  const std::function<bool(const Sequence&)>& fails;
  bool changed = false;
};

}  // namespace

Sequence shrink(Sequence sequence, const std::function<bool(const Sequence&)>& fails) {
  return Shrinker(std::move(sequence), fails).shrink();
}

}  // namespace oracle
