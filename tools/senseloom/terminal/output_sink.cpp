#include "terminal/output_sink.h"

#include <filesystem>
#include <system_error>

#include "input_error.h"

namespace senseloom::tool {

OutputSink::OutputSink(std::FILE* standardOutput, const std::string& file, const std::string& input)
    : out(standardOutput) {
  if (file.empty()) return;
  std::error_code error;
  if (std::filesystem::is_regular_file(file, error) && std::filesystem::equivalent(file, input, error)) {
    throw InputError(file + ": is the input, which would be lost");
  }
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
