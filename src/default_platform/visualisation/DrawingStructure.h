// What the renderer keeps with a mesh.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_DRAWINGSTRUCTURE_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_DRAWINGSTRUCTURE_H

#include <memory>

/// Holds the renderer's own form of a mesh, built when the mesh is first drawn and freed with the
/// mesh. A copy of the mesh starts without one, since it may be changed before it is drawn.
struct DrawingStructure {
  DrawingStructure() = default;
  DrawingStructure(const DrawingStructure&) {}
  DrawingStructure& operator=(const DrawingStructure&) {
    content.reset();
    return *this;
  }
  std::shared_ptr<const void> content;
};

#endif
