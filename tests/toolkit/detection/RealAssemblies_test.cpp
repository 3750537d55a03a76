// The detection beside an independent judge of real assemblies: see judged/README.md.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>

#include "toolkit/detection/Assembly.h"

namespace ZORDetection {
namespace {

struct JudgedPair {
  std::string kind;
  double distance = 0, volume = 0, depth = 0;
  bool hasSheets = false;
};

using Pair = std::pair<std::size_t, std::size_t>;

std::map<Pair, JudgedPair> ReadJudgements(const std::string& inPath) {
  std::map<Pair, JudgedPair> judged;
  std::ifstream stream(inPath);
  std::string line;
  std::getline(stream, line);  // the columns
  while (std::getline(stream, line)) {
    std::ranges::replace(line, ',', ' ');
    std::istringstream fields(line);
    Pair pair;
    JudgedPair judgement;
    fields >> pair.first >> pair.second >> judgement.kind >> judgement.distance >>
        judgement.volume >> judgement.depth >> judgement.hasSheets;
    judged[pair] = judgement;
  }
  return judged;
}

std::string WordOf(Kind inKind) {
  constexpr const char* kWords[] = {"clash", "contact", "clearance"};
  return kWords[static_cast<std::size_t>(inKind)];
}

void ExpectAgreement(const Interference& inFound, const JudgedPair& inJudged) {
  // A sheet has no volume, so that the judge cannot tell how deep it is.
  if (inJudged.kind == "sheet") return;
  EXPECT_EQ(WordOf(inFound.kind), inJudged.kind);
  if (inFound.kind == Kind::kClearance) {
    EXPECT_NEAR(inFound.value, inJudged.distance, 1e-6);
  }
  // The judge's depth is that of the deepest of many points.
  if (inFound.kind == Kind::kClash) {
    EXPECT_GT(-inFound.value, inJudged.depth - 1e-3);
  }
}

void ExpectAgreement(const std::string& inModel, double inClearance) {
  const auto judged = ReadJudgements(ZOR_SOURCE_DIR "/tests/toolkit/detection/judged/" +
                                     std::filesystem::path(inModel).stem().string() + ".csv");
  ASSERT_FALSE(judged.empty());
  Options options;
  options.clearance = inClearance;
  options.threads = 2;
  options.withCurves = false;
  const Findings findings = Assembly(inModel).Find(options);
  EXPECT_EQ(findings.interferences.size(), judged.size());
  for (const Interference& found : findings.interferences) {
    SCOPED_TRACE(std::to_string(found.first) + " against " + std::to_string(found.second));
    const auto place = judged.find({found.first, found.second});
    ASSERT_NE(place, judged.end()) << WordOf(found.kind) << ' ' << found.value;
    ExpectAgreement(found, place->second);
  }
}

TEST(RealAssemblies, As1) { ExpectAgreement(ZOR_SOURCE_DIR "/samples/as1-oc-214.stp", 2); }

TEST(RealAssemblies, Dissonance) {
  ExpectAgreement(ZOR_SOURCE_DIR "/samples/dissonance_assembly.step", 1);
}

TEST(RealAssemblies, OthersInTheFolderThatTheEnvironmentNames) {
  const char* const folder = std::getenv("ZOR_ASSEMBLIES");
  if (folder == nullptr) GTEST_SKIP() << "ZOR_ASSEMBLIES names no folder with more assemblies";
  ExpectAgreement(std::string(folder) + "/printable_case_full.stp", 0.5);
  ExpectAgreement(std::string(folder) + "/pushdevice_assembly.step", 1);
  ExpectAgreement(std::string(folder) + "/stamp_c6lora_smd.step", 0.05);
}

}  // namespace
}  // namespace ZORDetection
