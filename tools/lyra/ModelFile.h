// A CAD model that was given to the command.
#ifndef ZOR_TOOLS_LYRA_MODEL_FILE_H
#define ZOR_TOOLS_LYRA_MODEL_FILE_H

#include <string>

#include "default_platform/OpenModel.h"

namespace lyra {

/// Opens a model. What was mended or left out is told on standard error, progress too when that is
/// a terminal. Raises InputError with the reason for what cannot be opened, and for "-": a model is
/// always a file.
ZORDefault::OpenedModel OpenModelFile(const std::string& inPath);

}  // namespace lyra

#endif
