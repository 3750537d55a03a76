// Which interferences a list shows, and its forms.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "tools/Command.h"

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

namespace {

const std::string kTwoSets = "tests/golden/inputs/two_sets.xml";

/// The numbers of the interferences that a list with these options shows.
std::vector<int> Listed(std::vector<std::string> inOptions, const std::string& inFile = kTwoSets) {
  std::vector<std::string> arguments = {"list", "--json", inFile};
  arguments.insert(arguments.end(), inOptions.begin(), inOptions.end());
  const CommandResult result = RunCommand(arguments);
  EXPECT_EQ(result.code, 0) << result.error;
  std::vector<int> numbers;
  for (const auto& record : nlohmann::json::parse(result.out))
    numbers.push_back(record.at("index"));
  return numbers;
}

/// A reader of comma-separated values that takes what the format's rules allow and nothing else.
std::vector<std::vector<std::string>> ParseCsv(const std::string& inText) {
  std::vector<std::vector<std::string>> rows;
  std::size_t at = 0;
  while (at < inText.size()) {
    std::vector<std::string> row;
    for (bool more = true; more;) {
      std::string cell;
      if (inText.at(at) == '"') {
        for (++at; inText.at(at) != '"' || inText.at(at + 1) == '"'; ++at) {
          if (inText.at(at) == '"') ++at;
          cell += inText.at(at);
        }
        ++at;
      } else {
        while (inText.at(at) != ',' && inText.at(at) != '\r') {
          EXPECT_NE(inText.at(at), '"') << "a quote in a cell without quotes";
          EXPECT_NE(inText.at(at), '\n') << "a bare line feed";
          cell += inText.at(at++);
        }
      }
      row.push_back(cell);
      more = inText.at(at) == ',';
      if (more) ++at;
    }
    EXPECT_EQ(inText.substr(at, 2), "\r\n");
    at += 2;
    rows.push_back(row);
  }
  return rows;
}

/// A cell without the apostrophe that keeps a spreadsheet from running it.
std::string Unguarded(const std::string& inCell) {
  const bool isGuarded =
      inCell.size() > 1 && inCell[0] == '\'' && std::string("=+-@\t\r").find(inCell[1]) < 6;
  return isGuarded ? inCell.substr(1) : inCell;
}

}  // namespace

TEST(ListFilters, NoneShowsAllInOrder) { EXPECT_THAT(Listed({}), ElementsAre(1, 2, 3)); }

TEST(ListFilters, TypeInAnyLetterCase) {
  EXPECT_THAT(Listed({"--type", "CLASH"}), ElementsAre(1));
  EXPECT_THAT(Listed({"--type", "contact"}), ElementsAre(2));
  EXPECT_THAT(Listed({"--type", "Clearance"}), ElementsAre(3));
  EXPECT_THAT(Listed({"--type", "error"}), IsEmpty());
}

TEST(ListFilters, SeveralTypesAreEachShown) {
  EXPECT_THAT(Listed({"--type", "clash", "--type", "clearance"}), ElementsAre(1, 3));
}

TEST(ListFilters, StatusByEachOfItsSpellings) {
  EXPECT_THAT(Listed({"--status", "relevant"}), ElementsAre(1));
  EXPECT_THAT(Listed({"--status", "error"}), ElementsAre(2));
  EXPECT_THAT(Listed({"--status", "not-inspected"}), ElementsAre(3));
  EXPECT_THAT(Listed({"--status", "Not Inspected"}), ElementsAre(3));
  EXPECT_THAT(Listed({"--status", "irrelevant"}), IsEmpty());
}

TEST(ListFilters, ResultIsTheInterferencesOwnAndExact) {
  EXPECT_THAT(Listed({"--result", "First"}), ElementsAre(1, 2));
  EXPECT_THAT(Listed({"--result", "Second"}), ElementsAre(3));
  EXPECT_THAT(Listed({"--result", "second"}), IsEmpty());
}

TEST(ListFilters, ProductByAliasIdentifierInstanceAndLabel) {
  EXPECT_THAT(Listed({"--product", "HINGE.1"}), ElementsAre(1));
  EXPECT_THAT(Listed({"--product", "door --++--"}), ElementsAre(1));
  EXPECT_THAT(Listed({"--product", "ID-2"}), ElementsAre(1));
  EXPECT_THAT(Listed({"--product", "hinge.1 -- hinge"}), ElementsAre(1));
  EXPECT_THAT(Listed({"--product", "only"}), ElementsAre(3));
  EXPECT_THAT(Listed({"--product", "absent"}), IsEmpty());
}

TEST(ListFilters, ProductBeyondAsciiInAnyLetterCase) {
  EXPECT_THAT(Listed({"--product", "ΌΝΟΜΑ"}), ElementsAre(3));
}

