#include "default_platform/product_structure/model_reader/NamedFiles.h"

#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>
#include <set>
#include <string_view>
#include <vector>

#include "default_platform/product_structure/model_reader/GltfScene.h"

namespace ZORDefault {
namespace {

namespace fs = std::filesystem;

std::string ReadBytes(const std::string& inPath) {
  std::error_code error;
  const auto size = fs::file_size(inPath, error);
  std::string bytes(error ? 0 : size, '\0');
  std::ifstream file(inPath, std::ios::binary);
  file.read(bytes.data(), static_cast<std::streamsize>(bytes.size()));
  return bytes;
}

/// Calls inVisit with what follows each occurrence of a mark.
template <class Visit>
void ForEachAfter(std::string_view inText, std::string_view inMark, const Visit& inVisit) {
  for (std::size_t at = inText.find(inMark); at != std::string_view::npos;
       at = inText.find(inMark, at + 1))
    inVisit(inText.substr(at + inMark.size()));
}

/// The first quoted text of each document or external identification.
void AddNamesOfStep(std::string_view inText, std::vector<std::string>& outNames) {
  for (const char* const mark : {"DOCUMENT_FILE", "EXTERNAL_IDENTIFICATION_ASSIGNMENT"}) {
    ForEachAfter(inText, mark, [&](std::string_view inRest) {
      const std::size_t start = inRest.find('\'') + 1;
      const std::size_t end = inRest.find('\'', start);
      if (start > 0 && end != std::string_view::npos)
        outNames.emplace_back(inRest.substr(start, end - start));
    });
  }
}

/// The rest of each line that names a library of materials.
void AddNamesOfObj(std::string_view inText, std::vector<std::string>& outNames) {
  ForEachAfter(inText, "mtllib", [&](std::string_view inRest) {
    constexpr char kSpace[] = " \t\r";
    const std::string_view line = inRest.substr(0, inRest.find('\n'));
    const std::size_t start = line.find_first_not_of(kSpace);
    if (start != std::string_view::npos)
      outNames.emplace_back(line.substr(start, line.find_last_not_of(kSpace) + 1 - start));
  });
}

void AddNamesOfGltf(const std::string& inScene, std::vector<std::string>& outNames) {
  const auto scene = nlohmann::json::parse(inScene, nullptr, false);
  if (!scene.is_object()) return;
  for (const char* const kind : {"buffers", "images"}) {
    const auto all = scene.find(kind);
    if (all == scene.end()) continue;
    for (const auto& one : *all)
      if (one.is_object() && one.contains("uri") && one["uri"].is_string())
        outNames.push_back(one["uri"]);
  }
}

std::vector<std::string> NamesIn(const std::string& inPath, ModelFormat inFormat) {
  std::vector<std::string> names;
  if (inFormat == ModelFormat::kStep) AddNamesOfStep(ReadBytes(inPath), names);
  if (inFormat == ModelFormat::kObj) AddNamesOfObj(ReadBytes(inPath), names);
  if (inFormat == ModelFormat::kGltf || inFormat == ModelFormat::kGlb)
    AddNamesOfGltf(ReadGltfScene(inPath), names);
  return names;
}

bool IsEndless(const fs::file_status& inStatus) {
  return fs::exists(inStatus) && !fs::is_regular_file(inStatus) && !fs::is_directory(inStatus);
}

}  // namespace

std::string FindEndlessFile(const ModelRequest& inRequest) {
  std::vector<std::string> waiting = {inRequest.path};
  std::set<std::string> seen(waiting.begin(), waiting.end());
  while (!waiting.empty()) {
    const std::string path = waiting.back();
    waiting.pop_back();
    for (const std::string& name : NamesIn(path, inRequest.format)) {
      std::error_code error;
      const std::string other = (fs::path(path).parent_path() / name).string();
      const fs::file_status status = fs::status(other, error);
      if (IsEndless(status)) return name;
      if (inRequest.format == ModelFormat::kStep && fs::is_regular_file(status) &&
          seen.insert(other).second)
        waiting.push_back(other);
    }
  }
  return "";
}

}  // namespace ZORDefault
