#include "toolkit/review/Diff.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <set>

#include "toolkit/review/EditedResults.h"

namespace {

using namespace ZORToolkit;
using namespace review_tests;
using testing::ElementsAre;
using testing::HasSubstr;

const DiffEntry& OfNew(const ResultDiff& inDiff, int inPosition) {
  return *std::ranges::find(inDiff.entries, inPosition, &DiffEntry::newPosition);
}

std::vector<std::string> KindsOfChange(const DiffEntry& inEntry) {
  std::vector<std::string> kinds;
  for (const Change& change : inEntry.changes) kinds.emplace_back(change.what);
  return kinds;
}

/// A bolt in a plate.
TestResult OnePair() {
  TestResult result;
  result.products = {{"a --++-- bolt_1", "bolt", {0, 0, 0}},
                     {"a --++-- plate_1", "plate", {5, 0, 0}}};
  result.interferences = {{.truth = 0, .first = 0, .second = 1, .place = {1, 2, 3}}};
  return result;
}

// Reading

std::vector<std::string> SamplePaths() {
  std::vector<std::string> paths;
  for (const char* const folder : {"/samples", "/tests/golden/inputs"})
    for (const auto& entry :
         std::filesystem::directory_iterator(std::string(ZOR_SOURCE_DIR) + folder))
      if (entry.path().extension() == ".xml") paths.push_back(entry.path().string());
  return paths;
}

/// @return how many interferences were compared.
int CompareWithInterferenceRecords(ClashDocument& ioDocument) {
  const ReviewedResult result = ReadForReview(ioDocument);
  std::size_t i = 0;
  ForEachInterference(ioDocument, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
    ASSERT_LT(i, result.interferences.size());
    const ReviewRecord& record = result.interferences[i++];
    EXPECT_EQ(inRecord.index, record.index);
    EXPECT_EQ(inRecord.type, record.type);
    EXPECT_EQ(inRecord.value.text, record.value.text);
    EXPECT_EQ(inRecord.value.value, record.value.Value());
    EXPECT_EQ(inRecord.clearance.text, record.clearance.text);
    EXPECT_EQ(inRecord.clearance.value, record.clearance.Value());
    EXPECT_EQ(inRecord.rule.name, record.rule);
    EXPECT_EQ(inRecord.comment, record.comment);
    if (inRecord.status != "error") {
      EXPECT_EQ(inRecord.status, record.status);
    }
    EXPECT_EQ(inRecord.computationCase,
              result.computationCases[static_cast<std::size_t>(record.computationCase)]);
    for (std::size_t k = 0; k < 2; ++k) {
      const ProductRecord& product = inRecord.products[k];
      ASSERT_EQ(product.exists, record.products[k] >= 0);
      if (!product.exists) continue;
      const ReviewProduct& itself = result.products[static_cast<std::size_t>(record.products[k])];
      EXPECT_EQ(product.id, itself.id);
      const auto placement = result.PlacementOf(record.productElements[k]);
      if (product.whyMisread.empty() && placement) {
        EXPECT_EQ(product.placement, *placement);
      }
    }
    Position sum{};
    int count = 0;
    for (const NumberTriple& point : inRecord.points) {
      if (!point[0].value || !point[1].value || !point[2].value) continue;
      for (std::size_t k = 0; k < 3; ++k) sum[k] += *point[k].value;
      ++count;
    }
    const std::optional<Position> place = result.PlaceOf(record);
    ASSERT_EQ(count > 0, place.has_value());
    for (std::size_t k = 0; k < 3 && place; ++k) EXPECT_EQ(sum[k] / count, (*place)[k]);
  });
  EXPECT_EQ(i, result.interferences.size());
  return static_cast<int>(i);
}

TEST(ReviewRecords, SayWhatTheInterferenceRecordsSay) {
  int compared = 0;
  for (const std::string& path : SamplePaths()) {
    ClashDocument document(path);
    if (document.HasInterferences()) compared += CompareWithInterferenceRecords(document);
  }
  EXPECT_GT(compared, 1500);
}

/// What readers of results meet once in a while: elements that are missing, empty, there twice or
/// in another order, numbers of all kinds, texts beyond ASCII.
class OddResults {
 public:
  explicit OddResults(unsigned inSeed) : random_(inSeed) {}

