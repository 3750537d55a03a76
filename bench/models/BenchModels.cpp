// Opening models: the first time, and again from the cache.
//
// zor_bench_models MODEL…: a row each; exit code 1 when both openings differ or the cache was not
// used as it should be, 2 without models.
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <memory>
#include <string>

#include "ResultHash.h"
#include "default_platform/OpenModel.h"
#include "default_platform/PartMesh.h"
#include "foundation/TemporaryFile.h"

namespace {
namespace fs = std::filesystem;
using ZORDefault::OpenedModel;

constexpr int kRepeats = 5;
constexpr double kWantedRatio = 10;

struct Opening {
  double seconds = 0;
  bool isFromCache = false;
  std::uint64_t hash = 0;
};

void AddProduct(const ZORIProduct_var& inProduct, ResultHash& ioHash) {
  ZORDefault::ProductInfo facts;
  ZORDefault::GetProductInfo(inProduct.GetInterface(), facts);
  double placement[12];
  facts.rootFromProduct.GetCoefficients(placement);
  for (const double number : placement) ioHash.Add(std::to_string(number));
  if (facts.mesh) {
    ioHash.Add(facts.mesh->triangles.size());
    ioHash.Add(facts.mesh->points.size());
  }
  const std::unique_ptr<ZORListValZORBaseUnknown_var> children(
      inProduct->GetChildren("ZORIProduct"));
  for (int i = 1; children && i <= children->Size(); ++i)
    AddProduct(ZORIProduct_var((*children)[i]), ioHash);
}

Opening Open(const std::string& inPath) {
  Opening opening;
  const auto start = std::chrono::steady_clock::now();
  const OpenedModel model = ZORDefault::OpenModel(inPath);
  opening.seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
  opening.isFromCache = model.isFromCache;
  ResultHash hash;
  AddProduct(model.root, hash);
  opening.hash = hash.Value();
  return opening;
}

/// @return whether both ways gave the same.
bool Measure(const std::string& inPath) {
  const Opening first = Open(inPath);
  Opening best = Open(inPath);
  for (int i = 1; i < kRepeats; ++i) {
    const Opening again = Open(inPath);
    if (again.seconds < best.seconds) best = again;
  }
  const bool same = !first.isFromCache && best.isFromCache && first.hash == best.hash;
  const double ratio = first.seconds / best.seconds;
  std::printf("%-32s %12.1f %12.1f %8.1f  %-8s  %016llx%s\n",
              fs::path(inPath).filename().string().c_str(), 1000 * first.seconds,
              1000 * best.seconds, ratio, ratio >= kWantedRatio ? "kept" : "NOT KEPT",
              static_cast<unsigned long long>(best.hash), same ? "" : "  DIFFERENT");
  return same;
}
}  // namespace

int main(int inCount, char** inArguments) {
  if (inCount < 2) {
    std::fprintf(stderr, "usage: zor_bench_models MODEL...\n");
    return 2;
  }
  // A cache of this run's own, so that the first opening is one.
  const ZORFoundation::ScratchFolder cache;
  if (setenv("XDG_CACHE_HOME", cache.Path().c_str(), 1) != 0) return 1;
  std::printf("%-32s %12s %12s %8s  %-8s  hash\n", "model", "first ms", "cached ms", "ratio",
              "10 times");
  bool same = true;
  try {
    for (int i = 1; i < inCount; ++i) same = Measure(inArguments[i]) && same;
  } catch (const ZORDefault::ModelError& failure) {
    std::fprintf(stderr, "zor_bench_models: %s\n", failure.what());
    same = false;
  }
  return same ? 0 : 1;
}
