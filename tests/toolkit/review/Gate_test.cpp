#include "toolkit/review/Gate.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "foundation/ReadWholeFile.h"
#include "toolkit/review/EditedResults.h"

namespace {

using namespace ZORToolkit;
using namespace review_tests;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

TestResult Three() {
  TestResult result;
  result.products = {{"a --++-- bolt_1", "bolt", {0, 0, 0}},
                     {"a --++-- plate_1", "plate", {5, 0, 0}}};
  TestInterference clash{.first = 0, .second = 1}, contact = clash, accepted = clash;
  contact.type = "Contact";
  contact.value = "0";
  contact.place = {100, 0, 0};
  accepted.status = "Irrelevant";
  accepted.comment = "pressed in";
  accepted.place = {200, 0, 0};
  result.interferences = {clash, contact, accepted};
  return result;
}

template <class Read>
std::string ReasonFor(const Read& inRead, const std::string& inText) {
  try {
    inRead("f.toml", inText);
    return "accepted";
  } catch (const Error& error) {
    return error.what();
  }
}

// Rules

std::vector<int> Settled(const std::string& inConditions) {
  const Loaded loaded(Three());
  const auto rules = ReadRules("f.toml", "[[accept]]\nname='n'\nreason='r'\n" + inConditions);
  std::vector<int> positions;
  for (const ReviewEdit& edit : PlanRules(loaded.result, rules).edits)
    positions.push_back(edit.position);
  return positions;
}

TEST(Rules, ConditionsChoose) {
  EXPECT_THAT(Settled(""), ElementsAre(0, 1));  // the third is decided already
  EXPECT_THAT(Settled("type='contact'"), ElementsAre(1));
  EXPECT_THAT(Settled("product='bolt_?'"), ElementsAre(0, 1));
  EXPECT_THAT(Settled("product='bolt*'\nother-product='bolt*'"), ElementsAre());
  EXPECT_THAT(Settled("part='plate'\nother-part=['x','b*t']"), ElementsAre(0, 1));
  EXPECT_THAT(Settled("min-value=-0.5"), ElementsAre(1));
  EXPECT_THAT(Settled("max-value=-0.5"), ElementsAre(0));
  EXPECT_THAT(Settled("rule='*x'"), ElementsAre());
}

TEST(Rules, FirstRuleCountsAndItsReasonBecomesTheComment) {
  TestResult result = Three();
  result.interferences[1].comment = "seen";
  const Loaded loaded(result);
  const auto rules = ReadRules("f.toml",
                               "[[accept]]\nname='a'\nreason='touch'\ntype='Contact'\n"
                               "[[accept]]\nname='b'\nreason='all'\n"
                               "[[accept]]\nname='c'\nreason='none left'\n");
  const RulesPlan plan = PlanRules(loaded.result, rules);
  EXPECT_EQ("seen\ntouch", plan.edits[1].comment);
  EXPECT_EQ("Irrelevant", plan.edits[1].status);
  EXPECT_EQ(1, plan.outcomes[0].settled);
  EXPECT_EQ(2, plan.outcomes[1].matched);
  EXPECT_EQ(1, plan.outcomes[1].settled);
  EXPECT_EQ(0, plan.outcomes[2].matched);
}

TEST(Rules, WhatIsNotKnownIsRefusedWithItsPlace) {
  EXPECT_THAT(ReasonFor(ReadRules, "[[accept]]\nname='n'\nreason='r'\n  colour='x'\n"),
              HasSubstr("f.toml:4:3: unknown key \"colour\"; known are"));
  EXPECT_THAT(ReasonFor(ReadRules, "[[accept]]\nname='n'\nreason='r'\ntype=['clash','x']"),
              HasSubstr("f.toml:4:6: \"type\": unknown word \"x\""));
  EXPECT_THAT(ReasonFor(ReadRules, "[[accept]]\nname='n'"), HasSubstr("\"reason\" is missing"));
  EXPECT_THAT(ReasonFor(ReadRules, "a = ["), HasSubstr("f.toml:1:"));
  EXPECT_THAT(ReasonFor(ReadRules, "accept=1"), HasSubstr("[[accept]]"));
  EXPECT_THAT(ReasonFor(ReadRules, ""), HasSubstr("has no rule"));
}

// Gate

struct Judged {
  explicit Judged(const std::string& inPolicy, const TestResult& inResult = Three(),
                  const TestResult* inBaseline = nullptr)
      : policy(ReadPolicy("p.toml", inPolicy)), loaded(inResult) {
    if (inBaseline != nullptr) {
      const Loaded baseline(*inBaseline);
      diff = Diff(baseline.result, loaded.result);
    }
    outcome = Judge(policy, loaded.result, diff ? &*diff : nullptr);
  }
  GateReport Report() const {
    return {policy, loaded.result, outcome, diff ? &*diff : nullptr, "1"};
  }

