// The instances of a picture in camera space, and ray casting.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_RENDERSCENE_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_RENDERSCENE_H

#include <cstdint>
#include <vector>

#include "default_platform/visualisation/RayCaster.h"
#include "default_platform/visualisation/ray_caster/MeshBvh.h"
#include "default_platform/visualisation/ray_caster/Shading.h"

namespace ZORRayCaster {

/// A point in raster space: x to the right, y down, in pixels; pixel centres lie at halves.
struct RasterPoint {
  float x;
  float y;
};

/// The projection of camera space to raster space. An orthographic eye was moved back along the
/// sight until nothing lies behind it; depths are relative to it.
struct View {
  bool isPerspective = true;
  int width = 0;
  int height = 0;
  float pixelSize = 0;
  float nearClip = 0;      ///< minimum depth
  float farClip = 0;       ///< maximum depth
  float overlayDepth = 0;  ///< orthographic: by how much overlays move towards the eye
  double depthOffset = 0;  ///< to be added to a depth for the distance from the original eye

  /// The ray through a point is start + depth * direction.
  Vector3f RayStart(RasterPoint inPoint) const {
    return isPerspective ? Vector3f{0, 0, 0} : InPlane(inPoint, 0);
  }
  Vector3f RayDirection(RasterPoint inPoint) const {
    return isPerspective ? InPlane(inPoint, 1) : Vector3f{0, 0, 1};
  }
  /// Perspective: 1 / depth; orthographic: -depth. Linear in raster space along lines and over
  /// planes.
  float InverseDepth(float inDepth) const { return isPerspective ? 1 / inDepth : -inDepth; }
  /// The change of inverse depth over a depth of one pixel's size.
  float InverseDepthPerPixel(float inInverseDepth) const {
    return isPerspective ? pixelSize * inInverseDepth : pixelSize;
  }
  Vector3f InPlane(RasterPoint inPoint, float inDepth) const {
    return {(inPoint.x - 0.5F * static_cast<float>(width)) * pixelSize,
            (inPoint.y - 0.5F * static_cast<float>(height)) * pixelSize, inDepth};
  }
  /// Perspective: only of a point in front of the eye.
  RasterPoint Project(Vector3f inPlace) const;
  /// The raster length of a length at a depth.
  float PixelLength(float inLength, float inDepth) const;
};

/// A rectangle of pixels; left and top are inclusive, right and bottom exclusive.
struct PixelBounds {
  int left = 0;
  int top = 0;
  int right = 0;
  int bottom = 0;

  bool IsEmpty() const { return left >= right || top >= bottom; }
};

/// One mesh in camera space.
struct SceneInstance {
  const PartMesh* mesh = nullptr;
  const MeshBvh* bvh = nullptr;
  Transform3f cameraFromMesh{};
  Matrix3f normalMatrix{};  ///< cameraFromMesh for normals, which it does not normalize
  Vector3f centre{};
  float radius = 0;
  bool hasNormals = false;
  SurfaceColour colour;                ///< of triangles without their own
  std::vector<SurfaceColour> colours;  ///< of PartMesh::colours; empty when none is shown
  std::uint32_t number = 0;            ///< index in the request
  bool isOverlay = false;
  /// Perspective: depths are scaled by it. Orthographic: it is added to them. See ApplyDepthBias.
  float depthBias = 0;

  const SurfaceColour& ColourOf(std::uint32_t inTriangle) const;
};

/// The closest intersection of a ray. Uninitialised by default; a miss sets only `instance`.
struct Hit {
  static constexpr std::uint32_t kMiss = 0xFFFFFFFF;
  std::uint32_t instance;
  std::uint32_t triangle;
  float depth;
  float u;
  float v;
  Vector3f meshNormal;  ///< geometric, in mesh space, not normalized
};

class RenderScene {
 public:
  /// Skips meshes whose placement is not finite or too far away for single precision.
  /// Raises std::bad_alloc.
  explicit RenderScene(const ZORDefault::PictureRequest& inRequest);
  ~RenderScene();
  RenderScene(const RenderScene&) = delete;
  RenderScene& operator=(const RenderScene&) = delete;

  const View& GetView() const { return view_; }
  const std::vector<SceneInstance>& GetInstances() const { return instances_; }
  /// The distance from the original eye to a depth of an instance.
  double UnbiasedDepth(const SceneInstance& inInstance, float inDepth) const;
  /// Conservative raster bounds of an instance, including its lines; empty when it is not visible.
  PixelBounds BoundsOf(const SceneInstance& inInstance) const;
  /// Of all instances.
  const PixelBounds& GetBounds() const { return bounds_; }

  static constexpr int kPacket = 8;
  /// Casts a packet of up to kPacket coherent rays.
  /// @return false when all miss; outHits is untouched then.
  bool Cast(const RasterPoint* inPoints, int inCount, Hit* outHits) const;
  /// The closest intersection beyond a depth of the ray through a point.
  Hit CastBeyond(RasterPoint inPoint, float inDepth) const;

 private:
  void AttachInstances();
  PixelBounds BoundsOfInstances() const;
  void ApplyDepthBias(SceneInstance& ioInstance, std::size_t inPlace) const;

  View view_;
  std::vector<SceneInstance> instances_;
  PixelBounds bounds_;
  RTCScene scene_;
};

}  // namespace ZORRayCaster

#endif
