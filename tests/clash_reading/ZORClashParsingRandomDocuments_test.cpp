// Answers about random documents and about random changes of them, compared with answers that are
// worked out on another parser's tree by walking through all of it.
#include <gtest/gtest.h>

#include <cstdint>
#include <map>
#include <random>
#include <string>
#include <vector>

#include "clash_reading/Answers.h"
#include "support/LoadedReader.h"
#include "support/PlatformFolder.h"
#include "support/ScopedVariable.h"

namespace clash_reading_test {
namespace {

using support::PlatformFolder;
using support::ScopedVariable;
using support::SharedReader;

/// The same numbers on every system.
class Chance {
 public:
  explicit Chance(std::uint32_t inSeed) : engine_(inSeed) {}
  int Below(int inEnd) { return static_cast<int>(engine_() % static_cast<std::uint32_t>(inEnd)); }
  bool Percent(int inPercent) { return Below(100) < inPercent; }
  const char* OneOf(const std::vector<const char*>& inTexts) {
    return inTexts[static_cast<std::size_t>(Below(static_cast<int>(inTexts.size())))];
  }

 private:
  std::mt19937 engine_;
};

const std::vector<const char*> kNumbers = {"1,5", "2.5", "-3",   "1,2,3", "",
                                           "x",   "0",   "-1e3", "-0,25", " 7"};
const std::vector<const char*> kCounts = {"0", "1", "2", "3", "4", "2.7", "abc", "", "-1", "1e1"};
const std::vector<const char*> kNames = {"a", "b", "n1", "n2", "", "r --++-- s --++-- t", "é 🔩"};
const std::vector<const char*> kTypes = {"Clash", "Collision",   " Contact ",
                                         "Jeu",   "Penetration", ""};
const std::vector<const char*> kStatuses = {"Relevant",   "Irrelevant",    "Not inspected",
                                            "Pertinent",  "Non pertinent", "",
                                            " Relevant ", "Non inspecté"};
const std::vector<const char*> kAges = {"Old", "New", "Ancien", " Nouveau", "later", ""};
const std::vector<const char*> kPictures = {"../p.jpg", "p.jpg", "", "../../p.jpg"};
const std::vector<const char*> kColumns = {"Rx", "Ry", "Rz", "Sight", "Up", ""};
const std::vector<const char*> kModes = {"", "KORVAPDM", "other"};
const std::vector<const char*> kAttributeTypes = {"Feature", "String", "", "feature"};

/// What an element may hold, and how the attributes of each name are chosen.
struct Grammar {
  std::map<std::string, std::vector<const char*>> children;
  std::map<std::string, std::vector<const char*>> attributes;
};

const Grammar& ClashGrammar() {
  static const std::vector<const char*> kRootChildren = {
      "ClashResult",    "ClashResult", "ClashResult", "Interference", "Date",      "ClashSpec",
      "ProductsInSpec", "Elements",    "Error",       "Component",    "Component", "Box"};
  static const Grammar grammar = {
      {{"ClashElement", kRootChildren},
       {"InterferenceElement", kRootChildren},
       {"FederatorClashElement", kRootChildren},
       {"Components", kRootChildren},
       {"Errors", kRootChildren},
       {"Drawing", kRootChildren},
       {"ClashResult", {"Interference", "Interference", "Interference", "interference", "Box"}},
       {"Interference",
        {"Product", "Product", "Product", "ViolatedRule", "GeometricAspect", "Comment", "Picture",
         "Picture", "Picture", "Box"}},
       {"Product", {"Matrix"}},
       {"Matrix", {"Point", "Vector", "Vector", "Vector"}},
       {"GeometricAspect", {"Point", "Point", "Viewpoint", "Vector"}},
       {"Viewpoint", {"Point", "Vector", "Vector"}},
       {"ProductsInSpec", {"Specification", "Specification", "Box"}},
       {"Specification", {"ProdListe1", "ProdListe2", "Box"}},
       {"Elements", {"Element", "Box"}},
       {"Component", {"ComponentAttributes", "ComponentShapes", "ShapePosition", "Box"}},
       {"ComponentAttributes", {"ComponentAttribute", "ComponentAttribute", "Box"}},
       {"ComponentShapes", {"ComponentShape", "Box"}},
       {"ShapePosition", {"Rx", "Ry", "Rz", "T"}},
       {"Box", {"Interference", "ClashResult"}}},
      {{"Name", kNames},
       {"Id", kNames},
       {"Alias", kNames},
       {"DescriptionID", kNames},
       {"ShapeName", kNames},
       {"Preview", kPictures},
       {"HRef", kPictures},
       {"NbInterf", kCounts},
       {"ErrorId", kCounts},
       {"Value", kNumbers},
       {"Clearance", kNumbers},
       {"DistanceClearance", kNumbers},
       {"IntersectCurveLength", kNumbers},
       {"ExtractOrDistValue", kNumbers},
       {"FocusDistance", kNumbers},
       {"NearPlane", kNumbers},
       {"ProjectionType", kNumbers},
       {"Ux", kNumbers},
       {"Uy", kNumbers},
       {"Uz", kNumbers},
       {"Vx", kNumbers},
       {"Vy", kNumbers},
       {"Vz", kNumbers},
       {"ResultType", kTypes},
       {"Status", kStatuses},
       {"RetrieveInf", kAges},
       {"CorrespondingData", kColumns},
       {"ProcessMode", kModes},
       {"AttrType", kAttributeTypes}}};
  return grammar;
}

// The names that an element of each kind carries; each is left out now and then.
std::vector<const char*> AttributeNames(const std::string& inElement) {
  static const std::map<std::string, std::vector<const char*>> known = {
      {"ClashResult", {"Name", "ComputationCase", "NbInterf"}},
      {"Interference",
       {"Name", "Value", "ResultType", "DistanceClearance", "Status", "RetrieveInf"}},
      {"ViolatedRule", {"Name", "Clearance", "TypeCalc", "Severity", "PenetrationCandidate"}},
      {"Product",
       {"DescriptionID", "Alias", "Alien", "ProcessMode", "ShapeName", "ShapeSource", "Preview"}},
      {"GeometricAspect", {"IntersectCurveLength", "ExtractOrDistValue"}},
      {"Viewpoint", {"FocusDistance", "NearPlane", "FarPlane", "ProjectionType"}},
      {"Vector", {"CorrespondingData", "Vx", "Vy", "Vz"}},
      {"Comment", {"Value"}},
      {"Picture", {"HRef"}},
      {"Error", {"Message", "ErrorId"}},
      {"Component", {"Alias", "ComponentType", "Name"}},
      {"ComponentAttribute", {"Name", "AttrType", "AttrValue"}},
      {"ComponentShape", {"ShapeName", "ShapeType"}},
      {"Element",
       {"Link", "FirstProductName", "SecondProductName", "FirstProductId", "SecondProductId",
        "FirstProductURL", "SecondProductURL"}},
      {"Date", {"Id"}},
      {"ClashSpec", {"Id"}},
      {"Elements", {"Id"}}};
  const auto found = known.find(inElement);
  if (found != known.end()) return found->second;
  if (inElement == "Point" || inElement == "T" || (inElement.size() == 2 && inElement[0] == 'R'))
    return {"Ux", "Uy", "Uz"};
  if (inElement.rfind("ProdListe", 0) == 0)
    return {"Alias", "Alien", "ShapeName", "DisplayableID", "DocumentVersion"};
  return {"Version", "ZORDocument", "Responsible", "PRCName", "ServerMarker", "Transaction"};
}

std::string AttributeValue(Chance& ioChance, const std::string& inName) {
  const auto found = ClashGrammar().attributes.find(inName);
  return found != ClashGrammar().attributes.end() ? ioChance.OneOf(found->second)
                                                  : ioChance.OneOf({"", "v1", "v,2"});
}

std::string OddNode(Chance& ioChance) {
  return ioChance.OneOf({"\n  ", "<!-- Interference -->", "<?Interference p?>", "text",
                         "<![CDATA[<Interference/>]]>"});
}

std::string RandomElement(Chance& ioChance, const std::string& inName, int inDepth) {
  std::string text = "<" + inName;
  for (const char* name : AttributeNames(inName))
    if (ioChance.Percent(70))
      text += " " + std::string(name) + "=\"" + AttributeValue(ioChance, name) + "\"";
  if (inName == "Interference" && ioChance.Percent(30)) text += " ResultTypeNoNLS=\"neutral\"";
  text += ">";
  const auto content = ClashGrammar().children.find(inName);
  if (content != ClashGrammar().children.end() && inDepth < 6) {
    const int least = inDepth == 0 ? 3 : inName == "Interference" ? 2 : 0;
    const int count = least + ioChance.Below(inDepth == 0 ? 12 : 6);
    for (int i = 0; i < count; ++i) {
      if (ioChance.Percent(30)) {
        const std::string odd = OddNode(ioChance);
        text += odd;
        // Two texts side by side are one text.
        if (odd == "text" || odd == "\n  ") text += "<Between/>";
      }
      text += RandomElement(ioChance, ioChance.OneOf(content->second), inDepth + 1);
    }
  }
  return text + "</" + inName + ">";
}

std::string RandomDocument(Chance& ioChance) {
  return RandomElement(ioChance,
                       ioChance.OneOf({"ClashElement", "ClashElement", "ClashElement",
                                       "ClashElement", "InterferenceElement",
                                       "FederatorClashElement", "Components", "Errors", "Drawing"}),
                       0);
}

/// How often questions were answered with something, so that nobody compares nothing with nothing.
class Representative {
 public:
  void Count(const Answers& inAnswers) {
    for (const auto& [question, answer] : inAnswers) {
      const std::string kind = question.substr(0, question.find_first_of("(["));
      ++asked_[kind];
      if (answer != "none" && answer != kBefore && answer != "|" && answer != "") ++answered_[kind];
    }
  }
  void ExpectBetween(const std::string& inKind, int inLeast, int inMost) {
    ASSERT_GT(asked_[inKind], 0) << inKind;
    const int percent = 100 * answered_[inKind] / asked_[inKind];
    EXPECT_GE(percent, inLeast) << inKind;
    EXPECT_LE(percent, inMost) << inKind;
  }

