#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <fstream>
#include <string>
#include <utility>
#include <vector>

#include "input_error.h"
#include "terminal/interrupt.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {
namespace {

const std::string kHead = "{\"format\":1}\n";
const std::string kCall = "{\"call\":\"uninit\"}\n";
const std::string kEnd = "{\"end\":2,\"lost\":0}\n";

// A trace that becomes longer by a piece each time that its reader waits.
class FollowedTrace : public testing::Test {
 protected:
  ~FollowedTrace() override { std::remove(file.c_str()); }

  void write(const std::string& text, std::streamoff position) const {
    std::fstream(file, std::ios::binary | std::ios::in | std::ios::out).seekp(position) << text;
  }

  // The number of calls that a reader finds; once there are no more pieces, it is interrupted.
  size_t callsIn(const std::string& start, std::vector<std::string> pieces, size_t reserved = 0) {
    const InterruptMark mark;
    std::ofstream(file, std::ios::binary) << start << std::string(reserved, '\0');
    auto position = static_cast<std::streamoff>(start.size());
    size_t next = 0;
    const auto goOn = [&] {
      if (next == pieces.size()) {
        std::raise(SIGINT);
        return;
      }
      write(pieces[next], position);
      position += static_cast<std::streamoff>(pieces[next++].size());
    };
    TraceReader reader(file, remember(), {.follows = true, .meanwhile = goOn});
    size_t calls = 0;
    while (reader.next()) ++calls;
    wasInterrupted = isInterrupted();
    forgetInterrupt();
    return calls;
  }

  TraceReader::Remark remember() {
    return [this](const std::string& remark) { remarks += remark + '\n'; };
  }

  bool wasInterrupted = false;
  std::string remarks;
  const std::string file =
      testing::TempDir() + "followed_" + testing::UnitTest::GetInstance()->current_test_info()->name();
};

TEST_F(FollowedTrace, EndsWithTheRecording) {
  EXPECT_EQ(callsIn(kHead, {kCall, kCall + kEnd, ""}), 2U);
  EXPECT_EQ(remarks, "");
  EXPECT_FALSE(wasInterrupted);
}

TEST_F(FollowedTrace, GoesOnWhereCallsFollowItsEnd) {
  EXPECT_EQ(callsIn(kHead, {kCall + "{\"end\":1,\"lost\":0}\n", kCall, kEnd, ""}), 2U);
  EXPECT_EQ(remarks, "");
  EXPECT_FALSE(wasInterrupted);
}

TEST_F(FollowedTrace, WaitsForTheRestOfALine) {
  EXPECT_EQ(callsIn("", {kHead + kCall.substr(0, 5), kCall.substr(5, 9), kCall.substr(14) + kCall + kEnd}), 2U);
  EXPECT_EQ(remarks, "");
}

TEST_F(FollowedTrace, TakesReservedRoomForNothingThatIsThere) {
  EXPECT_EQ(callsIn(kHead, {kCall, kCall, kEnd, ""}, 4096), 2U);
  EXPECT_EQ(remarks, "");
  EXPECT_FALSE(wasInterrupted);
}

TEST_F(FollowedTrace, EndsWithoutARemarkWhenItIsInterrupted) {
  EXPECT_EQ(callsIn(kHead + kCall, {kCall}), 2U);
  EXPECT_EQ(callsIn(kCall + "{\"call\"", {}), 1U) << "in the middle of a line";
  EXPECT_EQ(remarks, "");
  EXPECT_TRUE(wasInterrupted);
}

TEST_F(FollowedTrace, CannotBeCompressed) {
  const std::string why = "what is compressed cannot be followed, but it can be read when it is complete";
  for (const char* start : {"\x1f\x8b", "\x28\xb5\x2f\xfd"}) {
    try {
      callsIn("", {start});
      FAIL() << "was read";
    } catch (const InputError& error) {
      EXPECT_EQ(error.what(), why);
    }
  }
}

TEST_F(FollowedTrace, MayNotBecomeShorter) {
  std::ofstream(file) << kHead + kCall;
  TraceReader reader(file, remember(),
                     {.follows = true, .meanwhile = [this] { EXPECT_EQ(truncate(file.c_str(), 5), 0); }});
  EXPECT_TRUE(reader.next());
  EXPECT_THROW(reader.next(), InputError);
}

TEST_F(FollowedTrace, WaitsForTheWriterOfAPipeAndForItsEnd) {
  ASSERT_EQ(mkfifo(file.c_str(), 0600), 0);
  std::FILE* writer = nullptr;
  size_t waits = 0;
  const auto goOn = [&] {
    ++waits;
    if (waits == 1) return;
    if (waits == 2) writer = std::fopen(file.c_str(), "w");
    if (waits < 4) {
      std::fputs((waits == 2 ? kHead + kCall + kEnd : kCall + kEnd).c_str(), writer);
      std::fflush(writer);
    } else if (writer != nullptr) {
      std::fclose(std::exchange(writer, nullptr));
    }
  };
  TraceReader reader(file, remember(), {.follows = true, .meanwhile = goOn});
  EXPECT_TRUE(reader.next());
  EXPECT_EQ(waits, 2U);
  EXPECT_TRUE(reader.next()) << "what comes behind the recording's end";
  EXPECT_FALSE(reader.next());
  EXPECT_NE(remarks.find("the recording ended with 2 calls, but 1 are there"), std::string::npos) << remarks;
}

// Where all that was sent is found, the reader is about to wait.
TEST_F(FollowedTrace, TellsBeforeAWaitForAPipeThatIsReadToItsEnd) {
  int ends[2];
  ASSERT_EQ(pipe(ends), 0);
  size_t sent = 0;
  const auto send = [&] {
    EXPECT_EQ(::write(ends[1], kCall.data(), kCall.size()), kCall.size());
    ++sent;
  };
  send();
  size_t found = 0;
  const auto goOn = [&] {
    if (found < sent) return;
    if (sent == 2) {
      close(ends[1]);
    } else {
      send();
    }
  };
  TraceReader reader("/proc/self/fd/" + std::to_string(ends[0]), remember(), {.meanwhile = goOn});
  while (reader.next()) ++found;
  EXPECT_EQ(found, 2U);
  close(ends[0]);
}

}  // namespace
}  // namespace senseloom::tool
