// A mesh as rays meet it.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_MESHSTRUCTURE_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_MESHSTRUCTURE_H

#include <embree3/rtcore.h>

#include <memory>

#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/PartMesh.h"

namespace ZORRayCaster {

/// The ray device, made once and kept until the process ends; null when there is none. It never
/// starts threads: what is built from one input is then always the same.
RTCDevice Device();

/// The search tree over one mesh's triangles, in the mesh's own space.
class MeshStructure : private ZORDefault::CountedObject<MeshStructure> {
 public:
  static const char* CountedName() { return "MeshStructure"; }

  /// Raises std::bad_alloc when it cannot be built.
  explicit MeshStructure(const PartMesh& inMesh);
  ~MeshStructure();
  MeshStructure(const MeshStructure&) = delete;
  MeshStructure& operator=(const MeshStructure&) = delete;

  RTCScene Scene() const { return scene_; }
  bool HasTriangles() const { return hasTriangles_; }
  /// Of all drawn lines together.
  float LineLength() const { return lineLength_; }

 private:
  RTCScene scene_;
  bool hasTriangles_ = false;
  float lineLength_ = 0;
};

/// The mesh's structure, built at the first call and kept by the mesh.
const MeshStructure& StructureOf(const PartMesh& inMesh);

}  // namespace ZORRayCaster

#endif
