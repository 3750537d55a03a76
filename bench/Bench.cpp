// zor_bench: times and memory of the library beside those of its peers, on generated documents.
#include <CLI/CLI.hpp>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iomanip>
#include <iostream>
#include <sstream>
#include <stdexcept>

#include "ChildProcess.h"
#include "ClashDocumentGenerator.h"
#include "Measurement.h"
#include "Results.h"
#include "StartTimes.h"
#include "foundation/TemporaryFile.h"

namespace {
namespace fs = std::filesystem;

constexpr std::size_t kSmallDocument = 32;
constexpr std::size_t kFewOfPair = 500, kManyOfPair = 5000;
// Past this the other libraries' trees need more memory than most machines have.
constexpr std::size_t kMostForPeers = 200'000;

struct Options {
  std::vector<std::size_t> sizes = {1000, 10'000, 100'000};
  std::vector<std::string> benchmarks = {"load",  "loop", "merge",  "report", "dump",
                                         "whole", "list", "review", "escape", "start"};
  std::size_t escapedCharacters = 100'000'000;
  int repeats = 5;
  std::string csv;
};

// Whether a subject makes a tree of several times a document's size.
enum Memory { kModest, kPeersTree };

struct Subject {
  const char* name;
  const char* measurement;
  Memory memory = kModest;
};

// The measuring process prints its steps, name last since it may hold spaces.
void PrintSteps(const Steps& inSteps) {
  std::cout << std::setprecision(17);
  for (const Step& step : inSteps)
    std::cout << step.milliseconds << ' ' << step.peakMegabytes << ' ' << step.hash << ' '
              << step.name << '\n';
}

Steps ReadSteps(const std::string& inText) {
  Steps steps;
  std::istringstream text(inText);
  for (Step step; text >> step.milliseconds >> step.peakMegabytes >> step.hash;) {
    std::getline(text >> std::ws, step.name);
    steps.push_back(step);
  }
  return steps;
}

class Bench {
 public:
  explicit Bench(const Options& inOptions) : options_(inOptions) {}

  void Run() {
    for (std::size_t size : options_.sizes) RunOnDocuments(size);
    if (IsWanted("review")) RunPairs();
    if (IsWanted("escape")) {
      Compare("escape", options_.escapedCharacters,
              {{"ZORLyra", "escape-zorlyra"},
               {"append each", "escape-append"},
               {"push_back each", "escape-push-back"}},
              {std::to_string(options_.escapedCharacters)});
    }
    if (IsWanted("start")) TimeStarts();
    PrintTargets();
  }

  const Results& Measured() const { return results_; }

 private:
  bool IsWanted(const std::string& inBenchmark) const {
    const auto& wanted = options_.benchmarks;
    return std::find(wanted.begin(), wanted.end(), inBenchmark) != wanted.end();
  }

  std::string Document(const std::string& inName, std::size_t inCount, std::uint64_t inSeed,
                       void (*inWrite)(std::size_t, std::uint64_t, std::ostream&)) {
    const fs::path path = fs::path(scratch_.Path()) / inName;
    std::ofstream file(path, std::ios::binary);
    inWrite(inCount, inSeed, file);
    if (!file.flush()) throw std::runtime_error("no room for the documents");
    return path.string();
  }

  void RunOnDocuments(std::size_t inSize) {
    const std::string clashes = Document("clashes.xml", inSize, 1, WriteClashDocument);
    const std::string output = scratch_.Path() + "/output.xml";
    if (IsWanted("load"))
      Compare("load", inSize,
              {{"ZORLyra", "load-zorlyra"},
               {"ZORLyra, former scanner", "load-former"},
               {"Xerces-C SAX2 scan", "scan-xerces"},
               {"Xerces-C DOM", "load-xerces", kPeersTree},
               {"libxml2", "load-libxml2", kPeersTree},
               {"pugixml", "load-pugixml"}},
              {clashes});
    if (IsWanted("loop"))
      Compare("loop", inSize,
              {{"ZORLyra", "loop-zorlyra"},
               {"pugixml by hand", "loop-pugixml"},
               {"libxml2, load alone", "loop-libxml2", kPeersTree}},
              {clashes, Document("components.xml", inSize / 10, 2, WriteComponentsDocument)});
    if (IsWanted("merge"))
      Compare("merge", inSize,
              {{"ZORLyra", "merge-zorlyra"}, {"Xerces-C DOM", "merge-xerces", kPeersTree}},
              {Document("first.xml", inSize / 2, 3, WriteClashDocument),
               Document("second.xml", inSize / 2, 4, WriteClashDocument)});
    if (IsWanted("report"))
      Compare("report", inSize, {{"ZORLyra", "report-zorlyra"}, {"std::string", "report-plain"}},
              {clashes, output});
    if (IsWanted("dump"))
      Compare("dump", inSize,
              {{"ZORLyra", "dump-zorlyra"}, {"Xerces-C DOM", "dump-xerces", kPeersTree}},
              {clashes, output});
    if (IsWanted("whole"))
      Compare("whole", inSize, {{"ZORLyra", "whole-zorlyra"}},
              {clashes, Document("more.xml", inSize / 100, 5, WriteClashDocument), output});
    if (IsWanted("review")) RunReview(inSize, clashes);
    if (IsWanted("list") && HasCommand())
      Compare("list", inSize, {{"lyra list --csv", "list-lyra"}, {"ZORLyra", "load-zorlyra"}},
              {clashes});
  }

