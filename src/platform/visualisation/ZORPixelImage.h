// A picture.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORPIXELIMAGE_H
#define ZOR_PLATFORM_VISUALISATION_ZORPIXELIMAGE_H

#include <cstdint>
#include <vector>

#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORBaseUnknown.h"
#include "platform/system/ZORString.h"

/// Pixels of 8-bit red, green and blue, rows from the top. Released by whoever rasterised it.
class ZOR_PLATFORM_EXPORT ZORPixelImage : public ZORBaseUnknown {
 public:
  ~ZORPixelImage() override;
  /// Prepares the pixels for writing.
  /// @param inDepth 2: true colour, which they have already; E_INVALIDARG for other values.
  HRESULT Prepare(int inDepth);
  /// Writes the picture beside its place and renames it, so that an old file stays whole on
  /// failure.
  /// @param inFormat "JPEG" or "PNG", any letter case. The path's ending does not matter.
  /// @return S_OK; E_INVALIDARG for an unknown format; a file code of ZORFile.h. No file is left
  ///         then.
  HRESULT Write(const ZORString& inFormat, const ZORString& inPath) const;

#if ZOR_PLATFORM_ADDITIONS
  ZORPixelImage(int inWidth, int inHeight, std::vector<std::uint8_t> inPixels);
  int GetWidth() const;
  int GetHeight() const;
  const std::vector<std::uint8_t>& GetPixels() const;
#endif

 private:
  int width_;
  int height_;
  std::vector<std::uint8_t> pixels_;
};

#endif
