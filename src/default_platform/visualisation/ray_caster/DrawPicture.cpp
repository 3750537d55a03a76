#include "default_platform/visualisation/ray_caster/DrawPicture.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "default_platform/visualisation/ray_caster/EdgeLines.h"
#include "default_platform/visualisation/ray_caster/Parallel.h"
#include "default_platform/visualisation/ray_caster/Refinement.h"

namespace ZORRayCaster {
namespace {

using ZORDefault::PictureRequest;

/// Strengths of what is drawn over surfaces.
constexpr float kEdgeInk = 0.92F;
constexpr float kHiddenEdgeInk = 0.22F;
constexpr float kOutlineInk = 0.60F;
constexpr float kOutlineInkAlone = 0.90F;  // where there is no shading

/// The rows of the background: one colour, or a soft gradient, bluish grey above and nearly white
/// below.
std::vector<Vec3> BackgroundRows(const PictureRequest& inRequest) {
  const auto light = [](const float* inShown) {
    return Vec3{LightOf(inShown[0]), LightOf(inShown[1]), LightOf(inShown[2])};
  };
  std::vector<Vec3> rows(static_cast<std::size_t>(inRequest.height));
  if (inRequest.hasBackground) {
    std::fill(rows.begin(), rows.end(), light(inRequest.background));
    return rows;
  }
  constexpr float kTop[3] = {0.68F, 0.76F, 0.86F};
  constexpr float kBottom[3] = {0.95F, 0.96F, 0.98F};
  for (std::size_t y = 0; y < rows.size(); ++y) {
    const float share = (static_cast<float>(y) + 0.5F) / static_cast<float>(rows.size());
    float shown[3];
    for (int i = 0; i < 3; ++i) shown[i] = kTop[i] + share * (kBottom[i] - kTop[i]);
    rows[y] = light(shown);
  }
  return rows;
}

/// Dark ink, or grey where the surface itself is nearly black.
Vec3 InkOn(Vec3 inLight) {
  constexpr float kDarkInk = 0.010F, kLightInk = 0.13F, kBlack = 0.012F, kDark = 0.04F;
  const float luminance = 0.2126F * inLight.x + 0.7152F * inLight.y + 0.0722F * inLight.z;
  const float share = std::clamp((kDark - luminance) / (kDark - kBlack), 0.F, 1.F);
  const float ink = kDarkInk + share * (kLightInk - kDarkInk);
  return {ink, ink, ink};
}

class Composition {
 public:
  Composition(const PictureRequest& inRequest, const Refinement& inRefinement,
              const LineCoverage& inLines)
      : request_(inRequest), refinement_(inRefinement), lines_(inLines) {}

  void ComposeRow(int inY, Vec3 inBackground, std::uint8_t* outBytes) const {
    const ShownColour background = Shown(inBackground);
    for (int x = 0; x < request_.width; ++x) {
      const std::size_t place =
          static_cast<std::size_t>(inY) * static_cast<std::size_t>(request_.width) +
          static_cast<std::size_t>(x);
      const bool isPlain = refinement_.IsBackground(place) && lines_.visible[place] == 0 &&
                           (lines_.hidden.empty() || lines_.hidden[place] == 0);
      const ShownColour shown = isPlain ? background : Shown(LightAt(x, inY, place));
      outBytes = std::copy(shown.begin(), shown.end(), outBytes);
    }
  }

 private:
  typedef std::array<std::uint8_t, 3> ShownColour;

  static ShownColour Shown(Vec3 inLight) {
    return {ShownByte(inLight.x), ShownByte(inLight.y), ShownByte(inLight.z)};
  }

  Vec3 LightAt(int inX, int inY, std::size_t inPlace) const {
    const ShownPixel pixel = refinement_.At(inX, inY);
    // The strongest ink alone: an edge on an outline is no darker than an edge.
    float ink = (request_.isShaded ? kOutlineInk : kOutlineInkAlone) * pixel.outline;
    ink = std::max(ink, kEdgeInk * static_cast<float>(lines_.visible[inPlace]) / 255);
    if (!lines_.hidden.empty())
      ink = std::max(ink, kHiddenEdgeInk * static_cast<float>(lines_.hidden[inPlace]) / 255);
    return ink > 0 ? Mix(pixel.light, InkOn(pixel.light), ink) : pixel.light;
  }

  const PictureRequest& request_;
  const Refinement& refinement_;
  const LineCoverage& lines_;
};

/// What the pixels of a row show between the sides of a box.
void SeeRow(const DrawnScene& inScene, const PictureBox& inBox, int inY,
            std::vector<ZORDefault::SeenPixel>& ioSeen) {
  constexpr int kPacket = DrawnScene::kPacket;
  const std::size_t row =
      static_cast<std::size_t>(inY) * static_cast<std::size_t>(inScene.GetView().width);
  for (int x = inBox.left; x < inBox.right; x += kPacket) {
    const int count = std::min(kPacket, inBox.right - x);
    PicturePoint middles[kPacket];
    for (int i = 0; i < count; ++i)
      middles[i] = {static_cast<float>(x + i) + 0.5F, static_cast<float>(inY) + 0.5F};
    Hit hits[kPacket];
    if (!inScene.Cast(middles, count, hits)) continue;
    for (int i = 0; i < count; ++i) {
      if (hits[i].item == Hit::kNothing) continue;
      const DrawnItem& item = inScene.GetItems()[hits[i].item];
      ioSeen[row + static_cast<std::size_t>(x + i)] = {
          item.number, static_cast<float>(inScene.RealDepth(item, hits[i].depth))};
    }
  }
}

}  // namespace

std::vector<std::uint8_t> DrawPicture(const PictureRequest& inRequest) {
  const DrawnScene scene(inRequest);
  const Backdrop backdrop{BackgroundRows(inRequest), inRequest.isShaded};
  const SurfacePass surfaces(scene, backdrop);
  const int threadCount = inRequest.threadCount;
  const std::unique_ptr<Sample[]> pixels = surfaces.CastPixels(threadCount);
  const LineCoverage lines =
      DrawEdgeLines(scene, pixels.get(), inRequest.showsHiddenEdges, threadCount);
  const Refinement refinement(surfaces, scene.GetView(), pixels.get(), threadCount);

  const std::size_t rowSize = 3 * static_cast<std::size_t>(inRequest.width);
  std::vector<std::uint8_t> bytes(rowSize * static_cast<std::size_t>(inRequest.height));
  const Composition composition(inRequest, refinement, lines);
  ForEach(threadCount, inRequest.height, [&](int inY) {
    composition.ComposeRow(inY, backdrop.rows[static_cast<std::size_t>(inY)],
                           bytes.data() + rowSize * static_cast<std::size_t>(inY));
  });
  return bytes;
}

std::vector<ZORDefault::SeenPixel> SeePicture(const PictureRequest& inRequest) {
  const DrawnScene scene(inRequest);
  std::vector<ZORDefault::SeenPixel> seen(static_cast<std::size_t>(inRequest.width) *
                                          static_cast<std::size_t>(inRequest.height));
  const PictureBox& box = scene.GetBox();
  for (int y = box.top; y < box.bottom; ++y) SeeRow(scene, box, y, seen);
  return seen;
}

}  // namespace ZORRayCaster
