#include "record/line_output.h"

#include <unistd.h>
#include <zlib.h>
#include <zstd.h>

#include <cerrno>
#include <cstring>
#include <new>
#include <stdexcept>
#include <utility>
#include <vector>

#include "terminal/new_file.h"

namespace senseloom::tool {
namespace {

constexpr std::string_view kGzip = ".gz";
constexpr std::string_view kZstd = ".zst";
constexpr int kGzipFormat = 16;
constexpr mode_t kOwnerOnly = 0600;  // it holds what the sensors saw

bool endsWith(std::string_view text, std::string_view end) {
  return text.size() > end.size() && text.substr(text.size() - end.size()) == end;
}

class StreamOutput final : public LineOutput {
 public:
  explicit StreamOutput(int file) : descriptor(file) {}

  void write(std::string_view lines) override {
    while (!lines.empty()) {
      const ssize_t count = ::write(descriptor, lines.data(), lines.size());
      if (count < 0 && errno == EINTR) continue;
      if (count < 0) throw std::runtime_error(std::string("the recording cannot be written: ") + std::strerror(errno));
      lines.remove_prefix(static_cast<size_t>(count));
    }
  }

 private:
  const int descriptor;
};

class GzipOutput final : public LineOutput {
 public:
  explicit GzipOutput(const std::string& name) : file(name, kOwnerOnly, NewFile::Rest::kept) {
    if (deflateInit2(&stream, Z_DEFAULT_COMPRESSION, Z_DEFLATED, kGzipFormat + MAX_WBITS, 8, Z_DEFAULT_STRATEGY) !=
        Z_OK) {
      throw std::bad_alloc();
    }
  }
  ~GzipOutput() override { deflateEnd(&stream); }
  GzipOutput(const GzipOutput&) = delete;
  GzipOutput& operator=(const GzipOutput&) = delete;

  void write(std::string_view lines) override { compress(lines, Z_NO_FLUSH); }
  void flush() override { compress("", Z_SYNC_FLUSH); }
  void finish() override {
    compress("", Z_FINISH);
    file.commit();
  }

 private:
  void compress(std::string_view lines, int mode) {
    stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(lines.data()));
    stream.avail_in = static_cast<uInt>(lines.size());
    char out[1 << 14];
    do {
      stream.next_out = reinterpret_cast<Bytef*>(out);
      stream.avail_out = sizeof out;
      deflate(&stream, mode);
      file.write({out, sizeof out - stream.avail_out});
    } while (stream.avail_out == 0);
    if (mode != Z_NO_FLUSH) file.flush();
  }

  NewFile file;
  z_stream stream{};
};

class ZstdOutput final : public LineOutput {
 public:
  explicit ZstdOutput(const std::string& name)
      : file(name, kOwnerOnly, NewFile::Rest::kept), stream(ZSTD_createCStream()), out(ZSTD_CStreamOutSize()) {
    if (stream == nullptr) throw std::bad_alloc();
  }

  void write(std::string_view lines) override { compress(lines, ZSTD_e_continue); }
  void flush() override { compress("", ZSTD_e_flush); }
  void finish() override {
    compress("", ZSTD_e_end);
    file.commit();
  }

 private:
  struct Free {
    void operator()(ZSTD_CStream* toFree) const { ZSTD_freeCStream(toFree); }
  };

  void compress(std::string_view lines, ZSTD_EndDirective mode) {
    ZSTD_inBuffer in{lines.data(), lines.size(), 0};
    size_t left = 0;
    do {
      ZSTD_outBuffer to{out.data(), out.size(), 0};
      left = ZSTD_compressStream2(stream.get(), &to, &in, mode);
      if (ZSTD_isError(left) != 0) throw std::runtime_error(ZSTD_getErrorName(left));
      file.write({out.data(), to.pos});
    } while (mode == ZSTD_e_continue ? in.pos < in.size : left != 0);
    if (mode != ZSTD_e_continue) file.flush();
  }

  NewFile file;
  std::unique_ptr<ZSTD_CStream, Free> stream;
  std::vector<char> out;
};

}  // namespace

std::unique_ptr<LineOutput> makeStreamOutput(int descriptor) {
  return std::make_unique<StreamOutput>(descriptor);
}

bool isCompressed(std::string_view file) {
  return endsWith(file, kGzip) || endsWith(file, kZstd);
}

std::unique_ptr<LineOutput> makeCompressedOutput(const std::string& file) {
  if (endsWith(file, kGzip)) return std::make_unique<GzipOutput>(file);
  return std::make_unique<ZstdOutput>(file);
}

}  // namespace senseloom::tool
