#include "terminal/output_sink.h"

#include <filesystem>
#include <system_error>

#include "input_error.h"

namespace senseloom::tool {

void requireOtherFile(const std::string& output, const std::string& input) {
  std::error_code error;
  if (std::filesystem::is_regular_file(output, error) && std::filesystem::equivalent(output, input, error)) {
    throw InputError(output + ": is the input, which would be lost");
  }
}

void requireEmpty(const std::string& output) {
  std::error_code error;
  if (std::filesystem::is_regular_file(output, error) && std::filesystem::file_size(output, error) > 0) {
    throw InputError(output + ": holds something already");
  }
}

OutputSink::OutputSink(std::FILE* standardOutput, const std::string& file, const std::string& input)
    : out(standardOutput) {
  if (file.empty()) return;
  requireOtherFile(file, input);
  newFile.emplace(file, 0666, NewFile::Rest::removed);
}

void OutputSink::write(std::string_view text) {
  if (newFile) {
    newFile->write(text);
  } else {
    std::fwrite(text.data(), 1, text.size(), out);  // whether that worked is seen when it is closed
  }
}

void OutputSink::commit() {
  if (newFile) newFile->commit();
}

}  // namespace senseloom::tool
