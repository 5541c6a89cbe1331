#include "record/recorded_program.h"

#include <unistd.h>

#include <csignal>
#include <cstdlib>

#include "record/child_program.h"
#include "record/program_file.h"
#include "record/recorder_files.h"
#include "terminal/interrupt.h"

namespace senseloom::tool {
namespace {

constexpr char kAudit[] = "LD_AUDIT";

// What is loaded by the environment already stays, in front.
std::string withOthers(const std::string& audit) {
  const char* others = std::getenv(kAudit);
  return others == nullptr || *others == '\0' ? audit : std::string(others) + ':' + audit;
}

}  // namespace

void runRecorded(std::FILE* out, const RecordingArguments& arguments, const std::vector<std::string>& command) {
  const std::string audit = auditLibrary(wordSizeOf(command.front()));
  const bool isOnOutput = arguments.file == "-";
  Recording recording(arguments, fileno(out));
  ChildProgram program(command, {{"SENSELOOM_TRACE", recording.order().text()}, {kAudit, withOthers(audit)}},
                       STDIN_FILENO, isOnOutput ? STDERR_FILENO : fileno(out));
  std::signal(SIGPIPE, SIG_IGN);  // the program goes on when nobody reads the recording
  while (!program.hasEnded()) recording.passOn();
  // Processes that it left behind may still write.
  const InterruptMark mark;
  recording.expectNoOtherWriter();
  while (!isInterrupted() && recording.passOn()) {
  }
  recording.complete(program.cause());
  const std::string where = isOnOutput ? "standard output" : recording.passes() ? arguments.file : "";
  const bool isRecorded = recording.report().print(command.front(), where);
  ExitStatus status = program.status();
  if (!isRecorded && status.status == 0 && status.signal == 0) status.status = kNothingRecorded;
  throw status;
}

}  // namespace senseloom::tool