 private:
  std::map<std::string, int> asked_, answered_;
};

class RandomDocuments : public testing::TestWithParam<const char*> {
 protected:
  RandomDocuments() { folder_.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n"); }

  Answers Compare(SharedReader& ioReader, const pugi::xml_node& inRoot,
                  const std::string& inWhere) {
    const Ranges ranges = RangesOf(inRoot);
    const Answers expected = NaiveAnswers(inRoot, support::Text(ioReader.kind), ranges, GetParam());
    ExpectSameAnswers(expected, ReaderAnswers(*ioReader, ioReader.root, ranges), inWhere);
    return expected;
  }

 private:
  PlatformFolder folder_;
  ScopedVariable language_{"ZOR_LANG", GetParam()};  // which the folder has set to English
  ScopedVariable catalogues_{"ZOR_CATALOGUE_PATH", ZOR_SOURCE_DIR "/resources/catalogues"};
};

TEST_P(RandomDocuments, AllAnswers) {
  Representative representative;
  for (std::uint32_t seed = 1; seed <= 80; ++seed) {
    Chance chance(seed);
    const std::string text = RandomDocument(chance);
    const pugi::xml_document parsed = Parsed(text);
    SharedReader reader(text);
    representative.Count(
        Compare(reader, parsed.document_element(), "seed " + std::to_string(seed)));
    if (HasFailure()) FAIL() << text;
  }
  representative.ExpectBetween("ith", 30, 70);
  representative.ExpectBetween("preview", 15, 70);
  representative.ExpectBetween("valid", 15, 70);
  representative.ExpectBetween("rebuild aliases", 30, 70);
}

// ---- Changes, made to both trees alike

/// The places of the children to go down, from the root.
using Path = std::vector<int>;

pugi::xml_node At(pugi::xml_node inRoot, const Path& inPath) {
  for (int place : inPath) {
    inRoot = inRoot.first_child();
    for (; place > 0; --place) inRoot = inRoot.next_sibling();
  }
  return inRoot;
}

DOM_Node At(DOM_Node inRoot, const Path& inPath) {
  for (const int place : inPath)
    inRoot = inRoot.getChildNodes().item(static_cast<unsigned int>(place));
  return inRoot;
}

void CollectPaths(const pugi::xml_node& inNode, const Path& inPath,
                  std::vector<Path>& outElements) {
  if (inNode.type() != pugi::node_element) return;
  outElements.push_back(inPath);
  int place = 0;
  for (const pugi::xml_node& child : inNode.children()) {
    Path path = inPath;
    path.push_back(place++);
    CollectPaths(child, path, outElements);
  }
}

/// One change at a time of a document that is there twice.
class Changing {
 public:
  Changing(Chance& ioChance, const pugi::xml_node& inTwin, SharedReader& ioReader)
      : chance_(ioChance), twin_(inTwin), reader_(ioReader) {}

