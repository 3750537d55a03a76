#include "default_platform/product_structure/model_reader/PartColours.h"

#include <Quantity_ColorRGBA.hxx>
#include <TDF_LabelSequence.hxx>
#include <TopExp_Explorer.hxx>
#include <XCAFDoc_ColorTool.hxx>
#include <XCAFDoc_DocumentTool.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <XCAFDoc_VisMaterial.hxx>
#include <XCAFDoc_VisMaterialTool.hxx>
#include <algorithm>
#include <cmath>

namespace ZORDefault {
namespace {

std::uint8_t ToByte(double inShare) {
  return static_cast<std::uint8_t>(std::lround(std::clamp(inShare, 0.0, 1.0) * 255));
}

/// The kernel keeps colours linear; pictures are made in the usual non-linear values.
PartColour ToPartColour(const Quantity_ColorRGBA& inColour) {
  double red = 0, green = 0, blue = 0;
  inColour.GetRGB().Values(red, green, blue, Quantity_TOC_sRGB);
  return {ToByte(red), ToByte(green), ToByte(blue), ToByte(inColour.Alpha())};
}

std::uint16_t PositionOf(const PartColour& inColour, std::vector<PartColour>& ioColours) {
  const auto found = std::ranges::find(ioColours, inColour);
  if (found != ioColours.end()) return static_cast<std::uint16_t>(found - ioColours.begin());
  if (ioColours.size() >= PartMesh::kNoColour) return PartMesh::kNoColour;
  ioColours.push_back(inColour);
  return static_cast<std::uint16_t>(ioColours.size() - 1);
}

}  // namespace

std::optional<PartColour> ColourOf(const TDF_Label& inLabel) {
  const auto tool = XCAFDoc_DocumentTool::ColorTool(inLabel);
  Quantity_ColorRGBA colour;
  for (const XCAFDoc_ColorType type : {XCAFDoc_ColorSurf, XCAFDoc_ColorGen})
    if (tool->GetColor(inLabel, type, colour)) return ToPartColour(colour);
  const Handle(XCAFDoc_VisMaterial) material =
      XCAFDoc_DocumentTool::VisMaterialTool(inLabel)->GetShapeMaterial(inLabel);
  if (material.IsNull() || material->IsEmpty()) return std::nullopt;
  return ToPartColour(material->BaseColor());
}

FaceColours FaceColoursOf(const TDF_Label& inPart, const TopTools_IndexedMapOfShape& inFaces) {
  FaceColours result;
  TDF_LabelSequence labels;
  if (!XCAFDoc_ShapeTool::GetSubShapes(inPart, labels)) return result;
  result.ofFace.assign(static_cast<std::size_t>(inFaces.Extent()), PartMesh::kNoColour);
  struct Coloured {
    TopoDS_Shape shape;
    PartColour colour;
  };
  std::vector<Coloured> coloured;
  for (const TDF_Label& label : labels)
    if (const auto colour = ColourOf(label))
      coloured.push_back({XCAFDoc_ShapeTool::GetShape(label), *colour});
  // Larger kinds of shape come first in their enumeration: a face's own colour wins in the end.
  std::ranges::stable_sort(coloured, {}, [](const Coloured& c) { return c.shape.ShapeType(); });
  for (const Coloured& one : coloured) {
    for (TopExp_Explorer face(one.shape, TopAbs_FACE); face.More(); face.Next()) {
      const int position = inFaces.FindIndex(face.Current());
      if (position > 0)
        result.ofFace[static_cast<std::size_t>(position) - 1] =
            PositionOf(one.colour, result.colours);
    }
  }
  if (result.colours.empty()) result.ofFace.clear();
  return result;
}

}  // namespace ZORDefault
