#include "platform/visualisation/ZORPixelImage.h"

#include <algorithm>
#include <cctype>
#include <new>
#include <string>
#include <string_view>
#include <utility>

#include "default_platform/system/FileOperations.h"
#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/Rendering.h"
#include "foundation/AtomicFile.h"

namespace {

bool IsSameWord(std::string_view inA, std::string_view inB) {
  return std::ranges::equal(inA, inB, [](unsigned char a, unsigned char b) {
    return std::tolower(a) == std::tolower(b);
  });
}

/// The encoder of a format's name; null for none.
ZORDefault::EncodeFunction* ZORDefault::RayCaster::*EncoderFor(std::string_view inName) {
  if (IsSameWord(inName, "JPEG")) return &ZORDefault::RayCaster::encodeJpeg;
  return IsSameWord(inName, "PNG") ? &ZORDefault::RayCaster::encodePng : nullptr;
}

bool HoldsAllPixels(int inWidth, int inHeight, std::size_t inByteCount) {
  constexpr std::size_t kBytesPerPixel = 3;
  return inWidth > 0 && inHeight > 0 &&
         inByteCount == kBytesPerPixel * static_cast<std::size_t>(inWidth) *
                            static_cast<std::size_t>(inHeight);
}

}  // namespace

ZORPixelImage::ZORPixelImage(int inWidth, int inHeight, std::vector<std::uint8_t> inPixels)
    : width_(inWidth), height_(inHeight), pixels_(std::move(inPixels)) {
  ++ZORDefault::CounterOf<ZORPixelImage>("ZORPixelImage").built;
}

ZORPixelImage::~ZORPixelImage() {
  ++ZORDefault::CounterOf<ZORPixelImage>("ZORPixelImage").released;
}

HRESULT ZORPixelImage::Prepare(int inDepth) {
  constexpr int kTrueColour = 2;
  return inDepth == kTrueColour ? S_OK : E_INVALIDARG;
}

HRESULT ZORPixelImage::Write(const ZORString& inFormat, const ZORString& inPath) const try {
  const auto encoder = EncoderFor(inFormat.CastToCharPtr());
  if (!encoder) return E_INVALIDARG;
  if (!HoldsAllPixels(width_, height_, pixels_.size())) return E_FAIL;
  const ZORDefault::RayCaster* const rayCaster = ZORDefault::LoadRayCaster();
  if (!rayCaster) return E_FAIL;
  const std::string bytes = (rayCaster->*encoder)(width_, height_, pixels_.data());
  if (bytes.empty()) return E_FAIL;
  // Not synchronised: a picture can be made again.
  ZORFoundation::WriteWholeFile(inPath.CastToCharPtr(), bytes, {.isSynchronised = false});
  return S_OK;
} catch (const ZORFoundation::FileError& error) {
  return ZORDefault::FileResultOf(error.Code());
} catch (const std::bad_alloc&) {
  return E_FAIL;
}

int ZORPixelImage::GetWidth() const { return width_; }
int ZORPixelImage::GetHeight() const { return height_; }
const std::vector<std::uint8_t>& ZORPixelImage::GetPixels() const { return pixels_; }