  void RunReview(std::size_t inSize, const std::string& inClashes) {
    const std::string later = Document("later.xml", inSize, 1, WriteRecomputedDocument);
    Compare("diff", inSize, {{"ZORLyra", "diff-zorlyra"}}, {inClashes, later});
    Compare("carry", inSize, {{"ZORLyra", "carry-zorlyra"}}, {inClashes, later});
    Compare("group", inSize, {{"ZORLyra", "group-zorlyra"}}, {inClashes});
    Compare("gate", inSize, {{"ZORLyra", "gate-zorlyra"}}, {inClashes});
  }

  // The same pair of products in hundreds and in thousands of interferences.
  void RunPairs() {
    for (const std::size_t size : {kFewOfPair, kManyOfPair})
      Compare("pair", size, {{"ZORLyra", "diff-zorlyra"}},
              {Document("pair.xml", size, 1, WritePairDocument),
               Document("pair-later.xml", size, 2, WritePairDocument)});
  }

  bool HasCommand() const {
    if (fs::exists(LyraBesideUs())) return true;
    std::cerr << "zor_bench: the command is not built; what it does is not measured\n";
    return false;
  }

  // Runs all subjects in turn, each time another one first, so that what the machine does meanwhile
  // meets all of them.
  void Compare(const std::string& inBenchmark, std::size_t inSize, std::vector<Subject> inSubjects,
               const Arguments& inArguments) {
    if (inSize > kMostForPeers)
      std::erase_if(inSubjects, [](const Subject& inOne) { return inOne.memory == kPeersTree; });
    const int repeats = inSize <= 10'000 ? 3 * options_.repeats : options_.repeats;
    std::vector<std::vector<Steps>> measured(inSubjects.size());
    for (int repeat = 0; repeat < repeats; ++repeat)
      for (std::size_t i = 0; i < inSubjects.size(); ++i) {
        const std::size_t turn = (i + static_cast<std::size_t>(repeat)) % inSubjects.size();
        measured[turn].push_back(RunMeasurement(inSubjects[turn].measurement, inArguments));
      }
    for (std::size_t i = 0; i < inSubjects.size(); ++i)
      results_.Add(inBenchmark, inSubjects[i].name, inSize, measured[i]);
    results_.PrintTable(inBenchmark, inSize, std::cout);
    std::cout.flush();
  }

  Steps RunMeasurement(const std::string& inMeasurement, const Arguments& inArguments) const {
    std::vector<std::string> command = {program_, "--measure", inMeasurement};
    command.insert(command.end(), inArguments.begin(), inArguments.end());
    const ChildOutcome outcome = RunChild(command);
    if (outcome.exitCode != 0) throw std::runtime_error(inMeasurement + " failed");
    return ReadSteps(outcome.output);
  }

  void TimeStarts() {
    if (!HasCommand()) return;
    const std::string document = Document("small.xml", kSmallDocument, 1, WriteClashDocument);
    const std::vector<std::string> info = {LyraBesideUs(), "info", document};
    const auto times =
        TimeCommands({info, {"xmllint", "--noout", document}}, 20 * options_.repeats);
    results_.Add("start", "lyra info", kSmallDocument, times[0]);
    results_.Add("start", "xmllint --noout", kSmallDocument, times[1]);
    results_.PrintTable("start", kSmallDocument, std::cout);
    heavyLibraries_ = HeavyLibrariesOf(info, scratch_.Path());
    startMeasured_ = true;
  }

