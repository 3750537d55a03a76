#include "toolkit/publishing/folder/PublishedFiles.h"

#include <algorithm>
#include <filesystem>
#include <initializer_list>
#include <optional>
#include <utility>

#include "ZORLyraXMLServices.h"
#include "foundation/AtomicFile.h"
#include "foundation/NativePath.h"
#include "foundation/ReadWholeFile.h"
#include "platform/system/ZORSettingRepository.h"
#include "toolkit/Error.h"
#include "toolkit/publishing/folder/Manifest.h"
#include "toolkit/publishing/page/PageLibrary.h"
#include "toolkit/publishing/viewer/GeometryFiles.h"
#include "toolkit/records/DocumentText.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr char kReportStyleSheet[] = "clash-report.xsl";
constexpr std::uint64_t kMaxStyleSheetSize = std::uint64_t{64} << 20;

Page MakePage(const PageRequest& inRequest) {
  Page page;
  if (!LoadPageLibrary().makePage(inRequest, page))
    throw Error(inRequest.styleSheetName, page.reason);
  return page;
}

/// The page loads nothing but its own pictures, and runs nothing but its own script and what that
/// puts in: the geometry, which in a folder stands in scripts, since a page from a disk can fetch
/// nothing.
std::string PolicyOf(const PublicationOptions& inOptions, const PublishedResult& inPublished) {
  const PageLibrary& library = LoadPageLibrary();
  const auto hash = [&](const std::string& inText) {
    return std::string(" 'sha256-").append(library.base64(library.sha256(inText))).append("'");
  };
  const std::string pictures = inOptions.isOneFile ? "data:" : "'self' file: data:";
  return "default-src 'none'; img-src " + pictures + "; style-src" + hash(inPublished.style) +
         "; script-src" + hash(inPublished.script) +
         " 'strict-dynamic'; form-action 'none'; base-uri 'none'";
}

/// A reference may be written with backslashes, as on other systems.
std::string StyleSheetOfSetting() {
  ZORSettingRepository* const settings = ZORSettingRepository::GetRepository("ClashPublish");
  ZORUnicodeString ignored;
  if (settings == nullptr || FAILED(settings->ReadSetting("XslTemplate", &ignored))) return {};
  std::string path = Utf8(ZORLyraXMLServices().getStyleSheetFromSetting());
  if (!fs::exists(ZORFoundation::NativePath(path))) std::ranges::replace(path, '\\', '/');
  return path;
}

void WriteReportFile(const ClashDocument& inDocument, const std::string& inStyleSheet,
                     const std::string& inPath, const ZORFoundation::AtomicFileOptions& inOptions) {
  Prologue prologue;
  prologue.styleSheet = inStyleSheet;
  ZORFoundation::AtomicFile file(inPath, inOptions);
  if (FAILED(WriteReport(inDocument, prologue, file.Temporary().Utf8Path())))
    throw Error(inPath, "the file could not be written");
  file.Commit();
}

bool HasOneOf(std::string_view inText, std::initializer_list<std::string_view> inMarks) {
  return std::ranges::any_of(inMarks, [&](std::string_view inMark) {
    return inText.find(inMark) != std::string_view::npos;
  });
}

class OwnFiles {
 public:
  OwnFiles(const PublicationOptions& inOptions, const PageStyleSheet& inSheet)
      : folder_(inOptions.folder), sheet_(inSheet) {}

  void Require() {
    const std::string styleSheet = FileNameOf(sheet_);
    RequireOwn(kManifestFile, [&](const std::string& inText) { return IsManifest(inText); });
    RequireOwn(kPageFile, [&](const std::string& inText) { return IsPage(inText); });
    RequireOwn(kReportFile, IsReport);
    RequireOwn(styleSheet, [&](const std::string& inText) { return IsStyleSheet(inText); });
    RequireOwn(kReportType, [](const std::string& inText) {
      return HasOneOf(inText, {"<!ELEMENT ClashElement"});
    });
    for (const fs::path& file : GeometryFilesIn(folder_))
      RequireOwn("viewer/" + file.filename().string(), IsGeometryScript);
  }

 private:
  template <class IsOwn>
  void RequireOwn(const std::string& inName, const IsOwn& inIsOwn) const {
    const std::string path = folder_ + "/" + inName;
    if (!fs::is_regular_file(ZORFoundation::NativePath(path)))
      return;  // what else cannot be written says so itself
    if (!inIsOwn(ZORFoundation::ReadWholeFile(path).bytes))
      throw Error(path + ": is in the way of the page and was not made by lyra publish");
  }

