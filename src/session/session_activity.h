#pragma once

#include "option/option_activity.h"
#include "session/session.h"

namespace senseloom {

// What a chain of activity stages knows of its elements.
bool _activity_equal_func(const void* a, const void* b);  // same class id; a null element equals only another one
void _activity_mask_func(void* item, int mask);           // a class outside `mask` becomes class 0
int _activity_check_seq_func(const void* item);           // sequence number; -1 for null

// Physical activity: gathers class decisions into batches and delivers each batch voted, masked and on change, as the
// session's option asks. Until the sensor's first negotiation records pass through untouched.
class SessionActivity final : public Session {
 public:
  SessionActivity() : Session(OptionActivity::kind.sensor, std::make_unique<OptionActivity>()) {}

  int postProcess(void* data, int len, void** out, int* outLen) noexcept override;
  int buildProc() override;

 private:
  // All that the chain is made of.
  struct ChainPlan {
    int batch;  // elements
    int summary;
    int weightVar;
    int classMask;
    int mode;
    bool operator==(const ChainPlan&) const = default;
  };
  static std::unique_ptr<Proc> makeChain(const ChainPlan& plan);

  // Hands out the chain's result. Apart from postProcess(), which most often has none.
  [[gnu::noinline]] int deliver(void** out, int* outLen);

  static constexpr int kMostItems = 256;  // the largest batch: 1 << the largest logN

  ChainPlan plan{};  // of the chain, while there is one
  ResultBuffer<10 + 2 * kMostItems> work;
};

}  // namespace senseloom
