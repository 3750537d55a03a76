#include "default_platform/product_structure/model_reader/ModelChecks.h"

#include <cmath>
#include <cstdint>
#include <cstring>
#include <filesystem>
#include <map>
#include <nlohmann/json.hpp>
#include <vector>

namespace ZORDefault {
namespace {

using nlohmann::json;

/// The JSON text of a glTF or GLB file: all of it, or the first chunk of a binary one.
std::string_view GltfScene(std::string_view inBytes) {
  constexpr std::size_t kLengthAt = 12, kTextAt = 20;
  if (!inBytes.starts_with("glTF") || inBytes.size() < kTextAt) return inBytes;
  std::uint32_t length = 0;
  std::memcpy(&length, inBytes.data() + kLengthAt, sizeof length);
  return inBytes.substr(kTextAt, length);
}

/// Raised for what is wrong with a scene.
struct Fault {
  std::string reason;
};

const json& Array(const json& inObject, const char* inName) {
  static const json kEmpty = json::array();
  const auto found = inObject.find(inName);
  return found != inObject.end() && found->is_array() ? *found : kEmpty;
}

/// A count of bytes or elements, which must not be negative.
double Number(const json& inObject, const char* inName, double inOtherwise,
              const std::string& inOf) {
  const auto found = inObject.is_object() ? inObject.find(inName) : inObject.end();
  if (!inObject.is_object() || found == inObject.end()) return inOtherwise;
  const double value = found->is_number() ? found->get<double>() : -1;
  if (!(value >= 0)) throw Fault{inOf + " has no valid " + inName};
  return value;
}

std::string Named(const char* inKind, std::size_t inIndex) {
  return std::string("its ") + inKind + ' ' + std::to_string(inIndex);
}

/// Counts of a glTF scene against the bytes that are there.
class GltfCounts {
 public:
  GltfCounts(const json& inScene, const ModelRequest& inRequest, std::size_t inFileSize)
      : scene_(inScene),
        folder_(std::filesystem::path(inRequest.path).parent_path()),
        fileSize_(inFileSize) {}

  void Check() const {
    std::size_t i = 0;
    for (const json& buffer : Array(scene_, "buffers")) {
      const std::string name = Named("buffer", i++);
      Require(Number(buffer, "byteLength", 0, name), Available(buffer), name);
    }
    i = 0;
    for (const json& view : Array(scene_, "bufferViews")) {
      const std::string name = Named("buffer view", i++);
      Require(Number(view, "byteOffset", 0, name) + Number(view, "byteLength", 0, name),
              LengthOf("buffers", view, "buffer", name), name);
    }
    i = 0;
    for (const json& accessor : Array(scene_, "accessors"))
      CheckAccessor(accessor, Named("accessor", i++));
  }

 private:
  static void Require(double inNeeded, double inAvailable, const std::string& inName) {
    if (inNeeded > inAvailable) throw Fault{inName + " claims more bytes than there are"};
  }

  /// An upper bound of the bytes behind a buffer.
  double Available(const json& inBuffer) const {
    const auto uri = inBuffer.is_object() ? inBuffer.find("uri") : inBuffer.end();
    if (!inBuffer.is_object() || uri == inBuffer.end() || !uri->is_string())
      return static_cast<double>(fileSize_);
    const std::string& name = uri->get_ref<const std::string&>();
    if (name.starts_with("data:")) return static_cast<double>(name.size());
    std::error_code error;
    const auto status = std::filesystem::status(folder_ / name, error);
    if (std::filesystem::exists(status) && !std::filesystem::is_regular_file(status))
      throw Fault{"names " + name + ", which is no file"};
    const auto size = std::filesystem::file_size(folder_ / name, error);
    return error ? INFINITY : static_cast<double>(size);  // a missing file is reported otherwise
  }

  double LengthOf(const char* inArray, const json& inUser, const char* inReference,
                  const std::string& inName) const {
    const double index = Number(inUser, inReference, INFINITY, inName);
    const json& all = Array(scene_, inArray);
    if (!(index < static_cast<double>(all.size())))
      throw Fault{inName + " refers to a missing " + inReference};
    return Number(all[static_cast<std::size_t>(index)], "byteLength", 0, inName);
  }

