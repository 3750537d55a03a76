// Finding the representation of a product.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORLYRAREPPATHBUILDER_H
#define ZOR_PLATFORM_VISUALISATION_ZORLYRAREPPATHBUILDER_H

#include <vector>

#include "platform/product_structure/ZORIProduct.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/visualisation/ZORRepPath.h"

/// Builds representation paths. The paths that it built and nobody deleted end with it.
class ZOR_PLATFORM_EXPORT ZORLyraRepPathBuilder {
 public:
  /// @param inLoadingStrategy 0: what is loaded already; other values mean the same.
  explicit ZORLyraRepPathBuilder(int inLoadingStrategy);
  ~ZORLyraRepPathBuilder();
  ZORLyraRepPathBuilder(const ZORLyraRepPathBuilder&) = delete;
  ZORLyraRepPathBuilder& operator=(const ZORLyraRepPathBuilder&) = delete;

  /// The path to the product's representation.
  /// @param inProduct a product of an opened model, or one that stands elsewhere than in its model.
  /// @param inPath    the alias path of the product that is meant, from below the root of
  ///                  inProduct's model down, joined by " --++-- "; empty: inProduct itself.
  /// @param outPath   null on failure.
  /// @return S_OK; E_INVALIDARG for a null product; E_FAIL when the model has no product of that
  ///         path, or the product shows nothing.
  HRESULT GetRepPathFromSpecObjV4(ZORIProduct_var inProduct, ZORUnicodeString inPath,
                                  ZORRepPath*& outPath);

 private:
  friend class ZORRepPath;
  std::vector<ZORRepPath*> paths_;
};

#endif
