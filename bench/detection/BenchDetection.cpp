// Processor time of finding interferences, beside that of the CAD kernel's distance and Boolean operation
// on the whole shapes of the same near pairs; and of many instances of few parts.
#include <sys/resource.h>

#include <BRepAlgoAPI_Common.hxx>
#include <BRepExtrema_DistShapeShape.hxx>
#include <BRepPrimAPI_MakeBox.hxx>
#include <BRepPrimAPI_MakeSphere.hxx>
#include <Standard_Failure.hxx>
#include <cstdio>
#include <ctime>
#include <exception>
#include <functional>

#include "toolkit/detection/Assembly.h"

namespace ZORDetection {
namespace {

double SecondsOf(const std::function<void()>& inWork) {
  const std::clock_t start = std::clock();
  inWork();
  return static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
}

/// With what the operations raise, as an application would.
void WorkOnWholeShapes(const Assembly& inAssembly, const std::vector<Interference>& inPairs) {
  for (const Interference& pair : inPairs) {
    const TopoDS_Shape first = inAssembly.PlacedShape(pair.first),
                       second = inAssembly.PlacedShape(pair.second);
    const BRepExtrema_DistShapeShape distance(first, second);
    if (!distance.IsDone() || distance.Value() > 1e-5) continue;
    const BRepAlgoAPI_Common common(first, second);
  }
}

void MeasureAssembly(const std::string& inPath) {
  Assembly assembly("");
  const double reading = SecondsOf([&] { assembly = Assembly(inPath); });
  Options options;
  options.clearance = 0.5;
  Findings findings;
  const double finding = SecondsOf([&] { findings = assembly.Find(options); });
  const double whole = SecondsOf([&] { WorkOnWholeShapes(assembly, findings.interferences); });
  std::printf("%s,%zu,%zu,%zu,%.3f,%.3f,%.3f,%.3f\n", inPath.substr(inPath.rfind('/') + 1).c_str(),
              assembly.products.size(), findings.pairsChecked, findings.interferences.size(),
              reading, finding, whole, finding / whole);
}

/// A lattice of cubes and balls that enter each other.
void MeasureLattice(int inSide) {
  const TopoDS_Shape cube = BRepPrimAPI_MakeBox(10., 10., 10.).Shape();
  const TopoDS_Shape ball = BRepPrimAPI_MakeSphere(gp_Pnt(5, 5, 5), 5.1).Shape();
  std::vector<Part> parts(2);
  parts[0].shape = &cube;
  parts[1].shape = &ball;
  std::vector<Product> products;
  for (int x = 0; x < inSide; ++x)
    for (int y = 0; y < inSide; ++y)
      for (int z = 0; z < inSide; ++z)
        products.push_back({static_cast<std::uint32_t>((x + y + z) % 2),
                            {{{1, 0, 0, 9.9 * x}, {0, 1, 0, 10.5 * y}, {0, 0, 1, 10. * z}}}});
  Findings findings;
  const double finding = SecondsOf([&] { findings = FindInterferences(parts, products, {}); });
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  std::printf("lattice,%zu,%zu,%zu,,%.3f,,%ld MB\n", products.size(), findings.pairsChecked,
              findings.interferences.size(), finding, usage.ru_maxrss / 1024);
}

}  // namespace
}  // namespace ZORDetection

int main(int inCount, char** inArguments) try {
  std::setvbuf(stdout, nullptr, _IOLBF, 0);
  std::puts("model,products,near pairs,found,reading s,finding s,whole shapes s,ratio");
  if (inCount == 1) ZORDetection::MeasureLattice(47);
  for (int i = 1; i < inCount; ++i) ZORDetection::MeasureAssembly(inArguments[i]);
} catch (const std::exception& error) {
  std::fprintf(stderr, "%s\n", error.what());
  return 1;
} catch (const Standard_Failure& failure) {
  std::fprintf(stderr, "%s\n", failure.GetMessageString());
  return 1;
}
