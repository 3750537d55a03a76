// Conversions between documents and texts, lengths, logical names.
#include "ZORLyraGeneralServices.h"

#include "LogicalNames.h"
#include "PlatformAdapter.h"
#include "platform/knowledge/ZORParmDictionary.h"
#include "platform/xml/DOM_NamedNodeMap.h"

namespace {

constexpr double kUnreadable = -0.0001;  // in metres; scaled like every other result
constexpr double kMillimetresPerMetre = 1000.0;

// Points and vectors are written alike.
template <class Triple>
DOM_Element CoordinatesElement(const ZORUnicodeString& inName, DOM_Document inDocument,
                               const Triple& inTriple) {
  DOM_Element element = inDocument.createElement(ZORLyraGeneralServices::GetDOMString(inName));
  const auto set = [&](const char* inAttribute, float inCoordinate) {
    element.setAttribute(inAttribute,
                         ZORLyraGeneralServices::GetDOMString(static_cast<double>(inCoordinate)));
  };
  set("Ux", inTriple.x);
  set("Uy", inTriple.y);
  set("Uz", inTriple.z);
  return element;
}

}  // namespace

ZORUnicodeString ZORLyraGeneralServices::GetAttrOnNode(DOM_Node inNode, const char* inName) {
  return GetDOMName(inNode.getAttributes().getNamedItem(inName).getNodeValue());
}

ZORUnicodeString ZORLyraGeneralServices::GetDOMName(DOMString inText) {
  return inText.DOMStringToZORUnicodeString();
}

ZORUnicodeString ZORLyraGeneralServices::GetDOMName(DOM_Element inElement) {
  return GetDOMName(inElement.getTagName());
}

ZORUnicodeString ZORLyraGeneralServices::GetDOMName(DOM_Node inNode) {
  return GetDOMName(inNode.getNodeName());
}

DOMString ZORLyraGeneralServices::GetDOMString(int inNumber) {
  ZORUnicodeString text;
  text.BuildFromNum(inNumber, "%i");
  return GetDOMString(text);
}

DOMString ZORLyraGeneralServices::GetDOMString(double inNumber) {
  ZORUnicodeString text;
  text.BuildFromNum(inNumber, "%f");
  return GetDOMString(text);
}

DOMString ZORLyraGeneralServices::GetDOMString(ZORUnicodeString inText) {
  return DOMString(inText.ConvertToChar());
}

DOM_Element ZORLyraGeneralServices::GetDOMVector(ZORUnicodeString inName, DOM_Document inDocument,
                                                 ZORMathPointf inPoint) {
  return CoordinatesElement(inName, inDocument, inPoint);
}

DOM_Element ZORLyraGeneralServices::GetDOMVector(ZORUnicodeString inName, DOM_Document inDocument,
                                                 ZORMathVectorf inVector) {
  return CoordinatesElement(inName, inDocument, inVector);
}

double ZORLyraGeneralServices::ConvertValueInMM(ZORUnicodeString inValue) {
  double length = -1.0;
  const ZORICkeMagnitude_var magnitude = ZORParmDictionary::FindMagnitude("LENGTH");
  if (magnitude.IsNull()) return length;
  const ZORICkeUnit_var unit = magnitude->Unit();
  if (unit.IsNull()) return length;

  if (unit->Decode(inValue, length) == ZORCke::False &&
      unit->Decode(inValue.Append("mm"), length) == ZORCke::False)
    length = kUnreadable;
  return length * kMillimetresPerMetre;
}

// The scheme is assumed to stand at the start, wherever it was found.
ZORUnicodeString ZORLyraGeneralServices::TransformFromDLName(ZORUnicodeString inName) {
  if (inName.SearchSubString(kLogicalNameScheme, 0, adapter::kSearchForward) < 0)
    return DirectoryOfLogicalName(inName);
  return DirectoryOfPrefixedName(inName, kLogicalNameSchemeLength);
}

ZORUnicodeString ZORLyraGeneralServices::TransformPathnameFromDLName(ZORUnicodeString inReference) {
  return PathOfReference(inReference);
}
