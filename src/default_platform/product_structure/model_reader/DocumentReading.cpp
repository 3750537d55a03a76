#include "default_platform/product_structure/model_reader/DocumentReading.h"

#include <BRep_Builder.hxx>
#include <IGESCAFControl_Reader.hxx>
#include <IGESControl_Controller.hxx>
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
#include <TopoDS_Compound.hxx>
#include <TopoDS_Face.hxx>
#include <XCAFDoc_DocumentTool.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <algorithm>
#include <filesystem>

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

std::string Refused(ModelFormat inFormat) {
  return std::string("cannot be read as ") + NameOfFormat(inFormat);
}

void AddReferencedFile(const TCollection_AsciiString& inFile, const std::string& inModelPath,
                       std::vector<std::string>& outReferencedFiles) {
  const std::filesystem::path path(inFile.ToCString());
  const auto relative = path.lexically_relative(std::filesystem::path(inModelPath).parent_path());
  outReferencedFiles.push_back(path.is_absolute() && !relative.empty() ? relative.string()
                                                                       : path.string());
}

bool ReadStep(const ModelRequest& inRequest, Handle(TDocStd_Document) & ioDocument,
              const Message_ProgressRange& inProgress,
              std::vector<std::string>& outReferencedFiles) {
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
  if (!reader.Transfer(ioDocument, scope.Next(kTransferShare))) return false;
  NCollection_DataMap<TCollection_AsciiString, Handle(STEPCAFControl_ExternFile)>::Iterator file(
      reader.ExternFiles());
  for (; file.More(); file.Next())
    AddReferencedFile(file.Key(), inRequest.path, outReferencedFiles);
  std::ranges::sort(outReferencedFiles);
  return true;
}

bool ReadIges(const ModelRequest& inRequest, Handle(TDocStd_Document) & ioDocument,
              const Message_ProgressRange& inProgress) {
  IGESCAFControl_Reader reader;
  reader.SetColorMode(true);
  reader.SetNameMode(true);
  reader.SetLayerMode(false);
  return reader.ReadFile(inRequest.path.c_str()) == IFSelect_RetDone &&
         reader.Transfer(ioDocument, inProgress);
}

bool ReadMeshes(RWMesh_CafReader& ioReader, const ModelRequest& inRequest,
                const Handle(TDocStd_Document) & inDocument,
                const Message_ProgressRange& inProgress,
                std::vector<std::string>& outReferencedFiles) {
  ioReader.SetDocument(inDocument);
  if (!ioReader.Perform(inRequest.path.c_str(), inProgress)) return false;
  NCollection_IndexedMap<TCollection_AsciiString>::Iterator file(ioReader.ExternalFiles());
  for (; file.More(); file.Next())
    AddReferencedFile(file.Value(), inRequest.path, outReferencedFiles);
  return true;
}

/// Puts several roots below one: the kernel would keep only one of roots that show the same mesh.
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
bool ReadGltf(const ModelRequest& inRequest, const Handle(TDocStd_Document) & inDocument,
              const Message_ProgressRange& inProgress,
              std::vector<std::string>& outReferencedFiles) {
  GltfReader reader;
  reader.SetSystemLengthUnit(kMillimetre);
  reader.SetSystemCoordinateSystem(RWMesh_CoordinateSystem_Zup);
  return ReadMeshes(reader, inRequest, inDocument, inProgress, outReferencedFiles);
}

/// OBJ says nothing of its unit and its upward axis: its numbers are taken as they stand.
bool ReadObj(const ModelRequest& inRequest, const Handle(TDocStd_Document) & inDocument,
             const Message_ProgressRange& inProgress,
             std::vector<std::string>& outReferencedFiles) {
  RWObj_CafReader reader;
  return ReadMeshes(reader, inRequest, inDocument, inProgress, outReferencedFiles);
}

bool ReadStl(const ModelRequest& inRequest, const Handle(TDocStd_Document) & inDocument,
             const Message_ProgressRange& inProgress) {
  const Handle(Poly_Triangulation) triangles = RWStl::ReadFile(inRequest.path.c_str(), inProgress);
  if (triangles.IsNull()) return false;
  TopoDS_Face face;
  BRep_Builder().MakeFace(face, triangles);
  XCAFDoc_DocumentTool::ShapeTool(inDocument->Main())->AddShape(face, false);
  return true;
}

bool Read(const ModelRequest& inRequest, Handle(TDocStd_Document) & ioDocument,
          const Message_ProgressRange& inProgress, std::vector<std::string>& outReferencedFiles) {
  switch (inRequest.format) {
    case ModelFormat::kStep:
      return ReadStep(inRequest, ioDocument, inProgress, outReferencedFiles);
    case ModelFormat::kIges:
      return ReadIges(inRequest, ioDocument, inProgress);
    case ModelFormat::kGltf:
    case ModelFormat::kGlb:
      return ReadGltf(inRequest, ioDocument, inProgress, outReferencedFiles);
    case ModelFormat::kObj:
      return ReadObj(inRequest, ioDocument, inProgress, outReferencedFiles);
    case ModelFormat::kStl:
      return ReadStl(inRequest, ioDocument, inProgress);
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

Handle(TDocStd_Document)
    ReadDocument(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
                 std::vector<std::string>& outReferencedFiles, std::string& outReason) {
  Handle(TDocStd_Document) document = NewDocument();
  if (Read(inRequest, document, inProgress, outReferencedFiles)) return document;
  outReason = Refused(inRequest.format);
  return nullptr;
}

}  // namespace ZORDefault
