// The acceleration structure of a mesh.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_MESHBVH_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_MESHBVH_H

#include <embree3/rtcore.h>

#include <memory>

#include "default_platform/PartMesh.h"
#include "default_platform/system/ObjectCounters.h"

namespace ZORRayCaster {

/// The Embree device, created once and never released; null when it cannot be created. It starts no
/// threads, so that a BVH is built the same way every time.
RTCDevice EmbreeDevice();

/// The bounding volume hierarchy over one mesh's triangles, in mesh space.
class MeshBvh : private ZORDefault::CountedObject<MeshBvh> {
 public:
  static const char* CountedName() { return "MeshBvh"; }

  /// Raises std::bad_alloc when it cannot be built.
  explicit MeshBvh(const PartMesh& inMesh);
  ~MeshBvh();
  MeshBvh(const MeshBvh&) = delete;
  MeshBvh& operator=(const MeshBvh&) = delete;

  RTCScene Scene() const { return scene_; }
  bool HasTriangles() const { return hasTriangles_; }
  /// Of all feature edges together.
  float LineLength() const { return lineLength_; }

 private:
  RTCScene scene_;
  bool hasTriangles_ = false;
  float lineLength_ = 0;
};

/// The mesh's BVH, built at the first call and cached by the mesh.
const MeshBvh& BvhOf(const PartMesh& inMesh);

}  // namespace ZORRayCaster

#endif
