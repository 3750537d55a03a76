// Results that a seeded program makes and edits, so that it knows what became of each interference.
#ifndef ZOR_TESTS_TOOLKIT_REVIEW_EDITED_RESULTS_H
#define ZOR_TESTS_TOOLKIT_REVIEW_EDITED_RESULTS_H

#include <algorithm>
#include <array>
#include <map>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "toolkit/review/Diff.h"

namespace review_tests {

struct TestProduct {
  std::string path, part;
  std::array<double, 3> at{};
};

struct TestInterference {
  int truth = 0;  ///< the same in all results for what is the same
  int first = 0, second = 0;
  std::string type = "Clash", value = "-1", rule{}, status = "Not inspected", comment{};
  bool hasPlace = true;
  std::array<double, 3> place{};  ///< in the frame of the first product, which is only translated
};

/// A result as a plain model of itself.
struct TestResult {
  std::vector<TestProduct> products;
  std::vector<TestInterference> interferences;
  std::string computationCase = "Between all components", types, clearance, specification;

  std::string Xml() const {
    std::string xml = "<?xml version='1.0' encoding='UTF-8'?>\n<ClashElement Version='1.2'>\n";
    if (!types.empty() || !clearance.empty())
      xml += "<ClashSpec Type='" + types + "' Clearance='" + clearance + "'/>\n";
    xml += "<ClashResult Name='r' ComputationCase='" + computationCase + "'>\n";
    for (const TestInterference& interference : interferences) xml += Xml(interference);
    return xml + "</ClashResult>\n" + specification + "</ClashElement>\n";
  }

 private:
  static std::string Number(double inNumber) {
    char digits[40];
    std::snprintf(digits, sizeof digits, "%.17g", inNumber);
    return digits;
  }
  static std::string Xyz(const std::array<double, 3>& inPoint) {
    return "Ux='" + Number(inPoint[0]) + "' Uy='" + Number(inPoint[1]) + "' Uz='" +
           Number(inPoint[2]) + "'";
  }
  std::string Xml(const TestProduct& inProduct) const {
    return "<Product DescriptionID='" + inProduct.path + "' Alias='" + inProduct.path +
           "' ShapeName='" + inProduct.part + "'><Matrix><Point " + Xyz(inProduct.at) +
           "/><Vector CorrespondingData='Rx' Vx='1' Vy='0' Vz='0'/>"
           "<Vector CorrespondingData='Ry' Vx='0' Vy='1' Vz='0'/>"
           "<Vector CorrespondingData='Rz' Vx='0' Vy='0' Vz='1'/></Matrix></Product>";
  }
  std::string Xml(const TestInterference& inOne) const {
    std::string xml = "<Interference Value='" + inOne.value + "' ResultTypeNoNLS='" + inOne.type +
                      "' Status='" + inOne.status + "' RetrieveInf='New' DistanceClearance='2'>";
    if (!inOne.rule.empty()) xml += "<ViolatedRule Name='" + inOne.rule + "'/>";
    const TestProduct& first = products[static_cast<std::size_t>(inOne.first)];
    xml += Xml(first) + Xml(products[static_cast<std::size_t>(inOne.second)]);
    if (inOne.hasPlace) {
      std::array<double, 3> world = inOne.place;
      for (std::size_t i = 0; i < 3; ++i) world[i] += first.at[i];
      xml += "<GeometricAspect><Point " + Xyz(world) + "/></GeometricAspect>";
    }
    if (!inOne.comment.empty()) xml += "<Comment Value='" + inOne.comment + "'/>";
    return xml + "</Interference>\n";
  }
};

/// A loaded result with the document that it was read from.
struct Loaded {
  explicit Loaded(const std::string& inXml)
      : document(std::make_unique<ZORToolkit::ClashDocument>("test.xml", inXml)),
        result(ZORToolkit::ReadForReview(*document, {.geometries = true, .identities = true})) {}
  explicit Loaded(const TestResult& inResult) : Loaded(inResult.Xml()) {}

  std::unique_ptr<ZORToolkit::ClashDocument> document;
  ZORToolkit::ReviewedResult result;
};

inline ZORToolkit::ResultDiff DiffOf(const TestResult& inOld, const TestResult& inNew) {
  const Loaded was(inOld), is(inNew);
  return ZORToolkit::Diff(was.result, is.result);
}

/// Bolts, plates and brackets in assemblies; of some pairs there are several interferences.
inline TestResult RandomResult(std::mt19937& ioRandom, int inProducts, int inInterferences) {
  TestResult result;
  const auto below = [&](int inLimit) {
    return static_cast<int>(ioRandom() % static_cast<unsigned>(inLimit));
  };
  for (int i = 0; i < inProducts; ++i) {
    const char* const part =
        std::array{"bolt", "plate", "bracket"}[static_cast<std::size_t>(i % 3)];
    result.products.push_back(
        {"assembly_" + std::to_string(i / 7) + " --++-- " + part + "_" + std::to_string(i),
         part,
         {100.0 * i, 37.5 * (i % 5), 12.25 * (i % 11)}});
  }
  for (int i = 0; i < inInterferences; ++i) {
    TestInterference one;
    one.truth = i;
    one.first = below(inProducts - 1);
    one.second = one.first + 1;  // few pairs, so that several share one
    one.type = std::array{"Clash", "Contact", "Clearance"}[static_cast<std::size_t>(below(3))];
    one.value = std::to_string(-below(50)) + "." + std::to_string(below(10));
    // Interferences of a pair lie 25 mm apart, more than twice what counts as one place.
    one.place = {25.0 * i, 2.5 * below(3), 0};
    result.interferences.push_back(one);
  }
  return result;
}

}  // namespace review_tests

#endif
