// What the platform and its drawing library say to each other.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAYCASTERENTRY_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAYCASTERENTRY_H

#include <cstdint>
#include <string>
#include <vector>

#include "default_platform/visualisation/DrawnMesh.h"

namespace ZORDefault {

/// A viewpoint that can be drawn: all finite, the axes of unit length and at right angles.
struct Camera {
  bool isConic = true;
  ZORMathVector eye;
  ZORMathVector right;
  ZORMathVector down;
  ZORMathVector forward;
  double pixelSize = 0;  ///< conic: of a pixel one away from the eye; cylindric: in millimetres
  double nearPlane = 0;  ///< 0: not limited
  double farPlane = 0;   ///< 0: not limited
};

struct PictureRequest {
  int width = 0;
  int height = 0;
  Camera camera;
  std::vector<DrawnMesh> meshes;
  bool hasBackground = false;
  float background[3] = {1, 1, 1};  ///< as shown, 0 to 1
  bool isShaded = true;
  bool showsHiddenEdges = false;
  int threadCount = 1;
};

/// What is seen in the middle of a pixel.
struct SeenPixel {
  static constexpr std::uint32_t kNothing = 0xFFFFFFFF;
  std::uint32_t mesh = kNothing;  ///< the place in PictureRequest::meshes
  float depth = 0;                ///< along the camera's forward axis
};

enum class PictureFormat { kJpeg, kPng };

/// The operations of the drawing library. They raise nothing, and answer false when there is not
/// enough memory.
struct RayCaster {
  /// @param outPixels red, green and blue, rows from the top.
  bool (*draw)(const PictureRequest& inRequest, std::vector<std::uint8_t>& outPixels);
  /// What the pixels of the same picture show.
  bool (*see)(const PictureRequest& inRequest, std::vector<SeenPixel>& outPixels);
  bool (*encode)(PictureFormat inFormat, int inWidth, int inHeight, const std::uint8_t* inPixels,
                 std::string& outBytes);
};

typedef const RayCaster* GetRayCasterFunction();

inline constexpr char kGetRayCasterName[] = "ZORGetRayCaster";

}  // namespace ZORDefault

#endif
