#include "toolkit/publishing/OneFile.h"

#include <algorithm>
#include <utility>

#include "toolkit/Error.h"
#include "toolkit/publishing/folder/Manifest.h"
#include "toolkit/publishing/page/PageLibrary.h"

namespace ZORToolkit {
namespace {

constexpr std::size_t kMaxResult = 0x7fffffff;  // what the library reads from memory
constexpr char kManifestStart[] = "<script type=\"application/json\" id=\"zor-manifest\">";

std::string BlockStart(const std::string& inName) {
  return "<script type=\"application/gzip\" id=\"zor-block-" + inName + "\">";
}

std::string PictureStart(const std::string& inName) {
  return "data-name=\"" + inName + "\" href=\"data:image/";
}

/// JSON in which no text can end the element that it stands in.
std::string InScript(const std::string& inJson) {
  std::string text;
  for (const char byte : inJson) byte == '<' ? text += "\\u003c" : text += byte;
  return text;
}

void AppendPicture(const PagePicture& inPicture, std::string& ioText) {
  const std::string width = std::to_string(inPicture.width),
                    height = std::to_string(inPicture.height);
  const char* const type = inPicture.bytes.starts_with("RIFF")      ? "webp"
                           : inPicture.bytes.starts_with("\x89PNG") ? "png"
                                                                    : "jpeg";
  ioText.append("<symbol id=\"").append(inPicture.id).append("\" viewBox=\"0 0 ");
  ioText.append(width).append(" ").append(height).append("\"><image width=\"").append(width);
  ioText.append("\" height=\"").append(height).append("\" ").append(PictureStart(inPicture.name));
  ioText.append(type).append(";base64,");
  ioText.append(LoadPageLibrary().base64(inPicture.bytes)).append("\"></image></symbol>\n");
}

}  // namespace

std::string PageWithBlocks(const std::string& inName, const std::string& inPage,
                           const std::vector<PagePicture>& inPictures,
                           const std::vector<PageBlock>& inBlocks, const std::string& inManifest) {
  const std::size_t end = inPage.rfind("</body>");
  if (end == std::string::npos) throw Error(inName, "the style sheet makes no HTML page");
  const PageLibrary& library = LoadPageLibrary();
  std::string page = inPage.substr(0, end);
  if (!inPictures.empty()) {
    page += "<svg class=\"store\" aria-hidden=\"true\">\n";
    for (const PagePicture& picture : inPictures) AppendPicture(picture, page);
    page += "</svg>\n";
  }
  for (const PageBlock& block : inBlocks) {
    page.append(BlockStart(block.name));
    page.append(library.base64(block.isPacked ? block.bytes : library.gzip(block.bytes)));
    page.append("</script>\n");
  }
  page.append(kManifestStart).append(InScript(inManifest)).append("</script>\n");
  return page.append(inPage, end);
}

PublishedPage::PublishedPage(std::string inName, std::string inBytes)
    : name_(std::move(inName)), bytes_(std::move(inBytes)) {}

/// Texts of a document cannot hold the start of an element: in them it is escaped.
std::optional<std::string_view> PublishedPage::ElementText(const std::string& inStart) const {
  const std::size_t start = bytes_.rfind(inStart);
  if (start == std::string::npos) return std::nullopt;
  const std::size_t from = start + inStart.size(), end = bytes_.find("</script>", from);
  if (end == std::string::npos) return std::nullopt;
  return std::string_view(bytes_).substr(from, end - from);
}

std::string PublishedPage::ManifestText() const {
  const auto text = ElementText(kManifestStart);
  if (!text) throw Error(name_, "is no page of lyra publish, or is cut off");
  return std::string(*text);
}

std::optional<std::string> PublishedPage::PackedBlock(const std::string& inName) const {
  const auto text = ElementText(BlockStart(inName));
  std::string packed;
  if (!text || !LoadPageLibrary().fromBase64(*text, packed)) return std::nullopt;
  return packed;
}

std::optional<std::string> PublishedPage::Block(const std::string& inName) const {
  const std::optional<std::string> packed = PackedBlock(inName);
  std::string bytes;
  if (!packed || !LoadPageLibrary().gunzip(*packed, kMaxResult, bytes)) return std::nullopt;
  return bytes;
}

std::string PublishedPage::Result() const {
  const Manifest manifest = ManifestFrom(name_, ManifestText());
  if (!manifest.result || bytes_.find(BlockStart(kSourceBlock)) == std::string::npos)
    throw Error(name_, "the page holds no result; it was made with -o DIR");
  const std::optional<std::string> result = Block(kSourceBlock);
  if (!result || Sha256Text(*result) != manifest.result->sha256)
    throw Error(name_, "the result in the page is damaged: its hash is another");
  return *result;
}

std::optional<std::string> PublishedPage::Picture(const std::string& inName) const {
  const std::size_t place = bytes_.rfind(PictureStart(inName));
  if (place == std::string::npos) return std::nullopt;
  const std::size_t from = bytes_.find(',', place) + 1, end = bytes_.find('"', from);
  std::string picture;
  if (from == 0 || end == std::string::npos ||
      !LoadPageLibrary().fromBase64(std::string_view(bytes_).substr(from, end - from), picture))
    return std::nullopt;
  return picture;
}

}  // namespace ZORToolkit
