// A picture's meshes in camera space, and the rays cast at them.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_DRAWNSCENE_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_DRAWNSCENE_H

#include <cstdint>
#include <vector>

#include "default_platform/visualisation/RayCasterEntry.h"
#include "default_platform/visualisation/ray_caster/MeshStructure.h"
#include "default_platform/visualisation/ray_caster/Shading.h"
#include "default_platform/visualisation/ray_caster/Vec3.h"

namespace ZORRayCaster {

/// A place in the picture: pixels from the left and from the top; pixel centres lie at halves.
struct PicturePoint {
  float x;
  float y;
};

/// How camera space is seen. All lengths are relative to an eye that, in cylindric projection, was
/// moved along the sight so that nothing lies behind it.
struct View {
  bool isConic = true;
  int width = 0;
  int height = 0;
  float pixelSize = 0;
  float nearest = 0;       ///< what is nearer is not seen
  float farthest = 0;      ///< what is farther is not seen
  float overlayDepth = 0;  ///< cylindric: how far what is drawn over all moves towards the eye
  double depthOffset = 0;  ///< add it to a depth to have the distance from the given eye

  /// The ray through a point is start + depth * direction.
  Vec3 RayStart(PicturePoint inPoint) const {
    return isConic ? Vec3{0, 0, 0} : InPlane(inPoint, 0);
  }
  Vec3 RayDirection(PicturePoint inPoint) const {
    return isConic ? InPlane(inPoint, 1) : Vec3{0, 0, 1};
  }
  /// Grows towards the eye, and is linear on the picture along lines and over planes.
  float Nearness(float inDepth) const { return isConic ? 1 / inDepth : -inDepth; }
  /// The nearness that one pixel's size along the depth makes.
  float NearnessOfPixel(float inNearness) const {
    return isConic ? pixelSize * inNearness : pixelSize;
  }
  Vec3 InPlane(PicturePoint inPoint, float inDepth) const {
    return {(inPoint.x - 0.5F * static_cast<float>(width)) * pixelSize,
            (inPoint.y - 0.5F * static_cast<float>(height)) * pixelSize, inDepth};
  }
  /// Conic: only of a point in front of the eye.
  PicturePoint PointOf(Vec3 inPlace) const;
  /// What a length at a depth measures on the picture.
  float PixelsOf(float inLength, float inDepth) const;
};

/// A part of the picture, in whole pixels; left and top belong to it, right and bottom do not.
struct PictureBox {
  int left = 0;
  int top = 0;
  int right = 0;
  int bottom = 0;

  bool IsEmpty() const { return left >= right || top >= bottom; }
};

/// One mesh in camera space.
struct DrawnItem {
  const PartMesh* mesh = nullptr;
  const MeshStructure* structure = nullptr;
  Affine cameraFromMesh{};
  Linear normalMatrix{};  ///< takes normals to camera space up to their length
  Vec3 centre{};
  float radius = 0;
  bool hasNormals = false;
  SurfaceColour colour;                ///< of triangles without their own
  std::vector<SurfaceColour> colours;  ///< of PartMesh::colours; empty when none is shown
  std::uint32_t number = 0;            ///< place in the request
  bool isDrawnOver = false;
  /// Conic: depths are this many times the real ones. Cylindric: larger than the real ones by this
  /// much. See MoveAlongRays.
  float depthChange = 0;

  const SurfaceColour& ColourOf(std::uint32_t inTriangle) const;
};

/// What a ray meets first. Nothing is set at first; only `item` is set where a ray meets nothing.
struct Hit {
  static constexpr std::uint32_t kNothing = 0xFFFFFFFF;
  std::uint32_t item;
  std::uint32_t triangle;
  float depth;
  float u;
  float v;
  Vec3 meshNormal;  ///< of the triangle's plane, in the mesh's space, of any length
};

class DrawnScene {
 public:
  /// Meshes that cannot be placed (not finite, or too far away for single precision) are left out.
  /// Raises std::bad_alloc.
  explicit DrawnScene(const ZORDefault::PictureRequest& inRequest);
  ~DrawnScene();
  DrawnScene(const DrawnScene&) = delete;
  DrawnScene& operator=(const DrawnScene&) = delete;

  const View& GetView() const { return view_; }
  const std::vector<DrawnItem>& GetItems() const { return items_; }
  /// How far something at a depth of an item really lies from the given eye.
  double RealDepth(const DrawnItem& inItem, float inDepth) const;
  /// All that an item may cover, with a pixel to spare for its lines; empty when it is not seen.
  PictureBox BoxOf(const DrawnItem& inItem) const;
  /// All that any item may cover.
  const PictureBox& GetBox() const { return box_; }

  static constexpr int kPacket = 8;
  /// Casts up to kPacket rays, which should lie close together.
  /// @return false when none meets anything; outHits is untouched then.
  bool Cast(const PicturePoint* inPoints, int inCount, Hit* outHits) const;
  /// What the ray through a point meets beyond a depth.
  Hit CastBeyond(PicturePoint inPoint, float inDepth) const;

 private:
  void AttachInstances();
  PictureBox BoxOfItems() const;
  void MoveAlongRays(DrawnItem& ioItem, std::size_t inPlace) const;

  View view_;
  std::vector<DrawnItem> items_;
  PictureBox box_;
  RTCScene scene_;
};

}  // namespace ZORRayCaster

#endif
