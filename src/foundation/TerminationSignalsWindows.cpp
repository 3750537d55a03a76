// Windows has no signals but the console's: Ctrl-C and Ctrl-Break count as SIGINT, a console that is
// closed, and the end of a session, as SIGTERM. They come on a thread of their own.
#include <array>
#include <atomic>
#include <csignal>
#include <cstdlib>

#include "foundation/TerminationSignals.h"
#include "foundation/WindowsCalls.h"

namespace ZORFoundation {
namespace {

/// An unfinished file.
struct Slot {
  std::atomic<bool> isTaken;
  std::atomic<const char*> path;
};

/// Few files are unfinished at a time; one too many stays when a signal comes.
constexpr std::size_t kMaxSlots = 64;
std::array<Slot, kMaxSlots> slots{};

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

void RemoveUnfinishedFiles() noexcept {
  for (const Slot& slot : slots)
    if (slot.isTaken && slot.path != nullptr) DeleteFileW(WidePath(slot.path.load()).c_str());
  for (const Slot& slot : slots)  // folders, which are empty only now
    if (slot.isTaken && slot.path != nullptr) RemoveDirectoryW(WidePath(slot.path.load()).c_str());
}

void HandleTerminationSignals() { Handle(); }

RemoveOnSignal::RemoveOnSignal(const char* inPath) noexcept : slot_(0) {
  for (; slot_ < kMaxSlots; ++slot_) {
    bool isTaken = false;
    if (!slots[slot_].isTaken.compare_exchange_strong(isTaken, true)) continue;
    slots[slot_].path = inPath;
    return;
  }
}

RemoveOnSignal::~RemoveOnSignal() {
  if (slot_ >= kMaxSlots) return;
  slots[slot_].path = nullptr;
  slots[slot_].isTaken = false;
}

StopRequest::StopRequest() {
  stopSignal = 0;
  isRequested = true;
  Handle();
}

StopRequest::~StopRequest() { isRequested = false; }

bool StopRequest::IsMade() const { return stopSignal != 0; }

void StopRequest::Check() const {
  if (IsMade()) throw Interrupted{stopSignal};
}

// As a shell of Unix reports it: Windows has no signal that a program could end by.
void EndBySignal(int inSignal) { std::_Exit(128 + inSignal); }

}  // namespace ZORFoundation
