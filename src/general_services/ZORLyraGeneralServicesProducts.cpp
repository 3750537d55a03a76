// Storage identifiers of products, product trees, providers of documents.
#include <memory>
#include <utility>
#include <vector>

#include "ZORLyraGeneralServices.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/product_structure/ZORILinkableObject.h"
#include "platform/product_structure/ZORIProductInSession.h"
#include "platform/product_structure/ZORIProviders.h"
#include "platform/product_structure/ZORISpecObject.h"
#include "platform/system/ZORListValZORUnicodeString.h"

namespace {

constexpr char kVersionSeparator[] = "<uuiddv>";
constexpr int kVersionSeparatorLength = 8;
constexpr char kPathSeparator[] = " --++-- ";
constexpr int kShownRepresentation = 1;

struct Releaser {
  void operator()(ZORBaseUnknown* inComponent) const { inComponent->Release(); }
};
/// An interface that came with a reference, which goes with this pointer.
template <class Interface>
using Referenced = std::unique_ptr<Interface, Releaser>;

/// An interface of a component; null when the component refuses it or gives nothing.
template <class Interface>
Referenced<Interface> Ask(ZORBaseUnknown& inComponent, const IID& inInterface, HRESULT& outResult) {
  void* found = nullptr;
  outResult = inComponent.QueryInterface(inInterface, &found);
  return Referenced<Interface>(SUCCEEDED(outResult) ? static_cast<Interface*>(found) : nullptr);
}

bool HasNamedRepresentation(ZORIProductInSession& inSession) {
  int state = 0;
  ZORUnicodeString name;
  return inSession.GetRepresentationName(state, kShownRepresentation, name) == S_OK && name != "";
}

/// The answer counts, not the handle: a representation may not be loaded yet.
bool HasRepresentation(ZORIProductInSession& inSession) {
  int state = 0;
  ZORBaseUnknown_var representation;
  return SUCCEEDED(inSession.GetRepresentation(state, kShownRepresentation, representation));
}

bool HasOwnRepresentation(ZORIProduct& inProduct) {
  HRESULT result = E_FAIL;
  const auto session =
      Ask<ZORIProductInSession>(inProduct, ZORIProductInSession::ClassId(), result);
  if (result != S_OK) return false;
  if (!session) ThrowErrorNullVar();
  return ZORPrdNewVisuMode() == 0 ? HasNamedRepresentation(*session) : HasRepresentation(*session);
}

/// A product whose children are being expanded.
struct Level {
  Referenced<ZORIProduct> product;  // null for the product that the caller holds
  std::unique_ptr<ZORListValZORBaseUnknown_var> children;
  int done = 0;

  bool HasNext() const { return children && done < children->Size(); }
  Referenced<ZORIProduct> Next() {
    const ZORBaseUnknown_var& child = (*children)[++done];
    HRESULT ignored = E_FAIL;
    if (child.IsNull()) return nullptr;
    return Ask<ZORIProduct>(*child.GetInterface(), ZORIProduct::ClassId(), ignored);
  }
};

/// Lists the product itself where it counts, and takes its children.
Level Enter(ZORIProduct& inProduct, ZORListValZORBaseUnknown_var& ioList) {
  Level level;
  level.children.reset(inProduct.GetChildren("ZORIProduct"));
  if (!level.HasNext() || HasOwnRepresentation(inProduct))
    ioList.Append(ZORBaseUnknown_var(&inProduct));
  return level;
}

/// The aliases of a product and all above it, from the product to the root.
ZORListValZORUnicodeString AliasesToRoot(ZORIProduct_var inProduct) {
  ZORListValZORUnicodeString aliases;
  for (ZORIAlias_var alias = inProduct; !alias.IsNull(); alias = inProduct) {
    aliases.Append(alias->GetAlias());
    const ZORISpecObject_var object = inProduct;
    const Referenced<ZORISpecObject> father(object->GetFather());
    inProduct = ZORISpecObject_var(father.get());
  }
  return aliases;
}

}  // namespace

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
  const int separator = inStorageId.SearchSubString(kVersionSeparator);
  if (separator < 0) {
    outPDMId = inStorageId;
    return S_OK;
  }
  const int version = separator + kVersionSeparatorLength;
  outPDMId = inStorageId.SubString(0, separator);
  outDocumentVersionId = inStorageId.SubString(version, inStorageId.GetLengthInChar() - version);
  return S_OK;
}

// With levels of its own instead of a call a level, so that a deep tree needs no deep stack.
void ZORLyraGeneralServices::Expand(ZORIProduct* inProduct, ZORListValZORBaseUnknown_var& ioList) {
  if (!inProduct) return;
  std::vector<Level> levels;
  levels.push_back(Enter(*inProduct, ioList));
  while (!levels.empty()) {
    if (!levels.back().HasNext()) {
      levels.pop_back();
    } else if (Referenced<ZORIProduct> child = levels.back().Next()) {
      levels.push_back(Enter(*child, ioList));
      levels.back().product = std::move(child);
    }
  }
}

ZORUnicodeString ZORLyraGeneralServices::GetPathRoot(ZORIProduct_var inProduct) {
  const ZORListValZORUnicodeString aliases = AliasesToRoot(inProduct);
  const int last = aliases.Size() - 1;  // below the root
  if (last < 1) return "";
  ZORUnicodeString path = aliases[last];
  for (int i = last - 1; i >= 1; --i) path.Append(kPathSeparator).Append(aliases[i]);
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
  const auto implemented = Ask<ZORBaseUnknown>(*inProvider.GetInterface(), inInterface, result);
  if (!implemented) return E_FAIL;
  const auto provider =
      Ask<ZORBaseUnknown>(*inProvider.GetInterface(), ZORBaseUnknown::ClassId(), result);
  if (!provider) return E_FAIL;
  return providers->AddProvider(inInterface, provider.get());
}
