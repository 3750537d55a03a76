#include "default_platform/product_structure/model_reader/ReferencedFiles.h"

#include <cmath>
#include <cstdint>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <nlohmann/json.hpp>
#include <set>
#include <string_view>
#include <vector>

namespace ZORDefault {
namespace {

namespace fs = std::filesystem;

std::string ReadGltfScene(const std::string& inPath) {
  constexpr std::size_t kLengthAt = 12, kTextAt = 20;
  std::ifstream file(inPath, std::ios::binary);
  std::string bytes((std::istreambuf_iterator<char>(file)), {});
  if (!bytes.starts_with("glTF") || bytes.size() < kTextAt) return bytes;
  std::uint32_t length = 0;
  std::memcpy(&length, bytes.data() + kLengthAt, sizeof length);
  return bytes.substr(kTextAt, length);
}

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

bool IsNonRegular(const fs::file_status& inStatus) {
  return fs::exists(inStatus) && !fs::is_regular_file(inStatus) && !fs::is_directory(inStatus);
}

constexpr double kTolerance = 1e-5;

bool IsOne(double inScale) { return std::abs(inScale - 1) < kTolerance; }

/// Whether a matrix, held by columns, turns and moves only.
bool IsRigid(const std::vector<double>& inMatrix) {
  const auto at = [&](std::size_t row, std::size_t column) { return inMatrix[4 * column + row]; };
  for (std::size_t column = 0; column < 3; ++column)
    if (!IsOne(std::hypot(at(0, column), at(1, column), at(2, column)))) return false;
  const double determinant = at(0, 0) * (at(1, 1) * at(2, 2) - at(1, 2) * at(2, 1)) -
                             at(0, 1) * (at(1, 0) * at(2, 2) - at(1, 2) * at(2, 0)) +
                             at(0, 2) * (at(1, 0) * at(2, 1) - at(1, 1) * at(2, 0));
  return std::abs(determinant - 1) < 10 * kTolerance;
}

bool IsScaled(const nlohmann::json& inNode) {
  if (const auto scale = inNode.find("scale"); scale != inNode.end())
    for (const double factor : scale->get<std::vector<double>>())
      if (!IsOne(factor)) return true;
  if (const auto matrix = inNode.find("matrix"); matrix != inNode.end()) {
    const auto values = matrix->get<std::vector<double>>();
    return values.size() == 16 && !IsRigid(values);
  }
  return false;
}

}  // namespace

std::string FindNonRegularFile(const ModelRequest& inRequest) {
  std::vector<std::string> waiting = {inRequest.path};
  std::set<std::string> seen(waiting.begin(), waiting.end());
  while (!waiting.empty()) {
    const std::string path = waiting.back();
    waiting.pop_back();
    for (const std::string& name : NamesIn(path, inRequest.format)) {
      std::error_code error;
      const std::string other = (fs::path(path).parent_path() / name).string();
      const fs::file_status status = fs::status(other, error);
      if (IsNonRegular(status)) return name;
      if (inRequest.format == ModelFormat::kStep && fs::is_regular_file(status) &&
          seen.insert(other).second)
        waiting.push_back(other);
    }
  }
  return "";
}

std::size_t CountScaledNodes(const std::string& inPath) {
  std::size_t count = 0;
  try {
    const auto scene = nlohmann::json::parse(ReadGltfScene(inPath));
    for (const auto& node : scene.value("nodes", nlohmann::json::array()))
      count += IsScaled(node) ? 1 : 0;
  } catch (const nlohmann::json::exception&) {
    return count;  // the kernel could read the file: at least what was counted is certain
  }
  return count;
}

}  // namespace ZORDefault
