#include "lyra/Picture.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <charconv>
#include <memory>
#include <string_view>

#include "ZORLyraXMLServices.h"
#include "lyra/CommandErrors.h"
#include "lyra/DocumentText.h"
#include "platform/visualisation/ZORPrint3DRepImage.h"

namespace lyra {
namespace {

constexpr int kLargestSize = 16384;

struct NamedView {
  std::string_view word;
  PictureView view;
};

const std::array<NamedView, 6>& NamedViews() {
  static const std::array<NamedView, 6> views = {{
      {"front", {{0, 1, 0}, {0, 0, 1}}},
      {"back", {{0, -1, 0}, {0, 0, 1}}},
      {"left", {{1, 0, 0}, {0, 0, 1}}},
      {"right", {{-1, 0, 0}, {0, 0, 1}}},
      {"top", {{0, 0, -1}, {0, 1, 0}}},
      {"bottom", {{0, 0, 1}, {0, -1, 0}}},
  }};
  return views;
}

/// @return 0 for what is no whole number or out of range.
int PixelCount(std::string_view inText) {
  int count = 0;
  const auto [end, error] = std::from_chars(inText.data(), inText.data() + inText.size(), count);
  const bool isNumber = error == std::errc() && end == inText.data() + inText.size();
  return isNumber && count >= 1 && count <= kLargestSize ? count : 0;
}

struct Releaser {
  void operator()(ZORBaseUnknown* inComponent) const { inComponent->Release(); }
};

void LookAlong(const PictureView& inView, const PictureSize& inSize, ZOR3DViewpoint& ioViewpoint) {
  ioViewpoint.projection = ZOR3DViewpoint::kCylindric;
  ioViewpoint.sight = inView.sight;
  ioViewpoint.up = inView.up;
  ioViewpoint.Reframe(static_cast<float>(inSize.width), static_cast<float>(inSize.height), 1, 1);
}

// What the library's picture of a representation cannot be asked for: other formats, or a view and
// a size together. The same drawing otherwise.
void TakeOtherPicture(ZOR3DRep& inRep, const PictureWishes& inWishes, const ZORString& inPath) {
  const std::unique_ptr<ZORPrint3DRepImage, Releaser> image(
      new ZORPrint3DRepImage(&inRep, inWishes.size.width, inWishes.size.height));
  ZORSupport& support = *image->GetSupport();
  if (!inWishes.keepsBackground) support.SetBackgroundColor(1, 1, 1);
  support.SetViewMode(ZORSupport::kShading, 1);
  support.SetViewMode(ZORSupport::kHiddenEdges, 0);
  if (inWishes.view) LookAlong(*inWishes.view, inWishes.size, *image->GetViewpoint());
  const std::unique_ptr<ZORPixelImage, Releaser> pixels(image->Rasterize());
  if (!pixels) return;
  pixels->Prepare(2);
  pixels->Write(inWishes.format == PictureFormat::kPng ? "PNG" : "JPEG", inPath);
}

}  // namespace

PictureFormat FormatOfPicture(const std::string& inPath) {
  std::string name = inPath.substr(inPath.find_last_of('/') + 1);
  std::transform(name.begin(), name.end(), name.begin(),
                 [](unsigned char inByte) { return static_cast<char>(std::tolower(inByte)); });
  if (name.ends_with(".jpg") || name.ends_with(".jpeg")) return PictureFormat::kJpeg;
  if (name.ends_with(".png")) return PictureFormat::kPng;
  throw UsageError("--output: the name of a picture ends in .jpg, .jpeg or .png, not \"" + inPath +
                   "\"");
}

PictureSize SizeOf(const std::string& inText) {
  const std::string_view text = inText;
  const std::size_t by = text.find('x');
  PictureSize size{0, 0};
  if (by != std::string_view::npos)
    size = {PixelCount(text.substr(0, by)), PixelCount(text.substr(by + 1))};
  if (size.width == 0 || size.height == 0)
    throw UsageError("--size: a size is such as 756x506, each 1 to " +
                     std::to_string(kLargestSize) + ", not \"" + inText + "\"");
  return size;
}

std::optional<PictureView> ViewOf(const std::string& inWord) {
  if (inWord == "iso") return std::nullopt;
  std::string known = "iso";
  for (const NamedView& named : NamedViews()) {
    if (named.word == inWord) return named.view;
    known += ", " + std::string(named.word);
  }
  throw UsageError("--view: unknown word \"" + inWord + "\"; known are " + known);
}

void TakePicture(ZOR3DRep& inRep, const PictureWishes& inWishes, const std::string& inPath) {
  const auto [width, height] = inWishes.size;
  if (inWishes.format == PictureFormat::kJpeg && !inWishes.view)
    ZORLyraXMLServices::TakeRepImage(&inRep, FromUtf8(inPath), width, height, 1,
                                     inWishes.keepsBackground ? 1 : 0);
  else
    TakeOtherPicture(inRep, inWishes, inPath.c_str());
}

}  // namespace lyra