  bool IsManifest(const std::string& inText) {
    try {
      manifest_ = ManifestFrom(kManifestFile, inText);
    } catch (const Error&) {
      return false;
    }
    return true;
  }

  /// The hash of the style sheet that the former publication was made with; empty for the page's
  /// own.
  std::string FormerStyleSheet() const {
    if (!manifest_) return {};
    for (const auto& [name, value] : manifest_->settings)
      if (name == "styleSheet") return value;
    return {};
  }

  /// A page by somebody's own style sheet may hold nothing that tells it.
  bool IsPage(const std::string& inText) const {
    return !FormerStyleSheet().empty() ||
           HasOneOf(inText,
                    {"id=\"zor-manifest\"", "id=\"zor-data\"", "class=\"kind\">Clash report<"});
  }

  static bool IsReport(const std::string& inText) {
    const std::string_view start = std::string_view(inText).substr(0, 4096);
    return HasOneOf(start, {"<?xml-stylesheet "}) &&
           HasOneOf(start, {"<ClashElement", "<InterferenceElement"});
  }

  bool IsStyleSheet(const std::string& inText) const {
    return (!sheet_.path.empty() && inText == sheet_.text) ||
           Sha256Text(inText) == FormerStyleSheet() ||
           HasOneOf(inText, {"Turns a report of a clash result into"});
  }

  std::string folder_;
  const PageStyleSheet& sheet_;
  std::optional<Manifest> manifest_;  // of the former publication
};

}  // namespace

std::string StyleSheetPath(const PublicationOptions& inOptions) {
  return inOptions.styleSheet.empty() ? StyleSheetOfSetting() : inOptions.styleSheet;
}

std::string FileNameOf(const PageStyleSheet& inSheet) {
  return inSheet.path.empty() ? kReportStyleSheet
                              : ZORFoundation::NativePath(inSheet.path).filename().string();
}

PageStyleSheet::PageStyleSheet(const PublicationOptions& inOptions)
    : path(StyleSheetPath(inOptions)) {
  if (path.empty()) return;
  ZORFoundation::ReadOptions limit;
  limit.maxSize = kMaxStyleSheetSize;
  text = ZORFoundation::ReadWholeFile(path, limit).bytes;
  if (text.empty()) throw Error(path, "the style sheet is empty");
  const std::string name = FileNameOf(*this);
  if (name == kReportFile || name == kPageFile || name == kReportType || name == kManifestFile)
    throw Error(path, "a style sheet of this name would take the place of another");
  MakePage({"", text, path});
}

// Comes before anything is written, since it may fail: the old publication stays as it was then.
std::string MakePageOf(const PublicationOptions& inOptions, const PageStyleSheet& inSheet,
                       const ClashDocument& inDocument, PublishedResult& ioPublished) {
  ioPublished.style = LoadPageLibrary().pageStyle;
  ioPublished.script = LoadPageLibrary().pageScript;
  ioPublished.policy = PolicyOf(inOptions, ioPublished);
  const std::string name = inSheet.path.empty() ? "clash-page.xsl" : inSheet.path;
  Page page = MakePage({AnnotatedReport(inDocument, ioPublished), inSheet.text, name});
  if (!page.messages.empty() && inOptions.warn)
    inOptions.warn(name + ": " + page.messages.substr(0, page.messages.find('\n')));
  return std::move(page.bytes);
}

void RequireOwnFiles(const PublicationOptions& inOptions, const PageStyleSheet& inSheet) {
  OwnFiles(inOptions, inSheet).Require();
}

void WritePublishedFiles(const PublicationOptions& inOptions, const PageStyleSheet& inSheet,
                         const ClashDocument& inDocument, const std::string& inPage,
                         const std::string& inManifest, const std::string& inWorkFolder) {
  ZORFoundation::AtomicFileOptions written;
  written.temporaryFolder = inWorkFolder;
  const std::string folder = inOptions.folder + "/", styleSheet = FileNameOf(inSheet);
  const PageLibrary& library = LoadPageLibrary();
  WriteReportFile(inDocument, styleSheet, folder + kReportFile, written);
  ZORFoundation::WriteWholeFile(folder + kReportType, library.reportType, written);
  ZORFoundation::WriteWholeFile(
      folder + styleSheet, inSheet.path.empty() ? library.reportStyleSheet : inSheet.text, written);
  ZORFoundation::WriteWholeFile(folder + kManifestFile, inManifest, written);
  ZORFoundation::WriteWholeFile(folder + kPageFile, inPage, written);
}

}  // namespace ZORToolkit
