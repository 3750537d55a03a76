// The entry of the reader library.
#include <Message_ProgressIndicator.hxx>
#include <Message_ProgressScope.hxx>
#include <Standard_Failure.hxx>
#include <algorithm>
#include <exception>
#include <filesystem>
#include <vector>

#include "default_platform/product_structure/ModelReader.h"
#include "default_platform/product_structure/model_reader/DocumentReading.h"
#include "default_platform/product_structure/model_reader/PartMeshing.h"
#include "default_platform/product_structure/model_reader/ReferencedFiles.h"
#include "default_platform/product_structure/model_reader/TreeWalk.h"

namespace ZORDefault {
namespace {

constexpr int kReadingShare = 60;  // of a hundred: reading against tessellating
constexpr int kMeshingShare = 40;

/// Tells a function of every hundredth that is done.
class Progress : public Message_ProgressIndicator {
 public:
  explicit Progress(const std::function<void(double)>& inTell) : tell_(inTell) {}

 protected:
  void Show(const Message_ProgressScope&, const Standard_Boolean) override {
    const double done = std::min(GetPosition(), 1.0);
    if (!tell_ || done < told_ + 0.01) return;
    told_ = done;
    tell_(done);
  }

 private:
  const std::function<void(double)>& tell_;
  double told_ = 0;
};

void MeshParts(const std::vector<TDF_Label>& inLabels, double inDeflection,
               const Message_ProgressRange& inProgress, ModelData& ioModel) {
  Message_ProgressScope scope(inProgress, nullptr, static_cast<double>(inLabels.size()));
  for (std::size_t i = 0; i < inLabels.size(); ++i, scope.Next())
    if (!ioModel.parts[i].isAssembly) MeshPart(inLabels[i], inDeflection, ioModel.parts[i]);
}

std::string Counted(std::size_t inCount, const char* inOne, const char* inSeveral) {
  return std::to_string(inCount) + ' ' + (inCount == 1 ? inOne : inSeveral);
}

void WarnOfMissingTriangles(ModelData& ioModel) {
  std::size_t parts = 0, faces = 0;
  for (const ModelPart& part : ioModel.parts) {
    parts += part.failedToTessellate ? 1 : 0;
    faces += part.facesWithoutTriangles;
  }
  if (parts > 0)
    ioModel.warnings.push_back(Counted(parts, "part", "parts") + " could not be tessellated");
  if (faces > 0)
    ioModel.warnings.push_back(Counted(faces, "face has", "faces have") + " no triangles");
}

void WarnOfScaledNodes(const ModelRequest& inRequest, ModelData& ioModel) {
  if (inRequest.format != ModelFormat::kGltf && inRequest.format != ModelFormat::kGlb) return;
  const std::size_t nodes = CountScaledNodes(inRequest.path);
  if (nodes > 0)
    ioModel.warnings.push_back(Counted(nodes, "scaled node is", "scaled nodes are") +
                               " shown without scale");
}

/// Messages of the kernel may have several lines.
std::string OneLine(const char* inMessage) {
  std::string line = inMessage ? inMessage : "";
  std::ranges::replace_if(
      line, [](unsigned char byte) { return byte < 0x20; }, ' ');
  return line;
}

/// "" when all are there.
std::string DescribeMissingFiles(const ModelRequest& inRequest, const ModelData& inModel) {
  const auto folder = std::filesystem::path(inRequest.path).parent_path();
  std::vector<std::string> missing = inModel.referencedFiles;
  std::erase_if(missing, [&](const std::string& file) {
    std::error_code error;
    return std::filesystem::exists(folder / file, error);
  });
  if (missing.empty()) return "";
  if (missing.size() == 1) return "its file " + missing[0] + " is missing";
  return "its file " + missing[0] + " and " + std::to_string(missing.size() - 1) +
         " more are missing";
}

/// Readers of meshes call a root without name as the file, but the file may be renamed.
void ForgetFileName(const ModelRequest& inRequest, ModelData& ioModel) {
  if (ioModel.products.empty()) return;
  std::u16string& rootName = ioModel.parts[ioModel.products[0].part].name;
  if (rootName == std::filesystem::path(inRequest.path).filename().u16string()) rootName.clear();
}

bool HasGeometry(const ModelData& inModel) {
  return std::ranges::any_of(inModel.parts, [](const ModelPart& part) {
    return part.mesh != nullptr || part.failedToTessellate;
  });
}

bool Read(const ModelRequest& inRequest, ModelData& outModel, std::string& outReason) {
  if (const std::string file = FindNonRegularFile(inRequest); !file.empty()) {
    outReason = OneLine(("names " + file + ", which is no file").c_str());
    return false;
  }
  PrepareReaders();
  Handle(Progress) progress = new Progress(inRequest.progress);
  Message_ProgressScope scope(progress->Start(), nullptr, kReadingShare + kMeshingShare);
  const Handle(TDocStd_Document) document =
      ReadDocument(inRequest, scope.Next(kReadingShare), outModel.referencedFiles, outReason);
  if (document.IsNull()) return false;
  const std::vector<TDF_Label> labels = WalkTree(document, outModel);
  MeshParts(labels, inRequest.deflection, scope.Next(kMeshingShare), outModel);
  ForgetFileName(inRequest, outModel);
  WarnOfMissingTriangles(outModel);
  WarnOfScaledNodes(inRequest, outModel);
  const std::string missingFiles = OneLine(DescribeMissingFiles(inRequest, outModel).c_str());
  if (!HasGeometry(outModel)) {
    outReason = missingFiles.empty() ? "holds no geometry" : "holds no geometry; " + missingFiles;
    return false;
  }
  if (!missingFiles.empty()) outModel.warnings.push_back(missingFiles);
  return true;
}

}  // namespace
}  // namespace ZORDefault

extern "C" __attribute__((visibility("default"))) bool ZORReadModel(
    const ZORDefault::ModelRequest& inRequest, ZORDefault::ModelData& outModel,
    std::string& outReason) {
  try {
    return ZORDefault::Read(inRequest, outModel, outReason);
  } catch (const Standard_Failure& failure) {
    outReason = "cannot be read: " + ZORDefault::OneLine(failure.GetMessageString());
  } catch (const std::exception& error) {
    outReason = "cannot be read: " + ZORDefault::OneLine(error.what());
  }
  return false;
}
