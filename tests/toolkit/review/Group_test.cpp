#include "toolkit/review/Group.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "toolkit/review/EditedResults.h"

namespace {

using namespace ZORToolkit;
using namespace review_tests;
using testing::ElementsAre;

/// Groups, and the result that they are of.
struct Grouped : InterferenceGroups {
  Grouped(std::shared_ptr<const Loaded> inLoaded, const GroupOptions& inOptions)
      : InterferenceGroups(GroupInterferences(inLoaded->result, inOptions)),
        loaded(std::move(inLoaded)) {}
  std::shared_ptr<const Loaded> loaded;
};

Grouped GroupsOf(const TestResult& inResult, std::vector<GroupBy> inBy, double inDistance = 50) {
  GroupOptions options;
  options.by = inBy;
  options.distance = inDistance;
  return {std::make_shared<const Loaded>(inResult), options};
}

std::vector<std::string> Labels(const GroupList& inGroups) {
  std::vector<std::string> labels;
  for (const InterferenceGroup group : inGroups) labels.push_back(group.Label());
  return labels;
}

std::vector<int> Members(const InterferenceGroup& inGroup) {
  return {inGroup.Members().begin(), inGroup.Members().end()};
}

/// Three bolts in one plate, and a rod beside it.
TestResult Bolts() {
  TestResult result;
  result.products = {{"a --++-- plate_1", "plate", {0, 0, 0}},
                     {"a --++-- bolt_1", "bolt", {0, 0, 0}},
                     {"a --++-- bolt_2", "bolt", {100, 0, 0}},
                     {"b --++-- bolt_3", "bolt", {140, 0, 0}},
                     {"b --++-- rod_1", "rod", {900, 0, 0}}};
  for (const auto& [first, second, value] :
       {std::tuple{0, 1, "-1"}, {2, 0, "-3"}, {3, 0, "-2"}, {4, 0, "x"}}) {
    TestInterference one;
    one.first = first;
    one.second = second;
    one.value = value;
    result.interferences.push_back(one);
  }
  return result;
}

TEST(Group, SamePartsInAnyOrderBelongTogether) {
  const auto groups = GroupsOf(Bolts(), {GroupBy::kParts});
  EXPECT_THAT(Labels(groups), ElementsAre("bolt x plate", "plate x rod"));
  EXPECT_THAT(Members(groups[0]), ElementsAre(0, 1, 2));
  EXPECT_EQ(1, groups[0].Representative());
  EXPECT_EQ(-3, groups[0].Worst());
  EXPECT_EQ(std::nullopt, groups[1].Worst());
  EXPECT_EQ(3, groups[1].Representative());
}

TEST(Group, GroupsAreNestedInTheOrderAsked) {
  const auto groups = GroupsOf(Bolts(), {GroupBy::kParts, GroupBy::kAssemblies, GroupBy::kPlace});
  EXPECT_THAT(Labels(groups[0].Groups()), ElementsAre("a x a", "a x b"));
  EXPECT_EQ(2u, groups[0].Groups()[0].Groups().size());  // 0 and 100 are more than 50 apart
  EXPECT_EQ(1u, groups[0].Groups()[1].Groups().size());
}

TEST(Group, PlacesAreChainsOfShortSteps) {
  const auto groups = GroupsOf(Bolts(), {GroupBy::kPlace}, 45);
  ASSERT_EQ(3u, groups.size());
  EXPECT_THAT(Members(groups[0]), ElementsAre(1, 2));
  EXPECT_EQ(2u, GroupsOf(Bolts(), {GroupBy::kPlace}, 100).size());
}

TEST(Group, ProductIsThatWithMoreInterferences) {
  const auto groups = GroupsOf(Bolts(), {GroupBy::kProduct});
  EXPECT_THAT(Labels(groups), ElementsAre("a --++-- plate_1"));
}

TEST(Group, ClustersAreThoseOfEveryPair) {
  std::mt19937 random(8);
  for (int round = 0; round < 30; ++round) {
    TestResult result = Bolts();
    result.interferences.assign(60, TestInterference(result.interferences[0]));
    for (TestInterference& one : result.interferences)
      one.place = {double(random() % 300), double(random() % 300), double(random() % 30)};
    // The naive answer: join until nothing changes.
    std::vector<int> cluster(60);
    for (std::size_t i = 0; i < 60; ++i) cluster[i] = static_cast<int>(i);
    for (bool isChanged = true; isChanged;) {
      isChanged = false;
      for (std::size_t i = 0; i < 60; ++i)
        for (std::size_t k = 0; k < 60; ++k) {
          double squared = 0;
          for (std::size_t axis = 0; axis < 3; ++axis) {
            const double step =
                result.interferences[i].place[axis] - result.interferences[k].place[axis];
            squared += step * step;
          }
          if (squared > 30 * 30 || cluster[i] == cluster[k]) continue;
          cluster[i] = cluster[k] = std::min(cluster[i], cluster[k]);
          isChanged = true;
        }
    }
    for (const InterferenceGroup group : GroupsOf(result, {GroupBy::kPlace}, 30)) {
      const int expected = cluster[static_cast<std::size_t>(group.Members()[0])];
      EXPECT_EQ(std::ranges::count(cluster, expected),
                static_cast<std::ptrdiff_t>(group.Members().size()));
      for (const int member : group.Members())
        EXPECT_EQ(expected, cluster[static_cast<std::size_t>(member)]);
    }
  }
}

TEST(Group, IsFoundByItsIdentifierAlsoInside) {
  const auto groups = GroupsOf(Bolts(), {GroupBy::kParts, GroupBy::kAssemblies});
  const InterferenceGroup inner = groups[0].Groups()[1];
  const auto found = groups.Find(inner.Id());
  ASSERT_TRUE(found);
  EXPECT_EQ("a x b", found->Label());
  EXPECT_EQ(Members(inner), Members(*found));
  EXPECT_FALSE(groups.Find("none"));
  EXPECT_FALSE(groups.Find(""));
  EXPECT_NE(groups[0].Groups()[0].Number(), inner.Number());
}

TEST(Group, EmptyResultHasNoGroups) {
  TestResult empty = Bolts();
  empty.interferences.clear();
  EXPECT_TRUE(GroupsOf(empty, {GroupBy::kParts}).empty());
}

}  // namespace
