// The scenes whose pictures are timed.
#ifndef ZOR_BENCH_PICTURES_PICTURESCENES_H
#define ZOR_BENCH_PICTURES_PICTURESCENES_H

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <ctime>
#include <memory>
#include <string>
#include <vector>

#include "platform/visualisation/ZOR3DViewpoint.h"
#include "support/MeshScenes.h"

inline constexpr int kPictureWidth = 756;
inline constexpr int kPictureHeight = 506;

/// Fills a scene: "two-products" (10,000 triangles), "one-part" (250,000), "whole" (2,500,000, of
/// ten parts), or all products of the model file of that name. Raises std::invalid_argument for
/// another name, ModelError for a file that is no model.
void FillScene(const std::string& inName, support::MeshScene& ioScene);

/// Where the points of a mesh, which are relative to its origin, lie in the scene.
ZORMathTransformation RootFromPoints(const PlacedMeshRep& inRep);

/// Where a scene's picture 0, 1, 2, … is seen from, with all in it.
void SetViewpoint(const ZOR3DRep& inScene, int inNumber, ZOR3DViewpoint& ioViewpoint);

/// Prints "covered SHARE 0": the share of a picture on white that shows something, in percent.
void PrintCovered(const std::uint8_t* inPixels);

/// Wall time, and processor time of all threads, in milliseconds.
struct Times {
  double wall = 0;
  double processor = 0;
};

class PictureWatch {
 public:
  Times Elapsed() const {
    const std::chrono::duration<double, std::milli> wall = Clock::now() - start_;
    return {wall.count(), 1e3 * static_cast<double>(std::clock() - processor_) / CLOCKS_PER_SEC};
  }

 private:
  using Clock = std::chrono::steady_clock;
  Clock::time_point start_ = Clock::now();
  std::clock_t processor_ = std::clock();
};

/// Times inDraw, which is given 0, 1, 2, …, and prints "NAME WALL PROCESSOR": the median of each.
template <class Draw>
void PrintMedian(const std::string& inName, int inCount, const Draw& inDraw);

void PrintTimes(const std::string& inName, std::vector<Times> inTimes);

template <class Draw>
void PrintMedian(const std::string& inName, int inCount, const Draw& inDraw) {
  std::vector<Times> times;
  for (int i = 0; i < inCount; ++i) {
    const PictureWatch watch;
    inDraw(i);
    times.push_back(watch.Elapsed());
  }
  PrintTimes(inName, times);
}

#endif
