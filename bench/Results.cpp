#include "Results.h"

#include <algorithm>
#include <cmath>
#include <iomanip>
#include <limits>
#include <map>
#include <tuple>

namespace {
double Median(std::vector<double> ioValues) {
  std::sort(ioValues.begin(), ioValues.end());
  const std::size_t middle = ioValues.size() / 2;
  return ioValues.size() % 2 == 1 ? ioValues[middle]
                                  : (ioValues[middle - 1] + ioValues[middle]) / 2;
}

Step MedianStep(const std::vector<Steps>& inRepeats, std::size_t inStep) {
  std::vector<double> times, peaks;
  for (const Steps& steps : inRepeats) {
    times.push_back(steps.at(inStep).milliseconds);
    peaks.push_back(steps.at(inStep).peakMegabytes);
  }
  Step median = inRepeats.front().at(inStep);
  median.milliseconds = Median(times);
  median.peakMegabytes = Median(peaks);
  return median;
}
}  // namespace

void Results::Add(const std::string& inBenchmark, const std::string& inSubject, std::size_t inSize,
                  const std::vector<Steps>& inRepeats) {
  for (std::size_t i = 0; i < inRepeats.front().size(); ++i) {
    const Step step = MedianStep(inRepeats, i);
    for (const Steps& repeat : inRepeats)
      if (repeat.at(i).hash != step.hash)
        disagreements_.push_back(inSubject + " answers " + inBenchmark + ", " + step.name +
                                 ", differently from one run to the next");
    rows_.push_back({inBenchmark, inSubject, inSize, step});
  }
}

const Step* Results::Find(const std::string& inBenchmark, const std::string& inSubject,
                          std::size_t inSize, const std::string& inStep) const {
  for (const ResultRow& row : rows_)
    if (row.benchmark == inBenchmark && row.subject == inSubject && row.size == inSize &&
        row.step.name == inStep)
      return &row.step;
  return nullptr;
}

double Results::Milliseconds(const std::string& inBenchmark, const std::string& inSubject,
                             std::size_t inSize, const std::string& inStep) const {
  const Step* const step = Find(inBenchmark, inSubject, inSize, inStep);
  return step == nullptr ? std::numeric_limits<double>::quiet_NaN() : step->milliseconds;
}

double Results::Megabytes(const std::string& inBenchmark, const std::string& inSubject,
                          std::size_t inSize, const std::string& inStep) const {
  const Step* const step = Find(inBenchmark, inSubject, inSize, inStep);
  return step == nullptr ? std::numeric_limits<double>::quiet_NaN() : step->peakMegabytes;
}

double Results::AllMilliseconds(const std::string& inBenchmark, const std::string& inSubject,
                                std::size_t inSize) const {
  double sum = 0;
  for (const ResultRow& row : rows_)
    if (row.benchmark == inBenchmark && row.subject == inSubject && row.size == inSize)
      sum += row.step.milliseconds;
  return sum > 0 ? sum : std::numeric_limits<double>::quiet_NaN();
}

bool Results::Agree(std::ostream& ioErrors) const {
  std::vector<std::string> disagreements = disagreements_;
  std::map<std::tuple<std::string, std::size_t, std::string>, const ResultRow*> firsts;
  for (const ResultRow& row : rows_) {
    const ResultRow& first =
        *firsts.try_emplace({row.benchmark, row.size, row.step.name}, &row).first->second;
    if (first.step.hash != row.step.hash)
      disagreements.push_back(row.subject + " and " + first.subject + " differ in " +
                              row.benchmark + ", " + row.step.name + ", " +
                              std::to_string(row.size));
  }
  for (const std::string& text : disagreements) ioErrors << "zor_bench: " << text << '\n';
  return disagreements.empty();
}

void Results::PrintTable(const std::string& inBenchmark, std::size_t inSize,
                         std::ostream& ioOut) const {
  ioOut << '\n' << inBenchmark << ", " << inSize << '\n' << std::fixed;
  std::map<std::string, double> firstTimes;
  for (const ResultRow& row : rows_) {
    if (row.benchmark != inBenchmark || row.size != inSize) continue;
    const Step& step = row.step;
    const double first = firstTimes.try_emplace(step.name, step.milliseconds).first->second;
    ioOut << "  " << std::left << std::setw(24) << row.subject << std::setw(17) << step.name
          << std::right << std::setw(11) << std::setprecision(2) << step.milliseconds << " ms"
          << std::setw(10) << std::setprecision(0)
          << step.milliseconds * 1e6 / static_cast<double>(inSize) << " ns each" << std::setw(9)
          << std::setprecision(1) << step.peakMegabytes << " MB" << std::setw(8)
          << std::setprecision(2) << step.milliseconds / first << " x  " << std::hex
          << std::setw(16) << std::setfill('0') << step.hash << std::dec << std::setfill(' ')
          << '\n';
  }
}

void Results::WriteCsv(std::ostream& ioOut) const {
  ioOut << "benchmark,subject,step,size,ms,peak_mb,hash\n" << std::fixed << std::setprecision(3);
  for (const ResultRow& row : rows_)
    ioOut << row.benchmark << ',' << row.subject << ',' << row.step.name << ',' << row.size << ','
          << row.step.milliseconds << ',' << row.step.peakMegabytes << ',' << std::hex
          << std::setw(16) << std::setfill('0') << row.step.hash << std::dec << std::setfill(' ')
          << '\n';
}
