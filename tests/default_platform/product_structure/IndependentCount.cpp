#include "default_platform/product_structure/IndependentCount.h"

#include <BRepGProp.hxx>
#include <BRep_Tool.hxx>
#include <GProp_GProps.hxx>
#include <Message.hxx>
#include <Message_Messenger.hxx>
#include <Poly_Triangulation.hxx>
#include <RWGltf_CafReader.hxx>
#include <STEPCAFControl_Reader.hxx>
#include <TDF_Tool.hxx>
#include <TDocStd_Document.hxx>
#include <TopExp_Explorer.hxx>
#include <TopoDS.hxx>
#include <TopoDS_Face.hxx>
#include <XCAFDoc_DocumentTool.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <XCAFPrs_DocumentExplorer.hxx>
#include <algorithm>
#include <map>
#include <stdexcept>

namespace products {
namespace {

Handle(TDocStd_Document) ReadDocument(const std::string& inPath) {
  Handle(TDocStd_Document) document = new TDocStd_Document("BinXCAF");
  XCAFDoc_DocumentTool::Set(document->Main());
  bool isRead = false;
  if (inPath.ends_with(".glb")) {
    RWGltf_CafReader reader;
    reader.SetSystemLengthUnit(0.001);
    reader.SetDocument(document);
    isRead = reader.Perform(inPath.c_str(), Message_ProgressRange());
  } else {
    STEPCAFControl_Reader reader;
    isRead = reader.ReadFile(inPath.c_str()) == IFSelect_RetDone && reader.Transfer(document);
  }
  if (!isRead) throw std::runtime_error(inPath + " cannot be read");
  return document;
}

double AreaOfTriangles(const TopoDS_Face& inFace) {
  TopLoc_Location location;
  const Handle(Poly_Triangulation) triangles = BRep_Tool::Triangulation(inFace, location);
  double area = 0;
  for (int i = 1; !triangles.IsNull() && i <= triangles->NbTriangles(); ++i) {
    int a = 0, b = 0, c = 0;
    triangles->Triangle(i).Get(a, b, c);
    const gp_Pnt corner = triangles->Node(a);
    area += gp_Vec(corner, triangles->Node(b)).CrossMagnitude(gp_Vec(corner, triangles->Node(c)));
  }
  return area / 2;
}

double AreaOf(const TopoDS_Shape& inShape) {
  double area = 0;
  bool hasSurface = false;
  for (TopExp_Explorer face(inShape, TopAbs_FACE); face.More(); face.Next()) {
    TopLoc_Location location;
    if (BRep_Tool::Surface(TopoDS::Face(face.Current()), location).IsNull())
      area += AreaOfTriangles(TopoDS::Face(face.Current()));
    else
      hasSurface = true;
  }
  if (!hasSurface) return area;
  GProp_GProps properties;
  BRepGProp::SurfaceProperties(inShape, properties, true);
  return properties.Mass();
}

}  // namespace

Count CountIndependently(const std::string& inPath) {
  Message::DefaultMessenger()->ChangePrinters().Clear();
  const Handle(TDocStd_Document) document = ReadDocument(inPath);
  std::map<std::string, double> areas;
  Count count;
  XCAFPrs_DocumentExplorer explorer(document, XCAFPrs_DocumentExplorerFlags_OnlyLeafNodes);
  for (; explorer.More(); explorer.Next()) {
    const TDF_Label part = explorer.Current().RefLabel;
    TCollection_AsciiString entry;
    TDF_Tool::Entry(part, entry);
    const auto [known, isNew] = areas.try_emplace(entry.ToCString(), 0.0);
    if (isNew) known->second = AreaOf(XCAFDoc_ShapeTool::GetShape(part));
    ++count.leaves;
    count.area += known->second;
    const gp_XYZ place = explorer.Current().Location.Transformation().TranslationPart();
    count.farthest = std::max(count.farthest, place.Modulus());
  }
  count.parts = areas.size();
  return count;
}

}  // namespace products
