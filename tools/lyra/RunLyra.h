// The command as a function.
#ifndef ZOR_TOOLS_LYRA_RUN_LYRA_H
#define ZOR_TOOLS_LYRA_RUN_LYRA_H

namespace lyra {

/// Runs the command line. Results go to standard output, everything else to standard error.
/// @return 0 done, 1 the input or output cannot be used, 2 wrong usage. Raises nothing.
int RunLyra(int inCount, char** inArguments);

}  // namespace lyra

#endif
