// Building, loading and merging, structure and root attributes.
#include "ZORClashParsing.h"

#include <algorithm>
#include <limits>
#include <memory>
#include <utility>

#include "PlatformAdapter.h"
#include "ZORLyraGeneralServices.h"
#include "clash_reading/ClashElements.h"
#include "clash_reading/NamedConstants.h"
#include "clash_reading/ZORClashDocumentIndex.h"
#include "platform/system/ZORFile.h"
#include "platform/xml/DOMParser.h"
#include "platform/xml/ZORXMLParser.h"

namespace {

constexpr int kReadAccess = 4;
constexpr const char* kMemoryIdentifier = "LIDPipodIBM";
constexpr const char* kDefaultVersion = "1.1";

/// A file's path or, if that is null, bytes in memory.
struct Source {
  const char* path;
  const char* buffer;
  int bufferLength;
};

/// @param ioResult set to the reason when the source is refused before parsing; a buffer source also
///                 leaves the code of its creation here.
/// @return whether the source was parsed.
bool Parse(const Source& inSource, DOM_Document& outDocument, HRESULT& ioResult) {
  DOMParser parser(nullptr);
  parser.setDoValidation(false);
  if (inSource.path) {
    if (ZORFileAccess(inSource.path, kReadAccess) != 0) {
      ioResult = E_FAIL;
      return false;
    }
    parser.parse(inSource.path);
  } else {
    InputSource* created = nullptr;
    ioResult = ZORXMLParser::CreateMemBufInputSource(
        reinterpret_cast<const unsigned char*>(inSource.buffer),
        static_cast<unsigned int>(inSource.bufferLength), kMemoryIdentifier, 0, created);
    if (FAILED(ioResult)) return false;
    const std::unique_ptr<InputSource> source(created);
    parser.parse(*source);
  }
  outDocument = parser.getDocument();
  return true;
}

bool HasClashAttributes(const ZORUnicodeString& inRootName) {
  return inRootName == "ClashElement" || inRootName == "InterferenceElement" ||
         inRootName == "FederatorClashElement";
}

void Trace(ZORUnicodeString& ioTrace, const char* inMessage) {
  ioTrace.Append(inMessage);
  ioTrace.Append("\n");
}

// Calls inVisit for the child elements of a name, but not for those that a visit appends, so that
// merging a document with itself ends.
template <class Visit>
void ForEachPresentElement(const DOM_Node& inParent, const char* inName, const Visit& inVisit) {
  unsigned int left = inParent.getChildNodes().getLength();
  for (DOM_Node child = inParent.getFirstChild(); left > 0; child = child.getNextSibling(), --left)
    if (IsElementNamed(child, inName)) inVisit(child);
}

// The first result set, or else the root's last child, whatever that is: hosts rely on it.
DOM_Node FindResultSet(const DOM_Element& inRoot, int& outCount) {
  const DOM_Node resultSet = FirstElement(inRoot, "ClashResult");
  if (resultSet.isNull()) return inRoot.getLastChild();
  outCount = TruncatedDeclaredCount(resultSet);
  return resultSet;
}

// Returns the declared number of the last result set: the numbers of several are not summed.
int AppendInterferences(const DOM_Element& inRoot, DOM_Document& ioTarget, DOM_Node& ioResultSet) {
  int count = 0;
  ForEachPresentElement(inRoot, "ClashResult", [&](const DOM_Node& inSource) {
    count = TruncatedDeclaredCount(inSource);
    if (ioResultSet.isNull()) return;
    ForEachPresentElement(inSource, "Interference", [&](const DOM_Node& inInterference) {
      ioResultSet.appendChild(ioTarget.importNode(inInterference, true));
    });
  });
  return count;
}

void AppendSpecifications(const DOM_Element& inRoot, DOM_Document& ioTarget,
                          DOM_Element& ioTargetRoot, DOM_Node& ioProducts) {
  ForEachPresentElement(inRoot, "ProductsInSpec", [&](const DOM_Node& inProducts) {
    ForEachPresentElement(inProducts, "Specification", [&](const DOM_Node& inSpecification) {
      if (ioProducts.isNull()) {
        ioProducts = ioTarget.importNode(inProducts, false);
        if (!ioTargetRoot.isNull()) ioTargetRoot.appendChild(ioProducts);
      }
      ioProducts.appendChild(ioTarget.importNode(inSpecification, true));
    });
  });
}

// A sum beyond the range of int becomes the nearest int, as a declared number does.
int SumOfCounts(int inFirst, int inSecond) {
  const long long sum = static_cast<long long>(inFirst) + inSecond;
  return static_cast<int>(
      std::clamp<long long>(sum, std::numeric_limits<int>::min(), std::numeric_limits<int>::max()));
}

void RewriteCount(const DOM_Element& inRoot, int inCount) {
  DOM_Node declared = FirstElement(inRoot, "ClashResult").getAttributes().getNamedItem("NbInterf");
  if (declared.isNull()) return;
  ZORUnicodeString text;
  text.BuildFromNum(inCount, "%d");
  declared.setNodeValue(DOMString(text.ConvertToChar()));
}

}  // namespace

