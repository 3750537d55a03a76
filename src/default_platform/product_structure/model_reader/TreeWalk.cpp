#include "default_platform/product_structure/model_reader/TreeWalk.h"

#include <NCollection_DataMap.hxx>
#include <Quantity_ColorRGBA.hxx>
#include <TDF_LabelMapHasher.hxx>
#include <TDF_LabelSequence.hxx>
#include <TDF_Tool.hxx>
#include <TDataStd_Name.hxx>
#include <TopExp_Explorer.hxx>
#include <TopLoc_Location.hxx>
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

/// From the kernel's linear RGB to sRGB.
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

constexpr double kMinDeterminant = 1e-9;

std::u16string NameOf(const TDF_Label& inLabel) {
  Handle(TDataStd_Name) name;
  if (!inLabel.FindAttribute(TDataStd_Name::GetID(), name)) return {};
  const TCollection_ExtendedString& text = name->Get();
  return std::u16string(text.ToExtString(), static_cast<std::size_t>(text.Length()));
}

std::string EntryOf(const TDF_Label& inLabel) {
  TCollection_AsciiString entry;
  TDF_Tool::Entry(inLabel, entry);
  return entry.ToCString();
}

ZORMathTransformation ToTransformation(const gp_Trsf& inPlacement) {
  const auto column = [&](int i) {
    return ZORMathVector(inPlacement.Value(1, i), inPlacement.Value(2, i), inPlacement.Value(3, i));
  };
  ZORMathTransformation transformation;
  transformation.SetMatrix({column(1), column(2), column(3)});
  transformation.SetVector(column(4));
  return transformation;
}

bool IsSound(const ZORMathTransformation& inPlacement) {
  const double determinant = inPlacement.GetMatrix().Determinant();
  const ZORMathVector& vector = inPlacement.GetVector();
  return std::isfinite(determinant) && std::isfinite(vector.x + vector.y + vector.z) &&
         std::abs(determinant) > kMinDeterminant;
}

class Walk {
 public:
  explicit Walk(ModelData& outModel) : model_(outModel) {}

  void AddRoot(const TDF_Label& inLabel) { Add(inLabel, inLabel, ModelProduct::kNoParent, {}); }

  void AddRoots(const TDF_LabelSequence& inLabels) {
    labels_.push_back(TDF_Label());
    model_.parts.emplace_back().isAssembly = true;
    model_.products.emplace_back();
    for (const TDF_Label& label : inLabels) Add(label, label, 0, {});
  }

  std::vector<TDF_Label> TakeLabels() { return std::move(labels_); }

 private:
  /// @param inInstance the label of the instance; for a root that of the part itself.
  void Add(const TDF_Label& inInstance, const TDF_Label& inPart, std::int32_t inParent,
           const ZORMathTransformation& inPlacement) {
    ModelProduct product;
    product.parent = inParent;
    product.part = PartOf(inPart);
    product.parentFromProduct = inPlacement;
    if (inInstance != inPart) {
      product.name = NameOf(inInstance);
      product.colour = ColourOf(inInstance);
    }
    const auto self = static_cast<std::int32_t>(model_.products.size());
    model_.products.push_back(product);
    AddComponents(inPart, self);
  }

  void AddComponents(const TDF_Label& inPart, std::int32_t inParent) {
    TDF_LabelSequence components;
    if (!XCAFDoc_ShapeTool::GetComponents(inPart, components, false)) return;
    for (const TDF_Label& component : components) {
      TDF_Label part;
      if (!XCAFDoc_ShapeTool::GetReferredShape(component, part)) continue;
      Add(component, part, inParent, PlacementOf(component));
    }
  }

  ZORMathTransformation PlacementOf(const TDF_Label& inComponent) {
    const ZORMathTransformation placement =
        ToTransformation(XCAFDoc_ShapeTool::GetLocation(inComponent).Transformation());
    if (IsSound(placement)) return placement;
    model_.warnings.push_back("a placement that cannot be undone was left out");
    return {};
  }

  std::uint32_t PartOf(const TDF_Label& inPart) {
    if (const std::uint32_t* const known = parts_.Seek(inPart)) return *known;
    ModelPart part;
    part.name = NameOf(inPart);
    part.label = EntryOf(inPart);
    part.colour = ColourOf(inPart);
    part.isAssembly = XCAFDoc_ShapeTool::IsAssembly(inPart);
    const auto position = static_cast<std::uint32_t>(model_.parts.size());
    parts_.Bind(inPart, position);
    model_.parts.push_back(std::move(part));
    labels_.push_back(inPart);
    return position;
  }

  ModelData& model_;
  std::vector<TDF_Label> labels_;
  NCollection_DataMap<TDF_Label, std::uint32_t, TDF_LabelMapHasher> parts_;
};

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
  // Compounds and solids come before faces, whose own colours win.
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

std::vector<TDF_Label> WalkTree(const Handle(TDocStd_Document) & inDocument, ModelData& outModel) {
  TDF_LabelSequence roots;
  XCAFDoc_DocumentTool::ShapeTool(inDocument->Main())->GetFreeShapes(roots);
  Walk walk(outModel);
  if (roots.Length() == 1)
    walk.AddRoot(roots.First());
  else if (roots.Length() > 1)
    walk.AddRoots(roots);
  return walk.TakeLabels();
}

}  // namespace ZORDefault
