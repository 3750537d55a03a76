#include "toolkit/scenes/InterferenceScenes.h"

#include <gtest/gtest.h>

#include "default_platform/OpenModel.h"
#include "platform/product_structure/ZORIAlias.h"

namespace {

using namespace ZORToolkit;

constexpr char kNut[] = "rod-assembly_1 --++-- nut_1";
constexpr char kRod[] = "rod-assembly_1 --++-- rod_1";

/// Opened once; its products are not changed by tests.
const ZORIProduct_var& Root() {
  static const ZORDefault::OpenedModel model = [] {
    ZORDefault::ModelOptions options;
    options.useCache = false;
    return ZORDefault::OpenModel(ZOR_SOURCE_DIR "/samples/as1-oc-214.stp", options);
  }();
  return model.root;
}

/// A quarter turn about z, then a translation.
ProductRecord Product(const std::string& inId) {
  ProductRecord product;
  product.exists = true;
  product.id = inId;
  product.placement = {0, 1, 0, -1, 0, 0, 0, 0, 1, 1, 2, 3};
  return product;
}
InterferenceRecord Record(const ProductRecord& inFirst, const ProductRecord& inSecond) {
  InterferenceRecord record;
  record.products = {inFirst, inSecond};
  return record;
}
NumberTriple Triple(double inX, double inY, double inZ) {
  return {Number(inX), Number(inY), Number(inZ)};
}
ResolvedInterference Resolve(const InterferenceRecord& inRecord,
                             ProductPlaces inPlaces = ProductPlaces::kResult) {
  return InterferenceScenes(Root()).Resolve(inRecord, inPlaces);
}

ViewpointRecord Viewpoint() {
  ViewpointRecord viewpoint;
  viewpoint.projection = "Cylindrique";
  viewpoint.focusDistance = Number(std::string("200,5"));
  viewpoint.point = Triple(1, 2, 3);
  viewpoint.sight = Triple(0, 2, 0);
  return viewpoint;
}

TEST(GeometryOf, PointsAreThoseOfThreeNumbers) {
  InterferenceRecord record;
  record.points = {Triple(1, 2, 3), {Number(1), Number(std::string("")), Number(3)}};
  const ZORDefault::InterferenceGeometry geometry = GeometryOf(record);
  ASSERT_EQ(1u, geometry.points.size());
  EXPECT_EQ(3, geometry.points[0].z);
}

TEST(GeometryOf, ClearanceHasADimensionLine) {
  InterferenceRecord record;
  EXPECT_EQ(ZORDefault::MarkerKind::kBalls, GeometryOf(record).markers);
  record.type = "Clearance";
  EXPECT_EQ(ZORDefault::MarkerKind::kDimension, GeometryOf(record).markers);
}

TEST(GeometryOf, ViewpointIsTheRecords) {
  InterferenceRecord record;
  record.viewpoint = Viewpoint();
  const auto viewpoint = GeometryOf(record).viewpoint;
  ASSERT_TRUE(viewpoint);
  EXPECT_EQ(ZOR3DViewpoint::kCylindric, viewpoint->projection);
  EXPECT_EQ(200.5, viewpoint->focusDistance);
  EXPECT_EQ(0, viewpoint->nearPlane);
}

TEST(GeometryOf, ViewpointWithoutSightOrPointIsNone) {
  InterferenceRecord record;
  record.viewpoint = Viewpoint();
  record.viewpoint->sight = Triple(0, 0, 0);
  EXPECT_FALSE(GeometryOf(record).viewpoint);
  record.viewpoint = Viewpoint();
  record.viewpoint->point[1] = Number();
  EXPECT_FALSE(GeometryOf(record).viewpoint);
}

TEST(WhyNotTrusted, RotationAndTranslationAreTrusted) {
  EXPECT_EQ("", WhyNotTrusted(Product("a")));
}

TEST(WhyNotTrusted, RotationOfSixDigitsIsTrusted) {
  ProductRecord product = Product("a");
  product.placement = {0.707107, 0.707107, 0, -0.707107, 0.707107, 0, 0, 0, 1, 0, 0, 0};
  EXPECT_EQ("", WhyNotTrusted(product));
}

TEST(WhyNotTrusted, WhatWasMisreadIsNot) {
  ProductRecord product = Product("a");
  product.whyMisread = "its numbers are cut at a decimal comma";
  EXPECT_EQ(product.whyMisread, WhyNotTrusted(product));
}

TEST(WhyNotTrusted, ScaleShearMirrorAndZerosAreNot) {
  for (const Placement& placement :
       {Placement{2, 0, 0, 0, 2, 0, 0, 0, 2}, Placement{1, 0, 0, 0.5, 1, 0, 0, 0, 1},
        Placement{-1, 0, 0, 0, 1, 0, 0, 0, 1}, Placement{}}) {
    ProductRecord product = Product("a");
    product.placement = placement;
    EXPECT_EQ("its matrix is no rotation", WhyNotTrusted(product));
  }
}

TEST(WhyNotTrusted, PositionThatIsNotFiniteIsNot) {
  ProductRecord product = Product("a");
  product.placement[10] = HUGE_VAL;
  EXPECT_EQ("its position is not finite", WhyNotTrusted(product));
}

TEST(InterferenceScenes, ProductsArePlacedAsTheResultSays) {
  const ResolvedInterference resolved = Resolve(Record(Product(kNut), Product(kRod)));
  EXPECT_EQ("", resolved.whyAsInModel);
  EXPECT_EQ(kNut, resolved.products[0].path);
  EXPECT_EQ(kRod, resolved.products[1].path);
  ASSERT_TRUE(resolved.products[1].shown.rootFromProduct);
  EXPECT_EQ(3, resolved.products[1].shown.rootFromProduct->GetVector().z);
}

TEST(InterferenceScenes, ProductsArePlacedAsInTheModelWhenAskedFor) {
  const ResolvedInterference resolved =
      Resolve(Record(Product(kNut), Product(kRod)), ProductPlaces::kModel);
  EXPECT_EQ("", resolved.whyAsInModel);
  EXPECT_FALSE(resolved.products[0].shown.rootFromProduct);
}

TEST(InterferenceScenes, OnePlacementThatIsNotTrustedPutsBothAsInTheModel) {
  ProductRecord rod = Product(kRod);
  rod.whyMisread = "the result has no matrix of it";
  const ResolvedInterference resolved = Resolve(Record(Product(kNut), rod));
  EXPECT_EQ(std::string(kRod) + ": the result has no matrix of it", resolved.whyAsInModel);
  EXPECT_FALSE(resolved.products[0].shown.rootFromProduct);
  EXPECT_FALSE(resolved.products[1].shown.rootFromProduct);
}

TEST(InterferenceScenes, MissingProductIsEmptyAndItsTextIsKept) {
  const ResolvedInterference resolved = Resolve(Record(Product("gone"), Product(kRod)));
  EXPECT_TRUE(resolved.products[0].shown.product.IsNull());
  EXPECT_EQ("gone", resolved.products[0].path);
  EXPECT_EQ("", resolved.products[0].colour);
  EXPECT_TRUE(resolved.HasProduct());
}

TEST(InterferenceScenes, AliasIsThePathWhereTheIdentifierIsNone) {
  ProductRecord product = Product("A1B2");
  product.alias = kNut;
  const ResolvedInterference resolved = Resolve(Record(product, {}));
  EXPECT_TRUE(ZORIAlias_var(resolved.products[0].shown.product)->GetAlias() == "nut_1");
  EXPECT_EQ(kNut, resolved.products[0].path);
}

TEST(InterferenceScenes, InterferenceWithoutProductsHasNone) {
  const ResolvedInterference resolved = Resolve({});
  EXPECT_FALSE(resolved.HasProduct());
  EXPECT_FALSE(MakeScene(resolved).interference.IsNull());
}

TEST(InterferenceScenes, ColoursAreThoseOfThePicture) {
  const ResolvedInterference different = Resolve(Record(Product(kNut), Product(kRod)));
  EXPECT_EQ("#ff0000", different.products[0].colour);
  EXPECT_EQ("#ff8000", different.products[1].colour);
  const ResolvedInterference same =
      Resolve(Record(Product(kNut), Product("rod-assembly_1 --++-- nut_2")));
  EXPECT_EQ("#ff0000", same.products[0].colour);
  EXPECT_EQ("#f0961e", same.products[1].colour);
  EXPECT_EQ("", Resolve(Record(Product("rod-assembly_1"), {})).products[0].colour);
}

TEST(InterferenceScenes, SceneIsMadeInOneCall) {
  const ZORDefault::InterferenceScene scene =
      MakeScene(Record(Product(kNut), Product(kRod)), Root());
  EXPECT_TRUE(ZORIAlias_var(scene.products[0])->GetAlias() == "nut_1");
  EXPECT_FALSE(scene.products[1].IsNull());
}

}  // namespace
