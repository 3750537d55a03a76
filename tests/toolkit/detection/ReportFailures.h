// For the main functions of programs that stand on the CAD kernel.
#ifndef ZOR_TESTS_TOOLKIT_DETECTION_REPORTFAILURES_H
#define ZOR_TESTS_TOOLKIT_DETECTION_REPORTFAILURES_H

#include <Standard_Failure.hxx>
#include <cstdio>
#include <exception>

namespace ZORDetection {

/// @return what the work returns; 1 with a line on stderr for whatever it raises.
template <typename Work>
int ReportFailures(const Work& inWork) {
  try {
    return inWork();
  } catch (const std::exception& error) {
    std::fprintf(stderr, "%s\n", error.what());
  } catch (const Standard_Failure& failure) {
    std::fprintf(stderr, "%s\n", failure.GetMessageString());
  }
  return 1;
}

}  // namespace ZORDetection

#endif
