// The JSON of every sample against records that are made here, from the file, by another XML parser
// and another reading of the same rules.
#include <gtest/gtest.h>

#include <cstdlib>
#include <map>
#include <memory>
#include <nlohmann/json.hpp>
#include <pugixml.hpp>

#include "ZORClashParsing.h"
#include "tools/Command.h"

namespace {

using Json = nlohmann::ordered_json;

std::string Text(const pugi::xml_node& inNode, const char* inName) {
  return inNode.attribute(inName).as_string();
}

std::string PointNumber(std::string inText) {
  if (const auto comma = inText.find(','); comma != std::string::npos) inText[comma] = '.';
  return inText;
}

std::string Number(const pugi::xml_node& inNode, const char* inName) {
  return PointNumber(Text(inNode, inName));
}

// Segments end at separators and, in the odd names of some models, at line feeds; empty ones do not
// count.
std::string LastSegment(std::string inPath) {
  const std::string separator = " --++-- ";
  for (auto at = inPath.find(separator); at != std::string::npos; at = inPath.find(separator))
    inPath.replace(at, separator.size(), "\n");
  const auto end = inPath.find_last_not_of('\n');
  if (end == std::string::npos) return {};
  const auto before = inPath.rfind('\n', end);
  const auto start = before == std::string::npos ? 0 : before + 1;
  return inPath.substr(start, end + 1 - start);
}

Json Triple(const pugi::xml_node& inNode, const char* inX, const char* inY, const char* inZ) {
  return Json::array({Number(inNode, inX), Number(inNode, inY), Number(inNode, inZ)});
}

// A decimal comma ends the number, which is what the reader does with placements.
double Value(const pugi::xml_node& inNode, const char* inName) {
  const std::string text = Text(inNode, inName);
  char* end = nullptr;
  const double value = std::strtod(text.c_str(), &end);
  return end == text.c_str() ? -1.0 : value;
}

Json Position(const pugi::xml_node& inMatrix) {
  Json numbers = Json::array();
  for (const char* column : {"Rx", "Ry", "Rz"}) {
    const pugi::xml_node vector =
        inMatrix.find_child_by_attribute("Vector", "CorrespondingData", column);
    for (const char* name : {"Vx", "Vy", "Vz"}) numbers.push_back(Value(vector, name));
  }
  for (const char* name : {"Ux", "Uy", "Uz"})
    numbers.push_back(Value(inMatrix.child("Point"), name));
  return numbers;
}

/// The words of the samples in the two languages that they are written in.
struct Words {
  bool french;
  std::string Type(const pugi::xml_node& inInterference) const {
    const std::string neutral = Text(inInterference, "ResultTypeNoNLS");
    if (!neutral.empty()) return neutral;
    const std::map<std::string, std::string> types = {
        {"Collision", "Clash"}, {"Contact", "Contact"}, {"Jeu", "Clearance"}};
    return types.at(Text(inInterference, "ResultType"));
  }
  std::string Status(const std::string& inWord) const {
    const std::map<std::string, std::string> english = {
        {"Relevant", "Relevant"}, {"Irrelevant", "Irrelevant"}, {"Not inspected", "Not inspected"}};
    const std::map<std::string, std::string> inFrench = {{"Pertinent", "Relevant"},
                                                         {"Non pertinent", "Irrelevant"},
                                                         {"Non inspecté", "Not inspected"}};
    const auto& words = french ? inFrench : english;
    const auto found = words.find(inWord);
    return found == words.end() ? "error" : found->second;
  }
  std::string Retrieve(const std::string& inWord) const {
    return french && inWord == "Nouveau" ? "New" : inWord;
  }
};

Json Product(const pugi::xml_node& inProduct) {
  return {{"id", Text(inProduct, "DescriptionID")},
          {"alias", Text(inProduct, "Alias")},
          {"instance", LastSegment(Text(inProduct, "DescriptionID"))},
          {"label", LastSegment(Text(inProduct, "Alias")) + " -- " + Text(inProduct, "ShapeName")},
          {"alien", Text(inProduct, "Alien")},
          {"processMode", Text(inProduct, "ProcessMode")},
          {"shape", Text(inProduct, "ShapeName")},
          {"shapeSource", Text(inProduct, "ShapeSource")},
          {"preview", Text(inProduct, "Preview")},
          {"position", Position(inProduct.child("Matrix"))}};
}

Json Viewpoint(const pugi::xml_node& inViewpoint) {
  if (!inViewpoint) return nullptr;
  return {{"projection", Text(inViewpoint, "ProjectionType")},
          {"focusDistance", Text(inViewpoint, "FocusDistance")},
          {"near", Number(inViewpoint, "NearPlane")},
          {"far", Number(inViewpoint, "FarPlane")},
          {"point", Triple(inViewpoint.child("Point"), "Ux", "Uy", "Uz")},
          {"sight", Triple(inViewpoint.child("Vector"), "Vx", "Vy", "Vz")}};
}

Json Record(const pugi::xml_node& inInterference, int inIndex, const Words& inWords) {
  const pugi::xml_node set = inInterference.parent();
  const pugi::xml_node rule = inInterference.child("ViolatedRule");
  const pugi::xml_node geometry = inInterference.child("GeometricAspect");
  const std::string ruleClearance = Number(rule, "Clearance");
  Json products = Json::array(), points = Json::array();
  for (const pugi::xml_node& product : inInterference.children("Product"))
    products.push_back(Product(product));
  for (const pugi::xml_node& point : geometry.children("Point"))
    points.push_back(Triple(point, "Ux", "Uy", "Uz"));
  return {{"index", inIndex},
          {"result", Text(set, "Name")},
          {"name", Text(inInterference, "Name")},
          {"value", Text(inInterference, "Value")},
          {"type", inWords.Type(inInterference)},
          {"clearance",
           ruleClearance.empty() ? Number(inInterference, "DistanceClearance") : ruleClearance},
          {"status", inWords.Status(Text(inInterference, "Status"))},
          {"computationCase", rule ? Text(rule, "TypeCalc") : Text(set, "ComputationCase")},
          {"retrieve", inWords.Retrieve(Text(inInterference, "RetrieveInf"))},
          {"rule",
           {{"name", Text(rule, "Name")},
            {"clearance", ruleClearance},
            {"severity", Text(rule, "Severity")},
            {"penetrationCandidate", Text(rule, "PenetrationCandidate")}}},
          {"products", products},
          {"comment", Text(inInterference.child("Comment"), "Value")},
          {"picture", Text(inInterference.child("Picture"), "HRef")},
          {"geometry",
           {{"curveLength", Number(geometry, "IntersectCurveLength")},
            {"value", Number(geometry, "ExtractOrDistValue")},
            {"points", points}}},
          {"viewpoint", Viewpoint(geometry.child("Viewpoint"))}};
}

std::vector<Json> Records(const std::string& inSample, const Words& inWords) {
  pugi::xml_document document;
  EXPECT_TRUE(document.load_file((ZOR_SOURCE_DIR "/" + inSample).c_str()));
  std::vector<Json> records;
  for (const pugi::xml_node& set : document.document_element().children("ClashResult"))
    for (const pugi::xml_node& interference : set.children("Interference"))
      records.push_back(Record(interference, static_cast<int>(records.size()) + 1, inWords));
  return records;
}

/// A record without its identifier, which no other reading knows.
std::string TextWithoutId(Json inRecord) {
  EXPECT_EQ(inRecord.at("id").get<std::string>().size(), 16u);
  inRecord.erase("id");
  return inRecord.dump();
}

void ExpectSame(const Json& inActual, const std::vector<Json>& inExpected) {
  ASSERT_EQ(inActual.size(), inExpected.size());
  ASSERT_GT(inExpected.size(), 0u);
  for (std::size_t i = 0; i < inExpected.size(); ++i)
    ASSERT_EQ(TextWithoutId(inActual[i]), inExpected[i].dump());
}

class JsonOfSample : public testing::TestWithParam<std::string> {};

}  // namespace

