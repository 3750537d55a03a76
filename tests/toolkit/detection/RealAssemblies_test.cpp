// The detection beside an independent judge: whole-shape distances and common volumes of the CAD kernel.
#include <gtest/gtest.h>

#include <BRepAlgoAPI_Common.hxx>
#include <BRepBndLib.hxx>
#include <BRepExtrema_DistShapeShape.hxx>
#include <BRepGProp.hxx>
#include <Bnd_Box.hxx>
#include <GProp_GProps.hxx>
#include <Message.hxx>
#include <Message_Messenger.hxx>
#include <NCollection_DataMap.hxx>
#include <STEPCAFControl_Reader.hxx>
#include <TDF_LabelMapHasher.hxx>
#include <TDF_LabelSequence.hxx>
#include <TDocStd_Document.hxx>
#include <TopLoc_Location.hxx>
#include <XCAFDoc_DocumentTool.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <cstdlib>
#include <filesystem>
#include <map>
#include <thread>

#include "toolkit/detection/Shapes.h"

namespace ZORDetection {
namespace {

/// The leaves of a STEP file.
struct Assembly {
  std::vector<TopoDS_Shape> shapes;
  std::vector<Product> products;
  std::vector<gp_Trsf> placements;

  explicit Assembly(const std::string& inPath) {
    Message::DefaultMessenger()->ChangePrinters().Clear();
    Handle(TDocStd_Document) document = new TDocStd_Document("MDTV-XCAF");
    XCAFDoc_DocumentTool::Set(document->Main());
    STEPCAFControl_Reader reader;
    if (reader.ReadFile(inPath.c_str()) != IFSelect_RetDone || !reader.Transfer(document)) return;
    TDF_LabelSequence roots;
    XCAFDoc_DocumentTool::ShapeTool(document->Main())->GetFreeShapes(roots);
    for (const TDF_Label& root : roots) Add(root, gp_Trsf());
  }

  Findings Find(const Options& inOptions) const {
    std::vector<Part> parts;
    for (const TopoDS_Shape& shape : shapes) parts.emplace_back().shape = &shape;
    return FindInterferences(parts, products, inOptions);
  }

  TopoDS_Shape PlacedShape(std::size_t inProduct) const {
    return shapes[products[inProduct].part].Moved(TopLoc_Location(placements[inProduct]));
  }

 private:
  void Add(const TDF_Label& inPart, const gp_Trsf& inPlacement) {
    TDF_LabelSequence components;
    if (XCAFDoc_ShapeTool::GetComponents(inPart, components, false)) {
      for (const TDF_Label& component : components) {
        TDF_Label part;
        if (XCAFDoc_ShapeTool::GetReferredShape(component, part))
          Add(part, inPlacement * XCAFDoc_ShapeTool::GetLocation(component).Transformation());
      }
      return;
    }
    if (!parts_.IsBound(inPart)) {
      parts_.Bind(inPart, static_cast<std::uint32_t>(shapes.size()));
      shapes.push_back(XCAFDoc_ShapeTool::GetShape(inPart));
    }
    Product product;
    product.part = parts_.Find(inPart);
    for (int row = 0; row < 3; ++row)
      for (int column = 0; column < 4; ++column)
        product.rootFromProduct[static_cast<std::size_t>(row)][static_cast<std::size_t>(column)] =
            inPlacement.Value(row + 1, column + 1);
    products.push_back(product);
    placements.push_back(inPlacement);
  }

  NCollection_DataMap<TDF_Label, std::uint32_t, TDF_LabelMapHasher> parts_;
};

struct Judgement {
  double distance = 0;
  double volume = 0;     ///< that both have
  double thickness = 0;  ///< of that volume, in the mean
};

Judgement Judge(const TopoDS_Shape& inFirst, const TopoDS_Shape& inSecond, double inFarthest) {
  Judgement judgement;
  Bnd_Box a, b;
  BRepBndLib::AddOptimal(inFirst, a, false, false);
  BRepBndLib::AddOptimal(inSecond, b, false, false);
  judgement.distance = a.Distance(b);
  if (judgement.distance > inFarthest) return judgement;
  const BRepExtrema_DistShapeShape distance(inFirst, inSecond);
  judgement.distance = distance.IsDone() ? distance.Value() : 0;
  if (judgement.distance > 1e-5) return judgement;
  BRepAlgoAPI_Common common(inFirst, inSecond);
  if (!common.IsDone()) return judgement;
  GProp_GProps volume, area;
  BRepGProp::VolumeProperties(common.Shape(), volume);
  BRepGProp::SurfaceProperties(common.Shape(), area);
  judgement.volume = std::abs(volume.Mass());
  if (area.Mass() > 0) judgement.thickness = 2 * judgement.volume / area.Mass();
  return judgement;
}

/// @param inStride the judge is slow: it looks at each so-many-th pair.
void ExpectAgreement(const std::string& inPath, int inStride = 1) {
  constexpr double kClearance = 0.5;
  const Assembly assembly(inPath);
  ASSERT_GT(assembly.products.size(), 2U) << inPath;
  Options options;
  options.clearance = kClearance;
  options.threads = 2;
  const Findings findings = assembly.Find(options);
  std::map<std::pair<std::size_t, std::size_t>, const Interference*> found;
  for (const Interference& interference : findings.interferences)
    found[{interference.first, interference.second}] = &interference;
  int near = 0, pair = 0;
  for (std::size_t i = 0; i < assembly.products.size(); ++i)
    for (std::size_t j = i + 1; j < assembly.products.size(); ++j) {
      if (pair++ % inStride != 0) continue;
      SCOPED_TRACE(std::to_string(i) + " against " + std::to_string(j));
      const auto place = found.find({i, j});
      const Judgement judgement =
          Judge(assembly.PlacedShape(i), assembly.PlacedShape(j), kClearance);
      const bool isNear = judgement.distance <= kClearance;
      ASSERT_EQ(place != found.end(), isNear || judgement.volume > 0) << judgement.distance;
      if (!isNear) continue;
      ++near;
      const Interference& interference = *place->second;
      if (judgement.distance > 1e-5) {
        EXPECT_EQ(interference.kind, Kind::kClearance);
        EXPECT_NEAR(interference.value, judgement.distance, 1e-6);
        continue;
      }
      EXPECT_NE(interference.kind, Kind::kClearance);
      // A volume as thin as the tolerance says nothing of its depth; nor does a deep one that is none.
      if (judgement.thickness > 2 * options.tolerance) {
        EXPECT_EQ(interference.kind, Kind::kClash) << judgement.volume;
      }
      if (judgement.volume == 0) {
        EXPECT_EQ(interference.kind, Kind::kContact) << interference.value;
      }
      if (interference.kind == Kind::kClash) {
        EXPECT_GT(judgement.volume, 0) << interference.value;
      }
    }
  EXPECT_GT(near, 0);
}

TEST(RealAssemblies, As1AgreesWithWholeShapes) {
  ExpectAgreement(ZOR_SOURCE_DIR "/samples/as1-oc-214.stp");
}

TEST(RealAssemblies, DissonanceAgreesWithWholeShapes) {
  ExpectAgreement(ZOR_SOURCE_DIR "/samples/dissonance_assembly.step", 3);
}

TEST(RealAssemblies, PrintableCaseAgreesWithWholeShapes) {
  const char* const folder = std::getenv("ZOR_ASSEMBLIES");
  if (folder == nullptr)
    GTEST_SKIP() << "ZOR_ASSEMBLIES names no folder with printable_case_full.stp";
  ExpectAgreement(std::string(folder) + "/printable_case_full.stp");
}

}  // namespace
}  // namespace ZORDetection
