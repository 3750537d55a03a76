#include "default_platform/product_structure/model_reader/ReaderSystem.h"

#include <signal.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <cmath>
#include <cstddef>
#include <limits>

#include "default_platform/ReaderProgram.h"

namespace ZORDefault {
namespace {

constexpr double kNoLimit = std::numeric_limits<double>::infinity();

void SetLimit(__rlimit_resource inResource, double inSoft, double inHard) {
  rlimit limit;
  if (getrlimit(inResource, &limit) != 0) return;
  // A lower limit of whoever started this process stays.
  const auto lower = [&limit](double inWanted) {
    return inWanted < static_cast<double>(limit.rlim_max) ? static_cast<rlim_t>(inWanted)
                                                          : limit.rlim_max;
  };
  limit = {lower(inSoft), lower(inHard)};
  setrlimit(inResource, &limit);
}

}  // namespace

void SetProcessLimits(const ModelLimits& inLimits) {
  SetLimit(RLIMIT_CPU, std::ceil(inLimits.seconds), kNoLimit);
  SetLimit(RLIMIT_CORE, 0, 0);
#ifndef __SANITIZE_ADDRESS__  // which maps far more than it uses
  const auto memory = static_cast<double>(inLimits.memory);
  SetLimit(RLIMIT_DATA, memory, memory);
#endif
  prctl(PR_SET_PDEATHSIG, SIGKILL);
}

void LiftTimeLimit() { SetLimit(RLIMIT_CPU, kNoLimit, kNoLimit); }

}  // namespace ZORDefault

#ifdef __SANITIZE_ADDRESS__
// A crash of the kernel ends this process by its signal, as it does without the sanitizer.
extern "C" __attribute__((visibility("default"))) const char* __asan_default_options() {
  return "handle_segv=0:handle_sigbus=0:handle_sigfpe=0";
}
#else
// A program's own functions come before those of the C library, for all libraries that it loads.
extern "C" {

void* __libc_malloc(std::size_t inSize);
void* __libc_calloc(std::size_t inCount, std::size_t inSize);
void* __libc_realloc(void* inOld, std::size_t inSize);

static void* Checked(void* inBlock) {
  if (inBlock == nullptr) _exit(ZORDefault::ModelReaderProtocol::kExitOutOfMemory);
  return inBlock;
}

__attribute__((visibility("default"))) void* malloc(std::size_t inSize) {
  return Checked(__libc_malloc(inSize));
}
__attribute__((visibility("default"))) void* calloc(std::size_t inCount, std::size_t inSize) {
  return Checked(__libc_calloc(inCount, inSize));
}
__attribute__((visibility("default"))) void* realloc(void* inOld, std::size_t inSize) {
  void* const block = __libc_realloc(inOld, inSize);
  return inSize == 0 ? block : Checked(block);
}
}
#endif
