#include "toolkit/publishing/OwnFiles.h"

#include <algorithm>
#include <filesystem>
#include <initializer_list>
#include <optional>

#include "foundation/ReadWholeFile.h"
#include "toolkit/Error.h"
#include "toolkit/publishing/Manifest.h"
#include "toolkit/publishing/PageLibrary.h"
#include "toolkit/publishing/viewer/GeometryFiles.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

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
    if (!fs::is_regular_file(path)) return;  // what else cannot be written says so itself
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

  /// The hash of the style sheet that the former publication was made with; empty for the page's own.
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

void RequireOwnFiles(const PublicationOptions& inOptions, const PageStyleSheet& inSheet) {
  OwnFiles(inOptions, inSheet).Require();
}

}  // namespace ZORToolkit
