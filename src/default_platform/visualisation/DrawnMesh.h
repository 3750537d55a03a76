// One mesh of a picture, with its place and colour worked out.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_DRAWNMESH_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_DRAWNMESH_H

#include <memory>
#include <vector>

#include "ZORPlatformExport.h"
#include "default_platform/visualisation/PartMesh.h"
#include "platform/visualisation/ZOR3DRep.h"

namespace ZORDefault {

struct DrawnMesh {
  std::shared_ptr<const PartMesh> mesh;
  ZORMathTransformation rootFromPart;
  /// Of the triangles without a colour of their own; of all when it is imposed.
  PartColour colour{210, 210, 210, 255};
  bool isColourImposed = false;
  bool isDrawnOver = false;  ///< over all meshes that are not
};

/// The meshes that a node shows, in the order of the tree. A node above that imposes its colour
/// wins, the topmost first; then a triangle's own colour; then the nearest node that shows its
/// colour.
ZOR_PLATFORM_EXPORT std::vector<DrawnMesh> CollectDrawnMeshes(const ZOR3DRep& inRep);

}  // namespace ZORDefault

#endif
