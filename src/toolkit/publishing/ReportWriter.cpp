#include "toolkit/publishing/ReportWriter.h"

#include <algorithm>
#include <span>
#include <string>

#include "BuildPath.h"
#include "ZORLyraGeneralServices.h"
#include "ZORLyraXMLServices.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

constexpr char kDocumentType[] = "clash-report.dtd";

using Names = std::span<const char* const>;

/// What reports hold of an element.
struct ElementRule {
  const char* name;
  Names attributes;
  Names children;
};

constexpr const char* kRootAttributes[] = {"Version", "ZORDocument",  "Responsible",
                                           "PRCName", "ServerMarker", "Transaction"};
constexpr const char* kClashChildren[] = {"Date", "ClashSpec", "ClashResult", "ProductsInSpec"};
constexpr const char* kInterferenceOnly[] = {"Interference"};
constexpr const char* kDateAttributes[] = {"Day",    "Month",  "Year", "Hour",
                                           "Minute", "Second", "Value"};
constexpr const char* kSpecAttributes[] = {"Name", "Type", "Clearance", "ComputationCase"};
constexpr const char* kResultAttributes[] = {"Name", "ComputationCase", "NbInterf"};
constexpr const char* kInterferenceAttributes[] = {
    "Name", "Value", "ResultType", "ResultTypeNoNLS", "DistanceClearance", "Status", "RetrieveInf"};
constexpr const char* kInterferenceChildren[] = {"ViolatedRule", "Product", "GeometricAspect",
                                                 "Comment", "Picture"};
constexpr const char* kRuleAttributes[] = {"Name", "Clearance", "TypeCalc", "Severity",
                                           "PenetrationCandidate"};
constexpr const char* kProductAttributes[] = {
    "DescriptionID", "Alias", "Alien", "ProcessMode", "ShapeName", "ShapeSource", "Preview"};
constexpr const char* kMatrixOnly[] = {"Matrix"};
constexpr const char* kPointAndVector[] = {"Point", "Vector"};
constexpr const char* kPointAttributes[] = {"Ux", "Uy", "Uz"};
constexpr const char* kVectorAttributes[] = {"CorrespondingData", "Vx", "Vy", "Vz"};
constexpr const char* kGeometryAttributes[] = {"IntersectCurveLength", "ExtractOrDistValue"};
constexpr const char* kGeometryChildren[] = {"Point", "Viewpoint"};
constexpr const char* kViewpointAttributes[] = {"FocusDistance", "NearPlane", "FarPlane",
                                                "ProjectionType"};
constexpr const char* kValueOnly[] = {"Value"};
constexpr const char* kHRefOnly[] = {"HRef"};
constexpr const char* kSpecificationOnly[] = {"Specification"};
constexpr const char* kProductSets[] = {"ProdListe1", "ProdListe2"};
constexpr const char* kSetAttributes[] = {"Alias", "Alien", "ShapeName", "DisplayableID",
                                          "DocumentVersion"};

// The most frequent elements first.
constexpr ElementRule kRules[] = {
    {"Vector", kVectorAttributes, {}},
    {"Point", kPointAttributes, {}},
    {"Product", kProductAttributes, kMatrixOnly},
    {"Matrix", {}, kPointAndVector},
    {"Interference", kInterferenceAttributes, kInterferenceChildren},
    {"GeometricAspect", kGeometryAttributes, kGeometryChildren},
    {"Viewpoint", kViewpointAttributes, kPointAndVector},
    {"Picture", kHRefOnly, {}},
    {"Comment", kValueOnly, {}},
    {"ViolatedRule", kRuleAttributes, {}},
    {"ClashResult", kResultAttributes, kInterferenceOnly},
    {"ClashElement", kRootAttributes, kClashChildren},
    {"InterferenceElement", kRootAttributes, kInterferenceOnly},
    {"Date", kDateAttributes, {}},
    {"ClashSpec", kSpecAttributes, {}},
    {"ProductsInSpec", {}, kSpecificationOnly},
    {"Specification", {}, kProductSets},
    {"ProdListe1", kSetAttributes, {}},
    {"ProdListe2", kSetAttributes, {}},
};

const ElementRule* RuleOf(const DOMString& inName) {
  const auto found =
      std::find_if(std::begin(kRules), std::end(kRules),
                   [&](const ElementRule& inRule) { return inName.equals(inRule.name); });
  return found == std::end(kRules) ? nullptr : found;
}

bool IsAmong(const DOMString& inName, Names inNames) {
  return std::any_of(inNames.begin(), inNames.end(),
                     [&](const char* inKnown) { return inName.equals(inKnown); });
}

