// What all programs that read models have in common: limits, the one way to files, and how they
// answer.
#ifndef ZOR_DEFAULT_PLATFORM_READERPROGRAM_H
#define ZOR_DEFAULT_PLATFORM_READERPROGRAM_H

#include <string>
#include <string_view>

#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

/// Raised where a model cannot be read.
struct Refusal {
  std::string reason;
};

/// The program's work, which each of them defines. It may open the model's path: the bytes come
/// from memory.
/// @return its answer. Raises Refusal, what the kernel raises, and std::exception.
std::string AnswerTo(const ModelRequest& inRequest, std::string_view inBytes);

/// A line for the process that started this one; see ModelReaderProtocol.
void ReportStatus(const std::string& inLine);

/// To be called when the model is read: what follows may take any time.
void LiftTimeLimit();

/// Messages of the kernel may have several lines.
std::string OneLine(const char* inMessage);

}  // namespace ZORDefault

#endif
