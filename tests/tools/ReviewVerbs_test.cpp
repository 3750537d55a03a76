// Comparing, settling and judging results from a shell.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "tools/Command.h"

using testing::HasSubstr;
using testing::StartsWith;

namespace {

const std::string kAs1 = "samples/as1.clash.xml";  // 32 interferences
const std::string kDissonance = "samples/dissonance.clash.xml";

std::string Text(const std::string& inPath) { return ReadFile(ZOR_SOURCE_DIR "/" + inPath); }

std::string Without(std::string inXml, const std::string& inName) {
  const std::size_t begin = inXml.find("<Interference Name=\"" + inName + "\"");
  const std::size_t end = inXml.find("</Interference>", begin) + 15;
  return inXml.erase(begin, end - begin);
}

std::string Replaced(std::string inText, const std::string& inFrom, const std::string& inTo) {
  const std::size_t at = inText.find(inFrom);
  return at == std::string::npos ? inText : inText.replace(at, inFrom.size(), inTo);
}

nlohmann::json Json(const std::vector<std::string>& inArguments) {
  const CommandResult result = RunCommand(inArguments);
  EXPECT_EQ(result.error, "");
  return nlohmann::json::parse(result.out);
}

}  // namespace

TEST(DiffVerb, JsonHasTheFiveClasses) {
  const TemporaryDirectory directory;
  const std::string newer = directory.Write("new.xml", Without(Text(kAs1), "Interference.2"));
  const auto diff = Json({"diff", kAs1, newer, "--json"});
  EXPECT_EQ(diff["persisting"].size(), 31);
  EXPECT_EQ(diff["new"].size() + diff["changed"].size() + diff["notComparable"].size(), 0);
  ASSERT_EQ(diff["resolved"].size(), 1);
  const auto& resolved = diff["resolved"][0];
  EXPECT_EQ(resolved["old"], 2);
  EXPECT_EQ(resolved["new"], nullptr);
  EXPECT_EQ(resolved["id"].get<std::string>().size(), 16);
  EXPECT_TRUE(resolved["changes"].empty());
  EXPECT_EQ(Json({"diff", newer, kAs1, "--json"})["new"][0]["new"], 2);
}

TEST(DiffVerb, ExitCodeSaysWhetherThereAreDifferences) {
  const TemporaryDirectory directory;
  const std::string newer = directory.Write("new.xml", Without(Text(kAs1), "Interference.2"));
  EXPECT_EQ(RunCommand({"diff", kAs1, newer}).code, 0);
  EXPECT_EQ(RunCommand({"diff", kAs1, newer, "--exit-code"}).code, 3);
  EXPECT_EQ(RunCommand({"diff", kAs1, kAs1, "--exit-code"}).code, 0);
  EXPECT_EQ(RunCommand({"diff", kAs1, directory.Path("missing.xml")}).code, 1);
  EXPECT_EQ(RunCommand({"diff", kAs1}).code, 2);
  EXPECT_EQ(RunCommand({"diff", kAs1, kAs1, "--json", "--csv"}).code, 2);
  EXPECT_EQ(RunCommand({"diff", kAs1, kAs1, "--tolerance", "wide"}).code, 2);
}

TEST(DiffVerb, PageShowsWhatBecameOfEach) {
  const TemporaryDirectory directory;
  std::string two = Text(kAs1);
  for (int i = 3; i <= 32; ++i) two = Without(two, "Interference." + std::to_string(i));
  const std::string older = directory.Write("old.xml", two);
  const std::string newer = directory.Path("new.xml"), page = directory.Path("page.html");
  ASSERT_EQ(RunCommand({"review", "set", older, "--only", "type=contact", "--status", "irrelevant",
                        "--comment", "seen", "-o", newer})
                .code,
            0);
  const CommandResult made =
      RunCommand({"diff", older, newer, "--page", page, "--model", "samples/as1-oc-214.stp"});
  EXPECT_EQ(made.code, 0) << made.error;
  EXPECT_THAT(made.out, HasSubstr("page.html: 2 interferences, 2 with a picture\n"));
  const std::string text = ReadFile(page);
  EXPECT_THAT(text, HasSubstr("data-change=\"changed\""));
  EXPECT_THAT(text, HasSubstr("class=\"before\""));
  // The page gives the new result back, and a second one of the same is the same
  const std::string back = directory.Path("back.xml");
  EXPECT_EQ(RunCommand({"extract", page, "-o", back}).code, 0);
  EXPECT_EQ(ReadFile(back), ReadFile(newer));
  // JSON stays JSON beside a page, which may have no pictures
  const auto entries = Json({"diff", older, newer, "--json", "--page", directory.Path("folder")});
  EXPECT_EQ(entries["changed"].size() + entries["persisting"].size(), 2);
  EXPECT_THAT(ReadFile(directory.Path("folder/index.html")), HasSubstr("data-change="));
  // What the new model lacks was not looked for
  const std::string fewer = directory.Write(
      "fewer.xml", "<ClashElement Version='1.2'><ClashResult Name='r'/></ClashElement>");
  const std::string other =
      directory.Write("other.stl",
                      "solid a\nfacet normal 0 0 1\nouter loop\nvertex 0 0 0\nvertex 1 0 0\n"
                      "vertex 0 1 0\nendloop\nendfacet\nendsolid a\n");
  EXPECT_EQ(Json({"diff", older, fewer, "--json"})["resolved"].size(), 2);
  EXPECT_EQ(Json({"diff", older, fewer, "--json", "--model", other})["notComparable"].size(), 2);
  EXPECT_EQ(RunCommand({"diff", older, newer, "--old-model", other}).code, 2);
}

