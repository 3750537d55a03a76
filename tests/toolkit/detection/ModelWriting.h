// Assemblies written to model files by the CAD kernel, for tests of the detection.
#ifndef ZOR_TESTS_TOOLKIT_DETECTION_MODELWRITING_H
#define ZOR_TESTS_TOOLKIT_DETECTION_MODELWRITING_H

#include <BRepMesh_IncrementalMesh.hxx>
#include <IGESControl_Controller.hxx>
#include <IGESControl_Writer.hxx>
#include <Interface_Static.hxx>
#include <Message.hxx>
#include <Message_Messenger.hxx>
#include <RWGltf_CafWriter.hxx>
#include <RWObj_CafWriter.hxx>
#include <STEPCAFControl_Controller.hxx>
#include <STEPCAFControl_Writer.hxx>
#include <TColStd_IndexedDataMapOfStringString.hxx>
#include <TDF_LabelSequence.hxx>
#include <TDataStd_Name.hxx>
#include <TDocStd_Document.hxx>
#include <TopLoc_Location.hxx>
#include <TopoDS_Shape.hxx>
#include <XCAFDoc_DocumentTool.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <string>

namespace ZORDetection {

/// A tree of one level.
class ModelWriting {
 public:
  ModelWriting() : document_(new TDocStd_Document("MDTV-XCAF")) {
    Message::DefaultMessenger()->ChangePrinters().Clear();
    XCAFDoc_DocumentTool::Set(document_->Main());
    tool_ = XCAFDoc_DocumentTool::ShapeTool(document_->Main());
    root_ = tool_->NewShape();
    TDataStd_Name::Set(root_, "pairs");
  }

  void Add(const std::string& inName, const TopoDS_Shape& inShape, const gp_Trsf& inPlacement) {
    const TDF_Label part = tool_->AddShape(inShape, false);
    const TDF_Label component = tool_->AddComponent(root_, part, TopLoc_Location(inPlacement));
    for (const TDF_Label& label : {part, component})
      TDataStd_Name::Set(label, TCollection_ExtendedString(inName.c_str()));
  }

  /// @param inUnit "MM", "M" or "INCH".
  bool WriteStep(const std::string& inPath, const char* inUnit) {
    tool_->UpdateAssemblies();
    STEPCAFControl_Controller::Init();
    Interface_Static::SetCVal("write.step.unit", inUnit);
    STEPCAFControl_Writer writer;
    return writer.Transfer(document_) && writer.Write(inPath.c_str()) == IFSelect_RetDone;
  }

  /// Without a tree: each part is a root.
  bool WriteIges(const std::string& inPath) {
    TDF_LabelSequence components;
    XCAFDoc_ShapeTool::GetComponents(root_, components, false);
    IGESControl_Controller::Init();
    IGESControl_Writer writer("MM", 1);
    for (const TDF_Label& component : components)
      if (!writer.AddShape(XCAFDoc_ShapeTool::GetShape(component))) return false;
    return writer.Write(inPath.c_str());
  }

  bool WriteGlb(const std::string& inPath) {
    Tessellate();
    RWGltf_CafWriter writer(inPath.c_str(), true);
    // The file's metres.
    writer.ChangeCoordinateSystemConverter().SetInputLengthUnit(0.001);
    return writer.Perform(document_, TColStd_IndexedDataMapOfStringString(),
                          Message_ProgressRange());
  }

  bool WriteObj(const std::string& inPath) {
    Tessellate();
    RWObj_CafWriter writer(inPath.c_str());
    return writer.Perform(document_, TColStd_IndexedDataMapOfStringString(),
                          Message_ProgressRange());
  }

 private:
  void Tessellate() {
    tool_->UpdateAssemblies();
    const BRepMesh_IncrementalMesh meshing(tool_->GetShape(root_), 0.02, false, 0.2);
  }

  Handle(TDocStd_Document) document_;
  Handle(XCAFDoc_ShapeTool) tool_;
  TDF_Label root_;
};

}  // namespace ZORDetection

#endif
