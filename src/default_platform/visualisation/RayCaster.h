// The interface between the platform and the ray caster, a plugin that is loaded when needed.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAYCASTER_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAYCASTER_H

#include <cstdint>
#include <string>
#include <vector>

#include "default_platform/visualisation/SceneGraph.h"

namespace ZORDefault {

/// A valid camera: all values finite, the axes orthonormal.
struct Camera {
  bool isPerspective = true;  ///< else orthographic
  ZORMathVector eye;
  ZORMathVector right;
  ZORMathVector down;
  ZORMathVector forward;
  double pixelSize = 0;  ///< perspective: at distance 1 from the eye; orthographic: in millimetres
  double nearPlane = 0;  ///< 0: none
  double farPlane = 0;   ///< 0: none
};

struct PictureRequest {
  int width = 0;
  int height = 0;
  Camera camera;
  std::vector<MeshInstance> meshes;
  bool hasBackground = false;
  float background[3] = {1, 1, 1};  ///< sRGB, 0 to 1
  bool isShaded = true;
  bool showsHiddenEdges = false;
  int threadCount = 1;
};

/// What is visible at a pixel's centre.
struct IdBufferPixel {
  static constexpr std::uint32_t kNone = 0xFFFFFFFF;
  std::uint32_t mesh = kNone;  ///< index in PictureRequest::meshes
  float depth = 0;             ///< along the camera's forward axis
};

/// Makes a picture file of 8-bit sRGB pixels, rows from the top.
/// @return its bytes; empty when out of memory. Raises std::bad_alloc.
typedef std::string EncodeFunction(int inWidth, int inHeight, const std::uint8_t* inPixels);

/// The plugin's operations. Those that return false when out of memory raise nothing.
struct RayCaster {
  /// @param outPixels 8-bit sRGB, rows from the top.
  bool (*render)(const PictureRequest& inRequest, std::vector<std::uint8_t>& outPixels);
  bool (*renderIdBuffer)(const PictureRequest& inRequest, std::vector<IdBufferPixel>& outPixels);
  EncodeFunction* encodeJpeg;
  EncodeFunction* encodePng;
};

typedef const RayCaster* GetRayCasterFunction();

inline constexpr char kGetRayCasterName[] = "ZORGetRayCaster";

}  // namespace ZORDefault

#endif