  std::string Xml() {
    std::string xml = "<ClashElement Version='1.2'>\n";
    for (int set = 0; set < 3; ++set) {
      xml += Below(2) ? "<ClashResult ComputationCase='" + Text() + "'>" : "<ClashResult>";
      for (int i = Below(20); i > 0; --i) xml += Interference();
      xml += "</ClashResult>\n";
    }
    return xml + "</ClashElement>";
  }

 private:
  int Below(int inLimit) { return static_cast<int>(random_() % static_cast<unsigned>(inLimit)); }
  template <std::size_t kCount>
  std::string OneOf(const char* const (&inTexts)[kCount]) {
    return inTexts[Below(kCount)];
  }
  std::string Text() { return OneOf({"", "a", "a --++-- b", "Träger", "ケーブル", "x &amp; y"}); }
  std::string Number() {
    return OneOf({"", "0", "-1.5", "2,25", "1e3", "-.5", "5.", "1.2.3", "+3", " 4",
                  "1234567890123456", "0.1234567890123456789", "-0", "x", "1e999", "12345.678",
                  "٣"});
  }
  std::string Attribute(const char* inName, const std::string& inValue) {
    return Below(5) == 0 ? "" : std::string(" ") + inName + "='" + inValue + "'";
  }
  std::string Triple(const char* inElement, const std::string& inNames, const std::string& inMore) {
    std::string xml = std::string("<") + inElement + inMore;
    for (const char axis : {'x', 'y', 'z'})
      xml += Below(30) == 0 ? "" : " " + inNames + axis + "='" + Coordinate() + "'";
    return xml + "/>";
  }
  std::string Coordinate() { return Below(8) ? std::to_string(Below(2000) * 0.25) : Number(); }
  std::string Product() {
    std::string xml = "<Product" + Attribute("DescriptionID", Text()) + Attribute("Alias", Text()) +
                      Attribute("ShapeName", Text()) + ">";
    for (int matrix = Below(8) ? 1 : Below(3); matrix > 0; --matrix) {
      xml += "<Matrix>";
      if (Below(20)) xml += Triple("Point", "U", "");
      for (const char* const column : {"Rx", "Ry", "Rz"})
        if (Below(20))
          xml += Triple("Vector", "V", std::string(" CorrespondingData='") + column + "'");
      xml += "</Matrix>";
    }
    return xml + "</Product>";
  }
  std::string Interference() {
    std::string xml = "<Interference" + Attribute("Value", Number()) +
                      Attribute("ResultType", OneOf({"Clash", "Kollision", "?"})) +
                      Attribute("ResultTypeNoNLS", OneOf({"Contact", "", "Clearance"})) +
                      Attribute("Status", OneOf({"Relevant", "Not inspected", "?"})) +
                      Attribute("DistanceClearance", Number()) + ">\n";
    for (int part = Below(8); part > 0; --part) {
      const int kind = Below(6);
      if (kind < 3) xml += Product();
      if (kind == 3) xml += "<Comment" + Attribute("Value", Text()) + "/>";
      if (kind == 4)
        xml += "<ViolatedRule" + Attribute("Name", Text()) + Attribute("Clearance", Number()) +
               Attribute("TypeCalc", Text()) + "/>";
      if (kind != 5) continue;
      xml += "<GeometricAspect>";
      for (int point = Below(4); point > 0; --point) xml += Triple("Point", "U", "");
      xml += "</GeometricAspect>";
    }
    return xml + "</Interference>\n";
  }

  std::mt19937 random_;
};

TEST(ReviewRecords, SayTheSameOfOddDocuments) {
  int compared = 0;
  for (unsigned seed = 1; seed <= 60 && !HasFailure(); ++seed) {
    SCOPED_TRACE(seed);
    ClashDocument document("odd.xml", OddResults(seed).Xml());
    compared += CompareWithInterferenceRecords(document);
  }
  EXPECT_GT(compared, 1000);
}

