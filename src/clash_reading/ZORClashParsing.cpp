// Building, loading, structure and root attributes.
#include "ZORClashParsing.h"

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
