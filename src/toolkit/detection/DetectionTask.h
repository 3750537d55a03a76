// The task of the program that finds interferences in a model, and its answer.
#ifndef ZOR_TOOLKIT_DETECTION_DETECTIONTASK_H
#define ZOR_TOOLKIT_DETECTION_DETECTIONTASK_H

#include <string>
#include <string_view>
#include <vector>

#include "toolkit/detection/kernel/FindInterferences.h"

namespace ZORDetection {

/// It lies in the folder of the model reader; see ZORDefault::ModelProgram.
inline constexpr char kInterferenceFinderPath[] = "/ZORLyra/zor-interference-finder";

struct TaskProduct {
  Product product;         ///< its part's number is that of ProductInfo
  std::uint32_t unit = 0;  ///< products of one unit are not checked against each other
  /// A pair is checked when one of it is in the first selection and the other in the second.
  bool isFirst = true, isSecond = true;
};

struct DetectionTask {
  Options options;  ///< without its functions
  std::vector<TaskProduct> products;
  bool isKept = false;  ///< records of what is found so far go to ModelReaderProtocol::kKept
};

// Both run on one machine from one build, so numbers are in its own byte order. Decoding raises
// std::runtime_error for truncated bytes.

std::string Encode(const DetectionTask& inTask);
DetectionTask DecodeTask(std::string_view inBytes);
std::string Encode(const Findings& inFindings);
Findings DecodeFindings(std::string_view inBytes);

/// Adds the findings of another share of the same work, in the order of one run.
/// @return false when they are of other work, or a verdict is in both.
bool MergeFindings(Findings inOther, Findings& ioFindings);

/// A record that a run appends to a file as it goes, so that its findings outlive it: first one
/// without verdicts, then one for each.
std::string EncodeRecord(const Findings& inFindings);

struct KeptFindings {
  Findings findings;
  std::size_t size = 0;  ///< in bytes, of the records that are whole; 0: nothing is known
};
/// @param inBytes of one run or of several, each of which went on with what the ones before had
/// found. Whatever follows a record that is cut off or damaged is left out.
KeptFindings DecodeRecords(std::string_view inBytes);

}  // namespace ZORDetection

#endif
