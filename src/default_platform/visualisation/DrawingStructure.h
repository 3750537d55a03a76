// What is worked out of a mesh and kept with it.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_DRAWINGSTRUCTURE_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_DRAWINGSTRUCTURE_H

#include <array>
#include <memory>
#include <optional>

/// The lowest and highest coordinates of a mesh's points, relative to its origin.
struct MeshBox {
  std::array<float, 3> low;
  std::array<float, 3> high;
};

/// Holds what is worked out of a mesh when it is first needed, and freed with the mesh: its box,
/// and the renderer's own form. A copy of the mesh starts without, since it may be changed.
struct DrawingStructure {
  DrawingStructure() = default;
  DrawingStructure(const DrawingStructure&) {}
  DrawingStructure& operator=(const DrawingStructure&) {
    content.reset();
    box.reset();
    return *this;
  }
  std::shared_ptr<const void> content;
  std::optional<MeshBox> box;
};

#endif
