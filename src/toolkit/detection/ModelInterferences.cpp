#include "toolkit/detection/ModelInterferences.h"

#include <Standard_Failure.hxx>
#include <TopoDS_Shape.hxx>
#include <algorithm>
#include <exception>
#include <map>

#include "default_platform/ModelShapes.h"

namespace ZORDetection {
namespace {

/// Only parts that a product shows are measured.
bool Find(const std::string& inModel, const std::vector<Product>& inProducts,
          const Options& inOptions, Findings& outFindings, std::string& outReason) {
  std::vector<TopoDS_Shape> shapes;
  if (!ZORDefault::ReadModelShapes(inModel, shapes, outReason)) return false;
  std::map<std::uint32_t, std::uint32_t> places;
  std::vector<std::uint32_t> numbers;
  std::vector<Part> parts;
  std::vector<Product> products = inProducts;
  for (Product& product : products) {
    if (product.part >= shapes.size()) {
      outReason = "changed while it was read";
      return false;
    }
    const auto [place, isNew] =
        places.try_emplace(product.part, static_cast<std::uint32_t>(parts.size()));
    if (isNew) {
      parts.emplace_back().shape = &shapes[product.part];
      numbers.push_back(product.part);
    }
    product.part = place->second;
  }
  outFindings = FindInterferences(parts, products, inOptions);
  for (Unjudged& unjudged : outFindings.unjudged) {
    unjudged.part = numbers[unjudged.part];
    if (unjudged.other) unjudged.other = numbers[*unjudged.other];
  }
  return true;
}

}  // namespace
}  // namespace ZORDetection

extern "C" __attribute__((visibility("default"))) bool ZORFindInterferencesInModel(
    const std::string& inModel, const std::vector<ZORDetection::Product>& inProducts,
    const ZORDetection::Options& inOptions, ZORDetection::Findings& outFindings,
    std::string& outReason) {
  try {
    return ZORDetection::Find(inModel, inProducts, inOptions, outFindings, outReason);
  } catch (const Standard_Failure& failure) {
    outReason = failure.GetMessageString();
  } catch (const std::exception& error) {
    outReason = error.what();
  }
  return false;
}
