#include "toolkit/publishing/viewer/GeometryFiles.h"

#include <filesystem>
#include <regex>

#include "foundation/AtomicFile.h"
#include "foundation/NativePath.h"
#include "toolkit/publishing/page/PageLibrary.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {
constexpr char kViewerFolder[] = "viewer";
constexpr char kScriptStart[] = "zorBlock(\"";
}  // namespace

std::string GeometryPath(const PageBlock& inBlock) {
  return std::string(kViewerFolder) + "/" + inBlock.name + ".js";
}

std::string GeometryScript(const PageBlock& inBlock) {
  const std::string bytes = LoadPageLibrary().base64(inBlock.bytes);
  return std::string(kScriptStart).append(inBlock.name).append("\",\"").append(bytes) + "\");\n";
}

bool IsGeometryScript(std::string_view inText) { return inText.starts_with(kScriptStart); }

std::vector<fs::path> GeometryFilesIn(const std::string& inFolder) {
  static const std::regex names(R"((scene|part-\d+)\.js)");
  std::vector<fs::path> files;
  const fs::path folder = ZORFoundation::NativePath(inFolder) / kViewerFolder;
  if (fs::is_directory(folder))
    for (const fs::directory_entry& entry : fs::directory_iterator(folder))
      if (std::regex_match(entry.path().filename().string(), names)) files.push_back(entry.path());
  return files;
}

void WriteGeometry(const std::vector<PageBlock>& inBlocks, const std::string& inFolder,
                   const std::string& inWorkFolder) {
  for (const fs::path& file : GeometryFilesIn(inFolder)) fs::remove(file);
  if (inBlocks.empty()) return;
  fs::create_directories(ZORFoundation::NativePath(inFolder) / kViewerFolder);
  ZORFoundation::AtomicFileOptions written;
  written.temporaryFolder = inWorkFolder;
  for (const PageBlock& block : inBlocks)
    ZORFoundation::WriteWholeFile(inFolder + "/" + GeometryPath(block), GeometryScript(block),
                                  written);
}

}  // namespace ZORToolkit
