#include <array>
#include <cstdio>
#include <tuple>

#include "clash_reading/Answers.h"
#include "support/AbandonedMemory.h"
#include "support/LoadedReader.h"

namespace clash_reading_test {
namespace {

using support::Attribute;
using support::Text;
using Texts = std::vector<std::string>;

Texts TextsOf(const ZORListValZORUnicodeString& inList) {
  Texts texts;
  for (int i = 1; i <= inList.Size(); ++i) texts.push_back(Text(inList[i]));
  return texts;
}

std::vector<DOM_Node> Children(const DOM_Node& inParent, const char* inName) {
  std::vector<DOM_Node> found;
  for (DOM_Node child = inParent.getFirstChild(); !child.isNull(); child = child.getNextSibling())
    if (child.getNodeType() == DOM_Node::ELEMENT_NODE && support::Name(child) == inName)
      found.push_back(child);
  return found;
}

/// Asks a reader.
class Asking {
 public:
  Asking(ZORClashParsing& ioReader, const DOM_Node& inRoot) : reader_(ioReader), root_(inRoot) {}

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

  void General() {
    ZORUnicodeString version, reference, responsible;
    DOM_Node date, specification;
    int count = 77;
    reader_.GetClashGeneralInfos(version, reference, date, specification, count, responsible);
    Say("general",
        Joined({Text(version), Text(reference), date.isNull() ? "none" : Attribute(date, "Id"),
                specification.isNull() ? "none" : Attribute(specification, "Id"),
                std::to_string(count), Text(responsible)}));
    ZORUnicodeString name = kBefore, message = kBefore;
    int firstCount = 77, errorId = 77;
    reader_.GetClashGeneralInfos(name, firstCount);
    Say("first result", Joined({Text(name), std::to_string(firstCount)}));
    reader_.GetErrorId(message, errorId);
    Say("error", Joined({Text(message), std::to_string(errorId)}));
    Say("root", Joined({Text(reader_.GetServerMarker()), Text(reader_.GetTransaction()),
                        Text(reader_.GetPRCName())}));
    Say("nodes", std::to_string(reader_.GetNodeList().getLength()));
  }

  void Interference(int inIndex) {
    const std::string number = "(" + std::to_string(inIndex) + ")";
    support::IthInterference ith;
    ith.secondLabel = ith.firstPreview = ith.secondPreview = kBefore;
    ith.Read(reader_, inIndex);
    Say("ith" + number,
        ith.result != S_OK
            ? "none"
            : "found " + Joined({Attribute(ith.interference, "Name"),
                                 std::to_string(ith.interference.getChildNodes().getLength()),
                                 Text(ith.firstLabel), Text(ith.secondLabel),
                                 Text(ith.firstPreview), Text(ith.secondPreview)}));
    support::ShortInfos brief;
    brief.value = brief.resultType = brief.ruleName = brief.firstAlias = brief.secondAlias =
        kBefore;
    const std::array<std::string, 5> five = brief.Read(reader_, inIndex).Texts();
    Say("short" + number, Joined({five.begin(), five.end()}));
    for (const char* version : {"1.2", "1.1"}) {
      support::ClashInfos infos(kBefore);
      infos.Read(reader_, version, inIndex);
      Texts out = {Text(infos.resultName)};
      for (int output = 1; output <= 41; ++output) out.push_back(infos[output]);
      Say(std::string("full ") + version + number, Joined(out));
    }
    ZORUnicodeString picture = kBefore;
    reader_.GetClashPreviewURL(inIndex, picture);
    Say("preview" + number, Text(picture));
    DOM_Node node;
    const bool valid = reader_.GetValideNode(root_, inIndex, "ClashResult", node) == S_OK;
    Say("valid" + number, valid ? "found " + Attribute(node, "Name") : "none");
  }

  void Rebuild() {
    ZORListValZORUnicodeString aliases, ids;
    ZORMathTransformation* positions = nullptr;
    {
      const support::AbandonedMemory abandoned;
      reader_.GetReBuildSessionInfos(aliases, ids, positions);
    }
    Say("rebuild aliases", Joined(TextsOf(aliases)));
    Say("rebuild identifiers", Joined(TextsOf(ids)));
    Texts numbers;
    for (std::size_t place = 0; place < DeclaredPlacements(); ++place) {
      double coefficients[12];
      positions[place].GetCoefficients(coefficients);
      for (const double number : coefficients) numbers.push_back(NumberText(number));
    }
    delete[] positions;
    Say("rebuild placements", Joined(numbers));
  }