TEST_P(JsonOfSample, ListAgreesWithAnotherReading) {
  const CommandResult result = RunCommand({"list", "--json", GetParam()});
  ASSERT_EQ(result.code, 0) << result.error;
  ExpectSame(Json::parse(result.out), Records(GetParam(), Words{false}));
}

TEST_P(JsonOfSample, ListInFrenchAgreesWithAnotherReading) {
  const CommandResult result = RunCommand({"list", "--json", "--lang", "fr", GetParam()});
  ASSERT_EQ(result.code, 0) << result.error;
  ExpectSame(Json::parse(result.out), Records(GetParam(), Words{true}));
}

TEST_P(JsonOfSample, ConvertHoldsTheSameInterferences) {
  const CommandResult result = RunCommand({"convert", GetParam(), "--to", "json"});
  ASSERT_EQ(result.code, 0) << result.error;
  const Json whole = Json::parse(result.out);
  ExpectSame(whole.at("interferences"), Records(GetParam(), Words{false}));
  EXPECT_EQ(whole.at("info").at("interferences"), whole.at("interferences").size());
  EXPECT_EQ(whole.at("specifications").size(), 1u);
  EXPECT_EQ(whole.at("components").size(), 0u);
  EXPECT_EQ(whole.at("links").size(), 0u);
}

