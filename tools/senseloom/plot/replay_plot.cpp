#include "plot/replay_plot.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <stdexcept>

#include "plot/svg_picture.h"

namespace senseloom::tool {
namespace {

struct CloseFile {
  void operator()(std::FILE* file) const { std::fclose(file); }
};
using File = std::unique_ptr<std::FILE, CloseFile>;

[[noreturn]] void fail(const std::string& name) {
  throw std::runtime_error(name + ": cannot be written: " + std::strerror(errno));
}

File open(const std::string& name, const char* mode) {
  File file(std::fopen(name.c_str(), mode));
  if (file == nullptr) fail(name);
  return file;
}

}  // namespace

// Opening the file for appending keeps its old content until there is a new picture.
ReplayPlot::ReplayPlot(std::unique_ptr<ReplayObserver> replayOutput, std::string plotTitle, PlotArguments plotArguments)
    : output(std::move(replayOutput)), title(std::move(plotTitle)), arguments(std::move(plotArguments)) {
  open(arguments.file, "a");
}

void ReplayPlot::onOutcome(const CallOutcome& outcome) {
  plot.onOutcome(outcome);
  output->onOutcome(outcome);
}

void ReplayPlot::onEnd() {
  write();
  output->onEnd();
}

void ReplayPlot::write() const {
  File file = open(arguments.file, "w");
  writeSvg(file.get(), plot, title, arguments.classNames);
  const bool isWritten = std::ferror(file.get()) == 0;
  if (std::fclose(file.release()) != 0 || !isWritten) fail(arguments.file);
}

std::unique_ptr<ReplayObserver> withPlot(std::unique_ptr<ReplayObserver> output, const std::string& trace,
                                         const PlotArguments& arguments) {
  if (arguments.file.empty()) return output;
  const size_t folder = trace.rfind('/');
  std::string title = trace == "-" ? "standard input" : trace.substr(folder == std::string::npos ? 0 : folder + 1);
  return std::make_unique<ReplayPlot>(std::move(output), std::move(title), arguments);
}

}  // namespace senseloom::tool
