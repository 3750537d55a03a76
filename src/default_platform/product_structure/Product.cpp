#include "default_platform/product_structure/Product.h"

#include <cstring>

#include "default_platform/product_structure/ModelDocument.h"
#include "default_platform/visualisation/SceneGraph.h"
#include "platform/system/ZORGetEnv.h"
#include "platform/visualisation/ZOR3DBagRep.h"

namespace ZORDefault {
namespace {

constexpr int kShownRepresentation = 1;
constexpr int kAllProperties = 11;
constexpr int kWholeGeometry = 5;

/// The colour that a product has itself: as an instance, else from its part.
const std::optional<PartColour>& OwnColourOf(const Product& inProduct) {
  const auto& colour = inProduct.GetModelProduct().colour;
  return colour ? colour : inProduct.GetPart().colour;
}

/// The colour in which a part is shown: its own, else that of the nearest product above it.
const PartColour* ShownColourOf(const Product& inProduct) {
  for (const Product* product = &inProduct; product; product = product->GetParent())
    if (const auto& colour = OwnColourOf(*product)) return &*colour;
  return nullptr;
}

/// A name may contain the separator, so the path is split at every one in turn.
Product* FindBelow(const Product& inParent, const ZORUnicodeString& inPath) {
  static const ZORUnicodeString kSeparator(" --++-- ");
  for (Product* const child : inParent.GetChildren())
    if (child->IsCalled(inPath)) return child;
  for (int end = inPath.SearchSubString(kSeparator); end >= 0;
       end = inPath.SearchSubString(kSeparator, end + 1)) {
    const ZORUnicodeString name = inPath.SubString(0, end);
    const ZORUnicodeString rest = inPath.SubString(end + kSeparator.GetLengthInChar());
    for (Product* const child : inParent.GetChildren()) {
      Product* const found = child->IsCalled(name) ? FindBelow(*child, rest) : nullptr;
      if (found) return found;
    }
  }
  return nullptr;
}

}  // namespace

const IID& ProductIdentity::ClassId() {
  static const IID& identifier = RegisterInterface("ZORProductIdentity", "ProductStructure");
  return identifier;
}

Product::Product(ModelDocument& inDocument, std::size_t inIndex, Product* inParent)
    : document_(&inDocument),
      index_(inIndex),
      parent_(inParent),
      product_(*this),
      inSession_(*this),
      alias_(*this),
      specObject_(*this),
      linkable_(*this),
      geoVisu_(*this),
      visProperties_(*this),
      identity_(*this) {
  rootFromProduct_ = GetModelProduct().parentFromProduct;
  if (parent_) rootFromProduct_ = parent_->rootFromProduct_ * rootFromProduct_;
  if (const auto& colour = OwnColourOf(*this))
    properties_.SetColor((*colour)[0], (*colour)[1], (*colour)[2]);
}

Product::~Product() {
  if (rep_) rep_->Destroy();
}

ZORBaseUnknown* Product::FindFacet(const IID& inInterface) {
  if (inInterface == ZORBaseUnknown::ClassId() || inInterface == ZORIProduct::ClassId())
    return &product_;
  if (inInterface == ZORIProductInSession::ClassId()) return &inSession_;
  if (inInterface == ZORIAlias::ClassId()) return &alias_;
  if (inInterface == ZORISpecObject::ClassId()) return &specObject_;
  if (inInterface == ZORILinkableObject::ClassId()) return &linkable_;
  if (inInterface == ZORI3DGeoVisu::ClassId()) return &geoVisu_;
  if (inInterface == ZORIVisProperties::ClassId()) return &visProperties_;
  return inInterface == ProductIdentity::ClassId() ? &identity_ : nullptr;
}

ZORMetaClass* Product::GetClass() const {
  static ZORMetaClass* const meta = fct_RetrieveMetaObject(
      "ZORModelProduct", kZORTypeImplementation, ZORBaseUnknown::MetaObject(), "ZORNull",
      "ProductStructure", sizeof(Product));
  return meta;
}

unsigned int Product::AddReference() { return document_->AddReference(); }
unsigned int Product::ReleaseReference() { return document_->ReleaseReference(); }

const ModelProduct& Product::GetModelProduct() const {
  return document_->GetModel().products[index_];
}
const ModelPart& Product::GetPart() const {
  return document_->GetModel().parts[GetModelProduct().part];
}
const ZORUnicodeString& Product::GetAlias() const { return document_->GetAlias(index_); }

ProductInfo Product::GetInfo() const {
  const ModelPart& part = GetPart();
  ProductInfo info;
  info.alias = GetAlias();
  info.instanceName = UnicodeFromUtf16(GetModelProduct().name);
  info.partName = UnicodeFromUtf16(part.name);
  info.part = GetModelProduct().part;
  info.isAssembly = part.isAssembly;
  info.parentFromProduct = GetModelProduct().parentFromProduct;
  info.rootFromProduct = rootFromProduct_;
  info.colour = OwnColourOf(*this);
  info.triangles = part.mesh ? part.mesh->triangles.size() : 0;
  info.area = part.area;
  info.failedToTessellate = part.failedToTessellate;
  info.facesWithoutTriangles = part.facesWithoutTriangles;
  info.mesh = part.mesh;
  return info;
}

bool Product::IsCalled(const ZORUnicodeString& inName) const {
  if (GetAlias() == inName) return true;
  const bool hasName = !GetModelProduct().name.empty() || !GetPart().name.empty();
  return !hasName && inName == ("=>[" + GetPart().label + "]").c_str();
}

ZOR3DRep* Product::GetRep() {
  if (!isRepMade_) MakeRep();
  isRepMade_ = true;
  return rep_;
}

void Product::MakeRep() {
  if (HasGeometry()) {
    rep_ = new PlacedMeshRep(GetPart().mesh, rootFromProduct_, ShownColourOf(*this));
  } else {
    ZOR3DBagRep* bag = nullptr;
    for (Product* const child : children_) {
      ZOR3DRep* const rep = child->GetRep();
      if (!rep) continue;
      if (!bag) rep_ = bag = new ZOR3DBagRep();
      bag->AddChild(rep);
    }
  }
  // The inheritance may have been set before there was a representation.
  unsigned int flag = 0;
  if (rep_ && SUCCEEDED(properties_.GetInheritance(ZORVisPropertiesValues::kColour, flag)) && flag)
    ShowColour(properties_);
}

void Product::ShowColour(const ZORVisPropertiesValues& inValues) {
  unsigned int red = 0, green = 0, blue = 0, flag = 0;
  if (FAILED(inValues.GetColor(red, green, blue))) return;
  if (FAILED(inValues.GetInheritance(ZORVisPropertiesValues::kColour, flag))) flag = 0;
  rep_->SetColorRGBA(red, green, blue, 255);
  rep_->SetInheritanceMode(flag ? ZORRep::kOwnColour | ZORRep::kImposeColour : ZORRep::kOwnColour);
}

void Product::SetProperties(const ZORVisPropertiesValues& inValues) {
  properties_ = inValues;
  if (rep_) ShowColour(properties_);
}

ZORListValZORBaseUnknown_var* Product::ProductFacet::GetChildren(const char* inInterfaceName) {
  const IID* const wanted = FindInterface(inInterfaceName);
  if (!wanted) return nullptr;
  auto* const list = new ZORListValZORBaseUnknown_var();
  for (Product* const child : self_.children_)
    if (ZORBaseUnknown* const facet = child->FindFacet(*wanted)) list->Append(facet);
  return list;
}

ZORIProduct_var Product::ProductFacet::GetFatherProduct() {
  return self_.parent_ ? ZORIProduct_var(&self_.parent_->product_) : ZORIProduct_var();
}

HRESULT Product::InSessionFacet::GetRepresentationName(int& outState, int inShown,
                                                       ZORUnicodeString& outName) {
  if (inShown != kShownRepresentation) return E_INVALIDARG;
  outState = self_.HasGeometry() ? 1 : 0;
  outName = ZORUnicodeString();
  if (!self_.HasGeometry()) return S_OK;
  outName = UnicodeFromUtf16(self_.GetPart().name);
  if (outName.GetLengthInChar() == 0) outName = self_.GetAlias();
  return S_OK;
}

HRESULT Product::InSessionFacet::GetRepresentation(int& outState, int inShown,
                                                   ZORBaseUnknown_var& outRep) {
  if (inShown != kShownRepresentation) return E_INVALIDARG;
  outState = self_.HasGeometry() ? 1 : 0;
  outRep = ZORBaseUnknown_var();
  if (!self_.HasGeometry()) return E_FAIL;
  outRep = ZORBaseUnknown_var(&self_.geoVisu_);
  return S_OK;
}

ZORISpecObject* Product::SpecObjectFacet::GetFather() {
  if (!self_.parent_) return nullptr;
  self_.parent_->AddReference();
  return &self_.parent_->specObject_;
}

ZORDocument* Product::LinkableFacet::GetDocument() { return self_.document_->GetInterface(); }

ZORRep* Product::GeoVisuFacet::GetRep() { return self_.GetRep(); }

HRESULT Product::VisPropertiesFacet::GetPropertiesAtt(ZORVisPropertiesValues& outValues,
                                                      int inProperties, int inGeometry, int, int) {
  if (inProperties != kAllProperties || inGeometry != kWholeGeometry) return E_INVALIDARG;
  outValues = self_.GetProperties();
  return S_OK;
}

HRESULT Product::VisPropertiesFacet::SetPropertiesAtt(const ZORVisPropertiesValues& inValues) {
  self_.SetProperties(inValues);
  return S_OK;
}

bool GetProductInfo(ZORIProduct* inProduct, ProductInfo& outInfo) {
  const ZORInterfaceHandle<ProductIdentity> product = ZORIProduct_var(inProduct);
  if (product.IsNull()) return false;
  outInfo = product->GetProduct().GetInfo();
  return true;
}

ZORIProduct_var FindProduct(const ZORIProduct_var& inRoot, const ZORUnicodeString& inAliasPath) {
  const ZORInterfaceHandle<ProductIdentity> root = inRoot;
  if (root.IsNull()) return {};
  Product* const found = FindBelow(root->GetProduct(), inAliasPath);
  return found ? ZORIProduct_var(found->GetInterface()) : ZORIProduct_var();
}

}  // namespace ZORDefault

int ZORPrdNewVisuMode() {
  const char* const mode = ZORGetEnv("ZOR_NEW_VISU_MODE");
  return mode && std::strcmp(mode, "0") == 0 ? 0 : 1;
}
