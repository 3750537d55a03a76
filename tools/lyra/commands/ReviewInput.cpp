#include "lyra/commands/ReviewInput.h"

#include "lyra/CommandErrors.h"

namespace lyra {
using namespace ZORToolkit;

void WriteReviewed(ReviewInput& ioInput, const std::string& inPath, Output& ioOutput) {
  OutputFile output(inPath);
  output.Check(ioInput.Write(output.Path()));
  output.Finish(ioOutput);
}

double LengthOf(const char* inOption, const std::string& inText, double inDefault) {
  if (inText.empty()) return inDefault;
  const std::optional<double> length = Number(inText).value;
  if (!length || *length < 0 || inText.find_first_not_of("0123456789.,eE+-") != std::string::npos)
    throw UsageError(std::string(inOption) + ": \"" + inText + "\" is no length in millimetres");
  return *length;
}

void CompareOptions::Declare(Arguments& ioArguments) {
  ioArguments.Text("--tolerance", "MM", tolerance,
                   "A value or a placement that differs by no more is the same (default: 0.001)");
  ioArguments.Text("--place", "MM", place,
                   "Farther apart on its products it is another interference (default: 10)");
  ioArguments.Language(language);
}

DiffOptions CompareOptions::Get() const {
  DiffOptions options;
  options.tolerance = LengthOf("--tolerance", tolerance, options.tolerance);
  options.samePlace = LengthOf("--place", place, options.samePlace);
  return options;
}

}  // namespace lyra
