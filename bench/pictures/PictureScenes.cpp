#include "PictureScenes.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <stdexcept>
#include <utility>

#include "default_platform/OpenModel.h"

namespace {

using support::kPi;

/// A wavy ball with some lines on it, of about inTriangles triangles.
std::shared_ptr<PartMesh> MakeWavyBall(double inRadius, std::uint32_t inTriangles) {
  const auto steps = static_cast<std::uint32_t>(std::sqrt(inTriangles / 4.0));
  const auto place = [&](double inAround, double inUp) {
    const double around = 2 * kPi * inAround, up = kPi * (inUp - 0.5);
    const double radius =
        inRadius * (1 + 0.05 * std::sin(12 * around) * std::cos(up) + 0.04 * std::sin(9 * up));
    return ZORMathVector(radius * std::cos(up) * std::cos(around),
                         radius * std::cos(up) * std::sin(around), radius * std::sin(up));
  };
  auto mesh = support::MakeGrid(2 * steps, steps, [&](double inAround, double inUp) {
    const ZORMathVector point = place(inAround, inUp);
    const double length = std::hypot(point.x, point.y, point.z);
    return std::pair(support::ToPoint(point.x, point.y, point.z),
                     support::ToPoint(point.x / length, point.y / length, point.z / length));
  });
  // About as many line segments as models have: one for seven triangles.
  constexpr int kLines = 24;
  const std::uint32_t segments = inTriangles / (7 * kLines);
  for (int line = 0; line < kLines; ++line) {
    mesh->lineStarts.push_back(static_cast<std::uint32_t>(mesh->edgePoints.size()));
    for (std::uint32_t i = 0; i <= segments; ++i) {
      const ZORMathVector point =
          place(static_cast<double>(i) / segments, (line + 1.0) / (kLines + 1));
      mesh->edgePoints.push_back(support::ToPoint(point.x, point.y, point.z));
    }
  }
  mesh->lineStarts.push_back(static_cast<std::uint32_t>(mesh->edgePoints.size()));
  mesh->sphere = {{0, 0, 0}, 1.1 * inRadius};
  return mesh;
}

constexpr PartColour kRed{200, 60, 50, 255};
constexpr PartColour kBlue{60, 110, 200, 255};
constexpr PartColour kGrey{210, 210, 210, 255};

void AddProducts(const ZORIProduct_var& inProduct, support::MeshScene& ioScene) {
  ZORDefault::ProductInfo facts;
  ZORDefault::GetProductInfo(inProduct.GetInterface(), facts);
  if (facts.mesh) ioScene.Add(facts.mesh, facts.rootFromProduct, facts.colour.value_or(kGrey));
  const std::unique_ptr<ZORListValZORBaseUnknown_var> children(
      inProduct->GetChildren("ZORIProduct"));
  for (int i = 1; children && i <= children->Size(); ++i)
    AddProducts(ZORIProduct_var((*children)[i]), ioScene);
}

}  // namespace

void FillScene(const std::string& inName, support::MeshScene& ioScene) {
  if (inName == "two-products") {
    ioScene.Add(MakeWavyBall(50, 5000), support::MovedBy(-30, 0, 0), kRed);
    ioScene.Add(MakeWavyBall(40, 5000), support::MovedBy(40, 10, 0), kBlue);
  } else if (inName == "one-part") {
    ioScene.Add(MakeWavyBall(50, 250'000), support::MovedBy(0, 0, 0), kRed);
  } else if (inName == "whole") {
    for (int i = 0; i < 10; ++i)
      ioScene.Add(MakeWavyBall(30 + i, 250'000),
                  support::MovedBy(70 * (i % 4), 70 * (i / 4), 8 * (i % 3)),
                  i % 2 == 0 ? kRed : kBlue);
  } else if (std::filesystem::is_regular_file(inName)) {
    AddProducts(ZORDefault::OpenModel(inName).root, ioScene);
  } else {
    throw std::invalid_argument("unknown scene: " + inName);
  }
}

ZORMathTransformation RootFromPoints(const PlacedMeshRep& inRep) {
  ZORMathTransformation placement = inRep.GetRootFromPart();
  placement.SetVector(placement * inRep.GetMesh()->origin);
  return placement;
}

void SetViewpoint(const ZOR3DRep& inScene, int inNumber, ZOR3DViewpoint& ioViewpoint) {
  const double angle = 0.4 + 0.07 * inNumber;
  ioViewpoint.sight = {-std::cos(angle), -std::sin(angle), -0.6};
  ioViewpoint.up = {0, 0, 1};
  ioViewpoint.Reframe(kPictureWidth, kPictureHeight, 1, 1, inScene.GetShowBoundingElement());
}

void PrintCovered(const std::uint8_t* inPixels) {
  constexpr int kPixels = kPictureWidth * kPictureHeight;
  int covered = 0;
  for (int i = 0; i < kPixels; ++i, inPixels += 3)
    covered += std::all_of(inPixels, inPixels + 3, [](std::uint8_t b) { return b == 255; }) ? 0 : 1;
  std::printf("covered %.3f 0\n", 100.0 * covered / kPixels);
}

void PrintTimes(const std::string& inName, std::vector<Times> inTimes) {
  const auto median = [&](double Times::*inKind) {
    std::ranges::sort(inTimes, {}, inKind);
    return inTimes[inTimes.size() / 2].*inKind;
  };
  const double wall = median(&Times::wall), processor = median(&Times::processor);
  std::printf("%s %.2f %.2f\n", inName.c_str(), wall, processor);
  std::fflush(stdout);
}