TEST(ReviewRecords, WordsOfOtherLanguagesAreUnderstood) {
  ClashDocument document(ZOR_SOURCE_DIR "/samples/dissonance.clash.xml");  // in French
  const ReviewedResult result = ReadForReview(document);
  EXPECT_EQ("Not inspected", result.interferences[0].status);
  EXPECT_EQ("New", result.interferences[0].retrieve);
  ASSERT_TRUE(
      result.PlacementOf(result.interferences[0].productElements[0]));  // with decimal commas
}

void CompareReadings(const TestResult& inOld, const TestResult& inNew) {
  ClashDocument was("was.xml", inOld.Xml()), is("is.xml", inNew.Xml());
  const ReviewReading all{.geometries = true, .identities = true};
  const ReviewedResult oldPlain = ReadForReview(was), newPlain = ReadForReview(is);
  const ReviewedResult oldAll = ReadForReview(was, all), newAll = ReadForReview(is, all);
  const ResultDiff expected = Diff(oldPlain, newPlain), found = Diff(oldAll, newAll);
  EXPECT_EQ(StableIds(newPlain), StableIds(newAll));
  const std::vector<std::string> oldIds = StableIds(oldPlain),
                                 ids = EntryIds(found, oldAll, newAll);
  EXPECT_EQ(EntryIds(expected, oldPlain, newPlain), ids);
  ASSERT_EQ(expected.entries.size(), found.entries.size());
  for (std::size_t i = 0; i < ids.size(); ++i) {
    const DiffEntry &one = expected.entries[i], &other = found.entries[i];
    EXPECT_EQ(std::tie(one.itsClass, one.oldPosition, one.newPosition, one.reason),
              std::tie(other.itsClass, other.oldPosition, other.newPosition, other.reason));
    EXPECT_EQ(one.changes.size(), other.changes.size());
    if (one.newPosition < 0) {
      EXPECT_EQ(oldIds[static_cast<std::size_t>(one.oldPosition)], ids[i]);
    }
  }
}

TEST(ReviewRecords, WhatIsReadAlongIsWhatTheDocumentAnswers) {
  std::mt19937 random(7);
  TestResult was = RandomResult(random, 20, 120);
  for (std::size_t i = 0; i < 20; ++i)  // of one pair, some without a place
    was.interferences.push_back(was.interferences[i % 4]);
  was.interferences.back().hasPlace = false;
  TestResult is = was;
  is.products[3].at[1] += 40;
  std::swap(is.interferences[5].first, is.interferences[5].second);
  is.interferences[6].value = "-77";
  is.interferences.erase(is.interferences.begin() + 10, is.interferences.begin() + 30);
  CompareReadings(was, is);
  CompareReadings(is, was);
}

// Identifiers

TEST(StableIds, DoNotDependOnOrderPlaceOfTheAssemblyOrWords) {
  std::mt19937 random(3);
  const TestResult was = RandomResult(random, 30, 120);
  TestResult is = was;
  for (TestProduct& product : is.products) product.at[2] += 1234.5;
  std::ranges::shuffle(is.interferences, random);
  for (TestInterference& one : is.interferences) {
    one.status = "Pertinent";
    std::replace(one.value.begin(), one.value.end(), '.', ',');
  }
  const Loaded oldOne(was), newOne(is);
  const std::vector<std::string> oldIds = StableIds(oldOne.result),
                                 newIds = StableIds(newOne.result);
  EXPECT_EQ(oldIds.size(), std::set(oldIds.begin(), oldIds.end()).size());
  for (std::size_t i = 0; i < newIds.size(); ++i)
    EXPECT_EQ(oldIds[static_cast<std::size_t>(is.interferences[i].truth)], newIds[i]);
}

TEST(StableIds, OrderOfTheTwoProductsDoesNotCount) {
  const TestResult was = OnePair();
  TestResult is = was;
  std::swap(is.interferences[0].first, is.interferences[0].second);
  is.interferences[0].place = {-4, 2, 3};  // the same place from the plate
  EXPECT_EQ(StableIds(Loaded(was).result), StableIds(Loaded(is).result));
  is.interferences[0].place = {40, 2, 3};
  EXPECT_NE(StableIds(Loaded(was).result), StableIds(Loaded(is).result));
}

