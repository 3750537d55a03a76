#include "lyra/terminal/Csv.h"

#include <charconv>

namespace lyra {
namespace {

/// A number in decimal, with a point or, as many documents write it, a comma.
bool IsPlainNumber(std::string_view inText) {
  std::string number(inText.substr(inText.find_first_not_of("+-") == 1 ? 1 : 0));
  const std::size_t comma = number.find(',');
  if (comma != std::string::npos) number[comma] = '.';
  if (number.find_first_not_of("0123456789.-+eE") != std::string::npos) return false;
  double value = 0;
  const char* const end = number.data() + number.size();
  const auto read = std::from_chars(number.data(), end, value);
  return read.ec != std::errc::invalid_argument && read.ptr == end;
}

bool IsFormula(std::string_view inText) {
  return !inText.empty() &&
         std::string_view("=+-@\t\r").find(inText[0]) != std::string_view::npos &&
         !IsPlainNumber(inText);
}

}  // namespace

std::string CsvCell(std::string_view inText) {
  std::string text(IsFormula(inText) ? 1 : 0, '\'');
  text += inText;
  if (text.find_first_of("\",\r\n") == std::string::npos) return text;
  std::string quoted = "\"";
  for (char byte : text) {
    if (byte == '"') quoted += '"';
    quoted += byte;
  }
  return quoted + '"';
}

std::string CsvRow(const std::vector<std::string>& inCells) {
  std::string row;
  for (std::size_t i = 0; i < inCells.size(); ++i) {
    if (i != 0) row += ',';
    row += CsvCell(inCells[i]);
  }
  return row + "\r\n";
}

}  // namespace lyra
