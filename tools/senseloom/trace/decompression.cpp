#include "trace/decompression.h"

#include <zlib.h>
#include <zstd.h>

#include <array>
#include <new>
#include <utility>

#include "input_error.h"

namespace senseloom::tool {
namespace {

constexpr int kGzipOnly = 16;
constexpr const char* kCutShort = "the compressed data is cut short";

[[noreturn]] void failDamaged(const char* why) {
  throw InputError(std::string("the compressed data is damaged: ") + why);
}

// What both have in common: compressed bytes in a buffer, from a file.
class Compressed : public ByteStream {
 protected:
  explicit Compressed(std::unique_ptr<ByteStream> bytes) : file(std::move(bytes)) {}

  // Whether there are bytes; false at the end of the file.
  bool fill() {
    if (begin == end) {
      begin = 0;
      end = file->read(buffer.data(), buffer.size());
    }
    return begin != end;
  }

  std::unique_ptr<ByteStream> file;
  std::array<char, 1 << 16> buffer;
  size_t begin = 0;
  size_t end = 0;
};

class Gunzipped final : public Compressed {
 public:
  explicit Gunzipped(std::unique_ptr<ByteStream> bytes) : Compressed(std::move(bytes)) {
    if (inflateInit2(&stream, kGzipOnly + MAX_WBITS) != Z_OK) throw std::bad_alloc();
  }
  ~Gunzipped() override { inflateEnd(&stream); }
  Gunzipped(const Gunzipped&) = delete;
  Gunzipped& operator=(const Gunzipped&) = delete;

  size_t read(char* bytes, size_t room) override {
    stream.next_out = reinterpret_cast<Bytef*>(bytes);
    stream.avail_out = static_cast<uInt>(room);
    while (stream.avail_out == room) {
      if (!fill()) {
        if (isInside) throw InputError(kCutShort);
        break;
      }
      stream.next_in = reinterpret_cast<Bytef*>(buffer.data() + begin);
      stream.avail_in = static_cast<uInt>(end - begin);
      isInside = true;
      const int result = inflate(&stream, Z_NO_FLUSH);
      begin = end - stream.avail_in;
      if (result == Z_STREAM_END) {
        isInside = false;
        inflateReset(&stream);
      } else if (result != Z_OK && result != Z_BUF_ERROR) {
        failDamaged(stream.msg == nullptr ? "not gzip" : stream.msg);
      }
    }
    return room - stream.avail_out;
  }

 private:
  z_stream stream{};
  bool isInside = false;  // of one of the compressed files
};

class Unzstded final : public Compressed {
 public:
  explicit Unzstded(std::unique_ptr<ByteStream> bytes) : Compressed(std::move(bytes)), stream(ZSTD_createDStream()) {
    if (stream == nullptr) throw std::bad_alloc();
  }

  size_t read(char* bytes, size_t room) override {
    ZSTD_outBuffer out{bytes, room, 0};
    while (out.pos == 0) {
      if (!fill()) {
        if (isInside) throw InputError(kCutShort);
        break;
      }
      ZSTD_inBuffer in{buffer.data(), end, begin};
      const size_t result = ZSTD_decompressStream(stream.get(), &out, &in);
      if (ZSTD_isError(result) != 0) failDamaged(ZSTD_getErrorName(result));
      begin = in.pos;
      isInside = result != 0;
    }
    return out.pos;
  }

 private:
  struct Free {
    void operator()(ZSTD_DStream* toFree) const { ZSTD_freeDStream(toFree); }
  };
  std::unique_ptr<ZSTD_DStream, Free> stream;
  bool isInside = false;
};

}  // namespace

std::unique_ptr<ByteStream> gunzipped(std::unique_ptr<ByteStream> bytes) {
  return std::make_unique<Gunzipped>(std::move(bytes));
}

std::unique_ptr<ByteStream> unzstded(std::unique_ptr<ByteStream> bytes) {
  return std::make_unique<Unzstded>(std::move(bytes));
}

}  // namespace senseloom::tool
