#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstring>
#include <iterator>

#include "clash_reading/Answers.h"

namespace clash_reading_test {
namespace {

using Node = pugi::xml_node;
using Texts = std::vector<std::string>;
using Numbers = std::array<double, 12>;

bool IsNamed(const Node& inNode, const char* inName) {
  return inNode.type() == pugi::node_element && std::strcmp(inNode.name(), inName) == 0;
}

std::vector<Node> Children(const Node& inParent, const char* inName) {
  std::vector<Node> found;
  for (const Node& child : inParent.children())
    if (IsNamed(child, inName)) found.push_back(child);
  return found;
}

std::vector<Node> Grandchildren(const Node& inParent, const char* inChild, const char* inName) {
  std::vector<Node> found;
  for (const Node& child : Children(inParent, inChild))
    for (const Node& grandchild : Children(child, inName)) found.push_back(grandchild);
  return found;
}

Node ChildAt(const Node& inParent, int inPosition) {
  int position = 0;
  for (const Node& child : inParent.children())
    if (position++ == inPosition) return child;
  return Node();
}

int ChildCount(const Node& inParent) {
  return static_cast<int>(std::distance(inParent.begin(), inParent.end()));
}

std::string Value(const Node& inNode, const char* inName) {
  return inNode.attribute(inName).value();
}

std::string WithPoint(std::string inText) {
  const std::size_t comma = inText.find(',');
  if (comma != std::string::npos) inText[comma] = '.';
  return inText;
}

std::string PointValue(const Node& inNode, const char* inName) {
  return WithPoint(Value(inNode, inName));
}

std::string Stripped(const std::string& inText) {
  const std::size_t first = inText.find_first_not_of(' ');
  if (first == std::string::npos) return "";
  return inText.substr(first, inText.find_last_not_of(' ') + 1 - first);
}

double Number(const Node& inNode, const char* inName, double inOtherwise) {
  double number = inOtherwise;
  return std::sscanf(Value(inNode, inName).c_str(), "%le", &number) == 1 ? number : inOtherwise;
}

std::string Instance(const std::string& inIdentifier) {
  std::string text = inIdentifier;
  const std::string separator = " --++-- ";
  for (std::size_t at = text.find(separator); at != text.npos; at = text.find(separator))
    text.replace(at, separator.size(), "\n");
  std::string last, segment;
  for (const char c : text + "\n") {
    if (c != '\n') {
      segment += c;
    } else {
      if (!segment.empty()) last = segment;
      segment.clear();
    }
  }
  return last;
}

/// Works the answers out for one document.
class NaiveReader {
 public:
  NaiveReader(const Node& inRoot, const std::string& inKind, const std::string& inLanguage)
      : root_(inRoot), kind_(inKind), french_(inLanguage == "fr") {}

  Answers All(const Ranges& inRanges) {
    General();
    for (int index = -1; index <= inRanges.interferences + 2; ++index) Interference(index);
    Rebuild();
    Specifications(inRanges.specifications);
    for (int position = 0; position <= inRanges.positions; ++position)
      Component(position, inRanges.partsOfAComponent);
    Linked();
    return answers_;
  }

 private:
  void Say(const std::string& inQuestion, const std::string& inAnswer) {
    answers_.emplace_back(inQuestion, inAnswer);
  }

  // ---- words

  std::string ResultType(const Node& inInterference) const {
    if (inInterference.attribute("ResultTypeNoNLS"))
      return Value(inInterference, "ResultTypeNoNLS");
    const std::string word = Stripped(Value(inInterference, "ResultType"));
    if (word == "Clash" || word == "Collision" || word == "Kollision") return "Clash";
    if (word == "Contact" || word == "Kontakt") return "Contact";
    if (word == "Clearance" || word == "Jeu" || word == "Abstand") return "Clearance";
    return "error";
  }
  std::string Status(const Node& inInterference) const {
    const std::string word = Stripped(Value(inInterference, "Status"));
    if (word == (french_ ? "Pertinent" : "Relevant")) return "Relevant";
    if (word == (french_ ? "Non pertinent" : "Irrelevant")) return "Irrelevant";
    if (word == (french_ ? "Non inspecté" : "Not inspected")) return "Not inspected";
    return "error";
  }
  std::string Retrieve(const Node& inInterference) const {
    const std::string word = Stripped(Value(inInterference, "RetrieveInf"));
    if (word == (french_ ? "Ancien" : "Old")) return "Old";
    if (word == (french_ ? "Nouveau" : "New")) return "New";
    return word;
  }

