#include "default_platform/visualisation/PictureDrawing.h"

#include <algorithm>
#include <charconv>
#include <cstdlib>
#include <cstring>
#include <utility>

#include "default_platform/visualisation/PictureCamera.h"
#include "default_platform/visualisation/RayCasterLibrary.h"

namespace ZORDefault {

bool IsPictureSize(int inWidth, int inHeight) {
  return inWidth >= 1 && inHeight >= 1 && inWidth <= kLargestPictureSize &&
         inHeight <= kLargestPictureSize;
}

int PictureThreadCount() {
  constexpr int kMost = 64;
  const char* const wanted = std::getenv("ZOR_PICTURE_THREADS");
  int count = 1;
  if (wanted) std::from_chars(wanted, wanted + std::strlen(wanted), count);
  return std::clamp(count, 1, kMost);
}

PictureRequest MakePictureRequest(const ZOR3DRep& inRep, const ZOR3DViewpoint& inViewpoint,
                                  int inWidth, int inHeight, const ZORSupport* inSupport) {
  PictureRequest request;
  request.width = inWidth;
  request.height = inHeight;
  request.camera = CameraOf(inViewpoint, inHeight);
  request.meshes = CollectDrawnMeshes(inRep);
  request.threadCount = PictureThreadCount();
  if (!inSupport) return request;
  request.hasBackground = inSupport->HasBackgroundColor();
  std::copy_n(inSupport->GetBackgroundColor(), 3, request.background);
  request.isShaded = inSupport->GetViewMode(ZORSupport::kShading) != 0;
  request.showsHiddenEdges = inSupport->GetViewMode(ZORSupport::kHiddenEdges) != 0;
  return request;
}

std::optional<std::vector<SeenPixel>> SeePixels(const ZOR3DRep& inRep,
                                                const ZOR3DViewpoint& inViewpoint, int inWidth,
                                                int inHeight) {
  if (!IsPictureSize(inWidth, inHeight)) return std::nullopt;
  const RayCaster* const rayCaster = LoadedRayCaster();
  std::vector<SeenPixel> pixels;
  if (!rayCaster ||
      !rayCaster->see(MakePictureRequest(inRep, inViewpoint, inWidth, inHeight, nullptr), pixels))
    return std::nullopt;
  return pixels;
}

}  // namespace ZORDefault
