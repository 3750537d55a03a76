// What the command does when memory, files or the disk fail it: every verb, with each of a sample of its
// allocations, openings and writes failing. ZOR_FAULT_SAMPLES says how many of each, 0 all.
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <random>
#include <set>
#include <sstream>

#include "support/ScopedVariable.h"
#include "tools/Command.h"

namespace fs = std::filesystem;
using support::ScopedVariable;

namespace {

constexpr char kOldText[] = "what was there before\n";

struct VerbCase {
  const char* name;
  std::vector<std::string> arguments;  ///< OUT stands for the output
  bool isFolder = false;               ///< the output is a folder
};

const std::string kInputs = "tests/golden/inputs/";
const std::string kAs1 = "samples/as1.clash.xml";
const std::string kModel = "samples/as1-oc-214.stp";
const std::string kTwoSets = kInputs + "two_sets.xml";

std::vector<VerbCase> Cases() {
  return {
      {"info", {"info", kTwoSets, kInputs + "greek.xml"}},
      {"list", {"list", "--csv", kTwoSets}},
      {"show", {"show", "--json", kTwoSets, "1"}},
      {"components", {"components", kInputs + "components.xml"}},
      {"specs", {"specs", kAs1}},
      {"links", {"links", kInputs + "federator.xml"}},
      {"convert", {"convert", "--to", "json", kTwoSets}},
      {"merge", {"merge", kTwoSets, kTwoSets, "-o", "OUT"}},
      {"federate", {"federate", kTwoSets, "-o", "OUT"}},
      {"report", {"report", kTwoSets, "-o", "OUT"}},
      {"diff", {"diff", kTwoSets, kAs1, "--json"}},
      {"carry", {"carry", kTwoSets, kTwoSets, "-o", "OUT"}},
      {"group", {"group", kTwoSets}},
      {"review",
       {"review", "set", kTwoSets, "--only", "status=relevant", "--status", "irrelevant", "-o",
        "OUT"}},
      {"rules", {"rules", kTwoSets, "--rules", "samples/rules.toml", "-o", "OUT"}},
      {"gate",
       {"gate", kTwoSets, "--baseline", kAs1, "--policy", "samples/policy.toml", "--report",
        "junit=OUT"}},
      {"path", {"path", "/tmp"}},
      {"escape", {"escape", "a < b"}},
      {"filename", {"filename", "a/b"}},
      {"tree", {"tree", kModel}},
      {"detect", {"detect", kModel, "--only", "rod*", "-o", "OUT"}},
      {"render", {"render", kModel, "--size", "32x24", "-o", "OUT.png"}},
      {"publish", {"publish", kTwoSets, "-o", "OUT"}, true},
      {"publish_pictures",
       {"publish", kAs1, "--model", kModel, "--only", "type=clash", "--size", "32x24", "--jobs",
        "1", "-o", "OUT"},
       true},
  };
}

struct Counts {
  long memory = 0, openings = 0, writes = 0;
};

/// What a run leaves: its result, and every file of the folder with its bytes.
struct Outcome {
  CommandResult result;
  std::map<std::string, std::string> files;
};

class VerbRuns {
 public:
  explicit VerbRuns(const VerbCase& inCase)
      : case_(inCase),
        cache_("XDG_CACHE_HOME", folder_.Path("cache")),
        temporary_("TMPDIR", folder_.Path("tmp")) {
    for (std::string& word : case_.arguments)
      if (const std::size_t at = word.find("OUT"); at != std::string::npos)
        word.replace(at, 3, folder_.Path("work/out")),
            output_ = folder_.Path("work/") + "out" + word.substr(word.find("work/out") + 8);
  }

  Outcome Run() {
    fs::remove_all(folder_.Path("work"));
    fs::create_directories(folder_.Path("work"));
    fs::create_directories(folder_.Path("tmp"));
    if (!output_.empty() && !case_.isFolder) std::ofstream(output_) << kOldText;
    if (case_.isFolder) fs::create_directories(output_);
    Outcome outcome{RunCommand(case_.arguments), {}};
    for (const char* const name : {"work", "tmp"})
      for (const auto& entry : fs::recursive_directory_iterator(folder_.Path(name)))
        if (entry.is_regular_file())
          outcome.files[fs::relative(entry.path(), folder_.Path("")).string()] =
              ReadFile(entry.path().string());
    return outcome;
  }

  Counts Count() {
    const ScopedVariable counts("ZOR_FAULT_COUNTS", folder_.Path("counts"));
    Run();
    std::istringstream text(ReadFile(folder_.Path("counts")));
    Counts result;
    text >> result.memory >> result.openings >> result.writes;
    return result;
  }

  Outcome RunWith(const std::string& inFault) {
    const ScopedVariable fault("ZOR_FAULT", inFault);
    return Run();
  }

