#include "default_platform/product_structure/ModelWriting.h"

#include <BRepPrimAPI_MakeBox.hxx>
#include <BRepPrimAPI_MakeSphere.hxx>
#include <BRep_Builder.hxx>
#include <IGESCAFControl_Writer.hxx>
#include <IGESControl_Controller.hxx>
#include <Interface_Static.hxx>
#include <Message.hxx>
#include <Message_Messenger.hxx>
#include <Quantity_Color.hxx>
#include <STEPCAFControl_Controller.hxx>
#include <STEPCAFControl_Writer.hxx>
#include <TDataStd_Name.hxx>
#include <TDocStd_Document.hxx>
#include <TopExp_Explorer.hxx>
#include <TopLoc_Location.hxx>
#include <TopoDS_Compound.hxx>
#include <XCAFDoc_ColorTool.hxx>
#include <XCAFDoc_DocumentTool.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <gp_Ax1.hxx>
#include <gp_Trsf.hxx>
#include <numbers>
#include <stdexcept>

namespace products {
namespace {

class Frame {
 public:
  Frame() : document_(new TDocStd_Document("BinXCAF")) {
    shapes_ = XCAFDoc_DocumentTool::ShapeTool(document_->Main());
    colours_ = XCAFDoc_DocumentTool::ColorTool(document_->Main());
    const TDF_Label block = AddBlock(), ball = AddBall();
    const TDF_Label frame = shapes_->NewShape();
    TDataStd_Name::Set(frame, "frame");
    AddInstance(frame, block, "block_1", MovedBy(-100, 0, 0));
    AddInstance(frame, block, "block_2", MovedBy(100, 50, 0) * TurnedByARightAngle());
    AddInstance(frame, ball, "ball_1", MovedBy(0, 0, 60));
    shapes_->UpdateAssemblies();
  }

  const Handle(TDocStd_Document) & GetDocument() const { return document_; }

 private:
  TDF_Label AddBlock() {
    const TopoDS_Shape box = BRepPrimAPI_MakeBox(10, 20, 30).Shape();
    const TDF_Label block = shapes_->AddShape(box, false);
    TDataStd_Name::Set(block, "block");
    SetColour(block, 0, 128, 255);
    SetColour(shapes_->AddSubShape(block, TopExp_Explorer(box, TopAbs_FACE).Current()), 255, 255,
              0);
    return block;
  }

  TDF_Label AddBall() {
    const TDF_Label ball = shapes_->AddShape(BRepPrimAPI_MakeSphere(5).Shape(), false);
    TDataStd_Name::Set(ball, "ball");
    SetColour(ball, 255, 0, 0);
    return ball;
  }

  static gp_Trsf MovedBy(double inX, double inY, double inZ) {
    gp_Trsf move;
    move.SetTranslation(gp_Vec(inX, inY, inZ));
    return move;
  }

  static gp_Trsf TurnedByARightAngle() {
    gp_Trsf turn;
    turn.SetRotation(gp::OZ(), std::numbers::pi / 2);
    return turn;
  }

  void SetColour(const TDF_Label& inLabel, int inRed, int inGreen, int inBlue) {
    colours_->SetColor(
        inLabel, Quantity_Color(inRed / 255.0, inGreen / 255.0, inBlue / 255.0, Quantity_TOC_sRGB),
        XCAFDoc_ColorSurf);
  }

  void AddInstance(const TDF_Label& inFrame, const TDF_Label& inPart, const char* inName,
                   const gp_Trsf& inPlacement) {
    TDataStd_Name::Set(shapes_->AddComponent(inFrame, inPart, TopLoc_Location(inPlacement)),
                       inName);
  }

  Handle(TDocStd_Document) document_;
  Handle(XCAFDoc_ShapeTool) shapes_;
  Handle(XCAFDoc_ColorTool) colours_;
};

void Require(bool inIsDone, const std::string& inPath) {
  if (!inIsDone) throw std::runtime_error(inPath + " cannot be written");
}

void Write(const Handle(TDocStd_Document) & inDocument, const std::string& inPath,
           const StepKind& inKind) {
  Message::DefaultMessenger()->ChangePrinters().Clear();
  STEPCAFControl_Controller::Init();
  Require(Interface_Static::SetCVal("write.step.schema", inKind.schema) &&
              Interface_Static::SetCVal("write.step.unit", inKind.unit),
          inPath);
  STEPCAFControl_Writer writer;
  Require(writer.Transfer(inDocument, STEPControl_AsIs, inKind.isSplit ? "" : nullptr), inPath);
  Require(writer.Write(inPath.c_str()) == IFSelect_RetDone, inPath);
}

}  // namespace

void WriteStep(const std::string& inPath, const StepKind& inKind) {
  Write(Frame().GetDocument(), inPath, inKind);
}

void WriteStepOfTwoSolids(const std::string& inPath) {
  TopoDS_Compound both;
  BRep_Builder builder;
  builder.MakeCompound(both);
  builder.Add(both, BRepPrimAPI_MakeBox(10, 10, 10).Shape());
  builder.Add(both, BRepPrimAPI_MakeBox(gp_Pnt(20, 0, 0), 10, 10, 10).Shape());
  const Handle(TDocStd_Document) document = new TDocStd_Document("BinXCAF");
  const auto shapes = XCAFDoc_DocumentTool::ShapeTool(document->Main());
  TDataStd_Name::Set(shapes->AddShape(both, false), "pair");
  Write(document, inPath, {});
}

void WriteIges(const std::string& inPath, const char* inUnit) {
  Message::DefaultMessenger()->ChangePrinters().Clear();
  IGESControl_Controller::Init();
  Require(Interface_Static::SetCVal("write.iges.unit", inUnit), inPath);
  IGESCAFControl_Writer writer;
  Require(writer.Transfer(Frame().GetDocument()), inPath);
  Require(writer.Write(inPath.c_str()), inPath);
}

}  // namespace products