  void PrintTarget(const std::string& inWhat, double inRatio, const char* inRelation,
                   double inLimit) const {
    if (std::isnan(inRatio)) return;
    const bool isLimitFromBelow = std::string_view(inRelation) == "at least";
    const bool isKept = isLimitFromBelow ? inRatio >= inLimit : inRatio <= inLimit;
    std::cout << "  " << (isKept ? "kept    " : "NOT KEPT") << "  " << std::left << std::setw(66)
              << inWhat << std::right << std::fixed << std::setprecision(2) << std::setw(7)
              << inRatio << "  (" << inRelation << ' ' << inLimit << ")\n";
  }

  double Ratio(const std::string& inBenchmark, std::size_t inSize, const char* inSubject,
               const char* inStep, const char* inOtherSubject, const char* inOtherStep) const {
    return results_.Milliseconds(inBenchmark, inSubject, inSize, inStep) /
           results_.Milliseconds(inBenchmark, inOtherSubject, inSize, inOtherStep);
  }

  void PrintTargets() const {
    std::cout << "\nTargets, at " << options_.sizes.back() << '\n';
    PrintGrowth();
    PrintLoadRatios();
    PrintRatios();
    PrintReviewRatios();
    if (startMeasured_) PrintStartTarget();
  }

  // What is linear takes as long for each interference however many there are.
  void PrintGrowth() const {
    const std::size_t least = options_.sizes.front();
    const std::size_t most = options_.sizes.back();
    const auto print = [&](const std::string& inWhat, double inMost, double inLeast,
                           double inLimit = 1.5) {
      PrintTarget(inWhat + ", time each there / at " + std::to_string(least),
                  inMost / inLeast * static_cast<double>(least) / static_cast<double>(most),
                  "at most", inLimit);
    };
    print("reading loop", results_.AllMilliseconds("loop", "ZORLyra", most),
          results_.AllMilliseconds("loop", "ZORLyra", least));
    print("merge", results_.Milliseconds("merge", "ZORLyra", most, "merge"),
          results_.Milliseconds("merge", "ZORLyra", least, "merge"));
    print("report, write", results_.Milliseconds("report", "ZORLyra", most, "write"),
          results_.Milliseconds("report", "ZORLyra", least, "write"));
    print("load, read, merge and dump", results_.AllMilliseconds("whole", "ZORLyra", most),
          results_.AllMilliseconds("whole", "ZORLyra", least), 1.2);
  }

  void PrintLoadRatios() const {
    const std::size_t most = options_.sizes.back();
    const auto against = [&](const char* inPeer) {
      return Ratio("load", most, "ZORLyra", "load", inPeer, "load");
    };
    PrintTarget("load / Xerces-C's DOM", against("Xerces-C DOM"), "at most", 0.25);
    PrintTarget("load / Xerces-C's DOM, peak memory",
                results_.Megabytes("load", "ZORLyra", most, "load") /
                    results_.Megabytes("load", "Xerces-C DOM", most, "load"),
                "at most", 0.25);
    PrintTarget("load / with the former scanner", against("ZORLyra, former scanner"), "at most",
                0.5);
    PrintTarget("load / pugixml", against("pugixml"), "at most", 1.3);
    PrintTarget("load / pugixml, peak memory",
                results_.Megabytes("load", "ZORLyra", most, "load") /
                    results_.Megabytes("load", "pugixml", most, "load"),
                "at most", 0.5);
    PrintTarget("load / libxml2", against("libxml2"), "at most", 0.25);
    PrintTarget("load and the reading loop / libxml2's load",
                results_.AllMilliseconds("loop", "ZORLyra", most) /
                    results_.Milliseconds("loop", "libxml2, load alone", most, "load"),
                "at most", 0.5);
    PrintTarget("dump / load", Ratio("dump", most, "ZORLyra", "dump", "ZORLyra", "load"), "at most",
                1.0 / 3);
    PrintTarget("lyra list --csv / load",
                Ratio("list", most, "lyra list --csv", "run", "ZORLyra", "load"), "at most", 1.5);
  }

  void PrintRatios() const {
    const std::size_t most = options_.sizes.back();
    PrintTarget("all GetClashInfos, full form / load",
                Ratio("loop", most, "ZORLyra", "full", "ZORLyra", "load"), "at most", 1);
    PrintTarget("merge / load of both", Ratio("merge", most, "ZORLyra", "merge", "ZORLyra", "load"),
                "at most", 0.5);
    PrintTarget("report by markers, write / load",
                Ratio("report", most, "ZORLyra", "write", "ZORLyra", "load"), "at most", 1);
    PrintTarget("DumpDocument / Xerces-C's serialiser",
                Ratio("dump", most, "ZORLyra", "dump", "Xerces-C DOM", "dump"), "at most", 1);
    const std::size_t characters = options_.escapedCharacters;
    for (const char* step : {"one text", "many texts"})
      PrintTarget(std::string("append each character / CheckXMLString, ") + step,
                  Ratio("escape", characters, "append each", step, "ZORLyra", step), "at least",
                  10);
  }

