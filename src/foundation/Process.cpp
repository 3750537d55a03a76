#include "foundation/Process.h"

#include <sys/resource.h>

#include <cstdlib>
#include <ctime>

namespace ZORFoundation {

const char* ReadEnvironment(const char* inName) { return std::getenv(inName); }

void WriteEnvironment(const char* inName, const char* inValue) {
  if (inValue == nullptr)
    unsetenv(inName);
  else
    setenv(inName, inValue, 1);
}

std::vector<std::string> WordsOfCommandLine(int inCount, char** inArguments) {
  return {inArguments, inArguments + inCount};
}

double MegabytesUsed() {
  rusage own{}, started{};
  getrusage(RUSAGE_SELF, &own);
  getrusage(RUSAGE_CHILDREN, &started);
  return static_cast<double>(own.ru_maxrss + started.ru_maxrss) / 1024;
}

double ProcessorSeconds() { return static_cast<double>(std::clock()) / CLOCKS_PER_SEC; }

}  // namespace ZORFoundation
