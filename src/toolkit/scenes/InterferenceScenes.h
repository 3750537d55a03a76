// Interferences of a clash result on a model.
#ifndef ZOR_TOOLKIT_SCENES_INTERFERENCE_SCENES_H
#define ZOR_TOOLKIT_SCENES_INTERFERENCE_SCENES_H

#include <array>
#include <memory>
#include <optional>
#include <string>

#include "default_platform/InterferenceScene.h"
#include "toolkit/records/InterferenceRecord.h"

namespace ZORToolkit {

/// Where the products of an interference are placed.
enum class ProductPlaces {
  kResult,  ///< as the result says, if that can be trusted for both
  kModel
};

/// A product of an interference, looked up in a model.
struct ResolvedProduct {
  ZORDefault::SceneProduct shown;  ///< without a product where the model has none of that path
  std::string path;                ///< the alias path by which it was found; of a missing one, the
                                   ///< text that says which it is
  std::string colour;              ///< "#rrggbb" in pictures; empty for an assembly of many colours
};

/// All that an interference needs of a model for its picture.
struct ResolvedInterference {
  std::array<ResolvedProduct, 2> products;
  ZORDefault::InterferenceGeometry geometry;
  double curveLength = 0;  ///< of the curve on which some of its points are, millimetres; 0: none
  ZORDefault::SceneColours colours;
  /// Why the products are placed as in the model although the result has placements: one line of
  /// UTF-8, empty when they are placed where these say.
  std::string whyAsInModel;

  bool HasProduct() const {
    return !products[0].shown.product.IsNull() || !products[1].shown.product.IsNull();
  }
};

/// What a record says of the place of an interference. A viewpoint without a point and a direction
/// is none; a point without three numbers neither.
ZOR_TOOLKIT_EXPORT ZORDefault::InterferenceGeometry GeometryOf(const InterferenceRecord& inRecord);

/// Why a placement cannot be where the product was: there is none, its numbers are not those that
/// were written, or it is no rotation and translation.
/// @return empty when it can.
ZOR_TOOLKIT_EXPORT std::string WhyNotTrusted(const ProductRecord& inProduct);

/// Looks up the interferences of results in one model. What was looked up once is remembered.
class ZOR_TOOLKIT_EXPORT InterferenceScenes {
 public:
  /// @param inRoot the root of an opened model.
  explicit InterferenceScenes(const ZORIProduct_var& inRoot);
  ~InterferenceScenes();
  InterferenceScenes(const InterferenceScenes&) = delete;
  InterferenceScenes& operator=(const InterferenceScenes&) = delete;

  /// Finds the products of an interference in the model, and how they are placed and coloured.
  ResolvedInterference Resolve(const InterferenceRecord& inRecord, ProductPlaces inPlaces);

 private:
  struct Found;
  const Found& Find(const std::string& inPath);
  void Resolve(const ProductRecord& inRecord, ResolvedProduct& outProduct);

  struct Memory;
  std::unique_ptr<Memory> memory_;
};

/// A scene for PrintPictures.
ZOR_TOOLKIT_EXPORT ZORDefault::InterferenceScene MakeScene(const ResolvedInterference& inResolved);
/// The same of one interference, its products placed as the result says.
/// @param inRoot the root of an opened model.
ZOR_TOOLKIT_EXPORT ZORDefault::InterferenceScene MakeScene(const InterferenceRecord& inRecord,
                                                           const ZORIProduct_var& inRoot);

}  // namespace ZORToolkit

#endif
