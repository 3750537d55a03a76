#include "lyra/EndingSignals.h"

#include <signal.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <cstdlib>

namespace lyra {
namespace {

constexpr int kEndingSignals[] = {SIGINT, SIGTERM, SIGHUP};

/// Few files are unfinished at a time; one too many stays when a signal comes.
constexpr std::size_t kMostPaths = 8;
std::array<std::atomic<const char*>, kMostPaths> unfinishedPaths{};
static_assert(std::atomic<const char*>::is_always_lock_free);

volatile sig_atomic_t askedToStopBy = 0;

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
  for (const int signal : kEndingSignals) Handle(signal, inHandler);
}

// Handlers do nothing but what is safe at any moment.
void RemoveAndEnd(int inSignal) {
  for (const std::atomic<const char*>& path : unfinishedPaths)
    if (const char* const unfinished = path) unlink(unfinished);
  EndBy(inSignal);
}

void NoteAndLetTheNextEnd(int inSignal) {
  askedToStopBy = inSignal;
  HandleAll(RemoveAndEnd);
}

}  // namespace

RemovedAtSignal::RemovedAtSignal(const char* inPath) : place_(0) {
  for (; place_ < kMostPaths; ++place_) {
    const char* none = nullptr;
    if (unfinishedPaths[place_].compare_exchange_strong(none, inPath)) break;
  }
  HandleAll(RemoveAndEnd);
}

RemovedAtSignal::~RemovedAtSignal() {
  if (place_ < kMostPaths) unfinishedPaths[place_] = nullptr;
}

StopRequest::StopRequest() {
  askedToStopBy = 0;
  HandleAll(NoteAndLetTheNextEnd);
}

StopRequest::~StopRequest() { HandleAll(RemoveAndEnd); }

bool StopRequest::IsMade() const { return askedToStopBy != 0; }

void StopRequest::Check() const {
  if (IsMade()) throw Interrupted{askedToStopBy};
}

void EndBy(int inSignal) {
  signal(inSignal, SIG_DFL);
  // The signal may be the one that is being handled, and so be held back.
  sigset_t unblocked;
  sigemptyset(&unblocked);
  sigaddset(&unblocked, inSignal);
  sigprocmask(SIG_UNBLOCK, &unblocked, nullptr);
  raise(inSignal);
  _exit(128 + inSignal);
}

}  // namespace lyra
