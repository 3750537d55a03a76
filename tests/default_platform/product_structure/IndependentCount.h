// What a model holds, counted in another way than by opening it.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_INDEPENDENTCOUNT_H
#define ZOR_TESTS_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_INDEPENDENTCOUNT_H

#include <cstddef>
#include <string>

namespace products {

struct Count {
  std::size_t leaves = 0;
  std::size_t parts = 0;
  double area = 0;      ///< of all leaves, square millimetres
  double farthest = 0;  ///< of the leaves' origins from the root's, millimetres
};

/// Of a STEP or GLB file, by the geometry kernel's own walk through the document and, for surfaces,
/// its exact area.
Count CountIndependently(const std::string& inPath);

}  // namespace products

#endif
