// Texts of documents made safe and fit for a terminal.
#ifndef ZOR_TOOLS_LYRA_TERMINAL_SAFE_TEXT_H
#define ZOR_TOOLS_LYRA_TERMINAL_SAFE_TEXT_H

#include <string>
#include <string_view>

namespace lyra {

/// The text on one line: control characters, line separators and characters that turn the direction
/// of writing are shown as \u{HEX}, so that a document can neither drive the terminal nor hide in
/// it. Bytes that are no UTF-8 become U+FFFD.
std::string Printable(std::string_view inText);

/// JSON text in which such characters are escaped; its values stay the same.
std::string EscapedForJson(std::string inJson);

/// Terminal columns of a printable text.
int DisplayWidth(std::string_view inText);

/// Which end of a text that does not fit is left out.
enum class Cut { kStart, kEnd };
/// A printable text of at most inWidth columns; what is left out is shown by "…".
std::string Fitted(std::string_view inText, int inWidth, Cut inCut);

}  // namespace lyra

#endif