ZORClashParsing::ZORClashParsing(char* inPath)
    : path_(inPath), buffer_(nullptr), bufferLength_(0) {}

ZORClashParsing::ZORClashParsing(char* inBuffer, int inLength)
    : path_(nullptr), buffer_(inBuffer), bufferLength_(inLength) {}

ZORClashParsing::ZORClashParsing(ZORClashParsing&) : ZORClashParsing(nullptr, 0) {}

// NOLINTNEXTLINE(bugprone-unhandled-self-assignment): takes nothing over
ZORClashParsing& ZORClashParsing::operator=(ZORClashParsing&) { return *this; }

ZORClashParsing::~ZORClashParsing() {
  path_ = nullptr;
  buffer_ = nullptr;
  bufferLength_ = 0;
  ZORClashDocumentIndex::Discard(*this);
}

// ---- Loading

HRESULT ZORClashParsing::LoadSequence(ZORUnicodeString& outKind, ZORUnicodeString& outReference,
                                      ZORUnicodeString& ioVersion) {
  ZORXMLParser::Initialize();
  outReference = ZORUnicodeString();
  DOM_Document document;
  HRESULT result = S_OK;
  if (!Parse({path_, buffer_, bufferLength_}, document, result)) return result;

  ZORClashDocumentIndex::Discard(*this);
  root_ = document.getDocumentElement();
  if (root_.isNull()) {
    outKind = "Unknown";
    documentKind_ = outKind;
    return E_FAIL;
  }
  const ZORUnicodeString name = ZORLyraGeneralServices::GetDOMName(root_);
  if (HasClashAttributes(name)) {
    outKind = name;
    outReference = GetAttrOnNode(root_, names::ZORDocument.ConvertToChar());
    ioVersion = GetAttrOnNode(root_, "Version");
    if (ioVersion.GetLengthInChar() == 0) ioVersion = kDefaultVersion;
  } else if (name == names::Components || name == "Errors") {
    outKind = name;
  } else {
    outKind = "Unknown";
  }
  documentKind_ = outKind;
  return S_OK;
}

HRESULT ZORClashParsing::LoadSequence(DOM_Document& outDocument, ZORUnicodeString& outKind) {
  ZORXMLParser::Initialize();
  HRESULT result = E_FAIL;
  DOM_Document document;
  if (!Parse({path_, buffer_, bufferLength_}, document, result)) return result;

  outDocument = document;
  ZORClashDocumentIndex::Discard(*this);
  root_ = document.getDocumentElement();
  if (!root_.isNull()) {
    result = S_OK;
    outKind = ZORLyraGeneralServices::GetDOMName(root_);
    documentKind_ = outKind;
  }
  return result;
}

// ---- Structure

DOM_NodeList ZORClashParsing::GetNodeList() {
  const bool listed = documentKind_ == "ClashElement" || documentKind_ == "FederatorClashElement";
  if (!listed || root_.isNull()) return DOM_NodeList();
  return root_.getChildNodes();
}

DOM_Node ZORClashParsing::GetElementsNode() {
  if (documentKind_ != "FederatorClashElement" || root_.isNull()) return DOM_Node();
  return FirstElement(root_, "Elements");
}

HRESULT ZORClashParsing::GetValideNode(DOM_Node inParent, int inIndex, ZORUnicodeString inName,
                                       DOM_Node& outNode) {
  const unsigned int childCount = inParent.getChildNodes().getLength();
  if (inIndex < 1 || static_cast<unsigned int>(inIndex) >= childCount) return E_FAIL;

  // The reader's index notices changes in the loaded document only.
  ZORClashDocumentIndex ownIndex;
  const bool isOurs = !root_.isNull() &&
                      adapter::AreSame(inParent.getOwnerDocument(), root_.getOwnerDocument()) &&
                      IsInDocument(inParent);
  ZORClashDocumentIndex& index = isOurs ? ZORClashDocumentIndex::Of(*this, root_) : ownIndex;
  const auto& children = index.NamedChildren(inParent, inName);
  if (static_cast<std::size_t>(inIndex) > children.size()) return E_FAIL;
  outNode = children[static_cast<std::size_t>(inIndex) - 1];
  return S_OK;
}

