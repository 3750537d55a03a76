#include "lyra/Csv.h"

#include <charconv>

namespace lyra {
namespace {

bool IsPlainNumber(std::string_view inText) {
  if (inText.starts_with('+')) inText.remove_prefix(1);
  if (inText.find_first_not_of("0123456789.-+eE") != std::string_view::npos) return false;
  double number = 0;
  const auto [end, error] = std::from_chars(inText.data(), inText.data() + inText.size(), number);
  return error != std::errc::invalid_argument && end == inText.data() + inText.size();
}

bool IsFormula(std::string_view inText) {
  return !inText.empty() &&
         std::string_view("=+-@\t\r").find(inText[0]) != std::string_view::npos &&
         !IsPlainNumber(inText);
}

}  // namespace

std::string CsvCell(std::string_view inText) {
  const std::string text = IsFormula(inText) ? "'" + std::string(inText) : std::string(inText);
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