TEST(StableIds, AreUniqueAmongAHundredOfOnePairWithoutGeometry) {
  TestResult result = OnePair();
  result.interferences[0].hasPlace = false;
  result.interferences.resize(100, result.interferences[0]);
  const Loaded loaded(result);
  const std::vector<std::string> ids = StableIds(loaded.result);
  EXPECT_EQ(100u, std::set(ids.begin(), ids.end()).size());
  EXPECT_EQ(1u, std::set({PairId(loaded.result, loaded.result.interferences[0]),
                          PairId(loaded.result, loaded.result.interferences[99])})
                    .size());
}

// Classes

TEST(Diff, SameResultPersists) {
  std::mt19937 random(4);
  const TestResult result = RandomResult(random, 20, 100);
  const ResultDiff diff = DiffOf(result, result);
  EXPECT_EQ(100, diff.Count(DiffClass::kPersisting));
  EXPECT_FALSE(diff.HasDifferences());
}

TEST(Diff, SamplePersistsAgainstItself) {
  for (const std::string& path : SamplePaths()) {
    ClashDocument document(path);
    if (!document.HasInterferences()) continue;
    const ReviewedResult result = ReadForReview(document);
    const ResultDiff diff = Diff(result, result);
    EXPECT_FALSE(diff.HasDifferences()) << path;
    for (const DiffEntry& entry : diff.entries) EXPECT_EQ(entry.oldPosition, entry.newPosition);
  }
}

TEST(Diff, EachChangeIsNamed) {
  const TestResult was = OnePair();
  TestResult is = was;
  is.interferences[0].type = "Contact";
  is.interferences[0].value = "0";
  is.interferences[0].rule = "R";
  is.interferences[0].status = "Relevant";
  is.interferences[0].comment = "c";
  is.products[1].at[0] = 6;
  const ResultDiff diff = DiffOf(was, is);
  EXPECT_THAT(KindsOfChange(OfNew(diff, 0)),
              ElementsAre("type", "value", "placement", "rule", "status", "comment"));
  EXPECT_EQ(DiffClass::kChanged, OfNew(diff, 0).itsClass);
  EXPECT_TRUE(OfNew(diff, 0).IsReopened());
}

TEST(Diff, ValueWithinTheTolerancePersists) {
  const TestResult was = OnePair();
  TestResult is = was;
  is.interferences[0].value = "-1,05";
  const Loaded oldOne(was), newOne(is);
  DiffOptions options;
  EXPECT_TRUE(Diff(oldOne.result, newOne.result, options).HasDifferences());
  options.tolerance = 0.05;
  EXPECT_FALSE(Diff(oldOne.result, newOne.result, options).HasDifferences());
}

TEST(Diff, MovedSubAssemblyKeepsItsInterferencesAndDecisions) {
  std::mt19937 random(5);
  const TestResult was = RandomResult(random, 14, 60);
  TestResult is = was;
  for (TestProduct& product : is.products)
    if (product.path.starts_with("assembly_1")) product.at[1] += 300;
  const ResultDiff diff = DiffOf(was, is);
  EXPECT_EQ(60, diff.Count(DiffClass::kPersisting) + diff.Count(DiffClass::kChanged));
  for (const DiffEntry& entry : diff.entries) {
    const TestInterference& one = is.interferences[static_cast<std::size_t>(entry.newPosition)];
    EXPECT_EQ(entry.oldPosition, entry.newPosition);
    const bool isFirstIn = one.first >= 7, isSecondIn = one.second >= 7;
    EXPECT_EQ(isFirstIn || isSecondIn, entry.itsClass == DiffClass::kChanged);
    EXPECT_EQ(isFirstIn != isSecondIn, entry.IsReopened());
  }
}

TEST(Diff, RenamedAndReorderedProductsAreFoundByPartAndPlacement) {
  const TestResult was = OnePair();
  TestResult is = was;
  is.products[0].path = "a --++-- screw_9";
  const ResultDiff renamed = DiffOf(was, is);
  EXPECT_FALSE(renamed.HasDifferences());
  EXPECT_THAT(renamed.entries[0].reason, HasSubstr("same part"));

  is.products[0].path = "b --++-- c --++-- bolt_1";  // moved under another assembly
  is.products[0].at[0] = 40;
  const ResultDiff moved = DiffOf(was, is);
  EXPECT_EQ(1, moved.Count(DiffClass::kChanged));
  EXPECT_THAT(moved.entries[0].reason, HasSubstr("same last name and part"));
}

