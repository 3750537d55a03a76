// A model in the form of the cache: refused, or the same after writing it.
#include "default_platform/product_structure/ModelData.h"
#include "fuzz/Fuzz.h"

namespace {

using ZORDefault::ModelData;

/// An assembly of one part with a triangle and an edge.
ModelData SmallModel() {
  auto mesh = std::make_shared<PartMesh>();
  mesh->points = {{0, 0, 0}, {1, 0, 0}, {0, 1, 0}};
  mesh->normals = {{0, 0, 1}, {0, 0, 1}, {0, 0, 1}};
  mesh->triangles = {{0, 1, 2}};
  mesh->triangleColours = {0};
  mesh->colours = {{10, 20, 30, 40}};
  mesh->edgePoints = {{0, 0, 0}, {1, 0, 0}};
  mesh->lineStarts = {0, 2};
  ModelData model;
  model.parts.resize(2);
  model.parts[0].isAssembly = true;
  model.parts[1].name = u"part";
  model.parts[1].mesh = mesh;
  model.products.resize(2);
  model.products[1].parent = 0;
  model.products[1].part = 1;
  model.referencedFiles.push_back({"other.bin", ZORDefault::ReferencedFile::State::kRead, 42});
  model.warnings = {"a warning"};
  return model;
}

/// Changes bytes of an entry: three bytes of the input each, the place and the new byte. What is left
/// over is added to the end.
std::string Patched(std::string inEntry, const std::string& inChanges) {
  std::size_t i = 0;
  for (; i + 2 < inChanges.size(); i += 3) {
    const auto byte = [&](std::size_t j) { return static_cast<unsigned char>(inChanges[i + j]); };
    inEntry[(byte(0) * 256u + byte(1)) % inEntry.size()] = inChanges[i + 2];
  }
  return inEntry + inChanges.substr(i);
}

void ReadAndWrite(const std::string& inEntry) {
  ModelData model, again;
  if (!DecodeModel(inEntry, model)) return;
  const std::string written = EncodeModel(model);
  fuzz::Require(DecodeModel(written, again), "what was written is not read");
  fuzz::Require(EncodeModel(again) == written, "written otherwise the second time");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  static const std::string entry = EncodeModel(SmallModel());
  const std::string bytes = fuzz::Text(inBytes, inSize);
  ReadAndWrite(bytes);
  ReadAndWrite(Patched(entry, bytes));
  return 0;
}
