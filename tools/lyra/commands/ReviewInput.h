// What the verbs that compare and settle results have in common.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_REVIEW_INPUT_H
#define ZOR_TOOLS_LYRA_COMMANDS_REVIEW_INPUT_H

#include <string>

#include "lyra/Arguments.h"
#include "lyra/terminal/Output.h"
#include "toolkit/review/ReviewedFile.h"

namespace lyra {

using ZORToolkit::BytesOfInput;
using ReviewInput = ZORToolkit::ReviewedFile;

/// Writes a result: as it was read when nothing in it changed, else as the document is now.
void WriteReviewed(ReviewInput& ioInput, const std::string& inPath, Output& ioOutput);

/// A length in millimetres, not negative. Raises UsageError.
/// @param inText with a decimal point or comma; empty for inDefault.
double LengthOf(const char* inOption, const std::string& inText, double inDefault);

/// The options of how results are compared.
struct CompareOptions {
  std::string tolerance, place, language;

  void Declare(Arguments& ioArguments);
  /// Raises UsageError.
  ZORToolkit::DiffOptions Get() const;
};

}  // namespace lyra

#endif
