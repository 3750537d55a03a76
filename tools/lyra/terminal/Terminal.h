// The program's streams, as each kind of system has them.
#ifndef ZOR_TOOLS_LYRA_TERMINAL_TERMINAL_H
#define ZOR_TOOLS_LYRA_TERMINAL_TERMINAL_H

#include <cstdio>
#include <string_view>

namespace lyra {

bool IsTerminal(std::FILE* inStream);

/// @return the columns of a terminal; 0 when they are not known.
int TerminalWidth(std::FILE* inStream);

/// Bytes pass through the standard streams as they are, a console takes them for UTF-8, and a reader
/// that goes away, or a file that may not grow any further, shows as a failed write.
void PrepareStreams();

/// Writes text to a terminal or whatever the stream is. A console of Windows gets it in wide
/// characters: through the C library it would take each byte for a character.
/// @return whether all of it was written; the reason is in errno else.
bool WriteText(std::FILE* inStream, std::string_view inText);

inline void WriteError(std::string_view inText) { WriteText(stderr, inText); }

}  // namespace lyra

#endif