  // ---- general information

  void General() {
    std::string date = "none", specification = "none", firstName = kBefore;
    int count = 77, firstCount = 77;
    for (const Node& child : root_.children()) {
      if (IsNamed(child, "Date")) date = Value(child, "Id");
      if (IsNamed(child, "ClashSpec")) specification = Value(child, "Id");
      if (IsNamed(child, "ClashResult"))
        std::sscanf(Value(child, "NbInterf").c_str(), "%d", &count);
    }
    Say("general", Joined({Value(root_, "Version"), Value(root_, "ZORDocument"), date,
                           specification, std::to_string(count), Value(root_, "Responsible")}));
    const std::vector<Node> resultSets = Children(root_, "ClashResult");
    if (!resultSets.empty()) {
      firstName = Value(resultSets[0], "Name");
      firstCount = static_cast<int>(Number(resultSets[0], "NbInterf", 0.0));
    }
    Say("first result", Joined({firstName, std::to_string(firstCount)}));
    const std::vector<Node> errors = Children(root_, "Error");
    int errorId = -1;
    if (!errors.empty()) std::sscanf(Value(errors[0], "ErrorId").c_str(), "%d", &errorId);
    Say("error",
        Joined({errors.empty() ? kBefore : Value(errors[0], "Message"), std::to_string(errorId)}));
    Say("root", Joined({Value(root_, "ServerMarker"), Value(root_, "Transaction"),
                        Value(root_, "PRCName")}));
    const bool listed = kind_ == "ClashElement" || kind_ == "FederatorClashElement";
    Say("nodes", std::to_string(listed ? ChildCount(root_) : 0));
  }

  // ---- one interference by number

  void Interference(int inIndex) {
    const std::string number = "(" + std::to_string(inIndex) + ")";
    const std::vector<Node> all = Grandchildren(root_, "ClashResult", "Interference");
    const bool there = inIndex >= 1 && static_cast<std::size_t>(inIndex) <= all.size();
    const Node interference = there ? all[static_cast<std::size_t>(inIndex) - 1] : Node();
    Say("ith" + number, there ? "found " + Labels(interference) : "none");
    Say("short" + number, Short(interference));
    for (const char* version : {"1.2", "1.1"})
      Say(std::string("full ") + version + number, Full(version, interference));
    Say("preview" + number, Preview(inIndex));
    const std::vector<Node> named = Children(root_, "ClashResult");
    const bool valid = inIndex >= 1 && inIndex < ChildCount(root_) &&
                       static_cast<std::size_t>(inIndex) <= named.size();
    Say("valid" + number,
        valid ? "found " + Value(named[static_cast<std::size_t>(inIndex) - 1], "Name") : "none");
  }

  std::string Labels(const Node& inInterference) const {
    std::string labels[2], previews[2] = {kBefore, kBefore};
    labels[1] = kBefore;
    for (const Node& product : Children(inInterference, "Product")) {
      const int place = labels[0].empty() ? 0 : 1;
      labels[place] = Instance(Value(product, "Alias")) + " -- " + Value(product, "ShapeName");
      previews[place] = Value(product, "Preview");
    }
    return Joined({Value(inInterference, "Name"), std::to_string(ChildCount(inInterference)),
                   labels[0], labels[1], previews[0], previews[1]});
  }

  std::string Short(const Node& inInterference) const {
    Texts out = {kBefore, kBefore, kBefore, "", ""};
    if (!inInterference) return Joined(out);
    out[0] = Value(inInterference, "Value");
    out[1] = Value(inInterference, "ResultType");
    for (const Node& rule : Children(inInterference, "ViolatedRule")) out[2] = Value(rule, "Name");
    for (const Node& product : Children(inInterference, "Product"))
      out[out[3].empty() ? 3 : 4] = Value(product, "Alias");
    return Joined(out);
  }

  // Outputs from 1 to 41; the name of the result set at 0.
  std::string Full(const std::string& inVersion, const Node& inInterference) const {
    Texts out(42, kBefore);
    out[8] = out[9] = out[13] = out[14] = "";
    const auto preferRule = [&] {
      if (!out[7].empty()) out[2] = out[7];
    };
    if (kind_ == "ClashElement") {
      for (const Node& resultSet : Children(root_, "ClashResult")) {
        out[0] = Value(resultSet, "Name");
        out[4] = Value(resultSet, "ComputationCase");
        for (const Node& child : Children(resultSet, "Interference")) {
          if (child != inInterference) continue;
          if (inVersion == "1.2") ReadInterference(child, out);
          preferRule();
        }
      }
      return Joined(out);
    }
    out[0] = "";
    const std::vector<Node> direct = Children(root_, "Interference");
    if (!direct.empty()) {
      ReadInterference(direct[0], out);
      preferRule();
    }
    return Joined(out);
  }

