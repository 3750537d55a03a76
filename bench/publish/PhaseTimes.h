// Where the processor time of a command that draws goes.
#ifndef ZOR_BENCH_PUBLISH_PHASETIMES_H
#define ZOR_BENCH_PUBLISH_PHASETIMES_H

#include <atomic>
#include <cstdint>

enum Phase {
  kOpenModel,
  kDraw,      ///< ZORPrint3DRepImage::Rasterize
  kEncode,    ///< ZORPixelImage::Write: encoding, and writing the file
  kTryViews,  ///< the small trial pictures by which directions and markers are chosen
  kPhaseCount
};

struct PhaseTime {
  std::atomic<std::uint64_t> calls, nanoseconds;
};

/// A file of this content, zeros at first, is shared by all processes of the command.
struct PhaseTimes {
  PhaseTime phases[kPhaseCount];
};
static_assert(std::atomic<std::uint64_t>::is_always_lock_free);

/// The environment variable that names the file.
inline constexpr char kPhaseTimesVariable[] = "ZOR_BENCH_PHASE_TIMES";

#endif
