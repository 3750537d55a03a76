#include "default_platform/visualisation/ray_caster/RenderScene.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <new>

namespace ZORRayCaster {
namespace {

using ZORDefault::Camera;
using ZORDefault::MeshInstance;
using ZORFoundation::Dot;

/// Embree rejects coordinates beyond this.
constexpr double kMaxCoordinate = 1e18;

/// cameraFromMesh in double precision.
struct Placement {
  ZORMathVector columns[3];
  ZORMathVector translation;
};

ZORMathVector ToCamera(const Camera& inCamera, const ZORMathVector& inDirection) {
  return {Dot(inCamera.right, inDirection), Dot(inCamera.down, inDirection),
          Dot(inCamera.forward, inDirection)};
}

Placement Place(const Camera& inCamera, const MeshInstance& inMesh) {
  Placement placement;
  for (int i = 0; i < 3; ++i)
    placement.columns[i] = ToCamera(inCamera, inMesh.rootFromPart.GetMatrix().GetColumn(i));
  const ZORMathVector middle = inMesh.rootFromPart * inMesh.mesh->origin;
  placement.translation = ToCamera(
      inCamera, {middle.x - inCamera.eye.x, middle.y - inCamera.eye.y, middle.z - inCamera.eye.z});
  return placement;
}

bool IsRepresentable(const Placement& inPlacement) {
  const auto isNear = [](const ZORMathVector& inVector) {
    return std::fabs(inVector.x) < kMaxCoordinate && std::fabs(inVector.y) < kMaxCoordinate &&
           std::fabs(inVector.z) < kMaxCoordinate;
  };
  return isNear(inPlacement.translation) &&
         std::all_of(inPlacement.columns, inPlacement.columns + 3, isNear);
}

Vector3f ToFloats(const ZORMathVector& inVector) {
  return {static_cast<float>(inVector.x), static_cast<float>(inVector.y),
          static_cast<float>(inVector.z)};
}

float MaxScale(const Transform3f& inAffine) {
  float square = 0;
  for (const Vector3f& column : inAffine.linear.columns)
    square = std::max(square, Dot(column, column));
  return std::sqrt(square);
}

void SetBoundingSphere(const PartMesh& inMesh, SceneInstance& ioInstance) {
  const ZOR3DBoundingSphere& sphere = inMesh.sphere;
  const Vector3f fromOrigin{static_cast<float>(sphere.centre.x - inMesh.origin.x),
                            static_cast<float>(sphere.centre.y - inMesh.origin.y),
                            static_cast<float>(sphere.centre.z - inMesh.origin.z)};
  ioInstance.centre = ioInstance.cameraFromMesh * fromOrigin;
  ioInstance.radius =
      std::max(static_cast<float>(sphere.radius), 0.F) * MaxScale(ioInstance.cameraFromMesh);
}

SceneInstance MakeInstance(const MeshInstance& inMesh, const Placement& inPlacement,
                           std::uint32_t inNumber) {
  SceneInstance instance;
  instance.mesh = inMesh.mesh.get();
  instance.bvh = &BvhOf(*instance.mesh);
  for (int i = 0; i < 3; ++i)
    instance.cameraFromMesh.linear.columns[i] = ToFloats(inPlacement.columns[i]);
  instance.cameraFromMesh.translation = ToFloats(inPlacement.translation);
  const Vector3f* const columns = instance.cameraFromMesh.linear.columns;
  for (int i = 0; i < 3; ++i)
    instance.normalMatrix.columns[i] = Cross(columns[(i + 1) % 3], columns[(i + 2) % 3]);
  SetBoundingSphere(*instance.mesh, instance);
  instance.hasNormals = instance.mesh->normals.size() >= instance.mesh->points.size();
  instance.colour = MakeSurfaceColour(inMesh.colour);
  const bool showsOwnColours = !inMesh.isColourImposed && instance.mesh->triangleColours.size() >=
                                                              instance.mesh->triangles.size();
  if (showsOwnColours)
    for (const PartColour& colour : instance.mesh->colours)
      instance.colours.push_back(MakeSurfaceColour(colour));
  instance.isOverlay = inMesh.isOverlay;
  instance.number = inNumber;
  return instance;
}

struct DepthRange {
  double low = 0;
  double high = 0;
};

DepthRange DepthRangeOf(const std::vector<Placement>& inPlacements,
                        const std::vector<double>& inRadii) {
  DepthRange range{std::numeric_limits<double>::max(), std::numeric_limits<double>::lowest()};
  for (std::size_t i = 0; i < inPlacements.size(); ++i) {
    range.low = std::min(range.low, inPlacements[i].translation.z - inRadii[i]);
    range.high = std::max(range.high, inPlacements[i].translation.z + inRadii[i]);
  }
  return inPlacements.empty() || !std::isfinite(range.high - range.low) ? DepthRange() : range;
}

double RadiusAround(const MeshInstance& inMesh, const Placement& inPlacement) {
  const ZOR3DBoundingSphere& sphere = inMesh.mesh->sphere;
  if (sphere.IsEmpty()) return 0;
  double stretch = 0;
  for (const ZORMathVector& column : inPlacement.columns)
    stretch = std::max(stretch, std::sqrt(Dot(column, column)));
  const ZORMathVector& origin = inMesh.mesh->origin;
  const double offset = std::hypot(sphere.centre.x - origin.x, sphere.centre.y - origin.y,
                                   sphere.centre.z - origin.z);
  return 1.001 * stretch * (offset + sphere.radius);
}

View MakeView(const ZORDefault::PictureRequest& inRequest, double inDepthOffset) {
  const Camera& camera = inRequest.camera;
  View view;
  view.isPerspective = camera.isPerspective;
  view.width = inRequest.width;
  view.height = inRequest.height;
  view.pixelSize = static_cast<float>(camera.pixelSize);
  view.depthOffset = inDepthOffset;
  const bool hasNearClip = camera.isPerspective || camera.nearPlane > 0;
  view.nearClip =
      hasNearClip ? std::max(static_cast<float>(camera.nearPlane - inDepthOffset), 0.F) : 0.F;
  view.farClip = camera.farPlane > 0 ? static_cast<float>(camera.farPlane - inDepthOffset)
                                     : std::numeric_limits<float>::infinity();
  return view;
}

RTCIntersectContext CoherentContext() {
  RTCIntersectContext context;
  rtcInitIntersectContext(&context);
  context.flags = RTC_INTERSECT_CONTEXT_FLAG_COHERENT;
  return context;
}

}  // namespace

RasterPoint View::Project(Vector3f inPlace) const {
  const float scale = 1 / (isPerspective ? pixelSize * inPlace.z : pixelSize);
  return {inPlace.x * scale + 0.5F * static_cast<float>(width),
          inPlace.y * scale + 0.5F * static_cast<float>(height)};
}

float View::PixelLength(float inLength, float inDepth) const {
  return inLength / (isPerspective ? pixelSize * std::max(inDepth, 1e-20F) : pixelSize);
}

const SurfaceColour& SceneInstance::ColourOf(std::uint32_t inTriangle) const {
  if (colours.empty()) return colour;
  const std::uint16_t own = mesh->triangleColours[inTriangle];
  return own < colours.size() ? colours[own] : colour;
}

RenderScene::RenderScene(const ZORDefault::PictureRequest& inRequest) {
  std::vector<Placement> placements;
  std::vector<double> radii;
  std::vector<std::uint32_t> numbers;
  for (std::uint32_t i = 0; i < inRequest.meshes.size(); ++i) {
    const MeshInstance& mesh = inRequest.meshes[i];
    if (!mesh.mesh) continue;
    const Placement placement = Place(inRequest.camera, mesh);
    if (!IsRepresentable(placement)) continue;
    placements.push_back(placement);
    radii.push_back(RadiusAround(mesh, placement));
    numbers.push_back(i);
  }
  // An orthographic eye moves back until everything lies in front of it, overlays included.
  const DepthRange depths = DepthRangeOf(placements, radii);
  const bool hasOverlay = std::ranges::any_of(inRequest.meshes, &MeshInstance::isOverlay) &&
                          inRequest.camera.nearPlane <= 0;
  const double overlayDepth = hasOverlay ? depths.high - depths.low : 0;
  const double offset = inRequest.camera.isPerspective ? 0 : depths.low - overlayDepth;
  view_ = MakeView(inRequest, offset);
  view_.overlayDepth = static_cast<float>(overlayDepth);
  instances_.reserve(placements.size());
  for (std::size_t i = 0; i < placements.size(); ++i) {
    placements[i].translation.z -= offset;
    instances_.push_back(MakeInstance(inRequest.meshes[numbers[i]], placements[i], numbers[i]));
    ApplyDepthBias(instances_.back(), i);
  }
  scene_ = EmbreeDevice() ? rtcNewScene(EmbreeDevice()) : nullptr;
  if (!scene_) throw std::bad_alloc();
  bounds_ = BoundsOfInstances();
  AttachInstances();
}

/// Moves an instance along its rays, which changes its depth but not its image. Products often have
/// coplanar faces: a bias of less than a thirtieth of a pixel's depth, growing with the index, lets
/// the first instance win instead of rounding (z-fighting). Overlays move in front of all else.
void RenderScene::ApplyDepthBias(SceneInstance& ioInstance, std::size_t inPlace) const {
  constexpr std::size_t kSteps = 32;
  constexpr float kStep = 1e-6F, kOverlayScale = 1e-4F;
  const float bias = kStep * static_cast<float>(inPlace % kSteps);
  if (!view_.isPerspective) {
    const float pictureHeight = view_.pixelSize * static_cast<float>(view_.height);
    ioInstance.depthBias = bias * std::max(pictureHeight, std::fabs(ioInstance.centre.z)) -
                           (ioInstance.isOverlay ? view_.overlayDepth : 0);
    ioInstance.cameraFromMesh.translation.z += ioInstance.depthBias;
    ioInstance.centre.z += ioInstance.depthBias;
    return;
  }
  const bool isOver = ioInstance.isOverlay && view_.nearClip <= 0;
  const float scale = (1 + bias) * (isOver ? kOverlayScale : 1);
  ioInstance.depthBias = scale;
  for (Vector3f& column : ioInstance.cameraFromMesh.linear.columns) column = scale * column;
  ioInstance.cameraFromMesh.translation = scale * ioInstance.cameraFromMesh.translation;
  ioInstance.centre = scale * ioInstance.centre;
  ioInstance.radius *= scale;
}

double RenderScene::UnbiasedDepth(const SceneInstance& inInstance, float inDepth) const {
  return view_.depthOffset +
         (view_.isPerspective ? inDepth / inInstance.depthBias : inDepth - inInstance.depthBias);
}

RenderScene::~RenderScene() { rtcReleaseScene(scene_); }

void RenderScene::AttachInstances() {
  rtcSetSceneFlags(scene_, RTC_SCENE_FLAG_ROBUST);
  for (std::uint32_t i = 0; i < instances_.size(); ++i) {
    const SceneInstance& instance = instances_[i];
    // A flattened mesh cannot be intersected; only its lines are drawn.
    const float determinant =
        Dot(instance.cameraFromMesh.linear.columns[0], instance.normalMatrix.columns[0]);
    if (!instance.bvh->HasTriangles() || !(std::fabs(determinant) > 0)) continue;
    const RTCGeometry geometry = rtcNewGeometry(EmbreeDevice(), RTC_GEOMETRY_TYPE_INSTANCE);
    rtcSetGeometryInstancedScene(geometry, instance.bvh->Scene());
    rtcSetGeometryTransform(geometry, 0, RTC_FORMAT_FLOAT3X4_COLUMN_MAJOR,
                            &instance.cameraFromMesh);
    rtcCommitGeometry(geometry);
    rtcAttachGeometryByID(scene_, geometry, i);
    rtcReleaseGeometry(geometry);
  }
  rtcCommitScene(scene_);
  if (rtcGetDeviceError(EmbreeDevice()) != RTC_ERROR_NONE) {
    rtcReleaseScene(scene_);
    throw std::bad_alloc();
  }
}

PixelBounds RenderScene::BoundsOf(const SceneInstance& inInstance) const {
  const PixelBounds all{0, 0, view_.width, view_.height};
  // Enlarged a little against rounding.
  const float radius = 1.001F * inInstance.radius;
  const Vector3f centre = inInstance.centre;
  const float nearDepth = centre.z - radius;
  if (centre.z + radius <= view_.nearClip || nearDepth > view_.farClip) return {};
  if (view_.isPerspective && !(nearDepth > 0)) return all;
  const RasterPoint middle = view_.Project(centre);
  const auto reach = [&](float inSideways) {
    const float slant = view_.isPerspective ? std::fabs(inSideways / centre.z) : 0;
    return view_.PixelLength(radius * (1 + slant), nearDepth) + 3;
  };
  const auto pixel = [](float inPlace, int inSize) {
    return static_cast<int>(std::clamp(inPlace, 0.F, static_cast<float>(inSize)));
  };
  if (!std::isfinite(middle.x + middle.y)) return all;
  return {pixel(middle.x - reach(centre.x), view_.width),
          pixel(middle.y - reach(centre.y), view_.height),
          pixel(std::ceil(middle.x + reach(centre.x)), view_.width),
          pixel(std::ceil(middle.y + reach(centre.y)), view_.height)};
}

PixelBounds RenderScene::BoundsOfInstances() const {
  PixelBounds all{view_.width, view_.height, 0, 0};
  for (const SceneInstance& instance : instances_) {
    const PixelBounds bounds = BoundsOf(instance);
    if (bounds.IsEmpty()) continue;
    all = {std::min(all.left, bounds.left), std::min(all.top, bounds.top),
           std::max(all.right, bounds.right), std::max(all.bottom, bounds.bottom)};
  }
  return all.IsEmpty() ? PixelBounds() : all;
}

bool RenderScene::Cast(const RasterPoint* inPoints, int inCount, Hit* outHits) const {
  alignas(32) int valid[kPacket];
  RTCRayHit8 packet;
  RTCRay8& ray = packet.ray;
  for (int i = 0; i < kPacket; ++i) {
    valid[i] = i < inCount ? -1 : 0;
    const RasterPoint point = inPoints[std::min(i, inCount - 1)];
    const Vector3f start = view_.RayStart(point);
    const Vector3f direction = view_.RayDirection(point);
    ray.org_x[i] = start.x;
    ray.org_y[i] = start.y;
    ray.org_z[i] = start.z;
    ray.dir_x[i] = direction.x;
    ray.dir_y[i] = direction.y;
    ray.dir_z[i] = direction.z;
    ray.tnear[i] = view_.nearClip;
    ray.tfar[i] = view_.farClip;
    ray.time[i] = 0;
    ray.mask[i] = 0xFFFFFFFF;
    ray.id[i] = 0;
    ray.flags[i] = 0;
    packet.hit.geomID[i] = RTC_INVALID_GEOMETRY_ID;
    packet.hit.instID[0][i] = RTC_INVALID_GEOMETRY_ID;
  }
  RTCIntersectContext context = CoherentContext();
  rtcIntersect8(valid, scene_, &context, &packet);
  const RTCHit8& hit = packet.hit;
  if (std::all_of(hit.geomID, hit.geomID + kPacket,
                  [](unsigned inId) { return inId == RTC_INVALID_GEOMETRY_ID; }))
    return false;
  for (int i = 0; i < inCount; ++i) {
    outHits[i].instance = hit.geomID[i] == RTC_INVALID_GEOMETRY_ID ? Hit::kMiss : hit.instID[0][i];
    outHits[i].triangle = hit.primID[i];
    outHits[i].depth = ray.tfar[i];
    outHits[i].u = hit.u[i];
    outHits[i].v = hit.v[i];
    outHits[i].meshNormal = {hit.Ng_x[i], hit.Ng_y[i], hit.Ng_z[i]};
  }
  return true;
}

Hit RenderScene::CastBeyond(RasterPoint inPoint, float inDepth) const {
  const Vector3f start = view_.RayStart(inPoint);
  const Vector3f direction = view_.RayDirection(inPoint);
  RTCRayHit ray{};
  ray.ray = {start.x,     start.y, start.z,       inDepth,    direction.x, direction.y,
             direction.z, 0,       view_.farClip, 0xFFFFFFFF, 0,           0};
  ray.hit.geomID = RTC_INVALID_GEOMETRY_ID;
  ray.hit.instID[0] = RTC_INVALID_GEOMETRY_ID;
  RTCIntersectContext context = CoherentContext();
  rtcIntersect1(scene_, &context, &ray);
  const RTCHit& hit = ray.hit;
  if (hit.geomID == RTC_INVALID_GEOMETRY_ID) return {Hit::kMiss, 0, 0, 0, 0, {0, 0, 0}};
  return {hit.instID[0], hit.primID, ray.ray.tfar, hit.u, hit.v, {hit.Ng_x, hit.Ng_y, hit.Ng_z}};
}

}  // namespace ZORRayCaster
