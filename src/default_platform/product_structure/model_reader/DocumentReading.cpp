#include "default_platform/product_structure/model_reader/DocumentReading.h"

#include <BRep_Builder.hxx>
#include <IGESCAFControl_Reader.hxx>
#include <IGESControl_Controller.hxx>
#include <Interface_Check.hxx>
#include <Interface_CheckIterator.hxx>
#include <Interface_InterfaceModel.hxx>
#include <Interface_ReportEntity.hxx>
#include <Interface_Static.hxx>
#include <Message.hxx>
#include <Message_Messenger.hxx>
#include <Message_ProgressScope.hxx>
#include <RWGltf_CafReader.hxx>
#include <RWObj_CafReader.hxx>
#include <RWStl.hxx>
#include <STEPCAFControl_Controller.hxx>
#include <STEPCAFControl_ExternFile.hxx>
#include <STEPCAFControl_Reader.hxx>
#include <Standard_Failure.hxx>
#include <TopoDS_Compound.hxx>
#include <TopoDS_Face.hxx>
#include <TopoDS_Shape.hxx>
#include <Transfer_TransientProcess.hxx>
#include <XCAFDoc_DocumentTool.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <XSControl_TransferReader.hxx>
#include <XSControl_WorkSession.hxx>
#include <algorithm>
#include <exception>
#include <filesystem>
#include <string_view>

#include "default_platform/ModelShapes.h"
#include "default_platform/product_structure/ModelFormat.h"
#include "default_platform/product_structure/model_reader/TreeWalk.h"
#include "foundation/ReadWholeFile.h"

