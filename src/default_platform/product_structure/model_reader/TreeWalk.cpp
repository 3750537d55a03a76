#include "default_platform/product_structure/model_reader/TreeWalk.h"

#include <NCollection_DataMap.hxx>
#include <TDF_LabelMapHasher.hxx>
#include <TDF_LabelSequence.hxx>
#include <TDF_Tool.hxx>
#include <TDataStd_Name.hxx>
#include <TopLoc_Location.hxx>
#include <XCAFDoc_DocumentTool.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <cmath>

#include "default_platform/product_structure/model_reader/PartColours.h"

namespace ZORDefault {
namespace {

constexpr double kSmallestDeterminant = 1e-9;

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
         std::abs(determinant) > kSmallestDeterminant;
}

class Walk {
 public:
  explicit Walk(ModelData& outModel) : model_(outModel) {}

  void AddRoot(const TDF_Label& inLabel) { Add(inLabel, inLabel, ModelProduct::kNoFather, {}); }

  void AddRoots(const TDF_LabelSequence& inLabels) {
    labels_.push_back(TDF_Label());
    model_.parts.emplace_back().isAssembly = true;
    model_.products.emplace_back();
    for (const TDF_Label& label : inLabels) Add(label, label, 0, {});
  }

  std::vector<TDF_Label> TakeLabels() { return std::move(labels_); }

 private:
  /// @param inInstance the label of the instance; for a root that of the part itself.
  void Add(const TDF_Label& inInstance, const TDF_Label& inPart, std::int32_t inFather,
           const ZORMathTransformation& inPlacement) {
    ModelProduct product;
    product.father = inFather;
    product.part = PartOf(inPart);
    product.fatherFromProduct = inPlacement;
    if (inInstance != inPart) {
      product.name = NameOf(inInstance);
      product.colour = ColourOf(inInstance);
    }
    const auto self = static_cast<std::int32_t>(model_.products.size());
    model_.products.push_back(product);
    AddComponents(inPart, self);
  }

  void AddComponents(const TDF_Label& inPart, std::int32_t inFather) {
    TDF_LabelSequence components;
    if (!XCAFDoc_ShapeTool::GetComponents(inPart, components, false)) return;
    for (const TDF_Label& component : components) {
      TDF_Label part;
      if (!XCAFDoc_ShapeTool::GetReferredShape(component, part)) continue;
      Add(component, part, inFather, PlacementOf(component));
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