  void ReadInterference(const Node& inInterference, Texts& ioOut) const {
    ioOut[1] = ResultType(inInterference);
    ioOut[2] = PointValue(inInterference, "DistanceClearance");
    ioOut[3] = Status(inInterference);
    ioOut[5] = Retrieve(inInterference);
    ioOut[28] = "";
    ioOut[32] = "NOVIEWPOINT";
    for (const Node& rule : Children(inInterference, "ViolatedRule")) {
      ioOut[4] = Value(rule, "TypeCalc");
      ioOut[6] = Value(rule, "Name");
      ioOut[7] = PointValue(rule, "Clearance");
      ioOut[23] = Value(rule, "Severity");
      ioOut[24] = Value(rule, "PenetrationCandidate");
    }
    for (const Node& product : Children(inInterference, "Product"))
      ReadProduct(product, ioOut[13].empty() ? 0 : 1, ioOut);
    for (const Node& geometry : Children(inInterference, "GeometricAspect"))
      ReadGeometry(geometry, ioOut);
    for (const Node& comment : Children(inInterference, "Comment"))
      ioOut[12] = Value(comment, "Value");
  }

  static void ReadProduct(const Node& inProduct, std::size_t inPlace, Texts& ioOut) {
    const std::string id = Value(inProduct, "DescriptionID");
    const std::string mode = Value(inProduct, "ProcessMode");
    const std::string alien = Value(inProduct, "Alien");
    ioOut[8 + inPlace] = ioOut[15 + inPlace] = id;
    ioOut[10 + inPlace] = mode;
    ioOut[13 + inPlace] = alien.empty() ? "YES" : alien;
    ioOut[17 + inPlace] = mode == "KORVAPDM" ? Value(inProduct, "Alias") : Instance(id);
    ioOut[19 + inPlace] = Value(inProduct, "ShapeName");
    ioOut[21 + inPlace] = Value(inProduct, "ShapeSource");
  }

  static void ReadGeometry(const Node& inGeometry, Texts& ioOut) {
    ioOut[25] = PointValue(inGeometry, "IntersectCurveLength");
    ioOut[26] = PointValue(inGeometry, "ExtractOrDistValue");
    ioOut[27] = "";
    for (const Node& point : Children(inGeometry, "Point"))
      ioOut[28] += (ioOut[28].empty() ? "" : "/") + PointValue(point, "Ux") + "/" +
                   PointValue(point, "Uy") + "/" + PointValue(point, "Uz");
    for (const Node& viewpoint : Children(inGeometry, "Viewpoint")) {
      ioOut[29] = Value(viewpoint, "FocusDistance");
      ioOut[30] = PointValue(viewpoint, "NearPlane");
      ioOut[31] = PointValue(viewpoint, "FarPlane");
      ioOut[32] = PointValue(viewpoint, "ProjectionType");
      for (const Node& point : Children(viewpoint, "Point"))
        FillTriple(point, "Ux", "Uy", "Uz", 33, ioOut);
      for (const Node& vector : Children(viewpoint, "Vector"))
        if (Value(vector, "CorrespondingData") == "Sight")
          FillTriple(vector, "Vx", "Vy", "Vz", 36, ioOut);
    }
  }

  static void FillTriple(const Node& inNode, const char* inX, const char* inY, const char* inZ,
                         std::size_t inFirst, Texts& ioOut) {
    ioOut[inFirst] = PointValue(inNode, inX);
    ioOut[inFirst + 1] = PointValue(inNode, inY);
    ioOut[inFirst + 2] = PointValue(inNode, inZ);
  }

  // The tests that use this set "PublishDefDir" to "/pub".
  std::string Preview(int inIndex) const {
    std::string picture = kBefore;
    const auto read = [&](const Node& inInterference) {
      const std::vector<Node> pictures = Children(inInterference, "Picture");
      if (!pictures.empty()) picture = Value(pictures[0], "HRef");
    };
    if (kind_ == "InterferenceElement" || inIndex == -1) {
      const std::vector<Node> direct = Children(root_, "Interference");
      if (direct.empty()) return picture;
      read(direct[0]);
      const std::size_t parent = picture.find("..");
      if (parent != std::string::npos) picture.replace(parent, 2, "/pub");
      return picture;
    }
    for (const Node& resultSet : Children(root_, "ClashResult")) {
      const std::vector<Node> own = Children(resultSet, "Interference");
      if (inIndex >= 1 && static_cast<std::size_t>(inIndex) <= own.size())
        read(own[static_cast<std::size_t>(inIndex) - 1]);
    }
    return picture;
  }

