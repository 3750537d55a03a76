#include "toolkit/publishing/viewer/GeometryFiles.h"

#include <filesystem>
#include <regex>

#include "foundation/AtomicFile.h"
#include "toolkit/publishing/PageLibrary.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {
constexpr char kFolder[] = "viewer";
}

std::string GeometryPath(const PageBlock& inBlock) {
  return std::string(kFolder) + "/" + inBlock.name + ".js";
}

std::string GeometryScript(const PageBlock& inBlock) {
  const std::string bytes = LoadPageLibrary().base64(inBlock.bytes);
  return std::string("zorBlock(\"").append(inBlock.name).append("\",\"").append(bytes) + "\");\n";
}

void WriteGeometry(const std::vector<PageBlock>& inBlocks, const std::string& inFolder,
                   const std::string& inWorkFolder) {
  static const std::regex names(R"((scene|part-\d+)\.js)");
  const fs::path folder = fs::path(inFolder) / kFolder;
  if (fs::exists(folder))
    for (const fs::directory_entry& entry : fs::directory_iterator(folder))
      if (std::regex_match(entry.path().filename().string(), names)) fs::remove(entry.path());
  if (inBlocks.empty()) return;
  fs::create_directories(folder);
  ZORFoundation::AtomicFileOptions written;
  written.temporaryFolder = inWorkFolder;
  for (const PageBlock& block : inBlocks)
    ZORFoundation::WriteWholeFile(inFolder + "/" + GeometryPath(block), GeometryScript(block),
                                  written);
}

}  // namespace ZORToolkit
