#include <signal.h>
#include <unistd.h>

#include <array>

#include "foundation/TerminationSignals.h"

namespace ZORFoundation {
namespace {

constexpr std::array kTerminationSignals = {SIGINT, SIGTERM, SIGHUP};

volatile sig_atomic_t stopSignal = 0;
std::array<struct sigaction, kTerminationSignals.size()> actionsBeforeRequest;

void Handle(int inSignal, void (*inHandler)(int)) {
  struct sigaction present {};
  sigaction(inSignal, nullptr, &present);
  if (present.sa_handler == SIG_IGN) return;
  struct sigaction action {};
  action.sa_handler = inHandler;
  action.sa_flags = SA_RESTART;
  sigaction(inSignal, &action, nullptr);
}

void HandleAll(void (*inHandler)(int)) {
  for (const int signal : kTerminationSignals) Handle(signal, inHandler);
}

// Handlers do nothing but what is async-signal-safe.
void RemoveAndEnd(int inSignal) {
  RemoveUnfinishedFiles();
  EndBySignal(inSignal);
}

void NoteAndLetTheNextEnd(int inSignal) {
  stopSignal = inSignal;
  HandleAll(RemoveAndEnd);
}

}  // namespace

void HandleTerminationSignals() { HandleAll(RemoveAndEnd); }

StopRequest::StopRequest() {
  stopSignal = 0;
  for (std::size_t i = 0; i < kTerminationSignals.size(); ++i)
    sigaction(kTerminationSignals[i], nullptr, &actionsBeforeRequest[i]);
  HandleAll(NoteAndLetTheNextEnd);
}

StopRequest::~StopRequest() {
  for (std::size_t i = 0; i < kTerminationSignals.size(); ++i)
    sigaction(kTerminationSignals[i], &actionsBeforeRequest[i], nullptr);
}

int StopRequest::Recorded() const { return stopSignal; }

void EndBySignal(int inSignal) {
  signal(inSignal, SIG_DFL);
  // The signal may be the one that is being handled, and so be blocked.
  sigset_t unblocked;
  sigemptyset(&unblocked);
  sigaddset(&unblocked, inSignal);
  sigprocmask(SIG_UNBLOCK, &unblocked, nullptr);
  raise(inSignal);
  _exit(128 + inSignal);
}

}  // namespace ZORFoundation