  void PrintReviewRatios() const {
    const std::size_t most = options_.sizes.back();
    const auto time = [&](const char* inBenchmark, const char* inStep) {
      return results_.Milliseconds(inBenchmark, "ZORLyra", most, inStep);
    };
    const double diff = time("diff", "read") + time("diff", "diff");
    PrintTarget("diff / load of both", diff / time("diff", "load"), "at most", 0.5);
    PrintTarget("diff with identifiers / load of both",
                (diff + time("diff", "identifiers")) / time("diff", "load"), "at most", 0.5);
    PrintTarget("carry / load of both", time("carry", "carry") / time("carry", "load"), "at most",
                0.3);
    const double group = time("group", "group");
    PrintTarget("group / load", group / time("group", "load"), "at most", 0.3);
    PrintTarget("group with labels and identifiers / load",
                (group + time("group", "identifiers")) / time("group", "load"), "at most", 0.3);
    PrintTarget("gate / load", time("gate", "gate") / time("gate", "load"), "at most", 0.3);
    const auto pair = [&](std::size_t inSize) {
      return results_.Milliseconds("pair", "ZORLyra", inSize, "read") +
             results_.Milliseconds("pair", "ZORLyra", inSize, "diff");
    };
    PrintTarget("diff of one pair, 5,000 interferences / 500", pair(kManyOfPair) / pair(kFewOfPair),
                "at most", 10);
  }

  void PrintStartTarget() const {
    PrintTarget("lyra info / xmllint --noout",
                Ratio("start", kSmallDocument, "lyra info", "run", "xmllint --noout", "run"),
                "at most", 1.3);
    std::cout << "  CAD and rendering libraries that lyra info loads:";
    for (const std::string& library : heavyLibraries_) std::cout << ' ' << library;
    std::cout << (heavyLibraries_.empty() ? " none\n" : "\n");
  }

  Options options_;
  const ZORFoundation::ScratchFolder scratch_;
  const std::string program_ = fs::read_symlink("/proc/self/exe").string();
  Results results_;
  bool startMeasured_ = false;
  std::vector<std::string> heavyLibraries_;
};

int Measure(const Arguments& inWords) {
  const Measurement measurement = inWords.empty() ? nullptr : FindMeasurement(inWords[0]);
  if (measurement == nullptr) throw std::runtime_error("unknown measurement");
  PrintSteps(measurement({inWords.begin() + 1, inWords.end()}));
  return 0;
}

int RunBench(const Options& inOptions) {
  setenv("ZOR_LANG", "en", 1);  // the documents' words are English
  Bench bench(inOptions);
  bench.Run();
  if (!inOptions.csv.empty()) {
    std::ofstream csv(inOptions.csv);
    bench.Measured().WriteCsv(csv);
    if (!csv.flush()) throw std::runtime_error("cannot write " + inOptions.csv);
  }
  return bench.Measured().Agree(std::cerr) ? 0 : 1;
}
}  // namespace

int main(int inCount, char** inArguments) {
  try {
    if (inCount > 1 && std::string_view(inArguments[1]) == "--measure")
      return Measure({inArguments + 2, inArguments + inCount});

    Options options;
    CLI::App app{"Times and memory of the library beside those of its peers."};
    app.add_option("--sizes", options.sizes, "numbers of interferences, ascending")
        ->delimiter(',')
        ->capture_default_str();
    app.add_option("--only", options.benchmarks, "benchmarks to run")
        ->delimiter(',')
        ->check(CLI::IsMember(options.benchmarks))
        ->capture_default_str();
    app.add_option("--characters", options.escapedCharacters, "length of the text that is escaped")
        ->capture_default_str();
    app.add_option("--repeats", options.repeats,
                   "runs of each, of which the median counts; three times as many up to 10000")
        ->check(CLI::PositiveNumber)
        ->capture_default_str();
    app.add_option("--csv", options.csv, "file for all rows");
    CLI11_PARSE(app, inCount, inArguments);
    return RunBench(options);
  } catch (const std::exception& error) {
    std::cerr << "zor_bench: " << error.what() << '\n';
    return 1;
  }
}