int ZORClashParsing::IsValideNode(int inPosition, ZORUnicodeString inName) {
  return IsElementNamed(ChildAt(root_, inPosition), inName) ? 1 : 0;
}

int ZORClashParsing::IsValideNode(int inPosition, int, ZORUnicodeString) {
  bool found = false;
  ForEachElement(ChildAt(root_, inPosition), names::ComponentShapes, [&](const DOM_Node& inShapes) {
    found = found || !FirstElement(inShapes, names::ComponentShape).isNull();
  });
  return found ? 1 : 0;
}

// ---- Attributes of the root, and errors

void ZORClashParsing::GetErrorId(ZORUnicodeString& outMessage, int& outErrorId) {
  outErrorId = -1;
  const DOM_Node error = FirstElement(root_, "Error");
  if (error.isNull()) return;
  outMessage = GetAttrOnNode(error, "Message");
  GetAttrOnNode(error, "ErrorId").ConvertToNum(&outErrorId, "%d");
}

ZORUnicodeString ZORClashParsing::GetServerMarker() {
  return GetAttrOnNode(root_, names::ServerMarker.ConvertToChar());
}

ZORUnicodeString ZORClashParsing::GetTransaction() {
  return GetAttrOnNode(root_, names::Transaction.ConvertToChar());
}

ZORUnicodeString ZORClashParsing::GetPRCName() {
  return GetAttrOnNode(root_, names::PRCName.ConvertToChar());
}

// ---- Reading attributes

ZORUnicodeString ZORClashParsing::GetAttrOnNode(DOM_Node inNode, const char* inName) {
  return ZORLyraGeneralServices::GetAttrOnNode(std::move(inNode), inName);
}

// -1.0 when there is no number, which marks incomplete placements.
double ZORClashParsing::GetAttrDoubleOnNode(DOM_Node inNode, const char* inName) {
  double value = 0.0;
  const ZORUnicodeString text = GetAttrOnNode(std::move(inNode), inName);
  return text.ConvertToNum(&value, "%le") != 0 ? value : -1.0;
}

// 0.0 when there is no number, unlike above: no offset.
double ZORClashParsing::TransDouble(DOM_NamedNodeMap inAttributes, char* inName) {
  double value = 0.0;
  const DOMString text = inAttributes.getNamedItem(inName).getNodeValue();
  ZORLyraGeneralServices::GetDOMName(text).ConvertToNum(&value, "%le");
  return value;
}

HRESULT ZORClashParsing::MergeDocuments(DOM_Document& ioFirst, DOM_Document& inSecond,
                                        ZORUnicodeString& ioTrace) {
  if (ioFirst.isNull() && inSecond.isNull()) {
    Trace(ioTrace, "!!!ERROR, Both documents are corrupted ");
    return E_FAIL;
  }
  if (ioFirst.isNull()) {
    ioFirst = inSecond;
    return S_OK;
  }

  DOM_Element firstRoot = ioFirst.getDocumentElement();
  Trace(ioTrace, "About to get Root Node of First Document");
  int firstCount = 0;
  DOM_Node resultSet = FindResultSet(firstRoot, firstCount);
  Trace(ioTrace, "About to get productsInSpec Node of First Document");
  DOM_Node products = FirstElement(firstRoot, "ProductsInSpec");
  // The nodes found so far remain those of the original first document.
  if (resultSet.isNull() && !inSecond.isNull()) ioFirst = inSecond;

  Trace(ioTrace, "About to append interferences of Second Document to first Document");
  if (inSecond.isNull()) {
    Trace(ioTrace, "Nothing to add to first Document");
    return S_OK;
  }
  const DOM_Element secondRoot = inSecond.getDocumentElement();
  const int secondCount = AppendInterferences(secondRoot, ioFirst, resultSet);
  Trace(ioTrace, "About to append productsInSpec of Second Document to first Document");
  AppendSpecifications(secondRoot, ioFirst, firstRoot, products);

  Trace(ioTrace, "About to set Number of Interference in XML");
  RewriteCount(firstRoot, SumOfCounts(firstCount, secondCount));
  return S_OK;
}
