// What was measured, in rows.
#ifndef ZOR_BENCH_RESULTS_H
#define ZOR_BENCH_RESULTS_H

#include <ostream>
#include <string>
#include <vector>

#include "Measurement.h"

/// One step of one subject at one size: the median over the repeats.
struct ResultRow {
  std::string benchmark;
  std::string subject;
  std::size_t size;
  Step step;
};

class Results {
 public:
  /// Adds the medians of repeated steps. Repeats must agree on every hash.
  void Add(const std::string& inBenchmark, const std::string& inSubject, std::size_t inSize,
           const std::vector<Steps>& inRepeats);

  /// The time of a step; not a number when it was not measured.
  double Milliseconds(const std::string& inBenchmark, const std::string& inSubject,
                      std::size_t inSize, const std::string& inStep) const;
  /// The peak memory up to the end of a step; not a number when it was not measured.
  double Megabytes(const std::string& inBenchmark, const std::string& inSubject, std::size_t inSize,
                   const std::string& inStep) const;
  /// The time of all steps of a subject.
  double AllMilliseconds(const std::string& inBenchmark, const std::string& inSubject,
                         std::size_t inSize) const;

  /// Whether all subjects, and all repeats, gave the same hash wherever they did the same step on
  /// the same input. Names on ioErrors those that did not.
  bool Agree(std::ostream& ioErrors) const;

  /// The rows of a benchmark and a size as a table, with each row's time relative to the first
  /// subject's.
  void PrintTable(const std::string& inBenchmark, std::size_t inSize, std::ostream& ioOut) const;
  void WriteCsv(std::ostream& ioOut) const;

 private:
  const Step* Find(const std::string& inBenchmark, const std::string& inSubject, std::size_t inSize,
                   const std::string& inStep) const;

  std::vector<ResultRow> rows_;
  std::vector<std::string> disagreements_;
};

#endif
