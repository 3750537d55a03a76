#include "toolkit/review/Carry.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "foundation/ReadWholeFile.h"
#include "toolkit/records/ClashDocumentEdit.h"
#include "toolkit/review/EditedResults.h"

namespace {

using namespace ZORToolkit;
using namespace review_tests;
using testing::HasSubstr;
using testing::Not;

/// The document of a loaded result as it is written.
std::string Dumped(Loaded& ioLoaded) {
  const std::string path = testing::TempDir() + "/carry_test.xml";
  EXPECT_EQ(S_OK, ClashDocumentEdit(*ioLoaded.document).Dump({}, path));
  const std::string bytes = ZORFoundation::ReadWholeFile(path).bytes;
  std::filesystem::remove(path);
  return bytes;
}

/// What carrying the decisions of an old result over to a new one writes.
std::string CarriedXml(const Loaded& inOld, const std::string& inNewXml,
                       bool inKeepChanged = false) {
  Loaded is(inNewXml);
  const ResultDiff diff = Diff(inOld.result, is.result);
  const CarryPlan plan = PlanCarry(inOld.result, is.result, diff, inKeepChanged);
  ApplyReviewEdits(*is.document, is.result, plan.edits);
  return Dumped(is);
}

TestResult OneDecided() {
  TestResult result;
  result.products = {{"a --++-- bolt_1", "bolt", {0, 0, 0}},
                     {"a --++-- plate_1", "plate", {5, 0, 0}}};
  result.interferences = {{.first = 0, .second = 1, .status = "Relevant", .comment = "look"}};
  return result;
}

TestResult Undecided(TestResult inResult) {
  for (TestInterference& one : inResult.interferences) {
    one.status = "Not inspected";
    one.comment.clear();
  }
  return inResult;
}

TEST(Carry, DecisionsArriveAndAgeIsSet) {
  const Loaded was(OneDecided());
  const Loaded out(CarriedXml(was, Undecided(OneDecided()).Xml()));
  EXPECT_EQ("Relevant", out.result.interferences[0].status);
  EXPECT_EQ("look", out.result.interferences[0].comment);
  EXPECT_EQ("Old", out.result.interferences[0].retrieve);
}

TEST(Carry, WhatChangedIsReopenedAndSaysWhat) {
  const Loaded was(OneDecided());
  TestResult is = Undecided(OneDecided());
  is.interferences[0].value = "-3";
  const Loaded out(CarriedXml(was, is.Xml()));
  EXPECT_EQ("Not inspected", out.result.interferences[0].status);
  EXPECT_EQ("look\nReopened, was Relevant: value -1 -> -3", out.result.interferences[0].comment);
  const Loaded kept(CarriedXml(was, is.Xml(), true));
  EXPECT_EQ("Relevant", kept.result.interferences[0].status);
  EXPECT_EQ("look", kept.result.interferences[0].comment);
}

TEST(Carry, NewOnesStayAsTheyAre) {
  const Loaded was(OneDecided());
  TestResult is = Undecided(OneDecided());
  is.interferences[0].place = {400, 0, 0};
  is.interferences[0].status = "Irrelevant";
  const Loaded out(CarriedXml(was, is.Xml()));
  EXPECT_EQ("Irrelevant", out.result.interferences[0].status);
  EXPECT_EQ("New", out.result.interferences[0].retrieve);
}

TEST(Carry, EverythingUnknownSurvivesAndWordsKeepTheirLanguage) {
  const Loaded was(OneDecided());
  std::string xml = Undecided(OneDecided()).Xml();
  xml.replace(xml.find("<ClashElement"), 0, "<?host a?><!DOCTYPE ClashElement><!-- kept -->");
  xml.replace(xml.find("Not inspected"), 13, "Non inspecté");
  xml.replace(xml.find("RetrieveInf='New'"), 17, "RetrieveInf='Nouveau' x='1'");
  xml.replace(xml.find("</Interference>"), 0, "<Comment Author='me' Value=''/><Own>t</Own>");
  const std::string out = CarriedXml(was, xml);
  for (const char* const text :
       {"<?host a?>", "<!DOCTYPE ClashElement", "<!-- kept -->", "x=\"1\"", "<Own>t</Own>",
        "Status=\"Pertinent\"", "RetrieveInf=\"Ancien\"", "Author=\"me\" Value=\"look\""})
    EXPECT_THAT(out, HasSubstr(text));
}

TEST(Carry, OverTenRunsDecisionsEndWhereTheyBelong) {
  std::mt19937 random(31);
  TestResult model = RandomResult(random, 20, 60);
  std::map<int, std::pair<std::string, std::string>> decided;  // by truth: status and comment
  std::string xml = model.Xml();
  int next = 1000;
  for (int run = 0; run < 10; ++run) {
    Loaded now(xml);
    // Review: decide on some.
    std::vector<ReviewEdit> edits;
    for (std::size_t i = 0; i < model.interferences.size(); i += 1 + random() % 5) {
      const std::string status = random() % 2 ? "Relevant" : "Irrelevant";
      const std::string comment = "run " + std::to_string(run);
      edits.push_back({static_cast<int>(i), status, comment, std::nullopt});
      decided[model.interferences[i].truth] = {status, comment};
    }
    ApplyReviewEdits(*now.document, now.result, edits);
    // Design: delete, add, move, and compute again in another order.
    for (int i = 0; i < 4; ++i) {
      const auto gone = model.interferences.begin() +
                        static_cast<std::ptrdiff_t>(random() % model.interferences.size());
      decided.erase(gone->truth);
      model.interferences.erase(gone);
      TestInterference one = model.interferences[random() % model.interferences.size()];
      one.truth = next++;
      one.place = {25.0 * one.truth, 900, 0};
      model.interferences.push_back(one);
    }
    for (TestProduct& product : model.products) product.at[2] += 10;  // all together
    std::ranges::shuffle(model.interferences, random);
    const Loaded reviewed(Dumped(now));
    xml = CarriedXml(reviewed, model.Xml());
    const Loaded out(xml);
    for (std::size_t i = 0; i < model.interferences.size(); ++i) {
      const ReviewRecord& record = out.result.interferences[i];
      const auto found = decided.find(model.interferences[i].truth);
      const bool isDecided = found != decided.end();
      EXPECT_EQ(isDecided ? found->second.first : "Not inspected", record.status);
      EXPECT_EQ(isDecided ? found->second.second : "", record.comment);
    }
  }
  EXPECT_GT(decided.size(), 10u);
}

// Merging

TestResult With(TestResult inResult, const std::string& inStatus, const std::string& inComment) {
  inResult.interferences[0].status = inStatus;
  inResult.interferences[0].comment = inComment;
  return inResult;
}

MergePlan PlanOf(const TestResult& inMine, const TestResult& inTheirs,
                 Preference inPreference = Preference::kNone) {
  const Loaded base(OneDecided()), mine(inMine), theirs(inTheirs);
  return PlanMerge(base.result, mine.result, theirs.result, inPreference);
}

TEST(ReviewMerge, WhatDoesNotMeetIsKeptOnBothSides) {
  const MergePlan plan =
      PlanOf(With(OneDecided(), "Irrelevant", "look"), With(OneDecided(), "Relevant", "theirs"));
  ASSERT_EQ(1u, plan.edits.size());
  EXPECT_EQ(std::nullopt, plan.edits[0].status);
  EXPECT_EQ("theirs", plan.edits[0].comment);
  EXPECT_TRUE(plan.conflicts.empty());
}

TEST(ReviewMerge, WhatMeetsIsAConflictUnlessASideIsPreferred) {
  const TestResult mine = With(OneDecided(), "Irrelevant", "look");
  const TestResult theirs = With(OneDecided(), "Not inspected", "look");
  const MergePlan plan = PlanOf(mine, theirs);
  ASSERT_EQ(1u, plan.conflicts.size());
  EXPECT_EQ("status", plan.conflicts[0].what);
  EXPECT_EQ("Relevant", plan.conflicts[0].base);
  EXPECT_TRUE(plan.edits.empty());
  EXPECT_EQ("Not inspected", PlanOf(mine, theirs, Preference::kTheirs).edits.at(0).status);
  EXPECT_TRUE(PlanOf(mine, mine).conflicts.empty());
}

// Review files

std::string ReviewOf(const std::string& inId, const std::string& inRest) {
  return R"({"format":"zorlyra-review/1","result":{"document":"d","hash":"h"},"entries":[{"id":")" +
         inId + "\"" + inRest + "}]}";
}

