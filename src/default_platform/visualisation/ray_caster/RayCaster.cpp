// The entry of the ray caster, and the passes of a picture in order.
#include <algorithm>
#include <array>
#include <cmath>
#include <exception>
#include <memory>

#include "default_platform/visualisation/ray_caster/EdgeLines.h"
#include "default_platform/visualisation/ray_caster/PictureEncoding.h"
#include "default_platform/visualisation/ray_caster/RenderScene.h"
#include "default_platform/visualisation/ray_caster/Sampling.h"
#include "foundation/ParallelFor.h"
#include "foundation/PluginFunction.h"

namespace ZORRayCaster {
namespace {

using ZORDefault::PictureRequest;

/// Opacities of lines over surfaces.
constexpr float kEdgeInk = 0.92F;
constexpr float kHiddenEdgeInk = 0.22F;
constexpr float kOutlineInk = 0.60F;
constexpr float kOutlineInkAlone = 0.90F;  // without shading

/// One colour, or a soft vertical gradient from bluish grey to nearly white.
std::vector<Vector3f> BackgroundRows(const PictureRequest& inRequest) {
  const auto linear = [](const float* inSrgb) {
    return Vector3f{LinearFromSrgb(inSrgb[0]), LinearFromSrgb(inSrgb[1]),
                    LinearFromSrgb(inSrgb[2])};
  };
  std::vector<Vector3f> rows(static_cast<std::size_t>(inRequest.height));
  if (inRequest.hasBackground) {
    std::fill(rows.begin(), rows.end(), linear(inRequest.background));
    return rows;
  }
  constexpr float kTop[3] = {0.68F, 0.76F, 0.86F};
  constexpr float kBottom[3] = {0.95F, 0.96F, 0.98F};
  for (std::size_t y = 0; y < rows.size(); ++y) {
    const float share = (static_cast<float>(y) + 0.5F) / static_cast<float>(rows.size());
    float srgb[3];
    for (int i = 0; i < 3; ++i) srgb[i] = kTop[i] + share * (kBottom[i] - kTop[i]);
    rows[y] = linear(srgb);
  }
  return rows;
}

/// Dark, or grey on a surface that is nearly black itself.
Vector3f InkOn(Vector3f inRadiance) {
  constexpr float kDarkInk = 0.010F, kLightInk = 0.13F, kBlack = 0.012F, kDark = 0.04F;
  const float luminance = 0.2126F * inRadiance.x + 0.7152F * inRadiance.y + 0.0722F * inRadiance.z;
  const float share = std::clamp((kDark - luminance) / (kDark - kBlack), 0.F, 1.F);
  const float ink = kDarkInk + share * (kLightInk - kDarkInk);
  return {ink, ink, ink};
}

class Compositor {
 public:
  Compositor(const PictureRequest& inRequest, const AdaptiveSampling& inSamples,
             const LineCoverage& inLines)
      : request_(inRequest), samples_(inSamples), lines_(inLines) {}

  void ComposeRow(int inY, Vector3f inBackground, std::uint8_t* outBytes) const {
    const SrgbColour background = ToSrgb(inBackground);
    for (int x = 0; x < request_.width; ++x) {
      const std::size_t place =
          static_cast<std::size_t>(inY) * static_cast<std::size_t>(request_.width) +
          static_cast<std::size_t>(x);
      const bool isBackground = samples_.IsBackground(place) && lines_.visible[place] == 0 &&
                                (lines_.hidden.empty() || lines_.hidden[place] == 0);
      const SrgbColour srgb = isBackground ? background : ToSrgb(RadianceAt(x, inY, place));
      outBytes = std::copy(srgb.begin(), srgb.end(), outBytes);
    }
  }

 private:
  typedef std::array<std::uint8_t, 3> SrgbColour;

  static SrgbColour ToSrgb(Vector3f inRadiance) {
    return {SrgbByteFromLinear(inRadiance.x), SrgbByteFromLinear(inRadiance.y),
            SrgbByteFromLinear(inRadiance.z)};
  }

