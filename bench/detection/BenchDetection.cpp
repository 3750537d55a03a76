// Finding interferences: processor time beside that of the CAD kernel's distance and Boolean operation on the
// whole shapes of the same near pairs, and of a mesh library on the same triangles; and of many instances of
// few parts.
//
// zor_bench_detection [--no-whole-shapes] MODEL…; without models the lattice.
#include <sys/resource.h>

#include <BRepAlgoAPI_Common.hxx>
#include <BRepExtrema_DistShapeShape.hxx>
#include <BRepPrimAPI_MakeBox.hxx>
#include <BRepPrimAPI_MakeSphere.hxx>
#include <Standard_Failure.hxx>
#include <chrono>
#include <cstdio>
#include <ctime>
#include <functional>
#include <string_view>

#include "MeshPeer.h"
#include "toolkit/detection/Assembly.h"
#include "toolkit/detection/ReportFailures.h"

namespace ZORDetection {
namespace {

constexpr double kClearance = 0.5;

double ProcessorSeconds() { return static_cast<double>(std::clock()) / CLOCKS_PER_SEC; }

double WallSeconds() {
  return std::chrono::duration<double>(std::chrono::steady_clock::now().time_since_epoch()).count();
}

double SecondsOf(const std::function<void()>& inWork) {
  const double start = ProcessorSeconds();
  inWork();
  return ProcessorSeconds() - start;
}

/// One search: making and measuring triangles, then what is done with the pairs that come near.
struct Search {
  Findings findings;
  NearPairs near;
  double preparation = 0, narrow = 0, wall = 0;

  Search(const Assembly& inAssembly, unsigned inThreads) {
    Options options;
    options.clearance = kClearance;
    options.threads = inThreads;
    const double start = ProcessorSeconds(), wallStart = WallSeconds();
    double between = start;
    options.isWanted = [&](std::uint32_t first, std::uint32_t second) {
      if (near.empty()) between = ProcessorSeconds();
      near.emplace_back(first, second);
      return true;
    };
    findings = inAssembly.Find(options);
    preparation = between - start;
    narrow = ProcessorSeconds() - between;
    wall = WallSeconds() - wallStart;
  }
};

/// With what the operations raise, as an application would.
void WorkOnWholeShapes(const Assembly& inAssembly, const NearPairs& inPairs) {
  for (const auto& [first, second] : inPairs) {
    const TopoDS_Shape a = inAssembly.PlacedShape(first), b = inAssembly.PlacedShape(second);
    const BRepExtrema_DistShapeShape distance(a, b);
    if (!distance.IsDone() || distance.Value() > 1e-5) continue;
    const BRepAlgoAPI_Common common(a, b);
  }
}

void PrintRatio(double inOurs, double inPeers) {
  if (inPeers > 0)
    std::printf(",%.3f,%.3f", inPeers, inOurs / inPeers);
  else
    std::printf(",,");
}

void MeasureAssembly(const std::string& inPath, bool inWithWholeShapes) {
  Assembly assembly("");
  const double reading = SecondsOf([&] { assembly = Assembly(inPath); });
  const Search search(assembly, 1), again(assembly, 1), inTwo(assembly, 2);
  const std::size_t verdicts = search.findings.verdicts;
  std::printf("%s,%zu,%zu,%zu,%zu,%.3f,%.3f,%.3f,%.2f,%.2f",
              inPath.substr(inPath.rfind('/') + 1).c_str(), assembly.products.size(),
              search.near.size(), verdicts, search.findings.interferences.size(), reading,
              search.preparation, search.narrow,
              1000 * search.narrow / static_cast<double>(std::max<std::size_t>(verdicts, 1)),
              inTwo.wall / again.wall);
  std::fflush(stdout);
  PrintRatio(search.narrow, MeshPeerSeconds(assembly, search.near));
  std::fflush(stdout);
  PrintRatio(search.narrow,
             inWithWholeShapes ? SecondsOf([&] { WorkOnWholeShapes(assembly, search.near); }) : 0);
  std::puts("");
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
  std::printf("lattice: %zu products, %zu near pairs, %zu verdicts, %zu found, %.3f s, %ld MB\n",
              products.size(), findings.pairsChecked, findings.verdicts,
              findings.interferences.size(), finding, usage.ru_maxrss / 1024);
}

int Run(int inCount, char** inArguments) {
  std::setvbuf(stdout, nullptr, _IOLBF, 0);
  const bool withWholeShapes =
      inCount < 2 || std::string_view(inArguments[1]) != "--no-whole-shapes";
  const int first = withWholeShapes ? 1 : 2;
  if (inCount <= first) {
    MeasureLattice(47);
    return 0;
  }
  std::puts(
      "model,products,near pairs,verdicts,found,reading s,meshing s,narrow phase s,ms a verdict,"
      "two threads / one (wall),mesh library s,ratio,whole shapes s,ratio");
  for (int i = first; i < inCount; ++i) MeasureAssembly(inArguments[i], withWholeShapes);
  return 0;
}

}  // namespace
}  // namespace ZORDetection

int main(int inCount, char** inArguments) {
  return ZORDetection::ReportFailures([&] { return ZORDetection::Run(inCount, inArguments); });
}
