// Windows has no signals but the console's: Ctrl-C and Ctrl-Break count as SIGINT, a console that
// is closed, and the end of a session, as SIGTERM. They come on a thread of their own.
#include <atomic>
#include <csignal>
#include <cstdlib>

#include "foundation/TerminationSignals.h"
#include "foundation/WindowsCalls.h"

namespace ZORFoundation {
namespace {

std::atomic<bool> isHandled = false, isRequested = false;
std::atomic<int> stopSignal = 0;

BOOL WINAPI OnConsoleEvent(DWORD inEvent) {
  const int signal = inEvent == CTRL_C_EVENT || inEvent == CTRL_BREAK_EVENT ? SIGINT : SIGTERM;
  int none = 0;
  if (isRequested && stopSignal.compare_exchange_strong(none, signal)) return TRUE;
  RemoveUnfinishedFiles();
  EndBySignal(signal);
}

void Handle() {
  if (!isHandled.exchange(true)) SetConsoleCtrlHandler(&OnConsoleEvent, TRUE);
}

}  // namespace

void HandleTerminationSignals() { Handle(); }

StopRequest::StopRequest() {
  stopSignal = 0;
  isRequested = true;
  Handle();
}

StopRequest::~StopRequest() { isRequested = false; }

int StopRequest::Recorded() const { return stopSignal; }

// The exit code that a Unix shell reports: on Windows no program ends by a signal.
void EndBySignal(int inSignal) { std::_Exit(128 + inSignal); }

}  // namespace ZORFoundation
