// Each pixel against all triangles, one by one in double precision.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <random>

#include "default_platform/OpenModel.h"
#include "default_platform/visualisation/Rendering.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "support/MeshScenes.h"

namespace {

using support::MeshScene;
using ZORDefault::Camera;
using ZORDefault::IdBufferPixel;
using ZORDefault::MeshInstance;
using ZORDefault::PictureRequest;

constexpr int kWidth = 400, kHeight = 300;
constexpr int kSampledPixels = 10'000;

ZORMathVector operator+(const ZORMathVector& inA, const ZORMathVector& inB) {
  return {inA.x + inB.x, inA.y + inB.y, inA.z + inB.z};
}
ZORMathVector operator-(const ZORMathVector& inA, const ZORMathVector& inB) {
  return {inA.x - inB.x, inA.y - inB.y, inA.z - inB.z};
}
ZORMathVector operator*(double inFactor, const ZORMathVector& inA) {
  return {inFactor * inA.x, inFactor * inA.y, inFactor * inA.z};
}
double Dot(const ZORMathVector& inA, const ZORMathVector& inB) {
  return inA.x * inB.x + inA.y * inB.y + inA.z * inB.z;
}
ZORMathVector Cross(const ZORMathVector& inA, const ZORMathVector& inB) {
  return {inA.y * inB.z - inA.z * inB.y, inA.z * inB.x - inA.x * inB.z,
          inA.x * inB.y - inA.y * inB.x};
}

struct Triangle {
  ZORMathVector corners[3];
  std::uint32_t mesh;
};

std::vector<Triangle> AllTriangles(const PictureRequest& inRequest) {
  std::vector<Triangle> triangles;
  for (std::uint32_t number = 0; number < inRequest.meshes.size(); ++number) {
    const MeshInstance& drawn = inRequest.meshes[number];
    for (const auto& corners : drawn.mesh->triangles) {
      Triangle triangle{{}, number};
      for (std::size_t i = 0; i < 3; ++i) {
        const auto& point = drawn.mesh->points[corners[i]];
        triangle.corners[i] =
            drawn.rootFromPart * (drawn.mesh->origin + ZORMathVector(point[0], point[1], point[2]));
      }
      triangles.push_back(triangle);
    }
  }
  return triangles;
}

struct Ray {
  ZORMathVector start, direction;  // by one along the camera's forward axis
};

Ray RayThrough(const Camera& inCamera, int inX, int inY) {
  const ZORMathVector aside = (inX + 0.5 - kWidth / 2.0) * inCamera.pixelSize * inCamera.right +
                              (inY + 0.5 - kHeight / 2.0) * inCamera.pixelSize * inCamera.down;
  if (inCamera.isPerspective) return {inCamera.eye, inCamera.forward + aside};
  return {inCamera.eye + aside, inCamera.forward};
}

/// Moller and Trumbore, "Fast, minimum storage ray/triangle intersection".
/// @return the depth, or infinity. ioMargin: how close the ray comes to the triangle's border.
double DepthOf(const Ray& inRay, const Triangle& inTriangle, double& ioMargin) {
  constexpr double kNone = std::numeric_limits<double>::infinity();
  const ZORMathVector a = inTriangle.corners[1] - inTriangle.corners[0];
  const ZORMathVector b = inTriangle.corners[2] - inTriangle.corners[0];
  const ZORMathVector p = Cross(inRay.direction, b);
  const double determinant = Dot(a, p);
  if (determinant == 0) return kNone;
  const ZORMathVector s = inRay.start - inTriangle.corners[0];
  const ZORMathVector q = Cross(s, a);
  const double u = Dot(s, p) / determinant, v = Dot(inRay.direction, q) / determinant;
  const double depth = Dot(b, q) / determinant;
  const double inside = std::min({u, v, 1 - u - v});
  ioMargin = std::min(ioMargin, std::fabs(inside));
  return inside >= 0 && (depth > 0 || !std::isfinite(depth)) ? depth : kNone;
}

struct Answer {
  std::uint32_t mesh = IdBufferPixel::kNone;
  double depth = std::numeric_limits<double>::infinity();
  double second = std::numeric_limits<double>::infinity();  // of another mesh
  double margin = 1;
};

Answer Search(const Ray& inRay, const std::vector<Triangle>& inTriangles) {
  Answer answer;
  for (const Triangle& triangle : inTriangles) {
    const double depth = DepthOf(inRay, triangle, answer.margin);
    if (depth < answer.depth) {
      if (answer.mesh != triangle.mesh) answer.second = answer.depth;
      answer.depth = depth;
      answer.mesh = triangle.mesh;
    } else if (triangle.mesh != answer.mesh) {
      answer.second = std::min(answer.second, depth);
    }
  }
  return answer;
}

/// A crowd of shapes that hide and cut each other.
void Fill(MeshScene& ioScene, double inOffset) {
  std::mt19937 random(7);
  const auto between = [&](double inLow, double inHigh) {
    return inLow + (inHigh - inLow) * (random() / 4294967296.0);
  };
  const auto ball = support::MakeSphere(9, 12);
  const auto box = support::MakeBox(20, 8, 14);
  const auto tube = support::MakeTube(5, 40, 20);
  for (int i = 0; i < 30; ++i) {
    const std::shared_ptr<const PartMesh> mesh = i % 3 == 0 ? ball : i % 3 == 1 ? box : tube;
    ioScene.Add(mesh,
                support::TurnedAndMoved(between(0, 6), inOffset + between(-60, 60),
                                        between(-60, 60), between(-40, 40) - inOffset),
                {200, 200, 200, 255});
  }
}

/// Where a ray passes within a hair of a border, or two meshes lie at one depth, either answer is
/// right; elsewhere the answers must agree.
void CompareSampled(const ZOR3DRep& inRep, const ZOR3DViewpoint& inViewpoint) {
  constexpr double kHair = 1e-4, kDepthShare = 5e-5;
  const PictureRequest request =
      ZORDefault::MakePictureRequest(inRep, inViewpoint, kWidth, kHeight, nullptr);
  const auto seen = ZORDefault::RenderIdBuffer(inRep, inViewpoint, kWidth, kHeight);
  ASSERT_TRUE(seen);
  const std::vector<Triangle> triangles = AllTriangles(request);
  std::mt19937 random(11);
  int doubtful = 0, hits = 0;
  for (int i = 0; i < kSampledPixels; ++i) {
    const int x = static_cast<int>(random() % kWidth), y = static_cast<int>(random() % kHeight);
    const IdBufferPixel& pixel = (*seen)[static_cast<std::size_t>(y * kWidth + x)];
    const Answer answer = Search(RayThrough(request.camera, x, y), triangles);
    const double tolerance = kDepthShare * inViewpoint.focusDistance;
    if (answer.margin < kHair || answer.second - answer.depth < tolerance) {
      ++doubtful;
      continue;
    }
    ASSERT_EQ(pixel.mesh, answer.mesh) << x << ' ' << y;
    if (pixel.mesh == IdBufferPixel::kNone) continue;
    ++hits;
    ASSERT_NEAR(pixel.depth, answer.depth, tolerance) << x << ' ' << y;
  }
  EXPECT_LT(doubtful, kSampledPixels / 20);
  EXPECT_GT(hits, kSampledPixels / 5);
}

ZOR3DViewpoint Framing(const ZOR3DRep& inRep, ZOR3DViewpoint::Projection inProjection) {
  ZOR3DViewpoint viewpoint;
  viewpoint.projection = inProjection;
  viewpoint.Reframe(kWidth, kHeight, 1.6F, 1.6F, inRep.GetShowBoundingElement());
  return viewpoint;
}

TEST(IdBuffer, ConicViewAgreesWithAllTriangles) {
  MeshScene scene;
  Fill(scene, 0);
  CompareSampled(*scene.Bag(), Framing(*scene.Bag(), ZOR3DViewpoint::kConic));
}

TEST(IdBuffer, CylindricViewAgreesWithAllTriangles) {
  MeshScene scene;
  Fill(scene, 0);
  CompareSampled(*scene.Bag(), Framing(*scene.Bag(), ZOR3DViewpoint::kCylindric));
}

TEST(IdBuffer, FarFromTheOriginAgreesWithAllTriangles) {
  MeshScene scene;
  Fill(scene, 1e7);
  CompareSampled(*scene.Bag(), Framing(*scene.Bag(), ZOR3DViewpoint::kConic));
}

TEST(IdBuffer, ModelAgreesWithAllTriangles) {
  ZORDefault::ModelOptions options;
  options.useCache = false;
  const auto model =
      ZORDefault::OpenModel(std::string(ZOR_SOURCE_DIR) + "/samples/as1-oc-214.stp", options);
  const ZORI3DGeoVisu_var shown = model.root;
  const auto& rep = dynamic_cast<const ZOR3DRep&>(*shown->GetRep());
  CompareSampled(rep, Framing(rep, ZOR3DViewpoint::kConic));
}

TEST(IdBuffer, DepthOfWhatIsDrawnOverIsItsReal) {
  for (const auto projection : {ZOR3DViewpoint::kConic, ZOR3DViewpoint::kCylindric}) {
    MeshScene scene;
    scene.Add(support::MakeSphere(5, 40), support::MovedBy(0, 30, 0), {255, 0, 0, 255})
        ->SetOverlay(true);
    scene.Add(support::MakeBox(20, 4, 20), support::MovedBy(0, 0, 0), {0, 0, 255, 255});
    ZOR3DViewpoint viewpoint;
    viewpoint.projection = projection;
    viewpoint.sight = {0, 1, 0};
    viewpoint.up = {0, 0, 1};
    viewpoint.origin = {0, -100, 0};
    const auto seen = ZORDefault::RenderIdBuffer(*scene.Bag(), viewpoint, kWidth, kHeight);
    ASSERT_TRUE(seen);
    const IdBufferPixel& middle = (*seen)[kHeight / 2 * kWidth + kWidth / 2];
    EXPECT_EQ(middle.mesh, 0u);
    EXPECT_NEAR(middle.depth, 125, 0.05);
  }
}

}  // namespace