  void CheckAccessor(const json& inAccessor, const std::string& inName) const {
    static const std::map<std::string, double> kComponents = {
        {"SCALAR", 1}, {"VEC2", 2}, {"VEC3", 3}, {"VEC4", 4},
        {"MAT2", 4},   {"MAT3", 9}, {"MAT4", 16}};
    static const std::map<int, double> kSizes = {{5120, 1}, {5121, 1}, {5122, 2},
                                                 {5123, 2}, {5125, 4}, {5126, 4}};
    const double count = Number(inAccessor, "count", 0, inName);
    if (count == 0 || !inAccessor.contains("bufferView")) return;
    const auto type = inAccessor.find("type"), size = inAccessor.find("componentType");
    const bool isTyped = type != inAccessor.end() && type->is_string() &&
                         kComponents.contains(type->get<std::string>()) &&
                         size != inAccessor.end() && size->is_number_integer() &&
                         kSizes.contains(size->get<int>());
    const double element =
        isTyped ? kComponents.at(type->get<std::string>()) * kSizes.at(size->get<int>()) : 1;
    Require(Number(inAccessor, "byteOffset", 0, inName) + count * element,
            LengthOf("bufferViews", inAccessor, "bufferView", inName), inName);
  }

  const json& scene_;
  std::filesystem::path folder_;
  std::size_t fileSize_;
};

/// Counts the products that a scene's nodes become: a node with two parents counts twice.
class GltfNodes {
 public:
  explicit GltfNodes(const json& inScene)
      : nodes_(Array(inScene, "nodes")), counts_(nodes_.size(), 0) {}

  void Check() {
    constexpr double kMaxProducts = 1e6;
    for (std::size_t root = 0; root < nodes_.size(); ++root)
      if (counts_[root] == 0 && CountBelow(root) > kMaxProducts)
        throw Fault{"has more than a million products"};
  }

 private:
  static constexpr double kOpen = -1;
  struct Visit {
    std::size_t node, next;
  };

  /// Depth first, without recursion: a chain of nodes may be long.
  double CountBelow(std::size_t inRoot) {
    std::vector<Visit> path{{inRoot, 0}};
    counts_[inRoot] = kOpen;
    std::vector<double> sums{1};
    while (!path.empty()) {
      const json& children = ChildrenOf(path.back().node);
      if (path.back().next == children.size()) {
        const double sum = counts_[path.back().node] = sums.back();
        path.pop_back();
        sums.pop_back();
        if (!sums.empty()) sums.back() += sum;
        continue;
      }
      const json& child = children[path.back().next++];
      if (!child.is_number_unsigned() || child.get<std::size_t>() >= nodes_.size())
        throw Fault{Named("node", path.back().node) + " has a child that does not exist"};
      const auto index = child.get<std::size_t>();
      if (counts_[index] == kOpen) throw Fault{Named("node", index) + " is its own descendant"};
      if (counts_[index] > 0) {
        sums.back() += counts_[index];
      } else {
        counts_[index] = kOpen;
        path.push_back({index, 0});
        sums.push_back(1);
      }
    }
    return counts_[inRoot];
  }

  const json& ChildrenOf(std::size_t inNode) const {
    static const json kNone = json::array();
    return nodes_[inNode].is_object() ? Array(nodes_[inNode], "children") : kNone;
  }

  const json& nodes_;
  std::vector<double> counts_;  // of products; 0: not visited yet
};

void CheckGltf(const ModelRequest& inRequest, std::string_view inBytes) {
  const json scene = json::parse(GltfScene(inBytes), nullptr, false);
  if (!scene.is_object()) return;  // the kernel says so
  GltfCounts(scene, inRequest, inBytes.size()).Check();
  GltfNodes(scene).Check();
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

std::string FindFault(const ModelRequest& inRequest, std::string_view inBytes) {
  try {
    if (inRequest.format == ModelFormat::kGltf || inRequest.format == ModelFormat::kGlb)
      CheckGltf(inRequest, inBytes);
  } catch (const Fault& fault) {
    return fault.reason;
  }
  return "";
}

std::size_t CountScaledNodes(std::string_view inBytes) {
  std::size_t count = 0;
  try {
    const json scene = json::parse(GltfScene(inBytes));
    for (const json& node : scene.value("nodes", json::array())) count += IsScaled(node) ? 1 : 0;
  } catch (const json::exception&) {
    return count;  // the kernel could read the file: at least what was counted is certain
  }
  return count;
}

}  // namespace ZORDefault
