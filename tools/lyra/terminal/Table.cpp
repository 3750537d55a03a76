#include "lyra/terminal/Table.h"

#include <algorithm>
#include <charconv>
#include <numeric>
#include <utility>

#include "lyra/terminal/SafeText.h"

namespace lyra {
namespace {

constexpr int kGap = 2;        // columns between two texts
constexpr int kNarrowest = 6;  // a column is not made narrower than this for the terminal's sake

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

Table::Table(std::vector<TableColumn> inColumns) : columns_(std::move(inColumns)) {
  for (const TableColumn& column : columns_) natural_.push_back(DisplayWidth(column.header));
}

void Table::Add(const std::vector<std::string>& inCells) {
  std::vector<std::string> cells;
  cells.reserve(inCells.size());
  for (std::size_t i = 0; i < inCells.size(); ++i) {
    cells.push_back(Printable(inCells[i]));
    natural_[i] = std::max(natural_[i], DisplayWidth(cells[i]));
  }
  rows_.push_back(std::move(cells));
}

// The widest column gives way first, so that short ones stay whole.
std::vector<int> Table::Widths(int inTotal) const {
  std::vector<int> widths = natural_;
  if (inTotal == 0) return widths;
  const int gaps = kGap * (static_cast<int>(widths.size()) - 1);
  int excess = std::accumulate(widths.begin(), widths.end(), gaps) - inTotal;
  for (; excess > 0; --excess) {
    const auto widest = std::max_element(widths.begin(), widths.end());
    if (*widest <= kNarrowest) break;
    --*widest;
  }
  return widths;
}

std::string Table::Line(const std::vector<std::string>& inCells,
                        const std::vector<int>& inWidths) const {
  std::string line;
  for (std::size_t i = 0; i < inCells.size(); ++i) {
    const std::string text = Fitted(inCells[i], inWidths[i], columns_[i].cut);
    const std::string fill(static_cast<std::size_t>(inWidths[i] - DisplayWidth(text)), ' ');
    if (i != 0) line.append(kGap, ' ');
    line += columns_[i].align == TableColumn::Align::kRight ? fill + text : text + fill;
  }
  line.erase(line.find_last_not_of(' ') + 1);
  return line;
}

void Table::Print(Output& ioOutput) const {
  const std::vector<int> widths = Widths(ioOutput.Width());
  std::vector<std::string> headers;
  for (const TableColumn& column : columns_) headers.push_back(column.header);
  ioOutput.Write(ioOutput.IsStyled() ? "\033[1m" + Line(headers, widths) + "\033[0m\n"
                                     : Line(headers, widths) + "\n");
  for (const std::vector<std::string>& row : rows_) ioOutput.Write(Line(row, widths) + "\n");
}

KeyValueList::KeyValueList(const std::string& inHeading) : heading_(Printable(inHeading)) {}

void KeyValueList::Add(const std::string& inName, const std::string& inValue) {
  if (!inValue.empty()) pairs_.emplace_back(inName, Printable(inValue));
}

void KeyValueList::Add(std::initializer_list<std::pair<const char*, const std::string&>> inPairs) {
  for (const auto& [name, value] : inPairs) Add(name, value);
}

void KeyValueList::AddGroup(const std::string& inName) { pairs_.emplace_back(inName, ""); }

void KeyValueList::Print(Output& ioOutput) const {
  std::size_t width = 0;
  for (const auto& [name, value] : pairs_)
    if (!value.empty()) width = std::max(width, name.size());
  const auto bold = [&](const std::string& inText) {
    return ioOutput.IsStyled() ? "\033[1m" + inText + "\033[0m" : inText;
  };
  ioOutput.Write(bold(heading_) + "\n");
  std::string indent = "  ";
  for (const auto& [name, value] : pairs_) {
    if (value.empty()) {
      ioOutput.Write("  " + bold(name) + "\n");
      indent = "    ";
    } else {
      const std::string fill(width - name.size() + 2, ' ');
      ioOutput.Write(indent + name + fill + value + "\n");
    }
  }
}

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