TEST(DiffVerb, TableShowsWhatChangedAndCsvAll) {
  const TemporaryDirectory directory;
  const std::string newer =
      directory.Write("new.xml", Replaced(Text(kAs1), "Value=\"0\"", "Value=\"-0.25\""));
  const std::string table = RunCommand({"diff", kAs1, newer}).out;
  EXPECT_THAT(table, HasSubstr("value 0 -> -0.25"));
  EXPECT_THAT(table, HasSubstr("0 new, 31 persisting, 1 changed, 0 resolved, 0 not comparable"));
  const std::string csv = RunCommand({"diff", kAs1, newer, "--csv"}).out;
  EXPECT_EQ(std::count(csv.begin(), csv.end(), '\n'), 33);
}

TEST(CarryVerb, SameResultIsWrittenByteForByte) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  for (const std::string& sample : Samples()) {
    ASSERT_EQ(RunCommand({"carry", sample, sample, "-o", out}).code, 0);
    EXPECT_TRUE(ReadFile(out) == Text(sample)) << sample;
    ASSERT_EQ(RunCommand({"review", "merge", kAs1, sample, sample, "-o", out}).code, 0);
    EXPECT_TRUE(ReadFile(out) == Text(sample)) << sample;
  }
}

TEST(CarryVerb, DecisionsOfAFrenchResultStayFrench) {
  const TemporaryDirectory directory;
  const std::string text = Text(kDissonance);
  const std::string older = directory.Write(
      "old.xml", Replaced(text, "Status=\"Non inspecté\"", "Status=\"Non pertinent\""));
  const std::string newer = directory.Write("new.xml", Replaced(text, "Day=\"20\"", "Day=\"21\""));
  const std::string out = directory.Path("out.xml");
  ASSERT_EQ(RunCommand({"carry", older, newer, "-o", out}).code, 0);
  EXPECT_THAT(ReadFile(out), HasSubstr("Status=\"Non pertinent\" RetrieveInf=\"Ancien\""));
}

TEST(GroupVerb, JsonIsNested) {
  const auto groups = Json({"group", kAs1, "--json"});
  std::size_t members = 0;
  for (const auto& group : groups) {
    EXPECT_EQ(group["by"], "parts");
    EXPECT_EQ(group["size"], group["members"].size());
    members += group["members"].size();
    EXPECT_EQ(group["groups"][0]["by"], "assemblies");
  }
  EXPECT_EQ(members, 32);
  EXPECT_EQ(RunCommand({"group", kAs1, "--by", "colour"}).code, 2);
  EXPECT_EQ(RunCommand({"group", kAs1, "--by", ""}).code, 2);
}

TEST(ReviewVerb, SetDecidesOnAGroup) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  const auto group = Json({"group", kAs1, "--json"})[0];
  const CommandResult result =
      RunCommand({"review", "set", kAs1, "--group", group["id"], "--status", "irrelevant",
                  "--comment", "by design", "-o", out});
  EXPECT_EQ(result.code, 0) << result.error;
  EXPECT_THAT(result.out, StartsWith(std::to_string(group["size"].get<int>()) + " chosen"));
  const auto records = Json({"list", out, "--json"});
  for (const int member : group["members"]) {
    EXPECT_EQ(records[static_cast<std::size_t>(member - 1)]["status"], "Irrelevant");
    EXPECT_EQ(records[static_cast<std::size_t>(member - 1)]["comment"], "by design");
  }
}