TEST_P(JsonOfSample, ShowOfFirstMiddleAndLastAgrees) {
  const std::vector<Json> records = Records(GetParam(), Words{false});
  for (const std::size_t number : {std::size_t{1}, records.size() / 2, records.size()}) {
    const CommandResult result = RunCommand({"show", "--json", GetParam(), std::to_string(number)});
    ASSERT_EQ(result.code, 0) << result.error;
    Json record = Json::parse(result.out);
    for (const char* const key : {"$schema", "version", "units", "tool", "filters"})
      EXPECT_EQ(record.erase(key), 1u) << key;
    EXPECT_EQ(TextWithoutId(record), records[number - 1].dump());
  }
}

TEST_P(JsonOfSample, PositionsAndIdentifiersAreThoseOfTheSessionReading) {
  std::string path = ZOR_SOURCE_DIR "/" + GetParam();
  ZORClashParsing reader(path.data());
  ZORUnicodeString kind, reference, version;
  ASSERT_EQ(reader.LoadSequence(kind, reference, version), S_OK);
  ZORListValZORUnicodeString aliases, identifiers;
  ZORMathTransformation* positions = nullptr;
  reader.GetReBuildSessionInfos(aliases, identifiers, positions);
  const std::unique_ptr<ZORMathTransformation[]> owned(positions);

  const CommandResult result = RunCommand({"list", "--json", GetParam()});
  const Json list = Json::parse(result.out);
  ASSERT_EQ(2 * list.size(), static_cast<std::size_t>(aliases.Size()));
  for (std::size_t i = 0; i < 2 * list.size(); ++i) {
    const Json& product = list[i / 2].at("products")[i % 2];
    double numbers[12];
    positions[i].GetCoefficients(numbers);
    EXPECT_EQ(product.at("position"), Json(numbers)) << i;
    EXPECT_EQ(product.at("alias"), aliases[static_cast<int>(i) + 1].ConvertToChar());
    EXPECT_EQ(product.at("id"), identifiers[static_cast<int>(i) + 1].ConvertToChar());
  }
}

TEST_P(JsonOfSample, LabelsAndPreviewsAreThoseOfTheReader) {
  std::string path = ZOR_SOURCE_DIR "/" + GetParam();
  ZORClashParsing reader(path.data());
  ZORUnicodeString kind, reference, version;
  ASSERT_EQ(reader.LoadSequence(kind, reference, version), S_OK);
  const CommandResult result = RunCommand({"list", "--json", GetParam()});
  const Json list = Json::parse(result.out);
  for (std::size_t i = 0; i < list.size(); ++i) {
    DOM_Node copy;
    ZORUnicodeString labels[2], previews[2];
    ASSERT_EQ(reader.GetithInterference(static_cast<int>(i) + 1, copy, labels[0], labels[1],
                                        previews[0], previews[1]),
              S_OK);
    for (std::size_t side = 0; side < 2; ++side) {
      const Json& product = list[i].at("products")[side];
      EXPECT_EQ(product.at("label"), labels[side].ConvertToChar());
      EXPECT_EQ(product.at("preview"), previews[side].ConvertToChar());
    }
  }
}

INSTANTIATE_TEST_SUITE_P(All, JsonOfSample, testing::ValuesIn(Samples()),
                         [](const testing::TestParamInfo<std::string>& inInfo) {
                           std::string name = inInfo.param.substr(inInfo.param.find('/') + 1);
                           name.resize(name.find('.'));
                           return name;
                         });
