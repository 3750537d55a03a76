#include "default_platform/product_structure/ClashPlacements.h"

#include <algorithm>

#include "platform/xml/DOMParser.h"
#include "platform/xml/DOM_Document.h"
#include "platform/xml/DOM_Element.h"

namespace products {
namespace {

std::string Attribute(const DOM_Element& inElement, const char* inName) {
  return inElement.getAttribute(inName).DOMStringToZORUnicodeString().ConvertToChar();
}

/// Decimal commas are read too.
double Number(const DOM_Element& inElement, const char* inName) {
  std::string text = Attribute(inElement, inName);
  std::ranges::replace(text, ',', '.');
  return std::stod(text);
}

Placement PlacementOf(const DOM_Element& inMatrix) {
  Placement placement{};
  std::size_t column = 0;
  for (DOM_Node node = inMatrix.getFirstChild(); !node.isNull(); node = node.getNextSibling()) {
    const DOM_Element element(node);
    if (element.isNull()) continue;
    const bool isPoint = element.getTagName().equals("Point");
    const std::size_t first = isPoint ? 9 : 3 * column++;
    placement[first] = Number(element, isPoint ? "Ux" : "Vx");
    placement[first + 1] = Number(element, isPoint ? "Uy" : "Vy");
    placement[first + 2] = Number(element, isPoint ? "Uz" : "Vz");
  }
  return placement;
}

void CollectPlacements(const DOM_Node& inNode, std::map<std::string, Placement>& ioPlacements) {
  for (DOM_Node node = inNode.getFirstChild(); !node.isNull(); node = node.getNextSibling()) {
    const DOM_Element element(node);
    if (element.isNull()) continue;
    if (element.getTagName().equals("Matrix"))
      ioPlacements[Attribute(DOM_Element(inNode), "DescriptionID")] = PlacementOf(element);
    CollectPlacements(node, ioPlacements);
  }
}

}  // namespace

std::map<std::string, Placement> PlacementsIn(const std::string& inPath) {
  DOMParser parser;
  parser.parse(inPath.c_str());
  std::map<std::string, Placement> placements;
  CollectPlacements(parser.getDocument().getDocumentElement(), placements);
  return placements;
}

}  // namespace products