TEST(Diff, EqualNamesInTwoAssembliesAreTheNearest) {
  TestResult was = OnePair();
  was.products.push_back({"b --++-- bolt_1", "bolt", {500, 0, 0}});
  was.products.push_back({"b --++-- plate_1", "plate", {505, 0, 0}});
  was.interferences.push_back({.truth = 1, .first = 2, .second = 3, .place = {1, 2, 3}});
  TestResult is = was;
  for (TestProduct& product : is.products)  // both assemblies get other names, in other order
    product.path = (product.at[0] < 100 ? "z" : "y") + product.path.substr(1);
  std::swap(is.interferences[0], is.interferences[1]);
  const ResultDiff diff = DiffOf(was, is);
  EXPECT_FALSE(diff.HasDifferences());
  EXPECT_EQ(1, OfNew(diff, 0).oldPosition);
}

TEST(Diff, SwappedEqualBoltsAreStableAndSaidToBeSo) {
  TestResult was = OnePair();
  was.products.push_back({"a --++-- bolt_2", "bolt", {50, 0, 0}});
  was.interferences.push_back({.truth = 1, .first = 2, .second = 1, .place = {1, 2, 3}});
  TestResult is = was;
  std::swap(is.products[0].at, is.products[2].at);
  const ResultDiff diff = DiffOf(was, is);
  EXPECT_EQ(2, diff.Count(DiffClass::kChanged));
  EXPECT_THAT(diff.entries[0].reason, HasSubstr("may have changed places"));
  EXPECT_EQ(0, OfNew(diff, 0).oldPosition);
}

TEST(Diff, AlikeWithoutGeometryAreTakenInOrderAndSaidToBeSo) {
  TestResult was = OnePair();
  was.interferences[0].hasPlace = false;
  was.interferences.resize(100, was.interferences[0]);
  TestResult is = was;
  is.interferences.resize(98);
  const ResultDiff diff = DiffOf(was, is);
  EXPECT_EQ(98, diff.Count(DiffClass::kPersisting));
  EXPECT_EQ(2, diff.Count(DiffClass::kResolved));
  EXPECT_THAT(diff.entries[0].reason, HasSubstr("alike"));
}

TEST(Diff, AnotherPlaceOfThePairIsAnotherInterference) {
  const TestResult was = OnePair();
  TestResult is = was;
  is.interferences[0].place = {300, 2, 3};
  const ResultDiff diff = DiffOf(was, is);
  EXPECT_EQ(1, diff.Count(DiffClass::kNew));
  EXPECT_EQ(1, diff.Count(DiffClass::kResolved));
}

TEST(Diff, EmptyResultsHaveNoDifferences) {
  TestResult empty = OnePair();
  empty.interferences.clear();
  EXPECT_FALSE(DiffOf(empty, empty).HasDifferences());
  EXPECT_EQ(1, DiffOf(OnePair(), empty).Count(DiffClass::kResolved));
  EXPECT_EQ(1, DiffOf(empty, OnePair()).Count(DiffClass::kNew));
}

// Not comparable

std::string WhyNotComparable(const TestResult& inOld, const TestResult& inNew) {
  const ResultDiff diff = DiffOf(inOld, inNew);
  EXPECT_EQ(1, diff.Count(DiffClass::kNotComparable));
  return std::string(diff.entries.empty() ? "" : diff.entries.back().reason);
}

std::string SpecificationOf(const std::string& inFirst, const std::string& inSecond) {
  return "<Specification><ProdListe1 Alias='" + inFirst + "'/><ProdListe2 Alias='" + inSecond +
         "'/></Specification>";
}

TEST(Diff, WhatTheSpecificationLacksIsNotComparable) {
  TestResult was = OnePair(), is = OnePair();
  is.interferences.clear();
  is.specification = "<ProductsInSpec>" + SpecificationOf("x", "y") + "</ProductsInSpec>";
  EXPECT_THAT(WhyNotComparable(was, is), HasSubstr("not in the new specification"));
  was.specification = "<ProductsInSpec>" + SpecificationOf("a", "a --++-- plate_1") +
                      "</ProductsInSpec>";  // an assembly stands for what is in it
  EXPECT_THAT(WhyNotComparable(was, is), HasSubstr("not in the new specification"));
  is.specification = was.specification;
  EXPECT_EQ(1, DiffOf(was, is).Count(DiffClass::kResolved));
}

