#include "default_platform/visualisation/ray_caster/DrawnScene.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <new>

namespace ZORRayCaster {
namespace {

using ZORDefault::Camera;
using ZORDefault::DrawnMesh;

/// Past this the ray device refuses coordinates.
constexpr double kFarthest = 1e18;

double Dot(const ZORMathVector& inA, const ZORMathVector& inB) {
  return inA.x * inB.x + inA.y * inB.y + inA.z * inB.z;
}

/// A placed mesh in camera space, not yet rounded to single precision.
struct Placement {
  ZORMathVector columns[3];
  ZORMathVector translation;
};

ZORMathVector ToCamera(const Camera& inCamera, const ZORMathVector& inDirection) {
  return {Dot(inCamera.right, inDirection), Dot(inCamera.down, inDirection),
          Dot(inCamera.forward, inDirection)};
}

Placement Place(const Camera& inCamera, const DrawnMesh& inMesh) {
  Placement placement;
  for (int i = 0; i < 3; ++i)
    placement.columns[i] = ToCamera(inCamera, inMesh.rootFromPart.GetMatrix().GetColumn(i));
  const ZORMathVector middle = inMesh.rootFromPart * inMesh.mesh->origin;
  placement.translation = ToCamera(
      inCamera, {middle.x - inCamera.eye.x, middle.y - inCamera.eye.y, middle.z - inCamera.eye.z});
  return placement;
}

bool CanBeDrawn(const Placement& inPlacement) {
  const auto isNear = [](const ZORMathVector& inVector) {
    return std::fabs(inVector.x) < kFarthest && std::fabs(inVector.y) < kFarthest &&
           std::fabs(inVector.z) < kFarthest;
  };
  return isNear(inPlacement.translation) &&
         std::all_of(inPlacement.columns, inPlacement.columns + 3, isNear);
}

Vec3 Rounded(const ZORMathVector& inVector) {
  return {static_cast<float>(inVector.x), static_cast<float>(inVector.y),
          static_cast<float>(inVector.z)};
}

float LargestStretch(const Affine& inAffine) {
  float square = 0;
  for (const Vec3& column : inAffine.linear.columns)
    square = std::max(square, ZORRayCaster::Dot(column, column));
  return std::sqrt(square);
}

/// Where the mesh's own sphere lies in camera space.
void SetSphere(const PartMesh& inMesh, DrawnItem& ioItem) {
  const ZOR3DBoundingSphere& sphere = inMesh.sphere;
  const Vec3 fromOrigin{static_cast<float>(sphere.centre.x - inMesh.origin.x),
                        static_cast<float>(sphere.centre.y - inMesh.origin.y),
                        static_cast<float>(sphere.centre.z - inMesh.origin.z)};
  ioItem.centre = ioItem.cameraFromMesh * fromOrigin;
  ioItem.radius =
      std::max(static_cast<float>(sphere.radius), 0.F) * LargestStretch(ioItem.cameraFromMesh);
}

DrawnItem MakeItem(const DrawnMesh& inMesh, const Placement& inPlacement, std::uint32_t inNumber) {
  DrawnItem item;
  item.mesh = inMesh.mesh.get();
  item.structure = &StructureOf(*item.mesh);
  for (int i = 0; i < 3; ++i)
    item.cameraFromMesh.linear.columns[i] = Rounded(inPlacement.columns[i]);
  item.cameraFromMesh.translation = Rounded(inPlacement.translation);
  const Vec3* const columns = item.cameraFromMesh.linear.columns;
  for (int i = 0; i < 3; ++i)
    item.normalMatrix.columns[i] = Cross(columns[(i + 1) % 3], columns[(i + 2) % 3]);
  SetSphere(*item.mesh, item);
  item.hasNormals = item.mesh->normals.size() >= item.mesh->points.size();
  item.colour = ToSurfaceColour(inMesh.colour);
  const bool showsOwnColours =
      !inMesh.isColourImposed && item.mesh->triangleColours.size() >= item.mesh->triangles.size();
  if (showsOwnColours)
    for (const PartColour& colour : item.mesh->colours)
      item.colours.push_back(ToSurfaceColour(colour));
  item.isDrawnOver = inMesh.isDrawnOver;
  item.number = inNumber;
  return item;
}

/// The depths between which all lies.
struct DepthRange {
  double low = 0;
  double high = 0;
};

DepthRange DepthsOf(const std::vector<Placement>& inPlacements,
                    const std::vector<double>& inRadii) {
  DepthRange range{std::numeric_limits<double>::max(), std::numeric_limits<double>::lowest()};
  for (std::size_t i = 0; i < inPlacements.size(); ++i) {
    range.low = std::min(range.low, inPlacements[i].translation.z - inRadii[i]);
    range.high = std::max(range.high, inPlacements[i].translation.z + inRadii[i]);
  }
  return inPlacements.empty() || !std::isfinite(range.high - range.low) ? DepthRange() : range;
}

double RadiusAround(const DrawnMesh& inMesh, const Placement& inPlacement) {
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
  view.isConic = camera.isConic;
  view.width = inRequest.width;
  view.height = inRequest.height;
  view.pixelSize = static_cast<float>(camera.pixelSize);
  view.depthOffset = inDepthOffset;
  const bool isLimited = camera.isConic || camera.nearPlane > 0;
  view.nearest =
      isLimited ? std::max(static_cast<float>(camera.nearPlane - inDepthOffset), 0.F) : 0.F;
  view.farthest = camera.farPlane > 0 ? static_cast<float>(camera.farPlane - inDepthOffset)
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

PicturePoint View::PointOf(Vec3 inPlace) const {
  const float scale = 1 / (isConic ? pixelSize * inPlace.z : pixelSize);
  return {inPlace.x * scale + 0.5F * static_cast<float>(width),
          inPlace.y * scale + 0.5F * static_cast<float>(height)};
}

float View::PixelsOf(float inLength, float inDepth) const {
  return inLength / (isConic ? pixelSize * std::max(inDepth, 1e-20F) : pixelSize);
}

const SurfaceColour& DrawnItem::ColourOf(std::uint32_t inTriangle) const {
  if (colours.empty()) return colour;
  const std::uint16_t own = mesh->triangleColours[inTriangle];
  return own < colours.size() ? colours[own] : colour;
}

DrawnScene::DrawnScene(const ZORDefault::PictureRequest& inRequest) {
  std::vector<Placement> placements;
  std::vector<double> radii;
  std::vector<std::uint32_t> numbers;
  for (std::uint32_t i = 0; i < inRequest.meshes.size(); ++i) {
    const DrawnMesh& mesh = inRequest.meshes[i];
    if (!mesh.mesh) continue;
    const Placement placement = Place(inRequest.camera, mesh);
    if (!CanBeDrawn(placement)) continue;
    placements.push_back(placement);
    radii.push_back(RadiusAround(mesh, placement));
    numbers.push_back(i);
  }
  // The eye of a cylindric view moves so that all lies in front of it, with room for what is drawn
  // over all else.
  const DepthRange depths = DepthsOf(placements, radii);
  const bool hasOverlay = std::ranges::any_of(inRequest.meshes, &DrawnMesh::isDrawnOver) &&
                          inRequest.camera.nearPlane <= 0;
  const double overlayDepth = hasOverlay ? depths.high - depths.low : 0;
  const double offset = inRequest.camera.isConic ? 0 : depths.low - overlayDepth;
  view_ = MakeView(inRequest, offset);
  view_.overlayDepth = static_cast<float>(overlayDepth);
  items_.reserve(placements.size());
  for (std::size_t i = 0; i < placements.size(); ++i) {
    placements[i].translation.z -= offset;
    items_.push_back(MakeItem(inRequest.meshes[numbers[i]], placements[i], numbers[i]));
    MoveAlongRays(items_.back(), i);
  }
  scene_ = Device() ? rtcNewScene(Device()) : nullptr;
  if (!scene_) throw std::bad_alloc();
  box_ = BoxOfItems();
  AttachInstances();
}

/// Moves an item in depth. On the picture nothing moves, since it is moved along its rays.
/// Products often lie flush, one face on another. Each item is moved back by a hair, less than a
/// thirtieth of a pixel's depth, so that rounding does not decide which one is seen: the first is.
/// What is drawn over all else is moved in front of it.
void DrawnScene::MoveAlongRays(DrawnItem& ioItem, std::size_t inPlace) const {
  constexpr std::size_t kSteps = 32;
  constexpr float kStep = 1e-6F, kNearTheEye = 1e-4F;
  const float hair = kStep * static_cast<float>(inPlace % kSteps);
  if (!view_.isConic) {
    const float pictureHeight = view_.pixelSize * static_cast<float>(view_.height);
    ioItem.depthChange = hair * std::max(pictureHeight, std::fabs(ioItem.centre.z)) -
                         (ioItem.isDrawnOver ? view_.overlayDepth : 0);
    ioItem.cameraFromMesh.translation.z += ioItem.depthChange;
    ioItem.centre.z += ioItem.depthChange;
    return;
  }
  const bool isOver = ioItem.isDrawnOver && view_.nearest <= 0;
  const float scale = (1 + hair) * (isOver ? kNearTheEye : 1);
  ioItem.depthChange = scale;
  for (Vec3& column : ioItem.cameraFromMesh.linear.columns) column = scale * column;
  ioItem.cameraFromMesh.translation = scale * ioItem.cameraFromMesh.translation;
  ioItem.centre = scale * ioItem.centre;
  ioItem.radius *= scale;
}

double DrawnScene::RealDepth(const DrawnItem& inItem, float inDepth) const {
  return view_.depthOffset +
         (view_.isConic ? inDepth / inItem.depthChange : inDepth - inItem.depthChange);
}

DrawnScene::~DrawnScene() { rtcReleaseScene(scene_); }

void DrawnScene::AttachInstances() {
  rtcSetSceneFlags(scene_, RTC_SCENE_FLAG_ROBUST);
  for (std::uint32_t i = 0; i < items_.size(); ++i) {
    const DrawnItem& item = items_[i];
    // A mesh pressed flat cannot be met by rays; its lines are drawn all the same.
    const float determinant =
        Dot(item.cameraFromMesh.linear.columns[0], item.normalMatrix.columns[0]);
    if (!item.structure->HasTriangles() || !(std::fabs(determinant) > 0)) continue;
    const RTCGeometry instance = rtcNewGeometry(Device(), RTC_GEOMETRY_TYPE_INSTANCE);
    rtcSetGeometryInstancedScene(instance, item.structure->Scene());
    rtcSetGeometryTransform(instance, 0, RTC_FORMAT_FLOAT3X4_COLUMN_MAJOR, &item.cameraFromMesh);
    rtcCommitGeometry(instance);
    rtcAttachGeometryByID(scene_, instance, i);
    rtcReleaseGeometry(instance);
  }
  rtcCommitScene(scene_);
  if (rtcGetDeviceError(Device()) != RTC_ERROR_NONE) {
    rtcReleaseScene(scene_);
    throw std::bad_alloc();
  }
}

PictureBox DrawnScene::BoxOf(const DrawnItem& inItem) const {
  const PictureBox all{0, 0, view_.width, view_.height};
  // A little more than the sphere, against rounding.
  const float radius = 1.001F * inItem.radius;
  const Vec3 centre = inItem.centre;
  const float nearDepth = centre.z - radius;
  if (centre.z + radius <= view_.nearest || nearDepth > view_.farthest) return {};
  if (view_.isConic && !(nearDepth > 0)) return all;
  const PicturePoint middle = view_.PointOf(centre);
  const auto reach = [&](float inSideways) {
    const float slant = view_.isConic ? std::fabs(inSideways / centre.z) : 0;
    return view_.PixelsOf(radius * (1 + slant), nearDepth) + 3;
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

PictureBox DrawnScene::BoxOfItems() const {
  PictureBox all{view_.width, view_.height, 0, 0};
  for (const DrawnItem& item : items_) {
    const PictureBox box = BoxOf(item);
    if (box.IsEmpty()) continue;
    all = {std::min(all.left, box.left), std::min(all.top, box.top), std::max(all.right, box.right),
           std::max(all.bottom, box.bottom)};
  }
  return all.IsEmpty() ? PictureBox() : all;
}

bool DrawnScene::Cast(const PicturePoint* inPoints, int inCount, Hit* outHits) const {
  alignas(32) int valid[kPacket];
  RTCRayHit8 packet;
  RTCRay8& ray = packet.ray;
  for (int i = 0; i < kPacket; ++i) {
    valid[i] = i < inCount ? -1 : 0;
    const PicturePoint point = inPoints[std::min(i, inCount - 1)];
    const Vec3 start = view_.RayStart(point);
    const Vec3 direction = view_.RayDirection(point);
    ray.org_x[i] = start.x;
    ray.org_y[i] = start.y;
    ray.org_z[i] = start.z;
    ray.dir_x[i] = direction.x;
    ray.dir_y[i] = direction.y;
    ray.dir_z[i] = direction.z;
    ray.tnear[i] = view_.nearest;
    ray.tfar[i] = view_.farthest;
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
    outHits[i].item = hit.geomID[i] == RTC_INVALID_GEOMETRY_ID ? Hit::kNothing : hit.instID[0][i];
    outHits[i].triangle = hit.primID[i];
    outHits[i].depth = ray.tfar[i];
    outHits[i].u = hit.u[i];
    outHits[i].v = hit.v[i];
    outHits[i].meshNormal = {hit.Ng_x[i], hit.Ng_y[i], hit.Ng_z[i]};
  }
  return true;
}

Hit DrawnScene::CastBeyond(PicturePoint inPoint, float inDepth) const {
  const Vec3 start = view_.RayStart(inPoint);
  const Vec3 direction = view_.RayDirection(inPoint);
  RTCRayHit ray{};
  ray.ray = {start.x,     start.y, start.z,        inDepth,    direction.x, direction.y,
             direction.z, 0,       view_.farthest, 0xFFFFFFFF, 0,           0};
  ray.hit.geomID = RTC_INVALID_GEOMETRY_ID;
  ray.hit.instID[0] = RTC_INVALID_GEOMETRY_ID;
  RTCIntersectContext context = CoherentContext();
  rtcIntersect1(scene_, &context, &ray);
  const RTCHit& hit = ray.hit;
  if (hit.geomID == RTC_INVALID_GEOMETRY_ID) return {Hit::kNothing, 0, 0, 0, 0, {0, 0, 0}};
  return {hit.instID[0], hit.primID, ray.ray.tfar, hit.u, hit.v, {hit.Ng_x, hit.Ng_y, hit.Ng_z}};
}

}  // namespace ZORRayCaster