  Vector3f RadianceAt(int inX, int inY, std::size_t inPlace) const {
    const ResolvedPixel pixel = samples_.Resolve(inX, inY);
    // The maximum, not the sum: an edge on a silhouette is no darker than an edge.
    float ink = (request_.isShaded ? kOutlineInk : kOutlineInkAlone) * pixel.outline;
    ink = std::max(ink, kEdgeInk * static_cast<float>(lines_.visible[inPlace]) / 255);
    if (!lines_.hidden.empty())
      ink = std::max(ink, kHiddenEdgeInk * static_cast<float>(lines_.hidden[inPlace]) / 255);
    return ink > 0 ? Lerp(pixel.radiance, InkOn(pixel.radiance), ink) : pixel.radiance;
  }

  const PictureRequest& request_;
  const AdaptiveSampling& samples_;
  const LineCoverage& lines_;
};

void RenderIdRow(const RenderScene& inScene, const PixelBounds& inBounds, int inY,
                 std::vector<ZORDefault::IdBufferPixel>& ioPixels) {
  constexpr int kPacket = RenderScene::kPacket;
  const std::size_t row =
      static_cast<std::size_t>(inY) * static_cast<std::size_t>(inScene.GetView().width);
  for (int x = inBounds.left; x < inBounds.right; x += kPacket) {
    const int count = std::min(kPacket, inBounds.right - x);
    RasterPoint centres[kPacket];
    for (int i = 0; i < count; ++i)
      centres[i] = {static_cast<float>(x + i) + 0.5F, static_cast<float>(inY) + 0.5F};
    Hit hits[kPacket];
    if (!inScene.Cast(centres, count, hits)) continue;
    for (int i = 0; i < count; ++i) {
      if (hits[i].instance == Hit::kMiss) continue;
      const SceneInstance& instance = inScene.GetInstances()[hits[i].instance];
      ioPixels[row + static_cast<std::size_t>(x + i)] = {
          instance.number, static_cast<float>(inScene.UnbiasedDepth(instance, hits[i].depth))};
    }
  }
}

std::vector<std::uint8_t> RenderPicture(const PictureRequest& inRequest) {
  const RenderScene scene(inRequest);
  const Background background{BackgroundRows(inRequest), inRequest.isShaded};
  const SurfacePass surfaces(scene, background);
  const int threadCount = inRequest.threadCount;
  const std::unique_ptr<Sample[]> pixels = surfaces.CastPixels(threadCount);
  const LineCoverage lines =
      DrawEdgeLines(scene, pixels.get(), inRequest.showsHiddenEdges, threadCount);
  const AdaptiveSampling samples(surfaces, scene.GetView(), pixels.get(), threadCount);

  const std::size_t rowSize = 3 * static_cast<std::size_t>(inRequest.width);
  std::vector<std::uint8_t> bytes(rowSize * static_cast<std::size_t>(inRequest.height));
  const Compositor compositor(inRequest, samples, lines);
  ZORFoundation::ParallelFor(threadCount, inRequest.height, [&](int inY) {
    compositor.ComposeRow(inY, background.rows[static_cast<std::size_t>(inY)],
                          bytes.data() + rowSize * static_cast<std::size_t>(inY));
  });
  return bytes;
}

std::vector<ZORDefault::IdBufferPixel> RenderIdBuffer(const PictureRequest& inRequest) {
  const RenderScene scene(inRequest);
  std::vector<ZORDefault::IdBufferPixel> pixels(static_cast<std::size_t>(inRequest.width) *
                                                static_cast<std::size_t>(inRequest.height));
  const PixelBounds& bounds = scene.GetBounds();
  for (int y = bounds.top; y < bounds.bottom; ++y) RenderIdRow(scene, bounds, y, pixels);
  return pixels;
}

bool Render(const PictureRequest& inRequest, std::vector<std::uint8_t>& outPixels) try {
  outPixels = RenderPicture(inRequest);
  return true;
} catch (const std::exception&) {
  return false;
}

bool RenderIds(const PictureRequest& inRequest,
               std::vector<ZORDefault::IdBufferPixel>& outPixels) try {
  outPixels = RenderIdBuffer(inRequest);
  return true;
} catch (const std::exception&) {
  return false;
}

}  // namespace
}  // namespace ZORRayCaster

ZOR_PLUGIN_FUNCTION const ZORDefault::RayCaster* ZORGetRayCaster() {
  static constexpr ZORDefault::RayCaster kRayCaster{&ZORRayCaster::Render, &ZORRayCaster::RenderIds,
                                                    &ZORRayCaster::EncodeJpeg,
                                                    &ZORRayCaster::EncodePng};
  return &kRayCaster;
}
