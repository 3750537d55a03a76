// The two ways in which the command ends early.
#ifndef ZOR_TOOLS_LYRA_COMMAND_ERRORS_H
#define ZOR_TOOLS_LYRA_COMMAND_ERRORS_H

#include "toolkit/Error.h"

namespace lyra {

/// What was asked for cannot be done with this input or output: one line on stderr, exit code 1.
using InputError = ZORToolkit::Error;

/// The command was called wrongly: one line on stderr, exit code 2.
using UsageError = ZORToolkit::UsageError;

}  // namespace lyra

#endif
