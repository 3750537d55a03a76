// Clash results computed from CAD models, from a shell.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>

#include "tools/Command.h"

using testing::AllOf;
using testing::HasSubstr;
using testing::Not;

namespace {

const std::string kModel = "samples/as1-oc-214.stp";

std::string BytesOf(const std::string& inPath) {
  std::ifstream stream(inPath, std::ios::binary);
  return {std::istreambuf_iterator<char>(stream), {}};
}

TEST(Detect, ResultReadsAsAnyOther) {
  const CommandResult detected = RunCommand({"detect", kModel, "-o", "-"});
  ASSERT_EQ(detected.code, 0) << detected.error;
  EXPECT_THAT(detected.out, AllOf(HasSubstr("NbInterf=\"32\""), Not(HasSubstr("NotChecked"))));
  TemporaryDirectory directory;
  const std::string result = directory.Path("as1.clash.xml");
  const CommandResult written = RunCommand({"detect", kModel, "-o", result});
  EXPECT_EQ(written.out, "0 clashes, 32 contacts, 0 clearances between 18 products\n");
  const CommandResult list = RunCommand({"list", "--type", "contact", result});
  EXPECT_EQ(list.code, 0) << list.error;
  EXPECT_THAT(list.out, HasSubstr("rod-assembly_1 --++-- nut_2"));
}

TEST(Detect, AnyNumberOfJobsGivesTheSameBytes) {
  TemporaryDirectory directory;
  const std::string one = directory.Path("one.xml"), three = directory.Path("three.xml");
  ASSERT_EQ(RunCommand({"detect", kModel, "-o", one, "--jobs", "1", "--clearance", "5"}).code, 0);
  ASSERT_EQ(RunCommand({"detect", kModel, "-o", three, "--jobs", "3", "--clearance", "5"}).code, 0);
  EXPECT_EQ(BytesOf(one), BytesOf(three));
  EXPECT_FALSE(BytesOf(one).empty());
}

TEST(Detect, ViewpointsLookAtTheMiddleOfEachInterference) {
  TemporaryDirectory directory;
  const std::string one = directory.Path("one.xml"), three = directory.Path("three.xml");
  const auto detect = [](const std::string& inResult, const char* inJobs) {
    return RunCommand({"detect", kModel, "-o", inResult, "--jobs", inJobs, "--clearance", "5",
                       "--only", "*bracket*", "--viewpoints"})
        .code;
  };
  ASSERT_EQ(detect(one, "1"), 0);
  ASSERT_EQ(detect(three, "3"), 0);
  EXPECT_EQ(BytesOf(one), BytesOf(three));
  const CommandResult converted = RunCommand({"convert", one, "--to", "json"});
  const nlohmann::json document = nlohmann::json::parse(converted.out);
  const nlohmann::json& all = document["interferences"];
  EXPECT_GT(all.size(), 10u);
  const auto number = [](const nlohmann::json& inText) {
    return std::stod(inText.get<std::string>());
  };
  for (const nlohmann::json& interference : all) {
    const nlohmann::json &seen = interference["viewpoint"],
                         &points = interference["geometry"]["points"];
    EXPECT_EQ(seen["projection"], "Conic");
    const double focus = number(seen["focusDistance"]), near = number(seen["near"]);
    EXPECT_GT(near, 0);
    EXPECT_GT(focus, near);
    EXPECT_GT(number(seen["far"]), focus);
    double length = 0;
    for (std::size_t axis = 0; axis < 3; ++axis) {
      const double sight = number(seen["sight"][axis]);
      std::vector<double> along;
      for (const nlohmann::json& point : points) along.push_back(number(point[axis]));
      const auto [low, high] = std::ranges::minmax(along);
      EXPECT_NEAR(number(seen["point"][axis]) + focus * sight, (low + high) / 2, 1e-6);
      length += sight * sight;
    }
    EXPECT_NEAR(length, 1, 1e-12);
  }
}

TEST(Detect, WhatWasDecidedBeforeHolds) {
  TemporaryDirectory directory;
  const std::string result = directory.Path("as1.clash.xml");
  ASSERT_EQ(RunCommand({"detect", kModel, "-o", result, "--only", "*bracket*"}).code, 0);
  std::string decided = BytesOf(result);
  const std::string open = "Status=\"Not inspected\"", settled = "Status=\"Irrelevant\"";
  ASSERT_NE(decided.find(open), std::string::npos);
  decided.replace(decided.find(open), open.size(), settled);
  std::ofstream(result, std::ios::binary) << decided;
  const CommandResult again =
      RunCommand({"detect", kModel, "-o", result, "--only", "*bracket*", "--previous", result});
  EXPECT_EQ(again.code, 0) << again.error;
  const std::string bytes = BytesOf(result);
  EXPECT_THAT(bytes, AllOf(HasSubstr(settled), HasSubstr(open), HasSubstr("RetrieveInf=\"Old\"")));
  EXPECT_EQ(bytes.find(settled), bytes.rfind(settled));
  EXPECT_EQ(RunCommand({"detect", kModel, "-o", "/dev/null", "--previous", "no/such.xml"}).code, 1);
}

TEST(Detect, SelectionsNarrowTheSearch) {
  const auto summary = [](const char* option, const char* value) {
    return RunCommand({"detect", kModel, "-o", "/dev/null", option, value}).out;
  };
  EXPECT_EQ(summary("--only", "*bolt_*"),
            "0 clashes, 0 contacts, 0 clearances between 6 products\n");
  EXPECT_EQ(summary("--ignore", "nut"),
            "0 clashes, 16 contacts, 0 clearances between 10 products\n");
  EXPECT_EQ(summary("--level", "1"), "0 clashes, 4 contacts, 0 clearances between 4 products\n");
  const CommandResult between =
      RunCommand({"detect", kModel, "-o", "-", "--between", "plate", "l-bracket"});
  EXPECT_THAT(between.out, AllOf(HasSubstr("NbInterf=\"2\""), Not(HasSubstr("ShapeName=\"nut\""))));
}

TEST(Detect, EmptySelectionIsToldAsSuch) {
  const CommandResult result = RunCommand({"detect", kModel, "-o", "/dev/null", "--only", "none"});
  EXPECT_EQ(result.code, 1);
  EXPECT_THAT(result.error, HasSubstr("no product is selected"));
}

TEST(Detect, ImpossibleLengthsAreWrongUsage) {
  for (const char* length : {"nan", "-1", "inf", "1mm", "", "1e999"})
    EXPECT_EQ(
        RunCommand({"detect", kModel, "-o", "/dev/null", "--tolerance=" + std::string(length)})
            .code,
        2)
        << length;
  EXPECT_EQ(
      RunCommand({"detect", kModel, "-o", "/dev/null", "--contact-gap", "2", "--clearance", "1"})
          .code,
      2);
  EXPECT_EQ(RunCommand({"detect", kModel, "-o", "/dev/null", "--level", "0"}).code, 2);
  EXPECT_EQ(RunCommand({"detect", kModel, "-o", "/dev/null", "--jobs", "0"}).code, 2);
  EXPECT_EQ(RunCommand({"detect", kModel, "-o", "/dev/null", "--sheets", "fold"}).code, 2);
}

TEST(Detect, MissingModelLeavesTheOldResult) {
  TemporaryDirectory directory;
  const std::string result = directory.Path("old.xml");
  std::ofstream(result) << "old";
  const CommandResult detected = RunCommand({"detect", "no/such.stp", "-o", result});
  EXPECT_EQ(detected.code, 1);
  EXPECT_THAT(detected.error, HasSubstr("no/such.stp: does not exist"));
  EXPECT_EQ(BytesOf(result), "old");
}

TEST(Detect, NothingToCheckIsAFailure) {
  TemporaryDirectory directory;
  const std::string model = directory.Path("one.stl");
  std::ofstream(model) << "solid one\nfacet normal 0 0 1\nouter loop\nvertex 0 0 0\n"
                          "vertex 1 0 0\nvertex 0 1 0\nendloop\nendfacet\nendsolid one\n";
  const CommandResult detected = RunCommand({"detect", model, "-o", "/dev/null"});
  EXPECT_EQ(detected.code, 1);
}

}  // namespace
