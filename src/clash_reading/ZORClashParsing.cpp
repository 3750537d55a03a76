// Building, loading, structure and root attributes.
#include "ZORClashParsing.h"

#include <memory>

#include "ZORLyraGeneralServices.h"
#include "clash_reading/ElementWalk.h"
#include "clash_reading/NamedConstants.h"
#include "clash_reading/ZORClashDocumentIndex.h"
#include "platform/system/ZORFile.h"
#include "platform/xml/DOMParser.h"
#include "platform/xml/ZORXMLParser.h"

namespace {

constexpr int kReadAccess = 4;
constexpr const char* kMemoryIdentifier = "LIDPipodIBM";
constexpr const char* kDefaultVersion = "1.1";

bool HasClashAttributes(const ZORUnicodeString& inRootName) {
  return inRootName == "ClashElement" || inRootName == "InterferenceElement" ||
         inRootName == "FederatorClashElement";
}

}  // namespace

ZORClashParsing::ZORClashParsing(char* inPath)
    : path_(inPath), buffer_(nullptr), bufferLength_(0), index_(new ZORClashDocumentIndex) {}

ZORClashParsing::ZORClashParsing(char* inBuffer, int inLength)
    : path_(nullptr),
      buffer_(inBuffer),
      bufferLength_(inLength),
      index_(new ZORClashDocumentIndex) {}

ZORClashParsing::ZORClashParsing(ZORClashParsing&) : ZORClashParsing(nullptr, 0) {}

ZORClashParsing& ZORClashParsing::operator=(ZORClashParsing&) { return *this; }

ZORClashParsing::~ZORClashParsing() {
  path_ = nullptr;
  buffer_ = nullptr;
  bufferLength_ = 0;
  delete index_;
}

// ---- Loading

// @param ioResult set to the reason when the source is refused before parsing; a buffer source also
//                 leaves the code of its creation here.
// @return whether the source was parsed.
bool ZORClashParsing::ParseSource(DOM_Document& outDocument, HRESULT& ioResult) {
  ZORXMLParser::Initialize();
  DOMParser parser(nullptr);
  parser.setDoValidation(false);
  if (path_) {
    if (ZORFileAccess(path_, kReadAccess) != 0) {
      ioResult = E_FAIL;
      return false;
    }
    parser.parse(path_);
  } else {
    InputSource* created = nullptr;
    ioResult = ZORXMLParser::CreateMemBufInputSource(
        reinterpret_cast<const unsigned char*>(buffer_), static_cast<unsigned int>(bufferLength_),
        kMemoryIdentifier, 0, created);
    if (FAILED(ioResult)) return false;
    const std::unique_ptr<InputSource> source(created);
    parser.parse(*source);
  }
  outDocument = parser.getDocument();
  return true;
}

HRESULT ZORClashParsing::LoadSequence(ZORUnicodeString& outKind, ZORUnicodeString& outReference,
                                      ZORUnicodeString& ioVersion) {
  outReference = ZORUnicodeString();
  DOM_Document document;
  HRESULT result = S_OK;
  if (!ParseSource(document, result)) return result;

  root_ = document.getDocumentElement();
  index_->Refresh(root_);
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
  HRESULT result = E_FAIL;
  DOM_Document document;
  if (!ParseSource(document, result)) return result;

  outDocument = document;
  root_ = document.getDocumentElement();
  index_->Refresh(root_);
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

  // Only changes inside the loaded document are seen by the reader's index.
  ZORClashDocumentIndex ownIndex;
  const bool ours = !root_.isNull() && inParent.getOwnerDocument() == root_.getOwnerDocument() &&
                    IsInDocument(inParent);
  ZORClashDocumentIndex& index = ours ? *index_ : ownIndex;
  if (ours) index.Refresh(root_);
  const auto& children = index.NamedChildren(inParent, inName);
  if (static_cast<std::size_t>(inIndex) > children.size()) return E_FAIL;
  outNode = children[static_cast<std::size_t>(inIndex) - 1];
  return S_OK;
}

int ZORClashParsing::IsValideNode(int inPosition, ZORUnicodeString inName) {
  return IsElementNamed(ComponentAt(inPosition), inName) ? 1 : 0;
}

int ZORClashParsing::IsValideNode(int inPosition, int, ZORUnicodeString) {
  bool found = false;
  ForEachElement(ComponentAt(inPosition), names::ComponentShapes, [&](const DOM_Node& inShapes) {
    found = found || !FirstElement(inShapes, names::ComponentShape).isNull();
  });
  return found ? 1 : 0;
}

// A null node outside the root's children.
DOM_Node ZORClashParsing::ComponentAt(int inPosition) {
  return root_.getChildNodes().item(static_cast<unsigned int>(inPosition));
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

// -1.0 where there is no number: placements of interferences show by it what they lack.
double ZORClashParsing::GetAttrDoubleOnNode(DOM_Node inNode, const char* inName) {
  double value = 0.0;
  const ZORUnicodeString text = GetAttrOnNode(std::move(inNode), inName);
  return text.ConvertToNum(&value, "%le") != 0 ? value : -1.0;
}

// 0.0 where there is no number, unlike above: components take it as no offset.
double ZORClashParsing::TransDouble(DOM_NamedNodeMap inAttributes, char* inName) {
  double value = 0.0;
  const DOMString text = inAttributes.getNamedItem(inName).getNodeValue();
  ZORLyraGeneralServices::GetDOMName(text).ConvertToNum(&value, "%le");
  return value;
}
