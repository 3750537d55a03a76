#include "platform/visualisation/ZORPixelImage.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <filesystem>
#include <optional>
#include <random>
#include <string>
#include <string_view>
#include <system_error>
#include <utility>

#include "default_platform/system/ObjectCounters.h"
#include "default_platform/system/Utf8.h"
#include "default_platform/visualisation/Rendering.h"
#include "platform/system/ZORFile.h"

namespace fs = std::filesystem;

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

/// The path in UTF-8, whatever the process's locale.
std::wstring ToWide(const std::string& inPath) {
  std::u16string units(inPath.size(), u'\0');
  units.resize(ZORDefault::DecodeUtf8(inPath, units.data()));
  std::wstring wide;
  for (std::size_t position = 0; position < units.size();)
    wide += static_cast<wchar_t>(ZORDefault::NextCharacter(units, position));
  return wide;
}

HRESULT WriteNewFile(const fs::path& inPath, const std::string& inBytes) {
  int descriptor = 0;
  HRESULT result = ZORFOpen(ToWide(inPath.string()).c_str(), "wb", &descriptor);
  if (FAILED(result)) return result;
  result = ZORFWrite(descriptor, inBytes.data(), inBytes.size(), nullptr);
  const HRESULT closed = ZORFClose(descriptor);
  return FAILED(result) ? result : closed;
}

/// A name beside a file that no other file has.
fs::path NameBeside(const fs::path& inPath) {
  static std::random_device random;
  constexpr std::string_view kDigits = "0123456789abcdef";
  std::string name = ".picture-";
  for (int i = 0; i < 16; ++i) name += kDigits[random() % kDigits.size()];
  return inPath.parent_path() / name;
}

HRESULT ReplaceFile(const fs::path& inPath, const std::string& inBytes) {
  std::error_code error;
  if (fs::is_directory(inPath, error)) return kZORFileIsDirectory;
  // A link stays and its target is replaced, as with a plain write.
  const fs::path resolved = fs::canonical(inPath, error);
  const fs::path target = error ? inPath : resolved;
  const fs::path beside = NameBeside(target);
  HRESULT result = WriteNewFile(beside, inBytes);
  if (SUCCEEDED(result)) {
    fs::rename(beside, target, error);
    if (error) result = E_FAIL;
  }
  if (FAILED(result)) fs::remove(beside, error);
  return result;
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
  return ReplaceFile(inPath.CastToCharPtr(), bytes);
} catch (const fs::filesystem_error&) {
  return kZORFileBadPath;
} catch (const std::system_error&) {
  return kZORFileBadPath;
} catch (const std::bad_alloc&) {
  return E_FAIL;
}

int ZORPixelImage::GetWidth() const { return width_; }
int ZORPixelImage::GetHeight() const { return height_; }
const std::vector<std::uint8_t>& ZORPixelImage::GetPixels() const { return pixels_; }
