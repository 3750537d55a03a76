#include "default_platform/ReaderProgram.h"

#include <signal.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <Standard_Failure.hxx>
#include <Standard_OutOfMemory.hxx>
#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdlib>
#include <exception>
#include <limits>
#include <new>
#include <optional>
#include <utility>

#include "default_platform/product_structure/model_reader/FileSandbox.h"
#include "default_platform/product_structure/model_reader/ObjFaces.h"
#include "foundation/Descriptor.h"
#include "foundation/ReadWholeFile.h"

namespace ZORDefault {
namespace {

constexpr double kNoLimit = std::numeric_limits<double>::infinity();

int Answer(int inExitCode, std::string_view inBytes) {
  std::size_t written = 0;
  const int error = ZORFoundation::WriteAll(ModelReaderProtocol::kResult, inBytes, written);
  return error == 0 ? inExitCode : ModelReaderProtocol::kExitOutOfMemory;
}

int Refuse(const std::string& inReason) {
  return Answer(ModelReaderProtocol::kExitRefused, inReason);
}

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

/// Limits this process's processor time and memory, and ends it with its parent. An allocation that
/// fails ends it too, see malloc below: the kernel would go on and leave out what it had no memory
/// for.
void SetProcessLimits(const ModelLimits& inLimits) {
  SetLimit(RLIMIT_CPU, std::ceil(inLimits.seconds), kNoLimit);
  SetLimit(RLIMIT_CORE, 0, 0);
#ifndef __SANITIZE_ADDRESS__  // which maps far more than it uses
  const auto memory = static_cast<double>(inLimits.memory);
  SetLimit(RLIMIT_DATA, memory, memory);
#endif
  prctl(PR_SET_PDEATHSIG, SIGKILL);
}

/// What the kernel gets for the model's bytes.
void Replace(std::string& ioBytes, std::string inOther) {
  std::size_t written = 0;
  if (ftruncate(ModelReaderProtocol::kModel, 0) != 0 ||
      lseek(ModelReaderProtocol::kModel, 0, SEEK_SET) != 0 ||
      ZORFoundation::WriteAll(ModelReaderProtocol::kModel, inOther, written) != 0)
    throw std::bad_alloc();  // it is a file in memory
  ioBytes = std::move(inOther);
}

int Run(char** inArguments) try {
  ModelRequest request;
  request.format = static_cast<ModelFormat>(std::atoi(inArguments[1]));
  request.deflection = std::atof(inArguments[2]);
  SetProcessLimits({std::atof(inArguments[4]), std::strtoull(inArguments[3], nullptr, 10)});
  request.path = inArguments[5];
  lseek(ModelReaderProtocol::kModel, 0, SEEK_SET);
  std::string bytes = ZORFoundation::ReadToEnd(ModelReaderProtocol::kModel, request.path);
  if (request.format == ModelFormat::kObj)
    if (std::optional<std::string> other = ObjWithoutLargeFaces(bytes))
      Replace(bytes, *std::move(other));
  EnterFileSandbox(request.path, ModelReaderProtocol::kModel);
  return Answer(ModelReaderProtocol::kExitRead, AnswerTo(request, bytes));
} catch (const Refusal& refusal) {
  return Refuse(refusal.reason);
} catch (const Standard_OutOfMemory&) {
  return ModelReaderProtocol::kExitOutOfMemory;
} catch (const std::bad_alloc&) {
  return ModelReaderProtocol::kExitOutOfMemory;
} catch (const Standard_Failure& failure) {
  return Refuse("cannot be read: " + OneLine(failure.GetMessageString()));
} catch (const std::exception& error) {
  return Refuse("cannot be read: " + OneLine(error.what()));
}

}  // namespace

void ReportStatus(const std::string& inLine) {
  std::size_t written = 0;
  ZORFoundation::WriteAll(ModelReaderProtocol::kStatus, inLine + '\n', written);
}

void LiftTimeLimit() { SetLimit(RLIMIT_CPU, kNoLimit, kNoLimit); }

std::string OneLine(const char* inMessage) {
  std::string line = inMessage ? inMessage : "";
  std::ranges::replace_if(
      line, [](unsigned char byte) { return byte < 0x20; }, ' ');
  return line;
}

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

int main(int inCount, char** inArguments) {
  constexpr int kArguments = 6;
  if (inCount != kArguments) return ZORDefault::ModelReaderProtocol::kExitOutOfMemory + 1;
  // Without destructors: what the kernel built need not be taken apart.
  _exit(ZORDefault::Run(inArguments));
}
