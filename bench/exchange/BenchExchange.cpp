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
#include <stdexcept>
#include <string>
#include <vector>

#include "ChildProcess.h"
#include "ClashDocumentGenerator.h"
#include "foundation/ScratchFolder.h"
#include "toolkit/exchange/ResultSheet.h"

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

typedef std::vector<std::vector<ZORToolkit::SheetCell>> Cells;

/// In a process of its own: this program calls itself.
int WriteBareSheet(const std::string& inResult, const std::string& inPath) {
  Cells rows;
  {
    ZORToolkit::ClashDocument result(inResult);
    ZORToolkit::ForEachSheetRow(result, {}, [&](const auto& inCells) { rows.push_back(inCells); });
  }
  timespec before{}, after{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &before);
  lxw_workbook_options options{};
  options.constant_memory = LXW_TRUE;
  lxw_workbook* const book = workbook_new_opt(inPath.c_str(), &options);
  lxw_worksheet* const sheet = workbook_add_worksheet(book, nullptr);
  for (std::size_t row = 0; row < rows.size(); ++row)
    for (std::size_t i = 0; i < rows[row].size(); ++i) {
      const ZORToolkit::SheetCell& cell = rows[row][i];
      const auto line = static_cast<lxw_row_t>(row);
      const auto column = static_cast<lxw_col_t>(i);
      if (cell.number)
        worksheet_write_number(sheet, line, column, *cell.number, nullptr);
      else if (!cell.text.empty())
        worksheet_write_string(sheet, line, column, cell.text.c_str(), nullptr);
    }
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
    bare.push_back(
        std::strtod(Run({self, "--bare-sheet", result, path("b.xlsx")}).output.c_str(), nullptr));
  }
  Report("BCF with ready pictures / zip -6", bcf, bcfPeak, zip, 1.5);
  Report("workbook / the same cells", sheet, sheetPeak, bare, 2);
  return 0;
}

}  // namespace

int main(int inCount, char** inArguments) {
  try {
    if (inCount == 4 && std::strcmp(inArguments[1], "--bare-sheet") == 0)
      return WriteBareSheet(inArguments[2], inArguments[3]);
    const long count = inCount > 1 ? std::strtol(inArguments[1], nullptr, 10) : 10000;
    if (count < 1) throw std::runtime_error("usage: zor_bench_exchange [COUNT]");
    return Bench(static_cast<std::size_t>(count));
  } catch (const std::exception& error) {
    std::fprintf(stderr, "zor_bench_exchange: %s\n", error.what());
    return 1;
  }
}
