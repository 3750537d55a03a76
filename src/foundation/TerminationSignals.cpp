// What a termination signal removes; TerminationSignalsUnix.cpp and TerminationSignalsWindows.cpp
// say how it comes.
#include "foundation/TerminationSignals.h"

#include <unistd.h>

#include <array>
#include <atomic>

#include "foundation/FileCalls.h"

namespace ZORFoundation {
namespace {

/// An unfinished file. Forked processes have their parent's, which are not theirs to remove.
struct Slot {
  std::atomic<int> owner;  // kFree, kClaimed, or the process that writes the file
  std::atomic<const char*> path;
};
constexpr int kFree = 0, kClaimed = -1;
static_assert(std::atomic<int>::is_always_lock_free &&
              std::atomic<const char*>::is_always_lock_free);

/// Few files are unfinished at a time; one too many stays when a signal comes.
constexpr std::size_t kMaxSlots = 64;
std::array<Slot, kMaxSlots> slots{};

}  // namespace

void RemoveUnfinishedFiles() noexcept {
  const int self = getpid();
  for (const Slot& slot : slots)
    if (slot.owner == self) RemoveFile(slot.path);
  for (const Slot& slot : slots)  // folders, which are empty only now
    if (slot.owner == self) RemoveFolder(slot.path);
}

RemoveOnSignal::RemoveOnSignal(const char* inPath) noexcept : slot_(0) {
  for (; slot_ < kMaxSlots; ++slot_) {
    int owner = kFree;
    if (!slots[slot_].owner.compare_exchange_strong(owner, kClaimed)) continue;
    slots[slot_].path = inPath;
    slots[slot_].owner = getpid();
    return;
  }
}

RemoveOnSignal::~RemoveOnSignal() {
  if (slot_ < kMaxSlots) slots[slot_].owner = kFree;
}

void StopRequest::Check() const {
  if (const int signal = Recorded(); signal != 0) throw Interrupted{signal};
}

}  // namespace ZORFoundation
