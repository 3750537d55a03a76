// Loaded before the libraries of a command, this stands in front of a few of the platform's
// functions: each call goes on to the real one, and its processor time is added up. The command
// itself is the one that users have.
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>

#include "default_platform/OpenModel.h"
#include "default_platform/visualisation/Rendering.h"
#include "platform/visualisation/ZORPrint3DRepImage.h"
#include "publish/PhaseTimes.h"

namespace {

[[noreturn]] void GiveUp(const char* inWhy) {
  std::fprintf(stderr, "phase times: %s\n", inWhy);
  std::abort();
}

PhaseTimes* MapTimes() {
  const char* const path = std::getenv(kPhaseTimesVariable);
  const int file = path ? open(path, O_RDWR | O_CLOEXEC) : -1;
  if (file < 0) GiveUp("there is no file for them");
  void* const memory =
      mmap(nullptr, sizeof(PhaseTimes), PROT_READ | PROT_WRITE, MAP_SHARED, file, 0);
  close(file);
  if (memory == MAP_FAILED) GiveUp("their file cannot be mapped");
  return static_cast<PhaseTimes*>(memory);
}

/// Of all threads of this process, in nanoseconds.
std::uint64_t ProcessorTime() {
  timespec time{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
  return static_cast<std::uint64_t>(time.tv_sec) * 1'000'000'000 +
         static_cast<std::uint64_t>(time.tv_nsec);
}

class PhaseWatch {
 public:
  explicit PhaseWatch(Phase inPhase) : phase_(inPhase) {}
  ~PhaseWatch() {
    static PhaseTimes* const times = MapTimes();
    times->phases[phase_].nanoseconds += ProcessorTime() - start_;
    ++times->phases[phase_].calls;
  }
  PhaseWatch(const PhaseWatch&) = delete;
  PhaseWatch& operator=(const PhaseWatch&) = delete;

 private:
  Phase phase_;
  std::uint64_t start_ = ProcessorTime();
};

/// The function of the same name that comes next. A member function is called like one that has the
/// object as its first argument.
template <class Function>
Function* Next(const char* inSymbol) {
  void* const symbol = dlsym(RTLD_NEXT, inSymbol);
  if (!symbol) GiveUp(inSymbol);
  return reinterpret_cast<Function*>(symbol);
}

}  // namespace

namespace ZORDefault {

OpenedModel OpenModel(const std::string& inPath, const ModelOptions& inOptions) {
  static auto* const next = Next<OpenedModel(const std::string&, const ModelOptions&)>(
      "_ZN10ZORDefault9OpenModelERKNSt7__cxx1112basic_stringIcSt11char_traitsIcESaIcEEE"
      "RKNS_12ModelOptionsE");
  const PhaseWatch watch(kOpenModel);
  return next(inPath, inOptions);
}

std::optional<std::vector<IdBufferPixel>> RenderIdBuffer(const ZOR3DRep& inRep,
                                                         const ZOR3DViewpoint& inViewpoint,
                                                         int inWidth, int inHeight) {
  static auto* const next = Next<std::optional<std::vector<IdBufferPixel>>(
      const ZOR3DRep&, const ZOR3DViewpoint&, int, int)>(
      "_ZN10ZORDefault14RenderIdBufferERK8ZOR3DRepRK14ZOR3DViewpointii");
  const PhaseWatch watch(kTryViews);
  return next(inRep, inViewpoint, inWidth, inHeight);
}

}  // namespace ZORDefault

ZORPixelImage* ZORPrint3DRepImage::Rasterize() {
  static auto* const next =
      Next<ZORPixelImage*(ZORPrint3DRepImage*)>("_ZN18ZORPrint3DRepImage9RasterizeEv");
  const PhaseWatch watch(kDraw);
  return next(this);
}

HRESULT ZORPixelImage::Write(const ZORString& inFormat, const ZORString& inPath) const {
  static auto* const next = Next<HRESULT(const ZORPixelImage*, const ZORString&, const ZORString&)>(
      "_ZNK13ZORPixelImage5WriteERK9ZORStringS2_");
  const PhaseWatch watch(kEncode);
  return next(this, inFormat, inPath);
}
