#include "record/attached_process.h"

#include <csignal>
#include <string>

#include "exit_status.h"
#include "input_error.h"
#include "record/process_control.h"
#include "record/recorded_program.h"
#include "terminal/interrupt.h"

namespace senseloom::tool {
namespace {

constexpr int kTenths = 20;  // of a second that something is waited for

// Waits for the process to make a call, and says so if that takes long.
std::string waitForAnswer(const ProcessControl& control, Recording& recording, const std::string& title, int most) {
  for (int i = 0; most < 0 || i < most; ++i) {
    if (std::string answer = control.answer(); !answer.empty()) return answer;
    if (!control.isAlive() || (most < 0 && isInterrupted())) break;
    if (i == kTenths) {
      std::fprintf(stderr, "senseloom: %s has not called the library yet; it is recorded from its next call on\n",
                   title.c_str());
    }
    recording.passOn();
  }
  return "";
}

}  // namespace

void recordAttached(std::FILE* out, const RecordingArguments& arguments, pid_t process) {
  const InterruptMark mark;
  const std::string title = "process " + std::to_string(process);
  ProcessControl control(process);
  if (control.isRecording()) throw InputError(title + " is being recorded already");
  Recording recording(arguments, fileno(out));
  control.give("record " + recording.order().text());
  const std::string answer = waitForAnswer(control, recording, title, -1);
  if (answer.compare(0, 3, "no:") == 0) throw InputError(title + " cannot be recorded:" + answer.substr(3));
  if (answer.empty()) control.takeBack();
  std::signal(SIGPIPE, SIG_IGN);  // the process has to be told to stop when nobody reads the recording
  const auto goesOn = [&] { return control.isAlive() && control.isRecording() && !recording.isBroken(); };
  while (!answer.empty() && goesOn() && !isInterrupted()) recording.passOn();

  std::string cause;
  if (!control.isAlive()) {
    cause = "the process is gone";
  } else if (control.isRecording()) {
    control.give("off");
    if (waitForAnswer(control, recording, title, kTenths).empty()) {
      std::fprintf(stderr, "senseloom: %s has not called the library since; its recording ends with its next call\n",
                   title.c_str());
    }
  }
  recording.expectNoOtherWriter();
  for (int i = 0; i < kTenths && recording.passOn(); ++i) {
  }
  recording.complete(cause);
  forgetInterrupt();
  const std::string where = arguments.file == "-" ? "standard output" : recording.passes() ? arguments.file : "";
  if (!recording.report().print(title, where)) throw ExitStatus{kNothingRecorded};
}

}  // namespace senseloom::tool