  void Change() {
    std::vector<Path> paths;
    CollectPaths(twin_, {}, paths);
    const Path path =
        paths[static_cast<std::size_t>(chance_.Below(static_cast<int>(paths.size())))];
    switch (chance_.Below(6)) {
      case 0:
        return SetAttribute(path);
      case 1:
        return RemoveAttribute(path);
      case 2:
        return AppendElement(path);
      case 3:
        return Rename(path);
      case 4:
        return MoveToFront(path);
      default:
        return Remove(path);
    }
  }

 private:
  void SetAttribute(const Path& inPath) {
    pugi::xml_node twin = At(twin_, inPath);
    const std::vector<const char*> names = AttributeNames(twin.name());
    const char* const name = chance_.OneOf(names);
    const std::string value = AttributeValue(chance_, name);
    if (!twin.attribute(name)) twin.append_attribute(name);
    twin.attribute(name).set_value(value.c_str());
    DOM_Element(At(reader_.root, inPath)).setAttribute(name, value.c_str());
  }

  void RemoveAttribute(const Path& inPath) {
    pugi::xml_node twin = At(twin_, inPath);
    const char* const name = chance_.OneOf(AttributeNames(twin.name()));
    twin.remove_attribute(name);
    DOM_Element(At(reader_.root, inPath)).removeAttribute(name);
  }