  void ForgetModels() const { fs::remove_all(folder_.Path("cache")); }
  /// Of a file.
  std::string OutputName() const {
    return output_.empty() ? "" : "work/" + fs::path(output_).filename().string();
  }

 private:
  TemporaryDirectory folder_;
  VerbCase case_;
  std::string output_;
  ScopedVariable cache_, temporary_;
};

/// All numbers up to a count, or a sample: the first few, the last, and others by chance.
std::set<long> Sample(long inCount, std::mt19937& ioRandom) {
  const char* const wanted = std::getenv("ZOR_FAULT_SAMPLES");
  const long size = wanted == nullptr ? 6 : std::atol(wanted);
  std::set<long> sample;
  if (size == 0 || inCount <= size) {
    for (long n = 1; n <= inCount; ++n) sample.insert(n);
    return sample;
  }
  sample = {1, inCount};
  std::uniform_int_distribution<long> any(2, inCount - 1);
  while (static_cast<long>(sample.size()) < size) sample.insert(any(ioRandom));
  return sample;
}

/// Without warnings, which may come before the reason.
std::string Reason(const std::string& inError) {
  std::istringstream lines(inError);
  std::string rest;
  for (std::string line; std::getline(lines, line);)
    if (!line.starts_with("lyra: warning: ")) rest += line + "\n";
  return rest;
}

bool IsOneLine(const std::string& inText) {
  return inText.starts_with("lyra: ") && inText.find('\n') == inText.size() - 1;
}

/// The dynamic loader ends a process without memory for a library's own data of threads.
bool IsEndedByLoader(const CommandResult& inResult) {
  return inResult.code == 127 && inResult.error.starts_with("cannot allocate memory for thread");
}

/// What is wrong with a run in which something failed; empty for none.
std::string Wrong(const VerbCase& inCase, const std::string& inOutput, const Outcome& inRun,
                  const Outcome& inWhole) {
  if (IsEndedByLoader(inRun.result)) return "";
  for (const auto& [name, bytes] : inRun.files)
    if (name.find(".zorlyra-") != std::string::npos ||
        name.find(".lyra-unf") != std::string::npos || name.starts_with("tmp/"))
      return "it leaves " + name;
  if (inRun.result.code == inWhole.result.code) {
    if (inRun.result.out != inWhole.result.out) return "another output, but the same exit code";
    if (inRun.files != inWhole.files) return "other files, but the same exit code";
    return "";
  }
  if (inRun.result.code != 1) return "exit code " + std::to_string(inRun.result.code);
  if (!IsOneLine(Reason(inRun.result.error))) return "no single line on standard error";
  if (!inCase.isFolder && !inOutput.empty()) {
    const auto file = inRun.files.find(inOutput);
    if (file == inRun.files.end()) return "the old file is gone";
    // A verb may also say what it has done, which may fail when the file is whole.
    if (file->second != kOldText && file->second != inWhole.files.at(inOutput))
      return "the old file is another one";
  }
  return "";
}

class Faults : public testing::TestWithParam<VerbCase> {};

}  // namespace

TEST_P(Faults, EndInTheResultOrInOneReason) {
  const ScopedVariable preload("LD_PRELOAD", ZOR_FAULT_LIBRARY);
  VerbRuns runs(GetParam());
  runs.Run();  // fills the cache
  const Outcome whole = runs.Run();
  ASSERT_TRUE(whole.result.code == 0 || whole.result.code == 3) << whole.result.error;
  const Counts counts = runs.Count();
  ASSERT_GT(counts.memory, 10);
  std::mt19937 random(2026);
  const std::pair<const char*, long> kinds[] = {{"memory", counts.memory},
                                                {"open", counts.openings},
                                                {"full", counts.writes},
                                                {"broken", counts.writes}};
  for (const auto& [kind, count] : kinds) {
    for (const long n : Sample(count, random)) {
      const std::string fault = std::string(kind) + ":" + std::to_string(n);
      if (n % 4 == 3) runs.ForgetModels();
      const Outcome run = runs.RunWith(fault);
      const std::string wrong = Wrong(GetParam(), runs.OutputName(), run, whole);
      EXPECT_EQ(wrong, "") << fault << " of " << count << ", exit code " << run.result.code << "\n"
                           << run.result.error.substr(0, 600);
    }
  }
  // Whatever failed, nothing wrong was kept.
  const Outcome again = runs.Run();
  EXPECT_EQ(again.result.out, whole.result.out);
  EXPECT_EQ(again.files, whole.files);
}

INSTANTIATE_TEST_SUITE_P(Command, Faults, testing::ValuesIn(Cases()),
                         [](const testing::TestParamInfo<VerbCase>& inInfo) {
                           return std::string(inInfo.param.name);
                         });
