#include "default_platform/space_analysis/ViewChoice.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>

#include "default_platform/visualisation/Rendering.h"
#include "foundation/Vector3.h"
#include "support/MeshScenes.h"

namespace {

using support::MakeBox;
using support::MovedBy;
using ZORDefault::ChosenView;
using ZORDefault::IdBufferPixel;

constexpr PartColour kColour{200, 30, 30, 255};

/// Two products and what is chosen for a point of them.
class Products {
 public:
  Products(std::shared_ptr<const PartMesh> inFirst, const ZORMathTransformation& inFirstPlace,
           std::shared_ptr<const PartMesh> inSecond, const ZORMathTransformation& inSecondPlace)
      : shown_{scene_.Add(std::move(inFirst), inFirstPlace, kColour),
               scene_.Add(std::move(inSecond), inSecondPlace, kColour)} {}

  ChosenView Choose(const ZORMathVector& inPoint) const {
    return ZORDefault::ChooseView(shown_, {inPoint}, false);
  }
  /// The direction that is chosen where there is nothing to choose for.
  static ZORMathVector DefaultSightDirection() {
    return ZORDefault::ChooseView({nullptr, nullptr}, {{0, 0, 0}}, false).markers.sight;
  }
  /// Pixels of the product that is seen less, in a picture of a report's size.
  int SeenOfTheLesser(const ChosenView& inView) const {
    constexpr int kWidth = 756, kHeight = 506;
    ZOR3DViewpoint viewpoint;
    viewpoint.sight = inView.markers.sight;
    viewpoint.up = inView.markers.up;
    viewpoint.Reframe(kWidth, kHeight, 1, 1, inView.framed);
    const auto pixels =
        ZORDefault::RenderIdBuffer(*scene_.Bag(), viewpoint, kWidth, kHeight).value();
    std::array<int, 2> seen{};
    for (const IdBufferPixel& pixel : pixels)
      if (pixel.mesh < seen.size()) ++seen[pixel.mesh];
    return std::min(seen[0], seen[1]);
  }

 private:
  support::MeshScene scene_;
  ZORDefault::ShownProducts shown_;
};

/// A hollow ball around the origin with a round opening, its edge a given angle from the direction
/// (1, 0, 1), which is 30 degrees and more from all that are tried first.
std::shared_ptr<PartMesh> BallOpenTowardsXAndZ(double inRadius, double inOpening) {
  const double half = std::sqrt(0.5);
  auto ball = support::MakeGrid(200, 100, [&](double inAround, double inDown) {
    const double down = inOpening + (support::kPi - inOpening) * inDown;
    const double along = std::cos(down), around = 2 * support::kPi * inAround;
    const double y = std::sin(down) * std::cos(around), across = std::sin(down) * std::sin(around);
    const double x = half * (along + across), z = half * (along - across);
    return std::pair(support::ToPoint(inRadius * x, inRadius * y, inRadius * z),
                     support::ToPoint(x, y, z));
  });
  ball->sphere = {{0, 0, 0}, inRadius};
  return ball;
}

void ExpectSame(const ZORMathVector& inA, const ZORMathVector& inB) {
  EXPECT_DOUBLE_EQ(inA.x, inB.x);
  EXPECT_DOUBLE_EQ(inA.y, inB.y);
  EXPECT_DOUBLE_EQ(inA.z, inB.z);
}

TEST(ChooseView, ProductsThatAreSeenAreSeenFromTheDefaultDirection) {
  const Products products(MakeBox(10, 10, 10), MovedBy(-5, 0, 0), MakeBox(10, 10, 10),
                          MovedBy(5, 0, 0));
  const ChosenView view = products.Choose({0, 0, 5});
  ExpectSame(view.markers.sight, Products::DefaultSightDirection());
  EXPECT_GT(products.SeenOfTheLesser(view), 10000);
}

TEST(ChooseView, ProductBehindTheOtherIsSeenFromAnotherSide) {
  // The default direction looks at the box's corner from above; the small one is below.
  const Products products(MakeBox(100, 100, 100), MovedBy(0, 0, 0), MakeBox(10, 10, 10),
                          MovedBy(0, 0, -55));
  const ChosenView view = products.Choose({0, 0, -50});
  EXPECT_GT(view.markers.sight.z, 0);
  EXPECT_GT(products.SeenOfTheLesser(view), 2000);
}

TEST(ChooseView, ProductSeenThroughOneOpeningOnlyIsLookedForClosely) {
  const Products products(BallOpenTowardsXAndZ(10, 0.15), MovedBy(0, 0, 0),
                          support::MakeSphere(3, 50), MovedBy(0, 0, 0));
  const ChosenView view = products.Choose({0, 0, 0});
  EXPECT_GT(products.SeenOfTheLesser(view), 1000);

  ChosenView usual = view;
  usual.markers.sight = Products::DefaultSightDirection();
  usual.markers.up = ZORDefault::UpFor(usual.markers.sight);
  usual.framed.radius = 4;
  EXPECT_EQ(products.SeenOfTheLesser(usual), 0);
}

TEST(ChooseView, ProductThatIsHiddenFromAllSidesIsFramedAllTheSame) {
  const Products products(support::MakeSphere(20, 50), MovedBy(0, 0, 0),
                          support::MakeSphere(20, 50), MovedBy(0, 0, 0));
  const ChosenView view = products.Choose({0, 0, 20});
  ExpectSame(view.framed.centre, {0, 0, 20});
  EXPECT_GT(view.framed.radius, 0);
}

TEST(ChooseView, WithOneProductAloneNothingHasToBeChosen) {
  support::MeshScene scene;
  const ChosenView view = ZORDefault::ChooseView(
      {scene.Add(MakeBox(10, 10, 10), MovedBy(0, 0, 0), kColour), nullptr}, {{0, 0, 5}}, false);
  ExpectSame(view.markers.sight, Products::DefaultSightDirection());
}

}  // namespace
