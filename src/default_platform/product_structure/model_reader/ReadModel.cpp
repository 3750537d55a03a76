// The program that reads models: damaged ones may crash the CAD kernel, which must not be in a host's
// process.
#include <signal.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <Message_ProgressIndicator.hxx>
#include <Message_ProgressScope.hxx>
#include <Standard_Failure.hxx>
#include <Standard_OutOfMemory.hxx>
#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdlib>
#include <exception>
#include <filesystem>
#include <new>
#include <set>
#include <vector>

#include "default_platform/product_structure/model_reader/DocumentReading.h"
#include "default_platform/product_structure/model_reader/FileDoor.h"
#include "default_platform/product_structure/model_reader/MeshBuilder.h"
#include "default_platform/product_structure/model_reader/ModelChecks.h"
#include "default_platform/product_structure/model_reader/TreeWalk.h"
#include "foundation/Descriptor.h"
#include "foundation/ReadWholeFile.h"
#include "foundation/Utf8.h"

namespace ZORDefault {
namespace {

constexpr int kReadingShare = 60;  // of a hundred: reading against tessellating
constexpr int kMeshingShare = 40;

/// Raised where a model cannot be read.
struct Refusal {
  std::string reason;
};

void ReportStatus(const std::string& inLine) {
  std::size_t written = 0;
  ZORFoundation::WriteAll(ModelReaderProtocol::kStatus, inLine + '\n', written);
}

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

/// Messages of the kernel may have several lines.
std::string OneLine(const char* inMessage) {
  std::string line = inMessage ? inMessage : "";
  std::ranges::replace_if(
      line, [](unsigned char byte) { return byte < 0x20; }, ' ');
  return line;
}

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

int Answer(int inExitCode, std::string_view inBytes) {
  std::size_t written = 0;
  const int error = ZORFoundation::WriteAll(ModelReaderProtocol::kResult, inBytes, written);
  return error == 0 ? inExitCode : ModelReaderProtocol::kExitOutOfMemory;
}

int Refuse(const std::string& inReason) {
  return Answer(ModelReaderProtocol::kExitRefused, inReason);
}

void SetLimit(__rlimit_resource inResource, double inSoft, double inHard) {
  rlimit limit;
  if (getrlimit(inResource, &limit) != 0) return;
  // A lower limit of whoever started this process stays.
  const auto lower = [&limit](double inWanted) {
    return inWanted < static_cast<double>(limit.rlim_max) ? static_cast<rlim_t>(inWanted)
                                                          : limit.rlim_max;
  };
  limit = {lower(inSoft), lower(inHard)};
  setrlimit(inResource, &limit);
}

/// Limits this process's processor time and memory, and ends it with its parent. An allocation that
/// fails ends it too, see malloc below: the kernel would go on and leave out what it had no memory
/// for.
void SetProcessLimits(const ModelLimits& inLimits) {
  const double seconds = std::ceil(inLimits.seconds);
  SetLimit(RLIMIT_CPU, seconds, seconds + 1);
  SetLimit(RLIMIT_CORE, 0, 0);
#ifndef __SANITIZE_ADDRESS__  // which maps far more than it uses
  const auto memory = static_cast<double>(inLimits.memory);
  SetLimit(RLIMIT_DATA, memory, memory);
#endif
  prctl(PR_SET_PDEATHSIG, SIGKILL);
}

int Run(char** inArguments) try {
  ModelRequest request;
  request.format = static_cast<ModelFormat>(std::atoi(inArguments[1]));
  request.deflection = std::atof(inArguments[2]);
  SetProcessLimits({std::atof(inArguments[4]), std::strtoull(inArguments[3], nullptr, 10)});
  request.path = inArguments[5];
  lseek(ModelReaderProtocol::kModel, 0, SEEK_SET);
  const std::string bytes = ZORFoundation::ReadToEnd(ModelReaderProtocol::kModel, request.path);
  CloseDoorBehind(request.path, ModelReaderProtocol::kModel);
  return Answer(ModelReaderProtocol::kExitRead, EncodeModel(Read(request, bytes)));
} catch (const Refusal& refusal) {
  return Refuse(refusal.reason);
} catch (const Standard_OutOfMemory&) {
  return ModelReaderProtocol::kExitOutOfMemory;
} catch (const std::bad_alloc&) {
  return ModelReaderProtocol::kExitOutOfMemory;
} catch (const Standard_Failure& failure) {
  return Refuse("cannot be read: " + OneLine(failure.GetMessageString()));
} catch (const std::exception& error) {
  return Refuse("cannot be read: " + OneLine(error.what()));
}

}  // namespace
}  // namespace ZORDefault

#ifdef __SANITIZE_ADDRESS__
// A crash of the kernel ends this process by its signal, as it does without the sanitizer.
extern "C" __attribute__((visibility("default"))) const char* __asan_default_options() {
  return "handle_segv=0:handle_sigbus=0:handle_sigfpe=0";
}
#else
// A program's own functions come before those of the C library, for all libraries that it loads.
extern "C" {

void* __libc_malloc(std::size_t inSize);
void* __libc_calloc(std::size_t inCount, std::size_t inSize);
void* __libc_realloc(void* inOld, std::size_t inSize);

static void* Checked(void* inBlock) {
  if (inBlock == nullptr) _exit(ZORDefault::ModelReaderProtocol::kExitOutOfMemory);
  return inBlock;
}

__attribute__((visibility("default"))) void* malloc(std::size_t inSize) {
  return Checked(__libc_malloc(inSize));
}
__attribute__((visibility("default"))) void* calloc(std::size_t inCount, std::size_t inSize) {
  return Checked(__libc_calloc(inCount, inSize));
}
__attribute__((visibility("default"))) void* realloc(void* inOld, std::size_t inSize) {
  void* const block = __libc_realloc(inOld, inSize);
  return inSize == 0 ? block : Checked(block);
}
}
#endif

int main(int inCount, char** inArguments) {
  constexpr int kArguments = 6;
  if (inCount != kArguments) return ZORDefault::ModelReaderProtocol::kExitOutOfMemory + 1;
  // Without destructors: what the kernel built need not be taken apart.
  _exit(ZORDefault::Run(inArguments));
}
