#pragma once

#include <gtest/gtest.h>

#include <optional>

#include "bytes_of.h"
#include "session/session.h"

// What a session made of one record, with the whole of its answer checked as far as it is the same for all kinds.
class Delivery {
 public:
  // `len` other than the record's own length is for records that claim to be of another length.
  Delivery(senseloom::Session& session, Bytes& record, int len)
      : result(session.postProcess(record.data(), len, &out, &outLen)) {
    if (result == 1) return;
    EXPECT_EQ(out, &kUntouched);
    EXPECT_EQ(outLen, kUntouchedLength);
  }
  Delivery(senseloom::Session& session, Bytes& record) : Delivery(session, record, static_cast<int>(record.size())) {}

  // The delivered bytes; none when nothing was delivered.
  std::optional<Bytes> bytes() const {
    if (result != 1) return std::nullopt;
    const auto* first = static_cast<const uint8_t*>(out);
    return Bytes(first, first + outLen);
  }

  void* out = &kUntouched;
  int outLen = kUntouchedLength;
  const int result;

 private:
  static inline char kUntouched;
  static constexpr int kUntouchedLength = -77;
};
