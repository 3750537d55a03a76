#include <fcntl.h>
#include <io.h>

#include <algorithm>
#include <cerrno>

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

bool WriteText(std::FILE* inStream, std::string_view inText) {
  if (!IsTerminal(inStream))
    return std::fwrite(inText.data(), 1, inText.size(), inStream) == inText.size();
  std::fflush(inStream);
  const std::wstring text = ZORFoundation::WideText(inText);
  for (std::wstring_view rest = text; !rest.empty();) {
    // Not between the halves of a character, and no more than every Windows takes at once.
    std::size_t count = std::min<std::size_t>(rest.size(), 8192);
    if (count < rest.size() && IS_HIGH_SURROGATE(rest[count - 1])) --count;
    DWORD written = 0;
    if (WriteConsoleW(HandleOf(inStream), rest.data(), static_cast<DWORD>(count), &written,
                      nullptr) == FALSE) {
      errno = ZORFoundation::ErrorNumberOf(GetLastError());
      return false;
    }
    rest.remove_prefix(written);
  }
  return true;
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