namespace ZORDefault {
namespace {

constexpr double kMillimetre = 0.001;  // in metres
constexpr int kReadShare = 30;         // of a hundred: reading against transferring
constexpr int kTransferShare = 70;

Handle(TDocStd_Document) NewDocument() {
  Handle(TDocStd_Document) document = new TDocStd_Document("MDTV-XCAF");
  XCAFDoc_DocumentTool::Set(document->Main());
  return document;
}

void AddReferencedFile(const TCollection_AsciiString& inFile, const std::string& inModelPath,
                       std::vector<std::string>& outReferencedFiles) {
  const std::filesystem::path path(inFile.ToCString());
  const auto relative = path.lexically_relative(std::filesystem::path(inModelPath).parent_path());
  outReferencedFiles.push_back(path.is_absolute() && !relative.empty() ? relative.string()
                                                                       : path.string());
}

std::size_t CountFailed(Interface_CheckIterator ioChecks) {
  std::size_t count = 0;
  for (ioChecks.Start(); ioChecks.More(); ioChecks.Next())
    if (ioChecks.Value()->HasFailed()) ++count;
  return count;
}

void AddDamage(std::size_t inCount, const char* inWhat, std::vector<std::string>& ioDamages) {
  if (inCount > 0)
    ioDamages.push_back(std::to_string(inCount) + (inCount == 1 ? " entity" : " entities") +
                        inWhat);
}

/// Exporters leave out names and the dimensions of units, on which nothing depends.
bool IsHarmless(std::string_view inMessage) {
  return inMessage.ends_with("not a quoted String") ||
         inMessage.find("(dimensions)") != std::string_view::npos;
}

bool IsDamaged(const Handle(Interface_Check) & inCheck) {
  for (int i = 1; i <= inCheck->NbFails(); ++i)
    if (!IsHarmless(inCheck->CFail(i))) return true;
  return false;
}

/// What the kernel itself says it could not read or build.
template <class Reader>
std::vector<std::string> DamagesOf(const Reader& inReader) {
  std::vector<std::string> damages;
  const Handle(XSControl_WorkSession)& session = inReader.WS();
  const Handle(Interface_InterfaceModel) model = session->Model();
  std::size_t unread = 0;
  for (int i = 1; i <= model->NbEntities(); ++i)
    if (model->IsErrorEntity(i) && IsDamaged(model->ReportEntity(i)->Check())) ++unread;
  AddDamage(unread, " of the file could not be read", damages);
  if (const auto& process = session->TransferReader()->TransientProcess(); !process.IsNull())
    AddDamage(CountFailed(process->CheckList(true)), " of the file could not be built", damages);
  return damages;
}

bool ReadStep(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
              const std::function<void(const char*)>& inTellStage, LoadedDocument& ioLoaded) {
  Message_ProgressScope scope(inProgress, nullptr, kReadShare + kTransferShare);
  STEPCAFControl_Reader reader;
  reader.SetColorMode(true);
  reader.SetNameMode(true);
  reader.SetLayerMode(false);
  reader.SetPropsMode(false);
  reader.SetGDTMode(false);
  reader.SetMatMode(false);
  if (reader.ReadFile(inRequest.path.c_str()) != IFSelect_RetDone) return false;
  scope.Next(kReadShare);
  if (inTellStage) inTellStage("building its shapes");
  if (!reader.Transfer(ioLoaded.document, scope.Next(kTransferShare))) return false;
  NCollection_DataMap<TCollection_AsciiString, Handle(STEPCAFControl_ExternFile)>::Iterator file(
      reader.ExternFiles());
  for (; file.More(); file.Next())
    AddReferencedFile(file.Key(), inRequest.path, ioLoaded.referencedFiles);
  std::ranges::sort(ioLoaded.referencedFiles);
  ioLoaded.damages = DamagesOf(reader.Reader());
  return true;
}

bool ReadIges(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
              const std::function<void(const char*)>& inTellStage, LoadedDocument& ioLoaded) {
  IGESCAFControl_Reader reader;
  reader.SetColorMode(true);
  reader.SetNameMode(true);
  reader.SetLayerMode(false);
  if (reader.ReadFile(inRequest.path.c_str()) != IFSelect_RetDone) return false;
  if (inTellStage) inTellStage("building its shapes");
  if (!reader.Transfer(ioLoaded.document, inProgress)) return false;
  ioLoaded.damages = DamagesOf(reader);
  return true;
}

bool ReadMeshes(RWMesh_CafReader& ioReader, const ModelRequest& inRequest,
                const Message_ProgressRange& inProgress, LoadedDocument& ioLoaded) {
  ioReader.SetDocument(ioLoaded.document);
  if (!ioReader.Perform(inRequest.path.c_str(), inProgress)) return false;
  NCollection_IndexedMap<TCollection_AsciiString>::Iterator file(ioReader.ExternalFiles());
  for (; file.More(); file.Next())
    AddReferencedFile(file.Value(), inRequest.path, ioLoaded.referencedFiles);
  return true;
}

/// Gives several roots a common parent: the kernel would merge roots that share a mesh.
class GltfReader : public RWGltf_CafReader {
 protected:
  void fillDocument() override {
    if (myRootShapes.Length() > 1) {
      TopoDS_Compound all;
      BRep_Builder builder;
      builder.MakeCompound(all);
      for (const TopoDS_Shape& root : myRootShapes) builder.Add(all, root);
      myRootShapes.Clear();
      myRootShapes.Append(all);
    }
    RWGltf_CafReader::fillDocument();
  }
};

/// glTF is in metres with y upwards.
bool ReadGltf(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
              LoadedDocument& ioLoaded) {
  GltfReader reader;
  reader.SetSystemLengthUnit(kMillimetre);
  reader.SetSystemCoordinateSystem(RWMesh_CoordinateSystem_Zup);
  return ReadMeshes(reader, inRequest, inProgress, ioLoaded);
}

/// OBJ says nothing of its unit and its upward axis: its numbers are taken as they stand.
bool ReadObj(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
             LoadedDocument& ioLoaded) {
  RWObj_CafReader reader;
  return ReadMeshes(reader, inRequest, inProgress, ioLoaded);
}

bool ReadStl(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
             LoadedDocument& ioLoaded) {
  const Handle(Poly_Triangulation) triangles = RWStl::ReadFile(inRequest.path.c_str(), inProgress);
  if (triangles.IsNull()) return false;
  TopoDS_Face face;
  BRep_Builder().MakeFace(face, triangles);
  XCAFDoc_DocumentTool::ShapeTool(ioLoaded.document->Main())->AddShape(face, false);
  return true;
}

bool Read(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
          const std::function<void(const char*)>& inTellStage, LoadedDocument& ioLoaded) {
  switch (inRequest.format) {
    case ModelFormat::kStep:
      return ReadStep(inRequest, inProgress, inTellStage, ioLoaded);
    case ModelFormat::kIges:
      return ReadIges(inRequest, inProgress, inTellStage, ioLoaded);
    case ModelFormat::kGltf:
    case ModelFormat::kGlb:
      return ReadGltf(inRequest, inProgress, ioLoaded);
    case ModelFormat::kObj:
      return ReadObj(inRequest, inProgress, ioLoaded);
    case ModelFormat::kStl:
      return ReadStl(inRequest, inProgress, ioLoaded);
    case ModelFormat::kUnknown:
      break;
  }
  return false;
}

}  // namespace

void PrepareReaders() {
  Message::DefaultMessenger()->ChangePrinters().Clear();
  // Names that the file does not give must stay empty.
  XCAFDoc_ShapeTool::SetAutoNaming(false);
  STEPCAFControl_Controller::Init();
  IGESControl_Controller::Init();
  Interface_Static::SetCVal("xstep.cascade.unit", "MM");
  Interface_Static::SetIVal("read.precision.mode", 0);
  Interface_Static::SetIVal("read.step.product.mode", 1);
  Interface_Static::SetIVal("read.step.assembly.level", 1);
  Interface_Static::SetIVal("read.stepcaf.subshapes.name", 0);
}

LoadedDocument ReadDocument(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
                            const std::function<void(const char*)>& inTellStage) {
  LoadedDocument loaded;
  loaded.document = NewDocument();
  if (!Read(inRequest, inProgress, inTellStage, loaded)) loaded.document.Nullify();
  return loaded;
}

bool ReadModelShapes(const std::string& inPath, int inFormat, std::vector<TopoDS_Shape>& outShapes,
                     std::string& outReason) try {
  ModelRequest request;
  request.path = inPath;
  request.format = static_cast<ModelFormat>(inFormat);
  PrepareReaders();
  const LoadedDocument loaded = ReadDocument(request, {});
  if (loaded.document.IsNull()) {
    outReason = std::string("cannot be read as ") + NameOfFormat(request.format);
    return false;
  }
  ModelData model;
  std::vector<TopoDS_Shape> shapes;
  for (const TDF_Label& label : WalkTree(loaded.document, model))
    shapes.push_back(label.IsNull() ? TopoDS_Shape() : XCAFDoc_ShapeTool::GetShape(label));
  outShapes = std::move(shapes);
  return true;
} catch (const Standard_Failure& failure) {
  outReason = failure.GetMessageString();
  return false;
} catch (const std::exception& error) {
  outReason = error.what();
  return false;
}

}  // namespace ZORDefault
