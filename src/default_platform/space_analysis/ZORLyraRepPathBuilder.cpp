#include "platform/visualisation/ZORLyraRepPathBuilder.h"

#include "default_platform/product_structure/Product.h"
#include "default_platform/system/ObjectCounters.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "platform/visualisation/ZORRepPath.h"

namespace {

ZORIProduct_var RootOf(const ZORIProduct_var& inProduct) {
  ZORIProduct_var root = inProduct;
  for (ZORIProduct_var parent = root; !parent.IsNull(); parent = parent->GetFatherProduct())
    root = parent;
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

ZORLyraRepPathBuilder::ZORLyraRepPathBuilder(int) {
  ++ZORDefault::CounterOf<ZORLyraRepPathBuilder>("ZORLyraRepPathBuilder").built;
}

ZORLyraRepPathBuilder::~ZORLyraRepPathBuilder() {
  for (ZORRepPath* const path : paths_) {
    path->builder_ = nullptr;
    delete path;
  }
  ++ZORDefault::CounterOf<ZORLyraRepPathBuilder>("ZORLyraRepPathBuilder").released;
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

ZORRepPath::ZORRepPath(ZORLyraRepPathBuilder* inBuilder, ZORRep* inRep)
    : builder_(inBuilder), reps_{inRep} {
  ++ZORDefault::CounterOf<ZORRepPath>("ZORRepPath").built;
}

ZORRepPath::~ZORRepPath() {
  if (builder_) std::erase(builder_->paths_, this);
  ++ZORDefault::CounterOf<ZORRepPath>("ZORRepPath").released;
}

void ZORRepPath::Rewind() { next_ = 0; }

ZORRep* ZORRepPath::NextChildRep() { return next_ < reps_.size() ? reps_[next_++] : nullptr; }