  void AppendElement(const Path& inPath) {
    pugi::xml_node twin = At(twin_, inPath);
    const auto content = ClashGrammar().children.find(twin.name());
    if (content == ClashGrammar().children.end()) return;
    const std::string text = RandomElement(chance_, chance_.OneOf(content->second), 3);
    const pugi::xml_document parsed = Parsed(text);
    twin.append_copy(parsed.document_element());
    const SharedReader other(text);
    At(reader_.root, inPath).appendChild(reader_.document.importNode(other.root, true));
  }

  // An element of another name takes the place, the attributes and the children.
  void Rename(const Path& inPath) {
    if (inPath.empty()) return;
    pugi::xml_node twin = At(twin_, inPath);
    const char* const name = chance_.OneOf(
        {"Interference", "ClashResult", "Product", "Box", "Specification", "ComponentShape"});
    DOM_Node own = At(reader_.root, inPath);
    DOM_Element renamed = reader_.document.createElement(name);
    for (const pugi::xml_attribute& attribute : twin.attributes())
      renamed.setAttribute(attribute.name(), attribute.value());
    own.getParentNode().replaceChild(renamed, own);
    while (own.hasChildNodes()) renamed.appendChild(own.getFirstChild());
    twin.set_name(name);
  }

  void MoveToFront(const Path& inPath) {
    if (inPath.empty() || inPath.back() == 0) return;
    pugi::xml_node twin = At(twin_, inPath);
    twin.parent().prepend_move(twin);
    DOM_Node own = At(reader_.root, inPath);
    DOM_Node parent = own.getParentNode();
    parent.insertBefore(own, parent.getFirstChild());
  }

  void Remove(const Path& inPath) {
    if (inPath.empty()) return;
    pugi::xml_node twin = At(twin_, inPath);
    twin.parent().remove_child(twin);
    DOM_Node own = At(reader_.root, inPath);
    own.getParentNode().removeChild(own);
  }

  Chance& chance_;
  pugi::xml_node twin_;
  SharedReader& reader_;
};

TEST_P(RandomDocuments, AllAnswersAfterEachChange) {
  Representative representative;
  for (std::uint32_t seed = 1001; seed <= 1020; ++seed) {
    Chance chance(seed);
    const std::string text = RandomDocument(chance);
    pugi::xml_document parsed = Parsed(text);
    SharedReader reader(text);
    Changing changing(chance, parsed.document_element(), reader);
    for (int change = 1; change <= 10; ++change) {
      changing.Change();
      representative.Count(
          Compare(reader, parsed.document_element(),
                  "seed " + std::to_string(seed) + ", change " + std::to_string(change)));
      if (HasFailure()) FAIL() << text;
    }
  }
  representative.ExpectBetween("ith", 30, 70);
  representative.ExpectBetween("preview", 15, 70);
}

INSTANTIATE_TEST_SUITE_P(Language, RandomDocuments, testing::Values("en", "fr"),
                         [](const auto& inInfo) { return std::string(inInfo.param); });

}  // namespace
}  // namespace clash_reading_test
