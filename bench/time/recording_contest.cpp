// Recording: each record passes through the recording library, which writes a line about it.
#include <dlfcn.h>

#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <memory>
#include <span>
#include <string>

#include "contests.h"
#include "dispatch.h"

namespace bench {
namespace {

const std::string kTrace = IN_PLACE_FOLDER "/trace.jsonl";
const std::string kHandMade = IN_PLACE_FOLDER "/by_hand.jsonl";

// The recording library's functions.
struct Recorder {
  decltype(&ctx_open_session) open;
  decltype(&ctx_dispatch_data) dispatch;

  static const Recorder& get() {
    static const Recorder recorder = load();
    return recorder;
  }

 private:
  static Recorder load() {
    std::remove(kTrace.c_str());
    setenv("SENSELOOM_TRACE", kTrace.c_str(), 1);
    std::atexit([] {
      std::remove(kTrace.c_str());
      std::remove(kHandMade.c_str());
    });
    void* library = dlopen(IN_PLACE_FOLDER "/libsenseloom.so", RTLD_NOW | RTLD_LOCAL);
    require(library != nullptr, "the recording library cannot be loaded");
    return {reinterpret_cast<decltype(&ctx_open_session)>(dlsym(library, "ctx_open_session")),
            reinterpret_cast<decltype(&ctx_dispatch_data)>(dlsym(library, "ctx_dispatch_data"))};
  }
};

template <class Sink>
class Recorded {
 public:
  Recorded(Records& input, Sink& results)
      : dispatch(Recorder::get().dispatch), handle(Recorder::get().open("GSFLK")), records(input), sink(results) {}

  void operator()() {
    for (uint8_t* record = records.begin(); record != records.end(); record += records.size()) {
      void* result;
      int length;
      if (dispatch(handle, record, records.size(), &result, &length) == 1) sink(result, length);
    }
  }

 private:
  decltype(&ctx_dispatch_data) dispatch;
  void* handle;
  Records& records;
  Sink& sink;
};

// What one would write oneself, around each call: the same line, in a buffer that is lost if the program crashes. The
// file begins anew with each pass.
template <class Sink>
class ByHand {
 public:
  ByHand(Records& input, Sink& results) : client("GSFLK"), records(input), sink(results) {
    require(file != nullptr, "the line cannot be written by hand");
  }

  void operator()() {
    std::rewind(file.get());
    for (uint8_t* record = records.begin(); record != records.end(); record += records.size()) {
      void* result;
      int length;
      const int64_t start = nanoseconds();
      const int returned = ctx_dispatch_data(client.handle, record, records.size(), &result, &length);
      const int64_t end = nanoseconds();
      write(record, returned, result, length, start, end);
      if (returned == 1) sink(result, length);
    }
  }

 private:
  struct Close {
    void operator()(std::FILE* toClose) const { std::fclose(toClose); }
  };

  static int64_t nanoseconds() {
    timespec now{};
    clock_gettime(CLOCK_MONOTONIC, &now);
    return int64_t{now.tv_sec} * 1'000'000'000 + now.tv_nsec;
  }

  void writeBytes(const void* bytes, int length) {
    char digits[128];
    char* digit = digits;
    for (const uint8_t byte : std::span(static_cast<const uint8_t*>(bytes), static_cast<size_t>(length))) {
      *digit++ = "0123456789abcdef"[byte >> 4];
      *digit++ = "0123456789abcdef"[byte & 15];
    }
    std::fwrite(digits, 1, static_cast<size_t>(digit - digits), file.get());
  }

  void write(const uint8_t* record, int returned, const void* result, int length, int64_t start, int64_t end) {
    std::fputs(R"({"call":"dispatch","session":"s1","record":{"hex":")", file.get());
    writeBytes(record, records.size());
    std::fprintf(file.get(), R"("},"returned":%d)", returned);
    if (returned == 1) {
      std::fputs(R"(,"result":{"hex":")", file.get());
      writeBytes(result, length);
      std::fputs(R"("})", file.get());
    }
    std::fprintf(file.get(), ",\"atUs\":%lld,\"thread\":%d,\"tookNs\":%lld}\n", static_cast<long long>(start / 1000), 1,
                 static_cast<long long>(end - start));
  }

  const Client client;
  Records& records;
  Sink& sink;
  std::unique_ptr<std::FILE, Close> file{std::fopen(kHandMade.c_str(), "w")};
};

}  // namespace

void recordingContest() {
  const auto records = std::make_shared<Records>(inTurnFlicks());
  Contest contest("recording a flick record", records->count());
  contest.enter("senseloom", [=](auto& sink) { return Recorded<SinkOf<decltype(sink)>>(*records, sink); });
  contest.enter("stdio", [=](auto& sink) { return ByHand<SinkOf<decltype(sink)>>(*records, sink); });
  contest.enter("not recorded", [=](auto& sink) {
    return ByHandle<ctx_dispatch_data, SinkOf<decltype(sink)>>("GSFLK", "{}", openingOrder(1), *records, sink);
  });
}

}  // namespace bench