  // ---- rebuilding

  static Numbers Placement(const Node& inProduct) {
    Numbers numbers{};
    for (const Node& point : Grandchildren(inProduct, "Matrix", "Point")) {
      const char* const names[] = {"Ux", "Uy", "Uz"};
      for (std::size_t i = 0; i < 3; ++i) numbers[9 + i] = Number(point, names[i], -1.0);
    }
    for (const Node& vector : Grandchildren(inProduct, "Matrix", "Vector")) {
      const std::string column = Value(vector, "CorrespondingData");
      const std::size_t first = column == "Rx" ? 0 : column == "Ry" ? 3 : column == "Rz" ? 6 : 99;
      if (first == 99) continue;
      const char* const names[] = {"Vx", "Vy", "Vz"};
      for (std::size_t i = 0; i < 3; ++i) numbers[first + i] = Number(vector, names[i], -1.0);
    }
    return numbers;
  }

  void Rebuild() {
    const Numbers identity{1, 0, 0, 0, 1, 0, 0, 0, 1, 0, 0, 0};
    Texts aliases, ids;
    std::vector<Numbers> placements;
    for (const Node& resultSet : Children(root_, "ClashResult")) {
      int declared = 0;
      std::sscanf(Value(resultSet, "NbInterf").c_str(), "%d", &declared);
      if (declared < 1) continue;
      placements.assign(2 * static_cast<std::size_t>(declared), identity);
      int taken = 0;
      for (const Node& interference : Children(resultSet, "Interference")) {
        if (taken == declared) break;
        std::string alias[2], id[2];
        for (const Node& product : Children(interference, "Product")) {
          const std::size_t place = id[0].empty() ? 0 : 1;
          id[place] = Value(product, "DescriptionID");
          alias[place] = Value(product, "Alias");
          placements[2 * static_cast<std::size_t>(taken) + place] = Placement(product);
        }
        aliases.insert(aliases.end(), {alias[0], alias[1]});
        ids.insert(ids.end(), {id[0], id[1]});
        ++taken;
      }
    }
    Say("rebuild aliases", Joined(aliases));
    Say("rebuild identifiers", Joined(ids));
    Texts numbers;
    for (const Numbers& placement : placements)
      for (const double number : placement) numbers.push_back(NumberText(number));
    Say("rebuild placements", Joined(numbers));
  }

  // ---- specification

  void Specifications(int inCount) {
    const std::vector<Node> all = Grandchildren(root_, "ProductsInSpec", "Specification");
    Say("specifications", std::to_string(all.size()));
    for (int number = -1; number <= inCount + 1; ++number) {
      Texts out(10, kBefore);
      if (number >= 1 && static_cast<std::size_t>(number) <= all.size()) {
        const char* const attributes[] = {"Alias", "DisplayableID", "DocumentVersion", "Alien",
                                          "ShapeName"};
        for (std::size_t set = 0; set < 2; ++set)
          for (const Node& list : Children(all[static_cast<std::size_t>(number) - 1],
                                           set == 0 ? "ProdListe1" : "ProdListe2"))
            for (std::size_t i = 0; i < 5; ++i) out[2 * i + set] = Value(list, attributes[i]);
      }
      Say("specification(" + std::to_string(number) + ")", Joined(out));
    }
  }

  // ---- components