TEST(ReviewFile, EntriesAreApplied) {
  const Loaded loaded(OneDecided());
  const std::string id = StableIds(loaded.result)[0];
  const ReviewFile file = ReadReviewFile(
      "r.json", ReviewOf(id, R"(,"index":1,"baseStatus":"Relevant","status":"not-inspected",
                                "comment":"x","who":"w","when":"t")"));
  const ApplyPlan plan = PlanApply(loaded.result, file);
  ASSERT_EQ(1u, plan.edits.size());
  EXPECT_EQ("Not inspected", plan.edits[0].status);
  EXPECT_EQ("x", plan.edits[0].comment);
}

TEST(ReviewFile, StaleEntriesConflictAndUnknownOnesAreSaid) {
  const Loaded loaded(OneDecided());
  const std::string id = StableIds(loaded.result)[0];
  const ReviewFile stale = ReadReviewFile(
      "r.json", ReviewOf(id, R"(,"baseStatus":"Not inspected","status":"Irrelevant")"));
  EXPECT_EQ(1u, PlanApply(loaded.result, stale).conflicts.size());
  EXPECT_TRUE(PlanApply(loaded.result, stale).edits.empty());
  EXPECT_EQ(1u, PlanApply(loaded.result, stale, Preference::kTheirs).edits.size());
  const ReviewFile unknown = ReadReviewFile("r.json", ReviewOf("0", R"(,"status":"Irrelevant")"));
  EXPECT_EQ(1u, PlanApply(loaded.result, unknown).unknown.size());
}

TEST(ReviewFile, WhatIsNoneIsRefusedWithItsPlace) {
  const auto reasonFor = [](const std::string& inText) {
    try {
      ReadReviewFile("r.json", inText);
      return std::string("accepted");
    } catch (const Error& error) {
      return std::string(error.what());
    }
  };
  EXPECT_THAT(reasonFor("{\n  x"), HasSubstr("r.json:2:3"));
  EXPECT_THAT(reasonFor("{}"), HasSubstr("no review file"));
  EXPECT_THAT(reasonFor("[]"), HasSubstr("no object"));
  EXPECT_THAT(reasonFor(R"({"format":"zorlyra-review/1"})"), HasSubstr("entries"));
  EXPECT_THAT(reasonFor(ReviewOf("a", R"(,"status":"maybe")")),
              HasSubstr("unknown status \"maybe\""));
  EXPECT_THAT(reasonFor(ReviewOf("a", R"(,"statsu":"Relevant")")),
              HasSubstr("entry 1: unknown key \"statsu\""));
  EXPECT_THAT(reasonFor(ReviewOf("a", R"(,"index":"1")")), HasSubstr("\"index\" is no number"));
  EXPECT_THAT(reasonFor(ReviewOf("a", R"(,"index":1e999)")), HasSubstr("too large"));
  for (const char* index : {"99999999999", "-1"})
    EXPECT_THAT(reasonFor(ReviewOf("a", std::string(R"(,"index":)") + index)),
                HasSubstr(std::string("\"index\" is no index: ") + index));
}

}  // namespace
