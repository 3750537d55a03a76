// The way into the drawing library.
#include <exception>

#include "default_platform/visualisation/ray_caster/DrawPicture.h"

namespace {

using ZORDefault::PictureRequest;

bool Draw(const PictureRequest& inRequest, std::vector<std::uint8_t>& outPixels) try {
  outPixels = ZORRayCaster::DrawPicture(inRequest);
  return true;
} catch (const std::exception&) {
  return false;
}

bool See(const PictureRequest& inRequest, std::vector<ZORDefault::SeenPixel>& outPixels) try {
  outPixels = ZORRayCaster::SeePicture(inRequest);
  return true;
} catch (const std::exception&) {
  return false;
}

bool Encode(ZORDefault::PictureFormat inFormat, int inWidth, int inHeight,
            const std::uint8_t* inPixels, std::string& outBytes) try {
  outBytes = inFormat == ZORDefault::PictureFormat::kJpeg
                 ? ZORRayCaster::JpegFile(inWidth, inHeight, inPixels)
                 : ZORRayCaster::PngFile(inWidth, inHeight, inPixels);
  return !outBytes.empty();
} catch (const std::exception&) {
  return false;
}

}  // namespace

extern "C" __attribute__((visibility("default"))) const ZORDefault::RayCaster* ZORGetRayCaster() {
  static constexpr ZORDefault::RayCaster kRayCaster{&Draw, &See, &Encode};
  return &kRayCaster;
}
