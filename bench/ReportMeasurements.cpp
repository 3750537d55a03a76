// Writing a report of all interferences by markers, and the same text by plain appends.
#include <array>
#include <fstream>
#include <stdexcept>

#include "BuildPath.h"
#include "Measurement.h"
#include "ZORClashParsing.h"
#include "ZORLyraXMLServices.h"
#include "ZORTree.h"

namespace {
constexpr std::array<const char*, 5> kNames = {"Value", "ResultType", "Rule", "First", "Second"};
using Row = std::array<ZORUnicodeString, kNames.size()>;
using Utf8Row = std::array<std::string, kNames.size()>;

std::vector<Row> LoadRows(const std::string& inPath, Steps& ioSteps) {
  std::string path = inPath;
  ZORClashParsing reader(path.data());
  TimeStep("load", ioSteps, [&] {
    ZORUnicodeString kind, reference, version;
    if (FAILED(reader.LoadSequence(kind, reference, version)))
      throw std::runtime_error("the document was not loaded");
  });
  ZORUnicodeString name;
  int count = 0;
  reader.GetClashGeneralInfos(name, count);
  std::vector<Row> rows(static_cast<std::size_t>(count));
  for (std::size_t i = 0; i < rows.size(); ++i) {
    Row& row = rows[i];
    reader.GetClashInfos(static_cast<int>(i) + 1, row[0], row[1], row[2], row[3], row[4]);
  }
  return rows;
}

void WriteByMarkers(std::vector<Row>& ioRows, const std::string& inPath) {
  ZORLyraXMLServices writer;
  writer.InitXMLMarkerWithoutAttr("Report");
  int number = 0;
  for (Row& row : ioRows) {
    writer.InitXMLMarkerWithAttr("Interference");
    writer.AddAttr("Number", ++number);
    for (std::size_t i = 0; i < row.size(); ++i) {
      ZORUnicodeString escaped;
      BuildPath::CheckXMLString(row[i], escaped);
      writer.AddAttr(kNames[i], escaped);
    }
    writer.CloseXMLAttrMarkerWithElem();
    writer.AddPCData("inspected");
    writer.CloseXMLMarker("Interference");
  }
  writer.CloseXMLMarker("Report");
  if (FAILED(writer.DumpDocument(inPath.c_str())))
    throw std::runtime_error("the report was not written");
}

std::string Escaped(const std::string& inText) {
  std::string escaped;
  for (char byte : inText) {
    switch (byte) {
      case '"':
        escaped += "&quot;";
        break;
      case '&':
        escaped += "&amp;";
        break;
      case '<':
        escaped += "&lt;";
        break;
      case '>':
        escaped += "&gt;";
        break;
      default:
        escaped += byte;
    }
  }
  return escaped;
}

void WriteByAppends(const std::vector<Utf8Row>& inRows, const std::string& inPath) {
  std::string text = "<Report> ";
  int number = 0;
  for (const Utf8Row& row : inRows) {
    text.append("<Interference Number=\"").append(std::to_string(++number)).append("\" ");
    for (std::size_t i = 0; i < row.size(); ++i)
      text.append(kNames[i]).append("=\"").append(Escaped(row[i])).append("\" ");
    text.append("> \ninspected\n</Interference> \n");
  }
  text.append("\n</Report> \n");
  std::ofstream file(inPath, std::ios::binary);
  file << text;
  if (!file.flush()) throw std::runtime_error("the report was not written");
}

std::vector<Utf8Row> ToUtf8(const std::vector<Row>& inRows) {
  std::vector<Utf8Row> rows(inRows.size());
  for (std::size_t r = 0; r < rows.size(); ++r)
    for (std::size_t i = 0; i < kNames.size(); ++i) rows[r][i] = inRows[r][i].ConvertToChar();
  return rows;
}
}  // namespace

Steps ReportWithZORLyra(const Arguments& inArguments) {
  Steps steps;
  std::vector<Row> rows = LoadRows(inArguments.at(0), steps);
  TimeStep("write", steps, [&] { WriteByMarkers(rows, inArguments.at(1)); });
  steps.back().hash = HashOfBytes(inArguments.at(1));
  return steps;
}

Steps ReportWithPlainText(const Arguments& inArguments) {
  Steps steps;
  const std::vector<Utf8Row> rows = ToUtf8(LoadRows(inArguments.at(0), steps));
  TimeStep("write", steps, [&] { WriteByAppends(rows, inArguments.at(1)); });
  steps.back().hash = HashOfBytes(inArguments.at(1));
  return steps;
}