TEST(Diff, SpecificationThatNeverHadThePairSaysNothing) {
  TestResult was = OnePair(), is = OnePair();
  is.interferences.clear();
  was.specification = is.specification =
      "<ProductsInSpec>" + SpecificationOf("x", "y") + "</ProductsInSpec>";
  EXPECT_EQ(1, DiffOf(was, is).Count(DiffClass::kResolved));
}

TEST(Diff, SmallerClearanceIsNotComparable) {
  TestResult was = OnePair(), is = OnePair();
  was.interferences[0].type = "Clearance";
  was.interferences[0].value = "1.5";
  is.interferences.clear();
  is.clearance = "1";
  EXPECT_THAT(WhyNotComparable(was, is), HasSubstr("clearance was 2 and is 1"));
  is.clearance = "2,0";
  EXPECT_EQ(1, DiffOf(was, is).Count(DiffClass::kResolved));
}

TEST(Diff, OtherKindsOfComputationAreNotComparable) {
  TestResult was = OnePair(), is = OnePair();
  is.interferences.clear();
  is.types = "Kontakt + Abstand";
  EXPECT_THAT(WhyNotComparable(was, is), HasSubstr("Kontakt + Abstand"));
  is.types = "Jeu + Contact + Collision";
  EXPECT_EQ(1, DiffOf(was, is).Count(DiffClass::kResolved));
  is.computationCase = "Inside one selection";
  EXPECT_THAT(WhyNotComparable(was, is), HasSubstr("Inside one selection"));
}

TEST(Diff, ProductMissingFromTheNewModelIsNotComparable) {
  const TestResult was = OnePair();
  TestResult is = was;
  is.interferences.clear();
  const Loaded oldOne(was), newOne(is);
  DiffOptions options;
  options.productsOfNewModel = {"a --++-- bolt_1"};
  const ResultDiff diff = Diff(oldOne.result, newOne.result, options);
  EXPECT_THAT(diff.entries[0].reason, HasSubstr("plate_1\" is not in the new model"));
}

TEST(Diff, SingleInterferenceDocumentResolvesNothingElse) {
  const Loaded was(OnePair());
  const Loaded is("<InterferenceElement><Interference/></InterferenceElement>");
  const ResultDiff diff = Diff(was.result, is.result);
  EXPECT_EQ(1, diff.Count(DiffClass::kNotComparable));
  EXPECT_EQ(1, diff.Count(DiffClass::kNew));
}

// Truth by construction

/// What a seeded edit makes of a result, and what is true of each interference of it.
struct Edited {
  TestResult result;
  std::map<int, std::set<std::string>> changed;  // what, by truth
  std::set<int> added, removed;
};

