#include "default_platform/product_structure/model_reader/GltfScales.h"

#include <cmath>
#include <nlohmann/json.hpp>

#include "default_platform/product_structure/model_reader/GltfScene.h"

namespace ZORDefault {
namespace {

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
