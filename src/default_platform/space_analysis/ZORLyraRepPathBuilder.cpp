#include "platform/visualisation/ZORLyraRepPathBuilder.h"

#include "default_platform/product_structure/Product.h"
#include "default_platform/system/ObjectCounters.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"

namespace {

ZORDefault::ObjectCounter& Counter() {
  static ZORDefault::ObjectCounter& counter = ZORDefault::CounterOf("ZORLyraRepPathBuilder");
  return counter;
}

ZORIProduct_var RootOf(const ZORIProduct_var& inProduct) {
  ZORIProduct_var root = inProduct;
  for (ZORIProduct_var father = root; !father.IsNull(); father = father->GetFatherProduct())
    root = father;
  return root;
}

/// Also of a product that stands elsewhere than in its model.
ZORDefault::Product* ModelProductOf(const ZORIProduct_var& inProduct) {
  const ZORInterfaceHandle<ZORDefault::ProductIdentity> identity = inProduct;
  return identity.IsNull() ? nullptr : &identity->GetProduct();
}

ZORIProduct_var Resolve(const ZORIProduct_var& inProduct, const ZORUnicodeString& inPath) {
  if (inPath.GetLengthInChar() == 0) return inProduct;
  const ZORIProduct_var found = ZORDefault::FindProduct(RootOf(inProduct), inPath);
  return ModelProductOf(found) == ModelProductOf(inProduct) ? inProduct : found;
}

}  // namespace

ZORLyraRepPathBuilder::ZORLyraRepPathBuilder(int) { ++Counter().built; }

ZORLyraRepPathBuilder::~ZORLyraRepPathBuilder() {
  for (ZORRepPath* const path : paths_) {
    path->builder_ = nullptr;
    delete path;
  }
  ++Counter().released;
}

HRESULT ZORLyraRepPathBuilder::GetRepPathFromSpecObjV4(ZORIProduct_var inProduct,
                                                       ZORUnicodeString inPath,
                                                       ZORRepPath*& outPath) {
  outPath = nullptr;
  if (inProduct.IsNull()) return E_INVALIDARG;
  const ZORI3DGeoVisu_var visualised = Resolve(inProduct, inPath);
  ZORRep* const rep = visualised.IsNull() ? nullptr : visualised->GetRep();
  if (!rep) return E_FAIL;
  outPath = new ZORRepPath(this, rep);
  paths_.push_back(outPath);
  return S_OK;
}
