// A model in the form of the cache, for tests and harnesses of that form.
#ifndef ZOR_TESTS_SUPPORT_SMALLMODEL_H
#define ZOR_TESTS_SUPPORT_SMALLMODEL_H

#include <memory>

#include "default_platform/product_structure/ModelData.h"

namespace support {

/// An assembly of two instances of one part with one coloured triangle and one edge.
inline ZORDefault::ModelData TwoInstances() {
  auto mesh = std::make_shared<PartMesh>();
  mesh->origin = {1, 2, 3};
  mesh->points = {{0, 0, 0}, {1, 0, 0}, {0, 1, 0}};
  mesh->normals = {{0, 0, 1}, {0, 0, 1}, {0, 0, 1}};
  mesh->triangles = {{0, 1, 2}};
  mesh->triangleColours = {0};
  mesh->colours = {{10, 20, 30, 40}};
  mesh->edgePoints = {{0, 0, 0}, {1, 0, 0}};
  mesh->lineStarts = {0, 2};
  mesh->sphere = {{1, 2, 3}, 4};
  ZORDefault::ModelData model;
  model.parts.resize(2);
  model.parts[0].name = u"assembly";
  model.parts[0].isAssembly = true;
  model.parts[1].name = u"part \u00e9";
  model.parts[1].mesh = mesh;
  model.parts[1].area = 0.5;
  model.parts[1].facesWithoutTriangles = 7;
  model.products.resize(3);
  for (const std::size_t i : {1u, 2u}) {
    model.products[i].parent = 0;
    model.products[i].part = 1;
  }
  model.products[1].colour = PartColour{1, 2, 3, 4};
  model.products[2].name = u"second";
  model.products[2].parentFromProduct.SetVector({5, 6, 7});
  model.referencedFiles.push_back({"other.bin", ZORDefault::ReferencedFile::State::kRead, 42});
  model.damages = {"1 entity of the file could not be read"};
  model.warnings = {"a warning"};
  return model;
}

}  // namespace support

#endif
