// A table of texts in aligned columns.
#ifndef ZOR_TOOLS_LYRA_TERMINAL_TABLE_H
#define ZOR_TOOLS_LYRA_TERMINAL_TABLE_H

#include <string>
#include <vector>

#include "lyra/terminal/Output.h"
#include "lyra/terminal/SafeText.h"

namespace lyra {

struct TableColumn {
  enum class Align { kLeft, kRight };
  std::string header;
  Align align = Align::kLeft;
  Cut cut = Cut::kEnd;  // where a text is cut when the terminal is too narrow
};

/// Collects rows and prints them: under a header, as wide as they are, but no wider than the
/// terminal as long as every column keeps a few characters.
class Table {
 public:
  explicit Table(std::vector<TableColumn> inColumns);
  /// @param inCells one text a column, as documents have them: they are made printable here.
  void Add(const std::vector<std::string>& inCells);
  void Print(Output& ioOutput) const;

 private:
  std::vector<int> Widths(int inTotal) const;
  std::string Line(const std::vector<std::string>& inCells, const std::vector<int>& inWidths) const;

  std::vector<TableColumn> columns_;
  std::vector<int> natural_;  // widths of the widest texts
  std::vector<std::vector<std::string>> rows_;
};

}  // namespace lyra

#endif
