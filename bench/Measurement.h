// What is measured. Each measurement runs in a process of its own, so that neither its memory nor
// what it leaves warm is another's.
#ifndef ZOR_BENCH_MEASUREMENT_H
#define ZOR_BENCH_MEASUREMENT_H

#include <cstdint>
#include <ctime>
#include <string>
#include <vector>

/// One timed step of a measurement.
struct Step {
  std::string name;
  double milliseconds;   ///< see Stopwatch; of whole commands, wall time
  double peakMegabytes;  ///< of the process up to the end of the step
  std::uint64_t hash;    ///< of what the step answered; 0 for a step without answer
};
using Steps = std::vector<Step>;
using Arguments = std::vector<std::string>;

/// The most memory that this process has had so far.
double PeakMegabytes();

/// Processor time of this process. Other processes then count as little as they can: what is timed
/// here runs on one thread and reads files that are cached.
class Stopwatch {
 public:
  double Milliseconds() const {
    return 1e3 * static_cast<double>(std::clock() - start_) / CLOCKS_PER_SEC;
  }

 private:
  std::clock_t start_ = std::clock();
};

/// Times inWork and appends the step, its hash still 0.
template <class Work>
void TimeStep(const std::string& inName, Steps& ioSteps, const Work& inWork) {
  const Stopwatch watch;
  inWork();
  const double milliseconds = watch.Milliseconds();
  ioSteps.push_back({inName, milliseconds, PeakMegabytes(), 0});
}

// The measurements by subject. Arguments are paths of documents, outputs last.
Steps LoadWithZORLyra(const Arguments& inArguments);
/// The loader of before: Xerces-C's scanner fills a tree in UTF-16.
Steps LoadAsFormerly(const Arguments& inArguments);
Steps LoadWithXerces(const Arguments& inArguments);
/// No tree: what it costs Xerces-C to read the text.
Steps ScanWithXerces(const Arguments& inArguments);
Steps LoadWithLibxml2(const Arguments& inArguments);
/// Without a hash of the tree, beside the reading loop.
Steps LoadAloneWithLibxml2(const Arguments& inArguments);
Steps LoadWithPugixml(const Arguments& inArguments);
/// Steps "load", "short", "full", "copy", "specifications", "load components", "components" of a
/// clash document and a document of components.
Steps LoopWithZORLyra(const Arguments& inArguments);
Steps LoopWithPugixml(const Arguments& inArguments);
/// Steps "load" of two documents and "merge".
Steps MergeWithZORLyra(const Arguments& inArguments);
Steps MergeWithXerces(const Arguments& inArguments);
/// Steps "load" and "write", of a report of all interferences into a file.
Steps ReportWithZORLyra(const Arguments& inArguments);
Steps ReportWithPlainText(const Arguments& inArguments);
/// Steps "load", "read in full", "merge" (the loading of the second document included) and "dump",
/// of a document and a smaller one.
Steps WholeWithZORLyra(const Arguments& inArguments);
/// Step "run": the command `lyra list --csv` on a document.
Steps ListWithLyra(const Arguments& inArguments);
/// Steps "load" and "dump", of a document into a file.
Steps DumpWithZORLyra(const Arguments& inArguments);
Steps DumpWithXerces(const Arguments& inArguments);
/// Steps "one text" and "many texts", of so many characters in all.
Steps EscapeWithZORLyra(const Arguments& inArguments);
Steps EscapeByCharacter(const Arguments& inArguments);
Steps EscapeByPushBack(const Arguments& inArguments);
/// Steps "load" of two documents, "read" for review, "diff" and "identifiers".
Steps DiffWithZORLyra(const Arguments& inArguments);
/// Steps "load" of two documents and "carry": read both, match, and set the decisions of the first
/// in the second.
Steps CarryWithZORLyra(const Arguments& inArguments);
/// Steps "load", "group": read and group, and "identifiers": all labels and identifiers of groups.
/// Or "load" and "gate": read and judge.
Steps GroupWithZORLyra(const Arguments& inArguments);
Steps GateWithZORLyra(const Arguments& inArguments);

using Measurement = Steps (*)(const Arguments&);
/// @return null for an unknown name.
Measurement FindMeasurement(const std::string& inName);

#endif
