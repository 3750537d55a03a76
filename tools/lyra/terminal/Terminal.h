// The program's streams, as each kind of system has them.
#ifndef ZOR_TOOLS_LYRA_TERMINAL_TERMINAL_H
#define ZOR_TOOLS_LYRA_TERMINAL_TERMINAL_H

#include <cstdio>

namespace lyra {

bool IsTerminal(std::FILE* inStream);

/// @return the columns of a terminal; 0 when they are not known.
int TerminalWidth(std::FILE* inStream);

/// Bytes pass through the standard streams as they are, a console takes them for UTF-8, and a reader
/// that goes away, or a file that may not grow any further, shows as a failed write.
void PrepareStreams();

}  // namespace lyra

#endif
