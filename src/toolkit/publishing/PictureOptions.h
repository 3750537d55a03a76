// How pictures are written.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURE_OPTIONS_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURE_OPTIONS_H

namespace ZORToolkit {

/// The formats that pictures are written in.
enum class PictureFormat { kJpeg, kPng };

/// The name of a format for PrintPictures.
inline const char* FormatName(PictureFormat inFormat) {
  return inFormat == PictureFormat::kPng ? "PNG" : "JPEG";
}

inline constexpr int kMaxPictureSize = 16384;

/// In pixels, 1 to kMaxPictureSize.
struct PictureSize {
  int width = 756;
  int height = 506;
};

}  // namespace ZORToolkit

#endif