bool IsHalf(ZORUC2Bytes inUnit, ZORUC2Bytes inFirst) { return (inUnit & 0xFC00) == inFirst; }

/// What a code unit that cannot stand in an attribute's value as it is becomes; null for others.
const char* Substitute(const ZORUC2Bytes* inUnits, int inPosition, int inCount) {
  constexpr const char* kReplacement = "\xEF\xBF\xBD";
  const ZORUC2Bytes unit = inUnits[inPosition];
  if (unit >= 0x20 && unit < 0xD800) return nullptr;
  if (unit == '\t') return "&#9;";
  if (unit == '\n') return "&#10;";
  if (unit == '\r') return "&#13;";
  if (IsHalf(unit, 0xD800)) {
    const bool isPaired = inPosition + 1 < inCount && IsHalf(inUnits[inPosition + 1], 0xDC00);
    return isPaired ? nullptr : kReplacement;
  }
  if (IsHalf(unit, 0xDC00)) {
    const bool isPaired = inPosition > 0 && IsHalf(inUnits[inPosition - 1], 0xD800);
    return isPaired ? nullptr : kReplacement;
  }
  return unit < 0x20 || unit >= 0xFFFE ? kReplacement : nullptr;
}

void WriteAttributes(const DOM_Node& inElement, Names inNames, ZORLyraXMLServices& ioWriter) {
  const DOM_NamedNodeMap attributes = inElement.getAttributes();
  const unsigned int count = attributes.getLength();
  for (unsigned int i = 0; i < count; ++i) {
    const DOM_Node attribute = attributes.item(i);
    const DOMString name = attribute.getNodeName();
    if (!IsAmong(name, inNames)) continue;
    ioWriter.AddAttr(name.DOMStringToZORUnicodeString(),
                     AttributeValue(ZORLyraGeneralServices::GetDOMName(attribute.getNodeValue())));
  }
}

/// The first child element, from a node on, that reports have.
DOM_Node NextKnown(DOM_Node inNode, Names inNames) {
  while (!inNode.isNull() && (inNode.getNodeType() != DOM_Node::ELEMENT_NODE ||
                              !IsAmong(inNode.getNodeName(), inNames)))
    inNode = inNode.getNextSibling();
  return inNode;
}

// Every name that is written is one of the rules', so no depth of the document makes this deep.
void WriteElement(const DOM_Node& inElement, ZORLyraXMLServices& ioWriter) {
  const ElementRule* rule = RuleOf(inElement.getNodeName());
  if (rule == nullptr) return;
  ioWriter.InitXMLMarkerWithAttr(rule->name);
  WriteAttributes(inElement, rule->attributes, ioWriter);
  DOM_Node child = NextKnown(inElement.getFirstChild(), rule->children);
  if (child.isNull()) {
    ioWriter.CloseXMLAttrMarkerWithoutElem();
    return;
  }
  ioWriter.CloseXMLAttrMarkerWithElem();
  for (; !child.isNull(); child = NextKnown(child.getNextSibling(), rule->children))
    WriteElement(child, ioWriter);
  ioWriter.CloseXMLMarker(rule->name);
}

}  // namespace

ZORUnicodeString AttributeValue(const ZORUnicodeString& inText) {
  const ZORUC2Bytes* units = inText.ConvertToUCChar();
  const int count = inText.GetLengthInChar();
  ZORUnicodeString value;
  int start = 0;
  const auto escapeUpTo = [&](int inEnd) {
    ZORUnicodeString part;
    part.BuildFromUTF16(units + start, static_cast<std::size_t>(inEnd - start));
    BuildPath::CheckXMLString(part, value);
  };
  for (int i = 0; i < count; ++i) {
    const char* substitute = Substitute(units, i, count);
    if (substitute == nullptr) continue;
    escapeUpTo(i);
    value += substitute;
    start = i + 1;
  }
  if (start < count) escapeUpTo(count);
  return value;
}

HRESULT WriteReport(const ClashDocument& inDocument, const Prologue& inPrologue,
                    const std::string& inPath) {
  inDocument.RequireInterferences();
  ZORLyraXMLServices writer;
  const ZORUnicodeString styleSheet = inPrologue.styleSheet.empty()
                                          ? writer.getStyleSheetFromSetting()
                                          : FromUtf8(inPrologue.styleSheet);
  writer.WriteXMLHeaderTag(
      RootName(inDocument.Kind()),
      inPrologue.dtd.empty() ? ZORUnicodeString(kDocumentType) : FromUtf8(inPrologue.dtd),
      AttributeValue(styleSheet));
  WriteElement(inDocument.Root(), writer);
  return writer.DumpDocument(FromUtf8(inPath));
}

}  // namespace ZORToolkit