  GatePolicy policy;
  Loaded loaded;
  std::optional<ResultDiff> diff;
  GateOutcome outcome;
};

TEST(Gate, LimitsCountAllButIrrelevantOnes) {
  EXPECT_EQ(Verdict::kFailed, Judged("[[limit]]\nname='l'\n").outcome.verdict);
  EXPECT_EQ(Verdict::kFailed, Judged("[[limit]]\nname='l'\nmax=1\n").outcome.verdict);
  EXPECT_EQ(Verdict::kPassed, Judged("[[limit]]\nname='l'\nmax=2\n").outcome.verdict);
  EXPECT_EQ(Verdict::kPassed, Judged("[[limit]]\nname='l'\nlevel='warning'\n").outcome.verdict);
  const Judged irrelevant("[[limit]]\nname='l'\nstatus='irrelevant'\n");
  EXPECT_THAT(irrelevant.outcome.limits[0].counted, ElementsAre(2));
  EXPECT_THAT(Judged("[[limit]]\nname='l'\n").outcome.limits[0].suppressed, ElementsAre(2));
}

TEST(Gate, NewIsWhatTheBaselineHasNot) {
  TestResult older = Three();
  older.interferences.erase(older.interferences.begin());
  const Judged judged("[[limit]]\nname='l'\nclass='new'\n", Three(), &older);
  EXPECT_EQ(Verdict::kFailed, judged.outcome.verdict);
  EXPECT_THAT(judged.outcome.limits[0].counted, ElementsAre(0));
  const TestResult same = Three();
  EXPECT_EQ(Verdict::kPassed,
            Judged("[[limit]]\nname='l'\nclass='new'\n", Three(), &same).outcome.verdict);
}

TEST(Gate, NothingCheckedDoesNotPass) {
  TestResult empty = Three();
  empty.interferences.clear();
  EXPECT_EQ(Verdict::kNothingJudged, Judged("[[limit]]\nname='l'\n", empty).outcome.verdict);
  EXPECT_EQ(Verdict::kPassed,
            Judged("allow-nothing-checked=true\n[[limit]]\nname='l'\n", empty).outcome.verdict);
  empty.specification =
      "<ProductsInSpec><Specification><ProdListe1 Alias='a'/><ProdListe2 Alias='b'/>"
      "</Specification></ProductsInSpec>";
  EXPECT_EQ(Verdict::kPassed, Judged("[[limit]]\nname='l'\n", empty).outcome.verdict);
  EXPECT_EQ(Verdict::kNothingJudged,
            Judged("[[limit]]\nname='l'\nclass='new'\n").outcome.verdict);  // without a baseline
}

TEST(Gate, TooMuchThatIsNotComparableFails) {
  TestResult older = Three();
  older.interferences[0].type = "Clearance";
  older.interferences[0].place = {900, 0, 0};
  TestResult newer = Three();
  newer.interferences.erase(newer.interferences.begin());
  newer.clearance = "1";
  const std::string policy = "max-not-comparable=0\n[[limit]]\nname='l'\nmax=9\n";
  EXPECT_EQ(Verdict::kFailed, Judged(policy, newer, &older).outcome.verdict);
  newer.clearance = "2";
  EXPECT_EQ(Verdict::kPassed, Judged(policy, newer, &older).outcome.verdict);
}

TEST(Gate, PolicyThatIsNotKnownIsRefusedWithItsPlace) {
  EXPECT_THAT(ReasonFor(ReadPolicy, "[[limit]]\nname='l'\nmost=1"),
              HasSubstr("f.toml:3:1: unknown key \"most\""));
  EXPECT_THAT(ReasonFor(ReadPolicy, "limits=1\n[[limit]]\nname='l'"),
              HasSubstr("f.toml:1:1: unknown key \"limits\""));
  EXPECT_THAT(ReasonFor(ReadPolicy, "[[limit]]\nname='l'\nmax=-1"), HasSubstr("f.toml:3:5"));
  EXPECT_THAT(ReasonFor(ReadPolicy, ""), HasSubstr("has no limit"));
}

TEST(Gate, SamplesOfRulesAndPolicyAreRead) {
  const auto text = [](const char* inName) {
    return ZORFoundation::ReadWholeFile(std::string(ZOR_SOURCE_DIR "/samples/") + inName).bytes;
  };
  EXPECT_GT(ReadRules("rules.toml", text("rules.toml")).size(), 1u);
  EXPECT_GT(ReadPolicy("policy.toml", text("policy.toml")).limits.size(), 1u);
}

TEST(GateReports, TextNamesWhatExceeds) {
  const std::string text = GateText(Judged("[[limit]]\nname='clashes'\ntype='clash'\n").Report());
  EXPECT_THAT(text, HasSubstr("FAILED  clashes: 1 found, at most 0 allowed (1 irrelevant)"));
  EXPECT_THAT(text, HasSubstr("1 Clash -1: a --++-- bolt_1 / a --++-- plate_1"));
}

TEST(GateReports, JUnitHasACaseForEachLimit) {
  const std::string xml =
      GateJUnit(Judged("[[limit]]\nname='a<b'\n[[limit]]\nname='ok'\nmax=9\n").Report());
  EXPECT_THAT(xml, HasSubstr("tests=\"2\" failures=\"1\" errors=\"0\""));
  EXPECT_THAT(xml, HasSubstr("name=\"a&lt;b\""));
  EXPECT_THAT(xml, HasSubstr("<failure message=\"2 found, at most 0 allowed\""));
  TestResult empty = Three();
  empty.interferences.clear();
  EXPECT_THAT(GateJUnit(Judged("[[limit]]\nname='l'\n", empty).Report()), HasSubstr("<error "));
}

TEST(GateReports, SarifHasWhatItsSchemaAsksFor) {
  const TestResult older = Three();
  const Judged judged("[[limit]]\nname='l'\n", Three(), &older);
  const auto sarif = nlohmann::json::parse(GateSarif(judged.Report()));
  EXPECT_EQ("2.1.0", sarif["version"]);
  const auto& run = sarif["runs"][0];
  EXPECT_EQ("lyra", run["tool"]["driver"]["name"]);
  ASSERT_EQ(3u, run["results"].size());
  const std::vector<std::string> ids = StableIds(judged.loaded.result);
  for (const auto& result : run["results"]) {
    EXPECT_EQ("l", result["ruleId"]);
    EXPECT_EQ("l", run["tool"]["driver"]["rules"][result["ruleIndex"].get<std::size_t>()]["id"]);
    EXPECT_THAT((std::vector<std::string>{"none", "note", "warning", "error"}),
                testing::Contains(result["level"]));
    EXPECT_TRUE(result["message"]["text"].is_string());
    EXPECT_EQ("unchanged", result["baselineState"]);
    EXPECT_EQ("test.xml", result["locations"][0]["physicalLocation"]["artifactLocation"]["uri"]);
  }
  EXPECT_EQ(ids[0], run["results"][0]["partialFingerprints"]["interference/v1"]);
  EXPECT_FALSE(run["results"][0].contains("suppressions"));
  const auto& suppression = run["results"][2]["suppressions"][0];
  EXPECT_EQ("external", suppression["kind"]);
  EXPECT_EQ("pressed in", suppression["justification"]);
}

}  // namespace