TEST(ListFilters, AllMustHold) {
  EXPECT_THAT(Listed({"--type", "clash", "--result", "Second"}), IsEmpty());
  EXPECT_THAT(Listed({"--type", "clash", "--status", "relevant", "--product", "bolt"}),
              ElementsAre(1));
}

TEST(ListFilters, UnknownTypeIsWrongUsageAndNamesTheKnown) {
  const CommandResult result = RunCommand({"list", kTwoSets, "--type", "crash"});
  EXPECT_EQ(result.code, 2);
  EXPECT_EQ(result.out, "");
  EXPECT_THAT(result.error, HasSubstr("\"crash\"; known are clash, contact, clearance, error\n"));
}

TEST(ListFilters, UnknownStatusIsWrongUsageAndNamesTheKnown) {
  const CommandResult result = RunCommand({"list", kTwoSets, "--status", "open"});
  EXPECT_EQ(result.code, 2);
  EXPECT_THAT(result.error,
              HasSubstr("\"open\"; known are relevant, irrelevant, not-inspected, error\n"));
}

TEST(ListOfSingleInterference, IsThatOne) {
  EXPECT_THAT(Listed({}, "tests/golden/inputs/single.xml"), ElementsAre(1));
}

TEST(ListOfNothing, IsAnEmptyArray) {
  const CommandResult result = RunCommand({"list", "--json", "-"}, "<ClashElement/>");
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(result.out, "[]\n");
}

TEST(ListOfNothing, IsAHeaderInATable) {
  const CommandResult result = RunCommand({"list", "-"}, "<ClashElement/>");
  EXPECT_EQ(result.code, 0);
  EXPECT_EQ(result.out, "N  Type  Value  Status  Rule  First product  Second product\n");
}

TEST(ListJson, IsOneRecordALine) {
  const CommandResult result = RunCommand({"list", "--json", kTwoSets});
  EXPECT_EQ(std::count(result.out.begin(), result.out.end(), '\n'), 5);
  EXPECT_THAT(result.out, StartsWith("[\n{\"index\":1,"));
}

TEST(ListJson, EscapesWhatCouldDriveATerminal) {
  const CommandResult result = RunCommand({"list", "--json", "tests/golden/inputs/hostile.xml"});
  EXPECT_THAT(result.out, HasSubstr("\"result\":\"\\u009b31mset\""));
  EXPECT_THAT(result.out, HasSubstr("\"id\":\"\\u202egnp.exe\""));
  EXPECT_THAT(result.out, HasSubstr("日本語の部品"));
  EXPECT_EQ(nlohmann::json::parse(result.out)[0]["name"], "line\nfeed");
}

TEST(ListCsv, ComesBackCellForCellThroughAnotherReader) {
  for (const std::string& sample : Samples()) {
    const CommandResult csv = RunCommand({"list", "--csv", sample});
    const CommandResult json = RunCommand({"list", "--json", sample});
    const auto rows = ParseCsv(csv.out);
    const auto records = nlohmann::json::parse(json.out);
    ASSERT_EQ(rows.size(), records.size() + 1) << sample;
    EXPECT_THAT(rows[0], ElementsAre("N", "Type", "Value", "Status", "Rule", "First product",
                                     "Second product"));
    for (std::size_t i = 0; i < records.size(); ++i) {
      const auto& record = records[i];
      const auto& products = record.at("products");
      std::vector<std::string> cells = rows[i + 1];
      for (std::string& cell : cells) cell = Unguarded(cell);
      EXPECT_THAT(cells, ElementsAre(std::to_string(i + 1), record.at("type").get<std::string>(),
                                     record.at("value").get<std::string>(),
                                     record.at("status").get<std::string>(),
                                     record.at("rule").at("name").get<std::string>(),
                                     products[0].at("alias").get<std::string>(),
                                     products[1].at("alias").get<std::string>()));
    }
  }
}

TEST(ListCsv, MakesFormulasSafe) {
  const CommandResult result = RunCommand({"list", "--csv", "tests/golden/inputs/hostile.xml"});
  EXPECT_EQ(ParseCsv(result.out)[1][2], "'=1+1");
}

TEST(ListForms, JsonAndCsvExcludeEachOther) {
  EXPECT_EQ(RunCommand({"list", "--json", "--csv", kTwoSets}).code, 2);
}

TEST(ListTable, ShowsControlsOfADocumentEscaped) {
  const CommandResult result = RunCommand({"list", "tests/golden/inputs/hostile.xml"});
  EXPECT_THAT(result.out, HasSubstr("\\u{9B}2J\\u{9}tab"));
  for (char byte : result.out) EXPECT_TRUE(byte == '\n' || byte < 0 || byte >= ' ');
  EXPECT_EQ(result.out.find("\xC2\x9B"), std::string::npos);
}
