// The program that reads models: damaged ones may crash the CAD kernel, which must not be in a
// host's process.
#include <Message_ProgressIndicator.hxx>
#include <Message_ProgressScope.hxx>
#include <algorithm>
#include <filesystem>
#include <set>
#include <vector>

#include "default_platform/ReaderProgram.h"
#include "default_platform/product_structure/model_reader/DocumentReading.h"
#include "default_platform/product_structure/model_reader/FileSandbox.h"
#include "default_platform/product_structure/model_reader/MeshBuilder.h"
#include "default_platform/product_structure/model_reader/ModelChecks.h"
#include "default_platform/product_structure/model_reader/TreeWalk.h"
#include "foundation/Utf8.h"

namespace ZORDefault {
namespace {

constexpr int kReadingShare = 60;  // of a hundred: reading against tessellating
constexpr int kMeshingShare = 40;

/// Reports every hundredth that is done.
class Progress : public Message_ProgressIndicator {
 protected:
  void Show(const Message_ProgressScope&, const Standard_Boolean) override {
    const int done = static_cast<int>(100 * std::min(GetPosition(), 1.0));
    if (done <= reported_) return;
    reported_ = done;
    ReportStatus(std::to_string(done));
  }

 private:
  int reported_ = 0;
};

std::string ToUtf8(const std::u16string& inText) {
  std::string text(ZORFoundation::Utf8Length(inText), '\0');
  ZORFoundation::EncodeUtf8(inText, text.data());
  return OneLine(text.c_str());
}

void MeshParts(const std::vector<TDF_Label>& inLabels, double inDeflection,
               const Message_ProgressRange& inProgress, ModelData& ioModel) {
  Message_ProgressScope scope(inProgress, nullptr, static_cast<double>(inLabels.size()));
  for (std::size_t i = 0; i < inLabels.size(); ++i, scope.Next()) {
    ModelPart& part = ioModel.parts[i];
    if (part.isAssembly) continue;
    ReportStatus("tessellating its part \"" + ToUtf8(part.name) + '"');
    if (!MeshPart(inLabels[i], inDeflection, part)) ioModel.hadFailure = true;
  }
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

void WarnOfScaledNodes(const ModelRequest& inRequest, std::string_view inBytes,
                       ModelData& ioModel) {
  if (inRequest.format != ModelFormat::kGltf && inRequest.format != ModelFormat::kGlb) return;
  const std::size_t nodes = CountScaledNodes(inBytes);
  if (nodes > 0)
    ioModel.warnings.push_back(Counted(nodes, "scaled node is", "scaled nodes are") +
                               " shown without scale");
}

/// "its file a.stp IS", or "its file a.stp and 2 more ARE"; "" for no file in this state.
std::string DescribeFiles(const ModelData& inModel, ReferencedFile::State inState,
                          const char* inPredicate) {
  std::vector<std::string> names;
  for (const ReferencedFile& file : inModel.referencedFiles)
    if (file.state == inState) names.push_back(file.name);
  if (names.empty()) return "";
  std::string text = "its file " + names[0];
  if (names.size() > 1) text += " and " + std::to_string(names.size() - 1) + " more";
  return OneLine((text + (names.size() == 1 ? " is " : " are ") + inPredicate).c_str());
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

ModelData Read(const ModelRequest& inRequest, std::string_view inBytes) {
  ReportStatus(std::string("reading its ") + NameOfFormat(inRequest.format) + " data");
  if (const std::string fault = FindFault(inRequest, inBytes); !fault.empty())
    throw Refusal{OneLine(fault.c_str())};
  PrepareReaders();
  Handle(Progress) progress = new Progress();
  Message_ProgressScope scope(progress->Start(), nullptr, kReadingShare + kMeshingShare);
  const LoadedDocument loaded = ReadDocument(inRequest, scope.Next(kReadingShare),
                                             [](const char* stage) { ReportStatus(stage); });
  if (const std::string file = FirstNonRegularFile(); !file.empty())
    throw Refusal{OneLine(("names " + file + ", which is no file").c_str())};
  if (loaded.document.IsNull())
    throw Refusal{std::string("cannot be read as ") + NameOfFormat(inRequest.format)};
  ModelData model;
  const std::vector<TDF_Label> labels = WalkTree(loaded.document, model);
  MeshParts(labels, inRequest.deflection, scope.Next(kMeshingShare), model);
  std::set<std::string> names(loaded.referencedFiles.begin(), loaded.referencedFiles.end());
  for (const std::string& name : RefusedFiles()) names.insert(name);
  for (const std::string& name : names) model.referencedFiles.push_back(ReferencedFileAt(name));
  ForgetFileName(inRequest, model);
  WarnOfMissingTriangles(model);
  WarnOfScaledNodes(inRequest, inBytes, model);
  const std::string missing = DescribeFiles(model, ReferencedFile::State::kMissing, "missing");
  if (!HasGeometry(model))
    throw Refusal{missing.empty() ? "holds no geometry" : "holds no geometry; " + missing};
  // The kernel cannot build what lies in a missing file, and that is said below.
  if (missing.empty()) model.damages = loaded.damages;
  for (const std::string& warning :
       {missing, DescribeFiles(model, ReferencedFile::State::kRefused, "outside its folder")})
    if (!warning.empty()) model.warnings.push_back(warning);
  model.hadFailure = model.hadFailure || HasChangedFile();
  return model;
}

}  // namespace

std::string AnswerTo(const ModelRequest& inRequest, std::string_view inBytes) {
  return EncodeModel(Read(inRequest, inBytes));
}

}  // namespace ZORDefault
