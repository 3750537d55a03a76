#include "lyra/commands/Picture.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <memory>
#include <string_view>

#include "PrintPictures.h"
#include "ZORLyraXMLServices.h"
#include "lyra/CommandErrors.h"
#include "lyra/commands/CommonOptions.h"
#include "platform/visualisation/ZOR3DViewpoint.h"
#include "toolkit/records/DocumentText.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

/// @return 0 for what is no whole number or out of range.
int PixelCount(std::string_view inText) {
  int count = 0;
  const auto [end, error] = std::from_chars(inText.data(), inText.data() + inText.size(), count);
  const bool isNumber = error == std::errc() && end == inText.data() + inText.size();
  return isNumber && count >= 1 && count <= kMaxPictureSize ? count : 0;
}

struct Releaser {
  void operator()(ZORBaseUnknown* inComponent) const { inComponent->Release(); }
};
using OwnedViewpoint = std::unique_ptr<ZOR3DViewpoint, Releaser>;

/// A camera that looks in the direction of a view and has all of a representation in the picture.
OwnedViewpoint ViewpointOf(const PictureView& inView, const PictureSize& inSize,
                           const ZOR3DRep& inRep) {
  OwnedViewpoint viewpoint(new ZOR3DViewpoint);
  viewpoint->projection = ZOR3DViewpoint::kCylindric;
  viewpoint->sight = inView.sight;
  viewpoint->up = inView.up;
  viewpoint->Reframe(static_cast<float>(inSize.width), static_cast<float>(inSize.height), 1, 1,
                     inRep.GetShowBoundingElement());
  return viewpoint;
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
                     std::to_string(kMaxPictureSize) + ", not \"" + inText + "\"");
  return size;
}

std::optional<PictureView> ViewOf(const std::string& inWord) {
  const std::size_t place = ChosenWord("--view", inWord, kViewWords);
  if (place == 0) return std::nullopt;
  static const PictureView views[] = {{{0, 1, 0}, {0, 0, 1}},  {{0, -1, 0}, {0, 0, 1}},
                                      {{1, 0, 0}, {0, 0, 1}},  {{-1, 0, 0}, {0, 0, 1}},
                                      {{0, 0, -1}, {0, 1, 0}}, {{0, 0, 1}, {0, -1, 0}}};
  return views[place - 1];
}

void TakePicture(ZOR3DRep& inRep, const PictureOptions& inOptions, const std::string& inPath) {
  constexpr int kPlainModes = 1;
  const auto [width, height] = inOptions.size;
  const int keepsBackground = inOptions.keepsBackground ? 1 : 0;
  const ZORUnicodeString path = FromUtf8(inPath);
  const char* const format = FormatName(inOptions.format);
  if (inOptions.view)
    PrintPictures::TakeRepImage(&inRep, path,
                                ViewpointOf(*inOptions.view, inOptions.size, inRep).get(), format,
                                width, height, kPlainModes, keepsBackground);
  else if (inOptions.format == PictureFormat::kPng)
    PrintPictures::TakeRepImage(&inRep, path, format, width, height, kPlainModes, keepsBackground);
  else
    ZORLyraXMLServices::TakeRepImage(&inRep, path, width, height, kPlainModes, keepsBackground);
}

}  // namespace lyra
