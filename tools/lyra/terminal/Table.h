// Tables and lists of texts, as people and programs read them.
#ifndef ZOR_TOOLS_LYRA_TERMINAL_TABLE_H
#define ZOR_TOOLS_LYRA_TERMINAL_TABLE_H

#include <initializer_list>
#include <string>
#include <string_view>
#include <utility>
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

/// Collects what is known of one thing and prints it under a heading.
class KeyValueList {
 public:
  /// @param inHeading, inValue as documents have them: they are made printable here.
  explicit KeyValueList(const std::string& inHeading);
  /// A pair whose value is empty is left out.
  void Add(const std::string& inName, const std::string& inValue);
  void Add(std::initializer_list<std::pair<const char*, const std::string&>> inPairs);
  /// A line of its own for a group of the pairs that follow.
  void AddGroup(const std::string& inName);
  void Print(Output& ioOutput) const;

 private:
  std::string heading_;
  std::vector<std::pair<std::string, std::string>> pairs_;  // a group has no value
};

/// A text as a cell: quoted where it must be. A text that a spreadsheet would take for a formula,
/// because it begins with = + - @, a tab or a carriage return and is no plain number, gets an
/// apostrophe in front.
std::string CsvCell(std::string_view inText);
/// The cells joined by commas, with the line end that the format asks for.
std::string CsvRow(const std::vector<std::string>& inCells);

}  // namespace lyra

#endif