  // The length of the array that the last result set with declared interferences brings.
  std::size_t DeclaredPlacements() const {
    std::size_t placements = 0;
    for (const DOM_Node& resultSet : Children(root_, "ClashResult")) {
      int declared = 0;
      if (std::sscanf(Attribute(resultSet, "NbInterf").c_str(), "%d", &declared) == 1 &&
          declared >= 1)
        placements = 2 * static_cast<std::size_t>(declared);
    }
    return placements;
  }

  void Specifications(int inCount) {
    int count = 77;
    reader_.GetSpecInfos(count);
    Say("specifications", std::to_string(count));
    for (int number = -1; number <= inCount + 1; ++number) {
      support::SpecifiedProducts products;
      products.outputs.fill(kBefore);
      const std::array<std::string, 10> ten = products.Read(reader_, number).Texts();
      Say("specification(" + std::to_string(number) + ")", Joined({ten.begin(), ten.end()}));
    }
  }

  void Component(int inPosition, int inParts) {
    const std::string at = "[" + std::to_string(inPosition) + "]";
    Say("component" + at,
        Joined({Text(reader_.GetPrdId(inPosition)), Text(reader_.GetPrdName(inPosition)),
                Text(reader_.GetPrdType(inPosition)), Text(reader_.GetAttrValue(inPosition, "n1")),
                Text(reader_.GetCompoAttr(inPosition, "Name")),
                std::to_string(reader_.GetNbRealAttr(inPosition)),
                std::to_string(reader_.GetNbShapes(inPosition)),
                std::to_string(reader_.IsValideNode(inPosition, "Component")),
                std::to_string(reader_.IsValideNode(inPosition, 0, ""))}));
    for (int number = -1; number <= inParts + 1; ++number) {
      ZORUnicodeString name = kBefore, type = kBefore, value = kBefore;
      reader_.GetSetOfRealAttr(inPosition, number, name, type, value);
      Say("part" + at + "(" + std::to_string(number) + ")",
          Joined({Text(name), Text(type), Text(value),
                  Text(reader_.GetShapeAttrValue(inPosition, number, "ShapeName"))}));
    }
    Say("placement" + at, Position(inPosition));
  }

  // A number whose source is missing must not even be looked at.
  std::string Position(int inPosition) {
    double* numbers = nullptr;
    reader_.GetPosition(inPosition, numbers);
    const DOM_Node component = root_.getChildNodes().item(static_cast<unsigned int>(inPosition));
    Texts out(12, "open");
    const char* const rows[] = {"Rx", "Ry", "Rz", "T"};
    for (std::size_t row = 0; row < 4; ++row)
      for (const DOM_Node& placement : Children(component, "ShapePosition"))
        if (!Children(placement, rows[row]).empty())
          for (std::size_t i = 3 * row; i < 3 * row + 3; ++i) out[i] = NumberText(numbers[i]);
    delete[] numbers;
    return Joined(out);
  }

  void Linked() {
    const DOM_Node elements = reader_.GetElementsNode();
    Say("elements", elements.isNull() ? "none" : "found " + Attribute(elements, "Id"));
    const DOM_NodeList linked = reader_.GetListOfLinkedElements();
    Texts links;
    for (unsigned int i = 0; i < linked.getLength(); ++i) {
      std::array<ZORUnicodeString, 7> out;
      std::apply([&](auto&... outs) { reader_.GetAttOfLinkedElement(linked.item(i), outs...); },
                 out);
      for (const ZORUnicodeString& text : out) links.push_back(Text(text));
    }
    Say("linked", Joined(links));
  }

  ZORClashParsing& reader_;
  DOM_Node root_;
  Answers answers_;
};

}  // namespace

Answers ReaderAnswers(ZORClashParsing& ioReader, const DOM_Node& inRoot, const Ranges& inRanges) {
  return Asking(ioReader, inRoot).All(inRanges);
}

}  // namespace clash_reading_test