TEST(ReviewVerb, SetChoosesByConditions) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  ASSERT_EQ(RunCommand(
                {"review", "set", kAs1, "--only", "product=nut", "--status", "relevant", "-o", out})
                .code,
            0);
  const auto records = Json({"list", out, "--json", "--product", "nut"});
  EXPECT_GT(records.size(), 3);
  for (const auto& record : records) EXPECT_EQ(record["status"], "Relevant");
  EXPECT_EQ(RunCommand({"review", "set", kAs1, "--status", "relevant", "-o", out}).code, 2);
  EXPECT_EQ(RunCommand({"review", "set", kAs1, "--only", "type=clash", "-o", out}).code, 2);
  EXPECT_EQ(RunCommand({"review", "burn", kAs1, "-o", out}).code, 2);
  EXPECT_EQ(RunCommand({"review", "merge", kAs1, kAs1, "-o", out}).code, 2);
}

TEST(ReviewVerb, MergeKeepsBothAndListsConflicts) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml"), mine = directory.Path("mine.xml"),
                    theirs = directory.Path("theirs.xml"), other = directory.Path("other.xml");
  const auto set = [&](const std::string& inOnly, const std::string& inStatus,
                       const std::string& inTarget) {
    RunCommand({"review", "set", kAs1, "--only", inOnly, "--status", inStatus, "-o", inTarget});
  };
  set("product=nut_1", "irrelevant", mine);
  set("product=plate", "relevant", theirs);
  ASSERT_EQ(RunCommand({"review", "merge", kAs1, mine, kAs1, "-o", out}).code, 0);
  EXPECT_TRUE(ReadFile(out) == ReadFile(mine));
  set("product=nut_1", "relevant", other);
  const CommandResult conflict =
      RunCommand({"review", "merge", kAs1, mine, other, "--json", "-o", out});
  EXPECT_EQ(conflict.code, 3);
  const auto conflicts = nlohmann::json::parse(conflict.out);
  ASSERT_FALSE(conflicts.empty());
  EXPECT_EQ(conflicts[0]["what"], "status");
  EXPECT_EQ(conflicts[0]["mine"], "Irrelevant");
  EXPECT_EQ(conflicts[0]["theirs"], "Relevant");
  EXPECT_EQ(
      RunCommand({"review", "merge", kAs1, mine, other, "--prefer", "theirs", "-o", out}).code, 0);
  EXPECT_EQ(RunCommand({"diff", other, out, "--exit-code"}).code, 0);
}

TEST(ReviewVerb, ApplyTakesInAReviewFile) {
  const TemporaryDirectory directory;
  const std::string out = directory.Path("out.xml");
  const auto entries = Json({"diff", kAs1, kAs1, "--json"})["persisting"];
  const std::string review = directory.Write(
      "review.json", R"({"format":"zorlyra-review/1","entries":[{"id":")" +
                         entries[4]["id"].get<std::string>() +
                         R"(","index":5,"status":"Irrelevant","comment":"seen\nagain"}]})");
  ASSERT_EQ(RunCommand({"review", "apply", kAs1, review, "-o", out}).code, 0);
  const auto record = Json({"show", out, "5", "--json"});
  EXPECT_EQ(record["status"], "Irrelevant");
  EXPECT_EQ(record["comment"], "seen\nagain");
  EXPECT_EQ(RunCommand({"review", "apply", kAs1, kAs1, "-o", out}).code, 1);
}

TEST(RulesVerb, SaysWhatEachRuleDid) {
  const TemporaryDirectory directory;
  const std::string rules = directory.Write(
      "rules.toml",
      "[[accept]]\nname='nuts'\nreason='thread'\npart='nut'\n[[accept]]\nname='moon'\n"
      "reason='far'\npart='moon'\n");
  const CommandResult result =
      RunCommand({"rules", kAs1, "--rules", rules, "-o", directory.Path("out.xml")});
  EXPECT_EQ(result.code, 0) << result.error;
  EXPECT_THAT(result.out, HasSubstr("moon  matched nothing"));
  const std::string wrong =
      directory.Write("wrong.toml", "[[accept]]\nname='x'\nreason='y'\ncolour='z'\n");
  const CommandResult refused =
      RunCommand({"rules", kAs1, "--rules", wrong, "-o", directory.Path("out.xml")});
  EXPECT_EQ(refused.code, 1);
  EXPECT_THAT(refused.error, HasSubstr("wrong.toml:4:1: unknown key \"colour\""));
}

