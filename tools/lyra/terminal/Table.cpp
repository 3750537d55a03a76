#include "lyra/terminal/Table.h"

#include <algorithm>
#include <numeric>
#include <utility>

namespace lyra {
namespace {
constexpr int kGap = 2;        // columns between two texts
constexpr int kNarrowest = 6;  // a column is not made narrower than this for the terminal's sake
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

}  // namespace lyra
