#include "platform/visualisation/ZORPixelImage.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "default_platform/system/FileResult.h"
#include "default_platform/system/ObjectCounters.h"
#include "default_platform/visualisation/Rendering.h"
#include "foundation/AtomicFile.h"

namespace {

ZORDefault::ObjectCounter& Counter() {
  static ZORDefault::ObjectCounter& counter = ZORDefault::CounterOf("ZORPixelImage");
  return counter;
}

bool IsSameWord(std::string_view inA, std::string_view inB) {
  return std::ranges::equal(inA, inB, [](unsigned char a, unsigned char b) {
    return std::tolower(a) == std::tolower(b);
  });
}

std::optional<ZORDefault::PictureFormat> FormatOf(std::string_view inName) {
  if (IsSameWord(inName, "JPEG")) return ZORDefault::PictureFormat::kJpeg;
  if (IsSameWord(inName, "PNG")) return ZORDefault::PictureFormat::kPng;
  return std::nullopt;
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
  ++Counter().built;
}

ZORPixelImage::~ZORPixelImage() { ++Counter().released; }

HRESULT ZORPixelImage::Prepare(int inDepth) {
  constexpr int kTrueColour = 2;
  return inDepth == kTrueColour ? S_OK : E_INVALIDARG;
}

HRESULT ZORPixelImage::Write(const ZORString& inFormat, const ZORString& inPath) const try {
  const auto format = FormatOf(inFormat.CastToCharPtr());
  if (!format) return E_INVALIDARG;
  if (!HoldsAllPixels(width_, height_, pixels_.size())) return E_FAIL;
  const ZORDefault::RayCaster* const rayCaster = ZORDefault::LoadRayCaster();
  std::string bytes;
  if (!rayCaster || !rayCaster->encode(*format, width_, height_, pixels_.data(), bytes))
    return E_FAIL;
  // A picture can be made again, so nobody waits for the disk.
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
