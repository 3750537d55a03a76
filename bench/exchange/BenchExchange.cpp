// zor_bench_exchange [COUNT]: a result of many interferences as a BCF file with ready pictures, beside
// zip of the same files, and as a workbook, beside a program that writes the same cells.
//
// Exit code 1 when something cannot be written; however slow it was, 0 otherwise.
#include <xlsxwriter.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <exception>
#include <filesystem>
#include <fstream>
#include <pugixml.hpp>
#include <stdexcept>
#include <string>
#include <vector>

#include "ChildProcess.h"
#include "ClashDocumentGenerator.h"
#include "foundation/TemporaryFile.h"

namespace fs = std::filesystem;

namespace {

constexpr int kRepeats = 5;

ChildOutcome Run(const std::vector<std::string>& inCommand) {
  ChildOutcome outcome = RunChild(inCommand);
  if (outcome.exitCode != 0) throw std::runtime_error(inCommand.front() + " failed");
  return outcome;
}

/// The golden pictures by turns, under the names that a published page has.
void WritePage(const fs::path& inPage, std::size_t inCount) {
  std::vector<fs::path> pictures;
  for (const auto& file : fs::directory_iterator(ZOR_SOURCE_DIR "/tests/golden/pictures"))
    if (file.path().extension() == ".png") pictures.push_back(file.path());
  if (pictures.empty()) throw std::runtime_error("there are no pictures");
  std::ranges::sort(pictures);
  fs::create_directories(inPage / "pictures");
  for (std::size_t i = 1; i <= inCount; ++i)
    fs::copy_file(pictures[i % pictures.size()],
                  inPage / "pictures" / ("interference_" + std::to_string(i) + ".png"));
}

struct Cell {
  lxw_col_t column = 0;
  bool isNumber = false;
  double number = 0;
  std::string text;
};
typedef std::vector<std::vector<Cell>> Sheet;  // rows of cells

/// As libxlsxwriter writes a sheet of which it keeps nothing: texts in their cells.
Sheet ReadSheet(const fs::path& inPath) {
  pugi::xml_document xml;
  if (!xml.load_file(inPath.c_str())) throw std::runtime_error("a sheet cannot be read");
  Sheet sheet;
  for (const pugi::xml_node row : xml.child("worksheet").child("sheetData").children("row")) {
    std::vector<Cell>& cells = sheet.emplace_back();
    for (const pugi::xml_node cell : row.children("c")) {
      Cell& read = cells.emplace_back();
      read.column = lxw_name_to_col(cell.attribute("r").value());
      read.isNumber = cell.attribute("t").empty();
      read.number = cell.child("v").text().as_double();
      read.text = cell.child("is").child("t").text().get();
    }
  }
  return sheet;
}

void WriteSheet(const Sheet& inSheet, lxw_worksheet* ioSheet) {
  for (std::size_t row = 0; row < inSheet.size(); ++row)
    for (const Cell& cell : inSheet[row]) {
      const auto line = static_cast<lxw_row_t>(row);
      if (cell.isNumber)
        worksheet_write_number(ioSheet, line, cell.column, cell.number, nullptr);
      else if (!cell.text.empty())
        worksheet_write_string(ioSheet, line, cell.column, cell.text.c_str(), nullptr);
    }
}

/// The cells of all sheets of an unpacked workbook, written without anything else and timed. In a
/// process of its own: this program calls itself.
int WriteBareSheets(const fs::path& inWorkbook, const std::string& inPath) {
  std::vector<Sheet> sheets;
  for (int number = 1;; ++number) {
    const fs::path path =
        inWorkbook / "xl/worksheets" / ("sheet" + std::to_string(number) + ".xml");
    if (!fs::exists(path)) break;
    sheets.push_back(ReadSheet(path));
  }
  timespec before{}, after{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &before);
  lxw_workbook_options options{};
  options.constant_memory = LXW_TRUE;
  lxw_workbook* const book = workbook_new_opt(inPath.c_str(), &options);
  for (const Sheet& sheet : sheets) WriteSheet(sheet, workbook_add_worksheet(book, nullptr));
  if (workbook_close(book) != LXW_NO_ERROR) return 1;
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &after);
  std::printf("%f\n", 1e3 * static_cast<double>(after.tv_sec - before.tv_sec) +
                          1e-6 * static_cast<double>(after.tv_nsec - before.tv_nsec));
  return 0;
}

double Median(std::vector<double> inTimes) {
  std::ranges::sort(inTimes);
  return inTimes[inTimes.size() / 2];
}

void Report(const char* inName, const std::vector<double>& inOurs, double inPeak,
            const std::vector<double>& inPeers, double inTarget) {
  const double ours = Median(inOurs), peers = Median(inPeers), ratio = ours / peers;
  std::printf("%s: %.0f ms, %.0f MB; peer %.0f ms; ratio %.2f, at most %.1f: %s\n", inName, ours,
              inPeak, peers, ratio, inTarget, ratio <= inTarget ? "kept" : "not kept");
}

int Bench(std::size_t inCount) {
  const ZORFoundation::ScratchFolder scratch;
  const fs::path folder = scratch.Path();
  const auto path = [&](const char* inName) { return (folder / inName).string(); };
  const std::string self = fs::read_symlink("/proc/self/exe").string();
  const std::string lyra = fs::path(self).parent_path() / "lyra", result = path("result.xml");
  {
    std::ofstream file(result, std::ios::binary);
    WriteClashDocument(inCount, 1, file);
  }
  WritePage(path("page"), inCount);
  std::vector<double> bcf, zip, sheet, bare;
  double bcfPeak = 0, sheetPeak = 0;
  for (int i = 0; i < kRepeats; ++i) {
    const ChildOutcome written =
        Run({lyra, "convert", result, "--to", "bcf", "--page", path("page"), "-o", path("a.bcf")});
    bcf.push_back(written.processorMilliseconds);
    bcfPeak = written.peakMegabytes;
    if (i == 0) Run({"/usr/bin/unzip", "-q", path("a.bcf"), "-d", path("files")});
    fs::remove(path("a.zip"));
    zip.push_back(Run({"/usr/bin/zip", "-6", "-q", "-r", path("a.zip"), path("files")})
                      .processorMilliseconds);
    const ChildOutcome filled =
        Run({lyra, "convert", result, "--to", "xlsx", "-o", path("a.xlsx")});
    sheet.push_back(filled.processorMilliseconds);
    sheetPeak = filled.peakMegabytes;
    if (i == 0) Run({"/usr/bin/unzip", "-q", path("a.xlsx"), "-d", path("sheets")});
    bare.push_back(std::strtod(
        Run({self, "--bare-sheets", path("sheets"), path("b.xlsx")}).output.c_str(), nullptr));
  }
  Report("BCF with ready pictures / zip -6", bcf, bcfPeak, zip, 1.5);
  Report("workbook / the same cells", sheet, sheetPeak, bare, 2);
  std::printf("the document alone: %.0f MB\n", Run({lyra, "info", result}).peakMegabytes);
  return 0;
}

}  // namespace

int main(int inCount, char** inArguments) {
  try {
    if (inCount == 4 && std::strcmp(inArguments[1], "--bare-sheets") == 0)
      return WriteBareSheets(inArguments[2], inArguments[3]);
    const long count = inCount > 1 ? std::strtol(inArguments[1], nullptr, 10) : 10000;
    if (count < 1) throw std::runtime_error("usage: zor_bench_exchange [COUNT]");
    return Bench(static_cast<std::size_t>(count));
  } catch (const std::exception& error) {
    std::fprintf(stderr, "zor_bench_exchange: %s\n", error.what());
    return 1;
  }
}
