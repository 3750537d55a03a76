#include "lyra/terminal/Terminal.h"

#include <sys/ioctl.h>
#include <unistd.h>

#include <csignal>
#include <initializer_list>

namespace lyra {

bool IsTerminal(std::FILE* inStream) { return isatty(fileno(inStream)) == 1; }

int TerminalWidth(std::FILE* inStream) {
  winsize size{};
  return ioctl(fileno(inStream), TIOCGWINSZ, &size) == 0 ? size.ws_col : 0;
}

bool WriteText(std::FILE* inStream, std::string_view inText) {
  return std::fwrite(inText.data(), 1, inText.size(), inStream) == inText.size();
}

void PrepareStreams() {
  for (const int signal : {SIGPIPE, SIGXFSZ}) std::signal(signal, SIG_IGN);
}

}  // namespace lyra
