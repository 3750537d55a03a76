// The leaves of a STEP file, for tests of the detection.
#ifndef ZOR_TESTS_TOOLKIT_DETECTION_ASSEMBLY_H
#define ZOR_TESTS_TOOLKIT_DETECTION_ASSEMBLY_H

#include <Message.hxx>
#include <Message_Messenger.hxx>
#include <NCollection_DataMap.hxx>
#include <STEPCAFControl_Reader.hxx>
#include <TDF_LabelMapHasher.hxx>
#include <TDF_LabelSequence.hxx>
#include <TDocStd_Document.hxx>
#include <TopLoc_Location.hxx>
#include <TopoDS_Shape.hxx>
#include <XCAFDoc_DocumentTool.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <string>
#include <vector>

#include "toolkit/detection/kernel/FindInterferences.h"

namespace ZORDetection {

struct Assembly {
  std::vector<TopoDS_Shape> shapes;
  std::vector<Product> products;
  std::vector<gp_Trsf> placements;

  /// Empty when the file cannot be read.
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

}  // namespace ZORDetection

#endif