  void Component(int inPosition, int inParts) {
    const std::string at = "[" + std::to_string(inPosition) + "]";
    const Node component = ChildAt(root_, inPosition);
    std::string value;
    for (const Node& attribute :
         Grandchildren(component, "ComponentAttributes", "ComponentAttribute"))
      if (Value(attribute, "Name") == "n1") {
        value = Value(attribute, "AttrValue");
        break;
      }
    const std::vector<Node> shapes = Grandchildren(component, "ComponentShapes", "ComponentShape");
    std::vector<Node> real;
    for (const Node& attribute :
         Grandchildren(component, "ComponentAttributes", "ComponentAttribute"))
      if (Value(attribute, "AttrType") != "Feature") real.push_back(attribute);
    Say("component" + at,
        Joined({Value(component, "Alias"), Value(component, "Alias"),
                Value(component, "ComponentType"), value, Value(component, "Name"),
                std::to_string(real.size()), std::to_string(shapes.size()),
                IsNamed(component, "Component") ? "1" : "0", shapes.empty() ? "0" : "1"}));
    for (int number = -1; number <= inParts + 1; ++number) {
      Texts out(3, kBefore);
      if (number >= 1 && static_cast<std::size_t>(number) <= real.size()) {
        const Node& attribute = real[static_cast<std::size_t>(number) - 1];
        out = {Value(attribute, "Name"), Value(attribute, "AttrType"),
               Value(attribute, "AttrValue")};
      }
      const bool isShape = number >= 0 && static_cast<std::size_t>(number) < shapes.size();
      out.push_back(isShape ? Value(shapes[static_cast<std::size_t>(number)], "ShapeName") : "");
      Say("part" + at + "(" + std::to_string(number) + ")", Joined(out));
    }
    Say("placement" + at, Position(component));
  }

  // A number that the document does not give is open.
  static std::string Position(const Node& inComponent) {
    Texts out(12, "open");
    const char* const names[] = {"Rx", "Ry", "Rz", "T"};
    const char* const attributes[] = {"Ux", "Uy", "Uz"};
    for (std::size_t row = 0; row < 4; ++row)
      for (const Node& triple : Grandchildren(inComponent, "ShapePosition", names[row]))
        for (std::size_t i = 0; i < 3; ++i)
          out[3 * row + i] = NumberText(Number(triple, attributes[i], 0.0));
    return Joined(out);
  }

  // ---- linked documents

  void Linked() {
    const std::vector<Node> elements = Children(root_, "Elements");
    const bool federator = kind_ == "FederatorClashElement" && !elements.empty();
    Say("elements", federator ? "found " + Value(elements[0], "Id") : "none");
    Texts links;
    if (federator)
      for (const Node& child : elements[0].children())
        for (const char* name : {"Link", "FirstProductName", "SecondProductName", "FirstProductId",
                                 "SecondProductId", "FirstProductURL", "SecondProductURL"})
          links.push_back(Value(child, name));
    Say("linked", Joined(links));
  }

  Node root_;
  std::string kind_;
  bool french_;
  Answers answers_;
};

}  // namespace

Ranges RangesOf(const pugi::xml_node& inRoot) {
  Ranges ranges;
  ranges.positions = ChildCount(inRoot);
  ranges.interferences =
      static_cast<int>(Grandchildren(inRoot, "ClashResult", "Interference").size());
  ranges.specifications =
      static_cast<int>(Grandchildren(inRoot, "ProductsInSpec", "Specification").size());
  for (const Node& child : inRoot.children())
    for (const Node& part : child.children())
      ranges.partsOfAComponent = std::max(ranges.partsOfAComponent, ChildCount(part));
  return ranges;
}

Answers NaiveAnswers(const pugi::xml_node& inRoot, const std::string& inKind,
                     const Ranges& inRanges, const std::string& inLanguage) {
  return NaiveReader(inRoot, inKind, inLanguage).All(inRanges);
}

std::string NumberText(double inNumber) {
  char text[64];
  std::snprintf(text, sizeof(text), "%.17g", inNumber);
  return text;
}

std::string Joined(const std::vector<std::string>& inTexts) {
  std::string joined;
  for (const std::string& text : inTexts) joined += "|" + text;
  return joined;
}

pugi::xml_document Parsed(const std::string& inXml) {
  pugi::xml_document document;
  const pugi::xml_parse_result result =
      document.load_buffer(inXml.data(), inXml.size(), pugi::parse_full | pugi::parse_ws_pcdata);
  EXPECT_TRUE(result) << result.description();
  return document;
}

int ExpectSameAnswers(const Answers& inExpected, const Answers& inActual,
                      const std::string& inWhere) {
  EXPECT_EQ(inExpected.size(), inActual.size()) << inWhere;
  const std::size_t count = std::min(inExpected.size(), inActual.size());
  for (std::size_t i = 0; i < count; ++i) {
    const auto& [question, expected] = inExpected[i];
    EXPECT_EQ(question, inActual[i].first) << inWhere;
    EXPECT_EQ(expected, inActual[i].second) << inWhere << ": " << question;
  }
  return static_cast<int>(count);
}

}  // namespace clash_reading_test
