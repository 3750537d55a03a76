#include "ZORLyraGeneralServices.h"

#include <memory>
#include <vector>

#include "LogicalNames.h"
#include "PlatformAdapter.h"
#include "platform/knowledge/ZORParmDictionary.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/product_structure/ZORILinkableObject.h"
#include "platform/product_structure/ZORIProductInSession.h"
#include "platform/product_structure/ZORIProviders.h"
#include "platform/product_structure/ZORISpecObject.h"
#include "platform/system/ZORListValZORUnicodeString.h"
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

constexpr char kVersionSeparator[] = "<uuiddv>";
constexpr int kVersionSeparatorLength = 8;
constexpr char kAliasSeparator[] = " --++-- ";
constexpr int kShownRepresentation = 1;

/// Queries a component (a pointer or a handle) for an interface. Empty if the query fails or yields
/// null. The reference that the query added is released at once: the handle holds its own.
template <class Interface, class Component>
ZORInterfaceHandle<Interface> Ask(const Component& inComponent, const IID& inInterface,
                                  HRESULT& outResult) {
  void* found = nullptr;
  outResult = inComponent->QueryInterface(inInterface, &found);
  if (FAILED(outResult) || !found) return ZORInterfaceHandle<Interface>();
  auto* const component = static_cast<Interface*>(found);
  const ZORInterfaceHandle<Interface> handle(component);
  component->Release();
  return handle;
}

bool HasNamedRepresentation(const ZORIProductInSession_var& inSession) {
  int state = 0;
  ZORUnicodeString name;
  return inSession->GetRepresentationName(state, kShownRepresentation, name) == S_OK && name != "";
}

/// Success alone decides: the handle is null while a representation is not loaded.
bool HasRepresentation(const ZORIProductInSession_var& inSession) {
  int state = 0;
  ZORBaseUnknown_var representation;
  return SUCCEEDED(inSession->GetRepresentation(state, kShownRepresentation, representation));
}

bool HasOwnRepresentation(ZORIProduct* inProduct) {
  HRESULT result = E_FAIL;
  const auto session =
      Ask<ZORIProductInSession>(inProduct, ZORIProductInSession::ClassId(), result);
  if (result != S_OK) return false;
  return ZORPrdNewVisuMode() == 0 ? HasNamedRepresentation(session) : HasRepresentation(session);
}

/// A product and how many of its children have been expanded.
struct Level {
  ZORIProduct_var product;
  std::unique_ptr<ZORListValZORBaseUnknown_var> children;
  int done = 0;

  bool HasNext() const { return children && done < children->Size(); }
  ZORIProduct_var Next() {
    const ZORBaseUnknown_var& child = (*children)[++done];
    HRESULT ignored = E_FAIL;
    if (child.IsNull()) return ZORIProduct_var();
    return Ask<ZORIProduct>(child, ZORIProduct::ClassId(), ignored);
  }
};

/// Lists the product itself if it qualifies, and fetches its children.
Level Enter(ZORIProduct* inProduct, ZORListValZORBaseUnknown_var& ioList) {
  Level level;
  level.product = ZORIProduct_var(inProduct);
  level.children.reset(inProduct->GetChildren("ZORIProduct"));
  if (!level.HasNext() || HasOwnRepresentation(inProduct))
    ioList.Append(ZORBaseUnknown_var(inProduct));
  return level;
}

/// The aliases of a product and all above it, from the product to the root.
ZORListValZORUnicodeString AliasesToRoot(ZORIProduct_var inProduct) {
  ZORListValZORUnicodeString aliases;
  for (ZORIAlias_var alias = inProduct; !alias.IsNull(); alias = inProduct) {
    aliases.Append(alias->GetAlias());
    const ZORISpecObject_var object = inProduct;
    ZORISpecObject* const parent = object->GetFather();
    inProduct = ZORISpecObject_var(parent);
    if (parent) parent->Release();
  }
  return aliases;
}

}  // namespace

ZORUnicodeString ZORLyraGeneralServices::GetAttrOnNode(DOM_Node inNode, const char* inName) {
  ZORUnicodeString text;
  adapter::AttributeSource(inNode).Read(inName, text);
  return text;
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

ZORUnicodeString ZORLyraGeneralServices::BuildStorageProdIdFromPDMIdDV(
    const ZORUnicodeString& inPDMId, const ZORUnicodeString& inDocumentVersionId) {
  if (inDocumentVersionId.GetLengthInChar() == 0) return inPDMId;
  return inPDMId + kVersionSeparator + inDocumentVersionId;
}

HRESULT ZORLyraGeneralServices::GetPDMIdDVFromStorageProdId(
    const ZORUnicodeString& inStorageId, ZORUnicodeString& outPDMId,
    ZORUnicodeString& outDocumentVersionId) {
  outPDMId = "";
  outDocumentVersionId = "";
  if (inStorageId.GetLengthInChar() == 0) return E_FAIL;
  const int separator = inStorageId.SearchSubString(kVersionSeparator, 0, adapter::kSearchForward);
  if (separator < 0) {
    outPDMId = inStorageId;
    return S_OK;
  }
  const int version = separator + kVersionSeparatorLength;
  outPDMId = inStorageId.SubString(0, separator);
  outDocumentVersionId = inStorageId.SubString(version, inStorageId.GetLengthInChar() - version);
  return S_OK;
}

// Iterative, so that a deep tree does not need a deep call stack.
void ZORLyraGeneralServices::Expand(ZORIProduct* inProduct, ZORListValZORBaseUnknown_var& ioList) {
  if (!inProduct) return;
  std::vector<Level> levels;
  levels.push_back(Enter(inProduct, ioList));
  while (!levels.empty()) {
    if (!levels.back().HasNext()) {
      levels.pop_back();
      continue;
    }
    const ZORIProduct_var child = levels.back().Next();
    if (!child.IsNull()) levels.push_back(Enter(child.operator->(), ioList));
  }
}

ZORUnicodeString ZORLyraGeneralServices::GetPathRoot(ZORIProduct_var inProduct) {
  const ZORListValZORUnicodeString aliases = AliasesToRoot(inProduct);
  const int last = aliases.Size() - 1;  // below the root
  if (last < 1) return "";
  ZORUnicodeString path = aliases[last];
  for (int i = last - 1; i >= 1; --i) path.Append(kAliasSeparator).Append(aliases[i]);
  return path;
}

HRESULT ZORLyraGeneralServices::RegisterProvider(const IID& inInterface,
                                                 ZORBaseUnknown_var& inProvider,
                                                 ZORDocument* inDocument) {
  if (inProvider.IsNull()) return E_FAIL;
  if (!inDocument) {
    const ZORILinkableObject_var linkable = inProvider;
    inDocument = linkable.IsNull() ? nullptr : linkable->GetDocument();
  }
  const ZORIProviders_var providers = ZORDocument_var(inDocument);
  if (providers.IsNull()) return E_FAIL;

  HRESULT result = E_FAIL;
  const auto implemented = Ask<ZORBaseUnknown>(inProvider, inInterface, result);
  if (implemented.IsNull()) return E_FAIL;
  const auto provider = Ask<ZORBaseUnknown>(inProvider, ZORBaseUnknown::ClassId(), result);
  if (provider.IsNull()) return E_FAIL;
  return providers->AddProvider(inInterface, provider.operator->());
}