Edited Edit(const TestResult& inResult, std::mt19937& ioRandom) {
  Edited edited{inResult, {}, {}, {}};
  TestResult& result = edited.result;
  const auto below = [&](std::size_t inLimit) { return ioRandom() % inLimit; };
  const auto any = [&]() -> TestInterference& {
    return result.interferences[below(result.interferences.size())];
  };
  int nextTruth = 100000;
  for (int i = 0; i < 12; ++i) {
    switch (below(9)) {
      case 0: {
        const std::size_t which = below(result.interferences.size());
        const int truth = result.interferences[which].truth;
        if (!edited.added.erase(truth)) edited.removed.insert(truth);
        edited.changed.erase(truth);
        result.interferences.erase(result.interferences.begin() +
                                   static_cast<std::ptrdiff_t>(which));
        break;
      }
      case 1: {
        TestInterference one = any();
        one.truth = nextTruth++;
        one.place[1] = 5000 + 25.0 * one.truth;  // another place of the pair
        edited.added.insert(one.truth);
        result.interferences.push_back(one);
        break;
      }
      case 2: {
        TestInterference& one = any();
        one.value = std::to_string(static_cast<int>(below(900)) + 100);
        edited.changed[one.truth].insert("value");
        break;
      }
      case 3: {
        TestInterference& one = any();
        one.type = one.type == "Clash" ? "Contact" : "Clash";
        auto& kinds = edited.changed[one.truth];
        if (!kinds.erase("type")) kinds.insert("type");
        if (one.truth < 100000 &&
            one.type != inResult.interferences[static_cast<std::size_t>(one.truth)].type)
          kinds.insert("type");
        break;
      }
      case 4: {
        TestInterference& one = any();
        one.rule = "rule " + std::to_string(below(1000));
        edited.changed[one.truth].insert("rule");
        break;
      }
      case 5:
        std::ranges::shuffle(result.interferences, ioRandom);
        break;
      case 6:  // renamed, with part and placement as they were
        result.products[below(result.products.size())].path =
            "elsewhere --++-- renamed_" + std::to_string(ioRandom());
        break;
      case 7: {
        const std::size_t product = below(result.products.size());
        result.products[product].at[1] += 500;
        for (const TestInterference& one : result.interferences)
          if (one.first == static_cast<int>(product) || one.second == static_cast<int>(product))
            edited.changed[one.truth].insert("placement");
        break;
      }
      default: {  // the two products the other way round, at the same place
        TestInterference& one = any();
        std::swap(one.first, one.second);
        for (std::size_t k = 0; k < 3; ++k)
          one.place[k] += result.products[static_cast<std::size_t>(one.second)].at[k] -
                          result.products[static_cast<std::size_t>(one.first)].at[k];
      }
    }
  }
  return edited;
}

TEST(Diff, ClassesAreRightForRandomEdits) {
  std::mt19937 random(20);
  int seen[kDiffClassCount] = {};
  for (int round = 0; round < 200; ++round) {
    const TestResult was = RandomResult(random, 25, 80);
    const Edited edited = Edit(was, random);
    // Renamed and moved at once: nothing says any more which product it was.
    bool isDecidable = true;
    for (std::size_t i = 0; i < was.products.size(); ++i)
      isDecidable = isDecidable && (was.products[i].path == edited.result.products[i].path ||
                                    was.products[i].at == edited.result.products[i].at);
    if (!isDecidable) continue;
    const ResultDiff diff = DiffOf(was, edited.result);
    for (const DiffEntry& entry : diff.entries) {
      ++seen[static_cast<std::size_t>(entry.itsClass)];
      if (entry.newPosition < 0) {
        EXPECT_EQ(DiffClass::kResolved, entry.itsClass);
        EXPECT_TRUE(edited.removed.contains(entry.oldPosition)) << "round " << round;
        continue;
      }
      const int truth =
          edited.result.interferences[static_cast<std::size_t>(entry.newPosition)].truth;
      if (edited.added.contains(truth)) {
        EXPECT_EQ(DiffClass::kNew, entry.itsClass) << "round " << round;
        continue;
      }
      EXPECT_EQ(truth, entry.oldPosition) << "round " << round << ": " << entry.reason;
      const std::vector<std::string> kinds = KindsOfChange(entry);
      const auto changed = edited.changed.find(truth);
      EXPECT_EQ(changed == edited.changed.end() ? std::set<std::string>() : changed->second,
                std::set(kinds.begin(), kinds.end()))
          << "round " << round << ": " << entry.reason;
    }
  }
  EXPECT_GT(seen[0], 100);
  EXPECT_GT(seen[1], 1000);
  EXPECT_GT(seen[2], 100);
  EXPECT_GT(seen[3], 100);
}

TEST(Diff, PairWithFiveThousandOnBothSidesIsMatched) {
  std::mt19937 random(6);
  TestResult was = OnePair();
  was.interferences.resize(5000, was.interferences[0]);
  for (std::size_t i = 0; i < was.interferences.size(); ++i) {
    const std::size_t column = i % 70, row = i / 70;
    was.interferences[i].place = {20.0 * static_cast<double>(column),
                                  20.0 * static_cast<double>(row), 0};
  }
  TestResult is = was;
  for (TestInterference& one : is.interferences) one.place[2] += 0.5;
  std::ranges::shuffle(is.interferences, random);
  const ResultDiff diff = DiffOf(was, is);
  EXPECT_EQ(5000, diff.Count(DiffClass::kPersisting));
}

}  // namespace
