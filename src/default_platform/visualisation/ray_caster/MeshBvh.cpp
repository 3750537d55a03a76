#include "default_platform/visualisation/ray_caster/MeshBvh.h"

#include <algorithm>
#include <mutex>
#include <new>

#include "foundation/Vector3.h"

namespace ZORRayCaster {
namespace {

/// A triangle with an index out of range becomes degenerate, so that the others keep their indices.
void CopyTriangles(const PartMesh& inMesh, std::uint32_t* outIndices) {
  const std::size_t pointCount = inMesh.points.size();
  for (const auto& triangle : inMesh.triangles) {
    const bool isWhole =
        std::ranges::all_of(triangle, [&](std::uint32_t point) { return point < pointCount; });
    for (const std::uint32_t point : triangle) *outIndices++ = isWhole ? point : 0;
  }
}

void AttachTriangles(RTCScene inScene, const PartMesh& inMesh) {
  const RTCGeometry geometry = rtcNewGeometry(EmbreeDevice(), RTC_GEOMETRY_TYPE_TRIANGLE);
  void* const points =
      rtcSetNewGeometryBuffer(geometry, RTC_BUFFER_TYPE_VERTEX, 0, RTC_FORMAT_FLOAT3,
                              sizeof(inMesh.points[0]), inMesh.points.size());
  void* const indices =
      rtcSetNewGeometryBuffer(geometry, RTC_BUFFER_TYPE_INDEX, 0, RTC_FORMAT_UINT3,
                              sizeof(inMesh.triangles[0]), inMesh.triangles.size());
  if (points && indices) {
    std::ranges::copy(inMesh.points, static_cast<std::array<float, 3>*>(points));
    CopyTriangles(inMesh, static_cast<std::uint32_t*>(indices));
    rtcCommitGeometry(geometry);
    rtcAttachGeometry(inScene, geometry);
  }
  rtcReleaseGeometry(geometry);
  if (!points || !indices) throw std::bad_alloc();
}

float LengthOfLines(const PartMesh& inMesh) {
  float length = 0;
  for (std::size_t line = 0; line + 1 < inMesh.lineStarts.size(); ++line) {
    const std::size_t end =
        std::min<std::size_t>(inMesh.lineStarts[line + 1], inMesh.edgePoints.size());
    for (std::size_t i = inMesh.lineStarts[line] + std::size_t{1}; i < end; ++i) {
      const ZORFoundation::Vector3f step = ZORFoundation::ToVector3(inMesh.edgePoints[i]) -
                                           ZORFoundation::ToVector3(inMesh.edgePoints[i - 1]);
      length += std::sqrt(Dot(step, step));
    }
  }
  return length;
}

RTCScene NewScene() {
  const RTCScene scene = EmbreeDevice() ? rtcNewScene(EmbreeDevice()) : nullptr;
  if (!scene) throw std::bad_alloc();
  // Robust: no ray passes between two triangles that share an edge.
  rtcSetSceneFlags(scene, RTC_SCENE_FLAG_ROBUST);
  return scene;
}

}  // namespace

RTCDevice EmbreeDevice() {
  static const RTCDevice device = rtcNewDevice("threads=1,start_threads=0");
  return device;
}

MeshBvh::MeshBvh(const PartMesh& inMesh)
    : scene_(NewScene()),
      hasTriangles_(!inMesh.triangles.empty() && !inMesh.points.empty()),
      lineLength_(LengthOfLines(inMesh)) {
  try {
    if (hasTriangles_) AttachTriangles(scene_, inMesh);
    rtcCommitScene(scene_);
    if (rtcGetDeviceError(EmbreeDevice()) != RTC_ERROR_NONE) throw std::bad_alloc();
  } catch (...) {
    rtcReleaseScene(scene_);
    throw;
  }
}

MeshBvh::~MeshBvh() { rtcReleaseScene(scene_); }

const MeshBvh& BvhOf(const PartMesh& inMesh) {
  static std::mutex mutex;
  const std::lock_guard lock(mutex);
  std::shared_ptr<const void>& content = inMesh.renderCache.bvh;
  if (!content) content = std::make_shared<const MeshBvh>(inMesh);
  return *static_cast<const MeshBvh*>(content.get());
}

}  // namespace ZORRayCaster
