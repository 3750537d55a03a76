#include "default_platform/ModelShapes.h"

#include <Standard_Failure.hxx>
#include <TopoDS_Shape.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <exception>
#include <filesystem>

#include "default_platform/product_structure/ModelFormat.h"
#include "default_platform/product_structure/model_reader/DocumentReading.h"
#include "default_platform/product_structure/model_reader/TreeWalk.h"
#include "foundation/ReadWholeFile.h"

namespace ZORDefault {

bool ReadModelShapes(const std::string& inPath, std::vector<TopoDS_Shape>& outShapes,
                     std::string& outReason) try {
  ModelRequest request;
  request.path = std::filesystem::absolute(inPath).string();
  request.format = DecideFormat(inPath, ZORFoundation::ReadWholeFile(inPath).bytes, outReason);
  if (request.format == ModelFormat::kUnknown) return false;
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