// By validators that others wrote; tests/support/schemas says where the schemas come from.
CommandResult ValidateJUnit(const std::string& inPath) {
  return RunShell("xmllint --noout --schema " ZOR_SOURCE_DIR "/tests/support/schemas/junit.xsd '" +
                  inPath + "'");
}
CommandResult ValidateSarif(const std::string& inPath) {
  return RunShell("/usr/bin/python3 -W ignore -m jsonschema -i '" + inPath +
                  "' " ZOR_SOURCE_DIR "/tests/support/schemas/sarif-2.1.0-rtm.5.json");
}

TEST(GateVerb, ReportsAreValid) {
  const TemporaryDirectory directory;
  const std::string junit = directory.Path("gate.xml"), sarif = directory.Path("gate.sarif");
  const std::string policies[] = {
      "[[limit]]\nname='a < b & \"c\"'\n[[limit]]\nname='open'\nlevel='warning'\nmax=2\n"
      "[[limit]]\nname='kept'\nmax=99\n",
      "max-not-comparable=0\n[[limit]]\nname='new'\nclass=['new','changed']\n"};
  const std::string empty =
      directory.Write("empty 1.xml", "<ClashElement><ClashResult/></ClashElement>");
  for (const std::string& policy : policies)
    for (const std::string& result : {std::string(kAs1), std::string(kDissonance), empty}) {
      RunCommand({"gate", result, "--policy", directory.Write("policy.toml", policy), "--baseline",
                  kAs1, "--report", "junit=" + junit, "--report", "sarif=" + sarif});
      EXPECT_EQ(ValidateJUnit(junit).code, 0) << result << ReadFile(junit);
      const CommandResult validated = ValidateSarif(sarif);
      EXPECT_EQ(validated.code, 0) << result << validated.out << validated.error;
    }
  std::string text = ReadFile(sarif);
  text.replace(text.find("\"version\""), 9, "\"edition\"");
  EXPECT_NE(ValidateSarif(directory.Write("bad.sarif", text)).code, 0);
  text = ReadFile(junit);
  text.replace(text.find(" tests="), 7, " checks=");
  EXPECT_NE(ValidateJUnit(directory.Write("bad.xml", text)).code, 0);
}

TEST(GateVerb, ExitCodesAndReportsOfOneRun) {
  const TemporaryDirectory directory;
  const auto policy = [&](const std::string& inText) {
    return directory.Write("policy.toml", inText);
  };
  const std::string junit = directory.Path("gate.xml"), sarif = directory.Path("gate.sarif");
  const CommandResult failed =
      RunCommand({"gate", kAs1, "--policy", policy("[[limit]]\nname='none'\n"), "--report",
                  "junit=" + junit, "--report", "sarif=" + sarif});
  EXPECT_EQ(failed.code, 3) << failed.error;
  EXPECT_THAT(failed.out, HasSubstr("FAILED  none: 29 found"));
  EXPECT_THAT(ReadFile(junit), HasSubstr("failures=\"1\""));
  EXPECT_EQ(nlohmann::json::parse(ReadFile(sarif))["runs"][0]["results"].size(), 32);
  EXPECT_EQ(RunCommand({"gate", kAs1, "--policy", policy("[[limit]]\nname='l'\nmax=32\n")}).code,
            0);
  EXPECT_EQ(RunCommand({"gate", kAs1, "--policy", policy("[[limit]]\nname='l'\nmin=32\n")}).code,
            1);
  const std::string onNew = policy("[[limit]]\nname='l'\nclass='new'\n");
  EXPECT_EQ(RunCommand({"gate", kAs1, "--policy", onNew}).code, 2);
  EXPECT_EQ(RunCommand({"gate", kAs1, "--policy", onNew, "--baseline", kAs1}).code, 0);
  const std::string empty =
      directory.Write("empty.xml", "<ClashElement><ClashResult/></ClashElement>");
  const CommandResult nothing = RunCommand({"gate", empty, "--policy", onNew, "--baseline", kAs1});
  EXPECT_EQ(nothing.code, 1);
  EXPECT_THAT(nothing.out, HasSubstr("nothing was checked"));
}
