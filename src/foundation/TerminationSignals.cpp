#include "foundation/TerminationSignals.h"

#include <signal.h>
#include <unistd.h>

#include <array>
#include <atomic>

namespace ZORFoundation {
namespace {

constexpr std::array kTerminationSignals = {SIGINT, SIGTERM, SIGHUP};

/// An unfinished file. Forked processes have their parent's, which are not theirs to remove.
struct Slot {
  std::atomic<pid_t> owner;  // kFree, kClaimed, or the process that writes the file
  std::atomic<const char*> path;
};
constexpr pid_t kFree = 0, kClaimed = -1;
static_assert(std::atomic<pid_t>::is_always_lock_free &&
              std::atomic<const char*>::is_always_lock_free);

/// Few files are unfinished at a time; one too many stays when a signal comes.
constexpr std::size_t kMaxSlots = 64;
std::array<Slot, kMaxSlots> slots{};

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

void RemoveUnfinishedFiles() noexcept {
  const pid_t self = getpid();
  for (const Slot& slot : slots)
    if (slot.owner == self) unlink(slot.path);
  for (const Slot& slot : slots)  // folders, which are empty only now
    if (slot.owner == self) rmdir(slot.path);
}

void HandleTerminationSignals() { HandleAll(RemoveAndEnd); }

RemoveOnSignal::RemoveOnSignal(const char* inPath) noexcept : slot_(0) {
  for (; slot_ < kMaxSlots; ++slot_) {
    pid_t owner = kFree;
    if (!slots[slot_].owner.compare_exchange_strong(owner, kClaimed)) continue;
    slots[slot_].path = inPath;
    slots[slot_].owner = getpid();
    return;
  }
}

RemoveOnSignal::~RemoveOnSignal() {
  if (slot_ < kMaxSlots) slots[slot_].owner = kFree;
}

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

bool StopRequest::IsMade() const { return stopSignal != 0; }

void StopRequest::Check() const {
  if (IsMade()) throw Interrupted{stopSignal};
}

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
