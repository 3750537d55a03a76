// What the surfaces show in each pixel.
#ifndef ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SURFACEPASS_H
#define ZOR_DEFAULT_PLATFORM_VISUALISATION_RAY_CASTER_SURFACEPASS_H

#include <memory>
#include <vector>

#include "default_platform/visualisation/ray_caster/DrawnScene.h"

namespace ZORRayCaster {

/// What is seen at one point of the picture. Nothing is set at first.
struct Sample {
  /// Of the surface at this point (View::Nearness); kBackground where there is none.
  float nearness;
  float slopeX;  ///< how the nearness changes over one pixel
  float slopeY;
  std::uint32_t item;  ///< Hit::kNothing: the background
  Vec3 light;

  static constexpr float kBackground = -1e30F;
};

/// The background of each row, and whether surfaces hide it.
struct Backdrop {
  std::vector<Vec3> rows;
  bool isShaded = true;  ///< else surfaces are drawn in the background's colour
};

class SurfacePass {
 public:
  SurfacePass(const DrawnScene& inScene, const Backdrop& inBackdrop)
      : scene_(inScene), backdrop_(inBackdrop) {}

  /// One sample in the middle of each pixel, rows from the top.
  std::unique_ptr<Sample[]> CastPixels(int inThreadCount) const;
  /// @param inCount up to DrawnScene::kPacket.
  void CastPoints(const PicturePoint* inPoints, int inCount, Sample* outSamples) const;

 private:
  void CastTile(int inTile, Sample* outPixels) const;
  void CastBlock(const PictureBox& inBlock, Sample* outPixels) const;
  Sample SampleOf(PicturePoint inPoint, const Hit& inHit) const;
  Sample SampleThrough(PicturePoint inPoint, Hit inHit) const;
  Vec3 LightOf(Vec3 inDirection, Vec3 inPlane, const Hit& inHit,
               const SurfaceColour& inColour) const;
  void SetSurface(Vec3 inDirection, Vec3 inPlane, float inDepth, Sample& outSample) const;
  Vec3 Background(PicturePoint inPoint) const;
  Sample BackgroundSample(PicturePoint inPoint) const {
    return {Sample::kBackground, 0, 0, Hit::kNothing, Background(inPoint)};
  }

  const DrawnScene& scene_;
  const Backdrop& backdrop_;
};

}  // namespace ZORRayCaster

#endif
