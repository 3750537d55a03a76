#include "lyra/ModelFile.h"

#include "lyra/CommandErrors.h"
#include "lyra/ProgressLine.h"

namespace lyra {

ZORDefault::OpenedModel OpenModelFile(const std::string& inPath) {
  if (inPath == "-") throw InputError("-: a model cannot be read from standard input");
  ProgressLine progress("reading " + inPath);
  ZORDefault::ModelOptions options;
  options.progress = [&](double inDone) { progress.Show(inDone); };
  options.warn = [&](const std::string& inWarning) { progress.Warn(inWarning); };
  try {
    return ZORDefault::OpenModel(inPath, options);
  } catch (const ZORDefault::ModelError& error) {
    throw InputError(error.what());
  }
}

}  // namespace lyra
