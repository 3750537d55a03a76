// Rows of comma-separated values that a spreadsheet can open without harm.
#ifndef ZOR_TOOLS_LYRA_TERMINAL_CSV_H
#define ZOR_TOOLS_LYRA_TERMINAL_CSV_H

#include <string>
#include <string_view>
#include <vector>

namespace lyra {

/// A text as a cell: quoted where it must be. A text that a spreadsheet would take for a formula,
/// because it begins with = + - @, a tab or a carriage return and is no plain number, gets an
/// apostrophe in front.
std::string CsvCell(std::string_view inText);
/// The cells joined by commas, with the line end that the format asks for.
std::string CsvRow(const std::vector<std::string>& inCells);

}  // namespace lyra

#endif
