#include "toolkit/publishing/ReportWriter.h"

#include <algorithm>
#include <cmath>
#include <functional>
#include <map>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "BuildPath.h"
#include "ZORLyraGeneralServices.h"
#include "ZORLyraXMLServices.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

constexpr char kDocumentType[] = "clash-report.dtd";

using Names = std::span<const char* const>;

/// The attributes and children of an element that reports have.
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

/// The first child element, from a node on, that reports have.
DOM_Node NextKnown(DOM_Node inNode, Names inNames) {
  while (!inNode.isNull() && (inNode.getNodeType() != DOM_Node::ELEMENT_NODE ||
                              !IsAmong(inNode.getNodeName(), inNames)))
    inNode = inNode.getNextSibling();
  return inNode;
}

/// Puts a report into the library's writer.
struct MarkerWriter {
  ZORLyraXMLServices& services;

  void Begin(const DOM_Node&, const char* inName) const { services.InitXMLMarkerWithAttr(inName); }
  void Attribute(const ZORUnicodeString& inName, const ZORUnicodeString& inValue) const {
    services.AddAttr(inName, inValue);
  }
  void EndAttributes(bool inHasChildren) const {
    inHasChildren ? services.CloseXMLAttrMarkerWithElem()
                  : services.CloseXMLAttrMarkerWithoutElem();
  }
  void End(const char* inName) const { services.CloseXMLMarker(inName); }
};

std::string GoneOf(const PublishedResult& inPublished);

/// Puts a report, laid out as the library's writer does, and what a page knows besides into a text.
class AnnotatingWriter {
 public:
  /// @param inInterferences those that are annotated.
  AnnotatingWriter(const PublishedResult& inPublished,
                   const std::vector<PublishedInterference>& inInterferences, std::string& ioText)
      : published_(inPublished), interferences_(inInterferences), text_(ioText) {}

  void Begin(const DOM_Node& inElement, const char* inName) {
    text_.append("<").append(inName).append(" ");
    attributes_.clear();
    appended_.clear();
    const std::string_view name = inName;
    if (name == "ClashElement" || name == "InterferenceElement") AnnotateRoot();
    if (name == "Interference") AnnotateInterference(ElementHandle(inElement));
    if (name == "Product") AnnotateProduct(ElementHandle(inElement));
    name_ = inName;
  }
  void Attribute(const ZORUnicodeString& inName, const ZORUnicodeString& inValue) {
    text_.append(Utf8(inName)).append("=\"").append(Utf8(inValue)).append("\" ");
  }
  void EndAttributes(bool inHasChildren) {
    text_ += attributes_;
    if (inHasChildren) {
      text_ += "> \n";
      open_.push_back(appended_);
    } else if (appended_.empty()) {
      text_ += "/> \n\n";
    } else {
      text_.append(">").append(appended_).append("</").append(name_).append("> \n\n");
    }
  }
  /// Whether it is the next one that is annotated.
  bool IsNext(const ElementHandle& inElement) const {
    return next_ < interferences_.size() && interferences_[next_].element == inElement;
  }
  void End(const char* inName) {
    text_.append("\n").append(open_.back()).append("</").append(inName).append("> \n");
    open_.pop_back();
  }

 private:
  static void Set(const char* inName, const std::string& inValue, std::string& ioText) {
    if (inValue.empty()) return;
    const std::string value = Utf8(AttributeValue(FromUtf8(inValue)));
    ioText.append(inName).append("=\"").append(value).append("\" ");
  }

  // Style sheets can count only slowly. The most frequent words first.
  void Count(const char* inElement, std::string PublishedInterference::*inWord) {
    std::map<std::string, std::size_t> counts;
    for (const PublishedInterference& each : published_.interferences) ++counts[each.*inWord];
    std::vector<std::pair<std::string, std::size_t>> words(counts.begin(), counts.end());
    std::ranges::stable_sort(words, std::ranges::greater(),
                             &std::pair<std::string, std::size_t>::second);
    for (const auto& [word, count] : words) {
      appended_.append("<").append(inElement).append(" ");
      Set("page:word", word, appended_);
      Set("page:count", std::to_string(count), appended_);
      appended_ += "/>";
    }
  }

  // How many of each type have each status.
  void CountCells() {
    std::map<std::pair<std::string, std::string>, std::size_t> counts;
    for (const PublishedInterference& each : published_.interferences)
      ++counts[{each.type, each.status}];
    for (const auto& [words, count] : counts) {
      appended_ += "<page:Cell ";
      Set("page:type", words.first, appended_);
      Set("page:word", words.second, appended_);
      Set("page:count", std::to_string(count), appended_);
      appended_ += "/>";
    }
  }

  void AppendText(const char* inElement, const std::string& inText) {
    appended_.append("<").append(inElement).append(">");
    for (const char byte : inText) {
      if (byte == '&')
        appended_ += "&amp;";
      else if (byte == '<')
        appended_ += "&lt;";
      else if (byte == '>')
        appended_ += "&gt;";
      else
        appended_ += byte;
    }
    appended_.append("</").append(inElement).append(">");
  }

