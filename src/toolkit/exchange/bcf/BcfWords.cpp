#include "toolkit/exchange/bcf/BcfWords.h"

#include <iterator>
#include <string_view>

#include "toolkit/exchange/XmlText.h"

namespace ZORToolkit {
namespace {

std::string LastName(const std::string& inPath) {
  constexpr std::string_view kSeparator = " --++-- ";
  const std::size_t at = inPath.rfind(kSeparator);
  return at == std::string::npos ? inPath : inPath.substr(at + kSeparator.size());
}

std::string Triple(const Placement& inPlacement, std::size_t inFirst) {
  return NumberText(inPlacement[inFirst]) + ", " + NumberText(inPlacement[inFirst + 1]) + ", " +
         NumberText(inPlacement[inFirst + 2]);
}

}  // namespace

const std::string& NameOf(const ProductRecord& inProduct) {
  return inProduct.alias.empty() ? inProduct.id : inProduct.alias;
}

std::string IdentityOf(const ProductRecord& inProduct) {
  return inProduct.id.empty() ? inProduct.alias + "\n" + inProduct.shape : inProduct.id;
}

std::string TypeOf(const InterferenceRecord& inRecord) {
  const bool isKnown =
      inRecord.type == "Clash" || inRecord.type == "Contact" || inRecord.type == "Clearance";
  return isKnown ? inRecord.type : "Interference";
}

std::string PairOf(const InterferenceRecord& inRecord) {
  const auto& [first, second] = inRecord.products;
  if (!second.exists) return LastName(NameOf(first));
  return LastName(NameOf(first)) + " x " + LastName(NameOf(second));
}

std::string DescriptionOf(const InterferenceRecord& inRecord) {
  std::string text = "Interference " + std::to_string(inRecord.index);
  if (!inRecord.name.empty()) text += " (" + inRecord.name + ")";
  text += ": " + TypeOf(inRecord);
  if (!inRecord.value.text.empty()) text += ", value " + inRecord.value.text + " mm";
  if (!inRecord.clearance.text.empty()) text += ", clearance " + inRecord.clearance.text + " mm";
  const auto addLine = [&](const std::string& inName, const std::string& inValue) {
    if (!inValue.empty()) text.append("\n").append(inName).append(": ").append(inValue);
  };
  const char* const kOrder[] = {"First product", "Second product"};
  for (std::size_t i = 0; i < 2; ++i) {
    const ProductRecord& product = inRecord.products[i];
    if (!product.exists) continue;
    std::string line = NameOf(product);
    if (!product.shape.empty()) line += ", part " + product.shape;
    if (product.whyMisread.empty())
      line += ", placed at " + Triple(product.placement, 9) + " mm with the axes " +
              Triple(product.placement, 0) + "; " + Triple(product.placement, 3) + "; " +
              Triple(product.placement, 6);
    addLine(kOrder[i], line);
  }
  std::string rule = inRecord.rule.name;
  if (!inRecord.rule.severity.empty()) rule += ", severity " + inRecord.rule.severity;
  addLine("Rule", rule);
  addLine("Result", inRecord.result);
  addLine("Computation", inRecord.computationCase);
  addLine("Length of the curve", inRecord.curveLength.text);
  return text;
}

void NotCarriedCounter::Add(const InterferenceRecord& inRecord) {
  const auto& [first, second] = inRecord.products;
  Count(!inRecord.value.text.empty(), 0);
  Count(!inRecord.clearance.text.empty(), 1);
  Count(!inRecord.rule.name.empty(), 2);
  Count(first.exists && second.exists, 3);
  Count((first.exists && first.whyMisread.empty()) || (second.exists && second.whyMisread.empty()),
        4);
  Count(!inRecord.computationCase.empty(), 5);
  Count(!inRecord.curveLength.text.empty(), 6);
  Count(!inRecord.points.empty(), 7);
  Count(!inRecord.retrieve.empty(), 8);
}

std::vector<NotCarried> NotCarriedCounter::List() const {
  static constexpr const char* kNames[] = {"value",
                                           "clearance",
                                           "violated rule, but for its name",
                                           "order of the products",
                                           "placements",
                                           "computation case",
                                           "length of the curve",
                                           "points of contact",
                                           "Old or New"};
  constexpr std::size_t kInWords = 7;
  std::vector<NotCarried> list;
  for (std::size_t i = 0; i < std::size(kNames); ++i)
    if (counts_[i] > 0)
      list.push_back({kNames[i], counts_[i],
                      i < kInWords ? "in the description, and in the attached result"
                                   : "in the attached result"});
  return list;
}

}  // namespace ZORToolkit
