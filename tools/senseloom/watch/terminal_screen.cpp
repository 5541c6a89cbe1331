#include "watch/terminal_screen.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <string_view>

namespace senseloom::tool {
namespace {

// Control sequences of ECMA-48, and the private ones of xterm that all terminals of today have.
constexpr char kEnter[] = "\x1b[?1049h\x1b[?25l\x1b[?7l";  // the second screen, no cursor, no wrapping
constexpr char kLeave[] = "\x1b[?7h\x1b[?25h\x1b[?1049l";
constexpr char kTopLeft[] = "\x1b[H";
constexpr char kEraseRestOfLine[] = "\x1b[K";
constexpr char kEraseRest[] = "\x1b[J";

// Standard input may be the trace.
int openTerminal() {
  return open("/dev/tty", O_RDWR | O_NOCTTY | O_CLOEXEC);
}

}  // namespace

bool TerminalScreen::isPossible(std::FILE* out) {
  const char* kind = std::getenv("TERM");
  if (isatty(fileno(out)) == 0 || kind == nullptr || std::string_view(kind) == "dumb") return false;
  const int descriptor = openTerminal();
  if (descriptor < 0) return false;
  close(descriptor);
  return true;
}

TerminalScreen::TerminalScreen(std::FILE* out) : terminal(openTerminal()) {
  std::fflush(out);
  tcgetattr(terminal, &before);
  termios raw = before;
  raw.c_lflag &= ~static_cast<tcflag_t>(ICANON | ECHO | ISIG | IEXTEN);
  raw.c_iflag &= ~static_cast<tcflag_t>(IXON | ICRNL);
  raw.c_cc[VMIN] = 1;
  raw.c_cc[VTIME] = 0;
  tcsetattr(terminal, TCSADRAIN, &raw);
  write(kEnter);
}

TerminalScreen::~TerminalScreen() {
  write(kLeave);
  tcsetattr(terminal, TCSADRAIN, &before);
  close(terminal);
}

ScreenSize TerminalScreen::size() const {
  winsize told{};
  if (ioctl(terminal, TIOCGWINSZ, &told) != 0 || told.ws_col == 0 || told.ws_row == 0) return {};
  return {.width = told.ws_col, .height = told.ws_row};
}

std::string TerminalScreen::takeKeys() const {
  std::string keys;
  pollfd input{.fd = terminal, .events = POLLIN, .revents = 0};
  char bytes[64];
  while (poll(&input, 1, 0) > 0) {
    const ssize_t count = read(terminal, bytes, sizeof bytes);
    if (count <= 0) break;
    keys.append(bytes, static_cast<size_t>(count));
  }
  return keys;
}

void TerminalScreen::show(const std::vector<std::string>& lines) {
  std::string text = kTopLeft;
  for (const std::string& line : lines) {
    text.append(&line == lines.data() ? "" : "\r\n").append(line).append(kEraseRestOfLine);
  }
  text += kEraseRest;
  if (text != shown) write(text);
  shown = text;
}

void TerminalScreen::write(const std::string& text) const {
  std::string_view rest = text;
  while (!rest.empty()) {
    const ssize_t count = ::write(terminal, rest.data(), rest.size());
    if (count < 0 && errno != EINTR) return;  // the terminal is gone
    if (count > 0) rest.remove_prefix(static_cast<size_t>(count));
  }
}

}  // namespace senseloom::tool