  void AnnotateRoot() {
    text_ += "xmlns:page=\"urn:zorlyra:page\" ";
    Set("page:model", published_.model, attributes_);
    Set("page:policy", published_.policy, attributes_);
    Set("page:map", published_.map, attributes_);
    if (!published_.map.empty())
      Set("page:mapHeight", std::to_string(std::lround(1000 * published_.mapRatio)), attributes_);
    if (published_.isAsInModel) Set("page:asInModel", "yes", attributes_);
    Count("page:Type", &PublishedInterference::type);
    Count("page:Status", &PublishedInterference::status);
    CountCells();
    Set("page:baseline", published_.baseline, attributes_);
    appended_ += GoneOf(published_);
    AppendText("page:Style", published_.style);
    AppendText("page:Script", published_.script);
    AppendText("page:Data", published_.data);
  }

  void AnnotateInterference(const ElementHandle& inElement) {
    interference_ = nullptr;
    if (!IsNext(inElement)) return;
    interference_ = &interferences_[next_++];
    const std::string number = std::to_string(interference_->number);
    Set("page:number", &interferences_ == &published_.gone ? "old-" + number : number, attributes_);
    Set("page:change", interference_->change, attributes_);
    Set("page:reason", interference_->reason, attributes_);
    Set("page:before", interference_->before, attributes_);
    for (const auto& [what, from, to] : interference_->changes) {
      appended_ += "<page:Change ";
      Set("page:what", what, appended_);
      Set("page:from", from, appended_);
      Set("page:to", to, appended_);
      appended_ += "/>";
    }
    Set("page:id", interference_->id, attributes_);
    Set("page:type", interference_->type, attributes_);
    Set("page:status", interference_->status, attributes_);
    Set("page:picture", interference_->picture, attributes_);
    Set("page:asInModel", interference_->whyAsInModel, attributes_);
    if (const auto& place = interference_->mapPlace) {
      Set("page:mapX", std::to_string(std::lround(1000 * (*place)[0])), attributes_);
      Set("page:mapY", std::to_string(std::lround(1000 * published_.mapRatio * (*place)[1])),
          attributes_);
    }
    for (const std::string& thumbnail : interference_->thumbnails) {
      appended_ += "<page:Thumbnail ";
      Set("href", thumbnail, appended_);
      appended_ += "/>";
    }
  }

  void AnnotateProduct(const ElementHandle& inElement) {
    if (interference_ == nullptr) return;
    for (const PublishedProduct& product : interference_->products) {
      if (!(product.element == inElement)) continue;
      Set("page:colour", product.colour, attributes_);
      Set("page:preview", product.preview, attributes_);
      if (product.isMissing) Set("page:missing", "yes", attributes_);
    }
  }

  const PublishedResult& published_;
  const std::vector<PublishedInterference>& interferences_;
  std::string& text_;
  std::string attributes_;  // of the element that is begun, behind its own
  std::string appended_;    // its elements, behind its own
  const char* name_ = "";
  std::vector<std::string> open_;  // what is appended to the elements around
  std::size_t next_ = 0;
  const PublishedInterference* interference_ = nullptr;
};

// Every name that is written is one of the rules', so no depth of the document makes this deep.
template <class Writer>
void WriteElement(const DOM_Node& inElement, Writer& ioWriter) {
  const ElementRule* const rule = RuleOf(inElement.getNodeName());
  if (rule == nullptr) return;
  ioWriter.Begin(inElement, rule->name);
  const DOM_NamedNodeMap attributes = inElement.getAttributes();
  const unsigned int count = attributes.getLength();
  for (unsigned int i = 0; i < count; ++i) {
    const DOM_Node attribute = attributes.item(i);
    const DOMString name = attribute.getNodeName();
    if (!IsAmong(name, rule->attributes)) continue;
    ioWriter.Attribute(
        name.DOMStringToZORUnicodeString(),
        AttributeValue(ZORLyraGeneralServices::GetDOMName(attribute.getNodeValue())));
  }
  DOM_Node child = NextKnown(inElement.getFirstChild(), rule->children);
  ioWriter.EndAttributes(!child.isNull());
  if (child.isNull()) return;
  for (; !child.isNull(); child = NextKnown(child.getNextSibling(), rule->children))
    WriteElement(child, ioWriter);
  ioWriter.End(rule->name);
}

/// The interferences of the baseline that the result has not, in a "page:Gone".
std::string GoneOf(const PublishedResult& inPublished) {
  if (inPublished.gone.empty() || inPublished.baselineDocument == nullptr) return {};
  constexpr const char* kSets[] = {"ClashResult"};
  std::string text = "<page:Gone>";
  AnnotatingWriter writer(inPublished, inPublished.gone, text);
  const auto writeAll = [&](const DOM_Node& inParent) {
    DOM_Node child = NextKnown(inParent.getFirstChild(), kInterferenceOnly);
    for (; !child.isNull(); child = NextKnown(child.getNextSibling(), kInterferenceOnly))
      if (writer.IsNext(ElementHandle(child))) WriteElement(child, writer);
  };
  const DOM_Element root = inPublished.baselineDocument->Root();
  writeAll(root);
  for (DOM_Node set = NextKnown(root.getFirstChild(), kSets); !set.isNull();
       set = NextKnown(set.getNextSibling(), kSets))
    writeAll(set);
  return text + "</page:Gone>";
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
  MarkerWriter markers{writer};
  WriteElement(inDocument.Root(), markers);
  return writer.DumpDocument(FromUtf8(inPath));
}

std::string AnnotatedReport(const ClashDocument& inDocument, const PublishedResult& inPublished) {
  std::string text = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
  AnnotatingWriter writer(inPublished, inPublished.interferences, text);
  WriteElement(inDocument.Root(), writer);
  return text;
}

}  // namespace ZORToolkit
