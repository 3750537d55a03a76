#include <fcntl.h>
#include <io.h>

#include "foundation/WindowsCalls.h"
#include "lyra/terminal/Terminal.h"

namespace lyra {
namespace {

HANDLE HandleOf(std::FILE* inStream) { return ZORFoundation::HandleOf(_fileno(inStream)); }

}  // namespace

// Not _isatty, which takes every device for one, NUL included.
bool IsTerminal(std::FILE* inStream) {
  DWORD mode = 0;
  return GetConsoleMode(HandleOf(inStream), &mode) != FALSE;
}

int TerminalWidth(std::FILE* inStream) {
  CONSOLE_SCREEN_BUFFER_INFO screen{};
  if (GetConsoleScreenBufferInfo(HandleOf(inStream), &screen) == FALSE) return 0;
  return screen.srWindow.Right - screen.srWindow.Left + 1;
}

void PrepareStreams() {
  for (std::FILE* const stream : {stdin, stdout, stderr}) _setmode(_fileno(stream), _O_BINARY);
  SetConsoleCP(CP_UTF8);
  SetConsoleOutputCP(CP_UTF8);
  DWORD mode = 0;
  const HANDLE console = HandleOf(stdout);
  if (GetConsoleMode(console, &mode) != FALSE)
    SetConsoleMode(console, mode | ENABLE_VIRTUAL_TERMINAL_PROCESSING);
}

}  // namespace lyra
