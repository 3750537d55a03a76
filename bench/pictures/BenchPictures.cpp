// zor_bench_pictures: milliseconds a picture, beside the same scenes in a toolkit's window and
// beside a viewer's whole process. Ratios of processor time hold on a busy machine too; both sides
// are given one thread.
//
// zor_bench_pictures [--model FILE]: a row each, also for a model when one is given; exit code 1
// when both sides cover other shares of a picture, 2 for other arguments.
// zor_bench_pictures SCENE: the times of one scene alone; see FillScene.
#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <stdexcept>
#include <string>

#include "ChildProcess.h"
#include "PictureScenes.h"
#include "foundation/TemporaryFile.h"
#include "platform/visualisation/ZORPrint3DRepImage.h"

namespace fs = std::filesystem;

namespace {

constexpr int kPictures = 15;
constexpr int kViewerRuns = 3;

/// Models that are opened are cached in it.
struct WorkFolder : ZORFoundation::ScratchFolder {
  WorkFolder() {
    if (setenv("XDG_CACHE_HOME", Path().c_str(), 1) != 0) throw std::runtime_error("no cache");
  }
};

/// The server must not start anew when a window's connection ends, or the next one may fail.
constexpr char kScreen[] = "-noreset -screen 0 1280x1024x24";

/// @return the directory of this program, where the other one lies too.
fs::path Here() { return fs::read_symlink("/proc/self/exe").parent_path(); }

ZORPixelImage* DrawOne(ZOR3DRep& ioRep, int inNumber) {
  auto* const image = new ZORPrint3DRepImage(&ioRep, kPictureWidth, kPictureHeight);
  image->GetSupport()->SetBackgroundColor(1, 1, 1);
  SetViewpoint(ioRep, inNumber, *image->GetViewpoint());
  ZORPixelImage* const pixels = image->Rasterize();
  image->Release();
  if (!pixels) throw std::runtime_error("no picture was drawn");
  return pixels;
}

void TimeScene(const std::string& inName) {
  support::MeshScene scene;
  FillScene(inName, scene);
  ZOR3DRep& rep = *scene.Bag();
  PrintMedian("first", 1, [&](int) { DrawOne(rep, 0)->Release(); });
  PrintMedian("next", kPictures, [&](int inNumber) { DrawOne(rep, inNumber)->Release(); });
  ZORPixelImage* const picture = DrawOne(rep, 0);
  PrintCovered(picture->GetPixels().data());
  picture->Release();
}

/// As Wavefront text, for the viewer.
void WriteObj(const std::string& inScene, const fs::path& inPath) {
  support::MeshScene scene;
  FillScene(inScene, scene);
  std::ofstream file(inPath);
  std::size_t first = 1;
  for (const auto* const child : scene.Bag()->GetChildren()) {
    const auto& rep = dynamic_cast<const PlacedMeshRep&>(*child);
    const ZORMathTransformation rootFromPoints = RootFromPoints(rep);
    for (const auto& point : rep.GetMesh()->points) {
      const ZORMathVector p = rootFromPoints * ZORMathVector(point[0], point[1], point[2]);
      file << "v " << p.x << ' ' << p.y << ' ' << p.z << '\n';
    }
    for (const auto& t : rep.GetMesh()->triangles)
      file << "f " << t[0] + first << ' ' << t[1] + first << ' ' << t[2] + first << '\n';
    first += rep.GetMesh()->points.size();
  }
}

/// The lines of "NAME WALL PROCESSOR" that a command prints.
std::map<std::string, Times> Measure(const std::vector<std::string>& inCommand) {
  std::map<std::string, Times> times;
  const ChildOutcome outcome = RunChild(inCommand);
  std::istringstream lines(outcome.output);
  std::string name;
  Times one;
  while (lines >> name >> one.wall >> one.processor) times[name] = one;
  return times;
}

void PrintRow(const std::string& inName, const Times& inOurs, const Times& inTheirs,
              double inTarget) {
  const double wall = inTheirs.wall / inOurs.wall;
  const double processor = inTheirs.processor / inOurs.processor;
  const double counts = std::isnan(processor) ? wall : processor;
  std::printf("%-44s %9.1f %9.1f %7.2f   %9.1f %9.1f %7.2f   %.1f %s\n", inName.c_str(),
              inOurs.wall, inTheirs.wall, wall, inOurs.processor, inTheirs.processor, processor,
              inTarget, counts >= inTarget ? "kept" : "NOT KEPT");
}

/// What is asked of a scene: how many times the toolkit's rate, with its window kept and with a new
/// one a picture.
struct Wanted {
  double kept;
  double renewed;
};

class Comparison {
 public:
  void WithToolkit(const std::string& inScene, const Wanted& inWanted) {
    const std::string name = NameOf(inScene);
    auto mine = Measure({(Here() / "zor_bench_pictures").string(), inScene});
    auto other = Measure({"/usr/bin/xvfb-run", "-a", "-s", kScreen,
                          (Here() / "zor_bench_pictures_vtk").string(), inScene});
    if (other.empty()) {
      std::printf("%-44s %9.1f         -       -   %9.1f (no toolkit)\n", name.c_str(),
                  mine["next"].wall, mine["next"].processor);
      return;
    }
    PrintRow(name + ", one window kept", mine["next"], other["next"], inWanted.kept);
    PrintRow(name + ", a new window a picture", mine["next"], other["window"], inWanted.renewed);
    PrintRow(name + ", the first picture", mine["first"], other["first"], 1);
    ExpectSameCover(name, mine["covered"].wall, other["covered"].wall);
  }

  /// The first picture of what is in memory beside the whole process of a viewer; of each the
  /// quickest of some runs, since both are timed by the clock on the wall.
  void WithViewer(const std::string& inScene) {
    if (!fs::exists("/usr/bin/f3d")) return;
    const fs::path model = fs::path(folder_.Path()) / "scene.obj",
                   picture = fs::path(folder_.Path()) / "f3d.png";
    WriteObj(inScene, model);
    Times mine{INFINITY, INFINITY}, viewers{INFINITY, NAN};
    for (int run = 0; run < kViewerRuns; ++run) {
      const Times first = Measure({(Here() / "zor_bench_pictures").string(), inScene})["first"];
      mine = {std::min(mine.wall, first.wall), std::min(mine.processor, first.processor)};
      const ChildOutcome viewer =
          RunChild({"/usr/bin/xvfb-run", "-a", "-s", kScreen, "/usr/bin/f3d", model.string(),
                    "--output", picture.string(), "--resolution", "756,506", "--quiet"});
      if (viewer.exitCode != 0) {
        std::printf("f3d ended with %d\n", viewer.exitCode);
        return;
      }
      viewers.wall = std::min(viewers.wall, viewer.milliseconds);
    }
    PrintRow(NameOf(inScene) + ", first beside f3d's process", mine, viewers, 3);
  }

  bool AreAnswersAlike() const { return isAlike_; }

 private:
  /// A scene, or the file of a model without its folder.
  static std::string NameOf(const std::string& inScene) {
    return fs::path(inScene).filename().string();
  }

  /// Lines are of about the same width on both sides, so the shares, in percent, differ by little.
  void ExpectSameCover(const std::string& inName, double inOurs, double inTheirs) {
    constexpr double kTolerance = 1;
    if (std::fabs(inOurs - inTheirs) <= kTolerance) return;
    std::printf("%s: %.2f %% of the picture covered, %.2f %% by the toolkit: DIFFERENT\n",
                inName.c_str(), inOurs, inTheirs);
    isAlike_ = false;
  }

  const WorkFolder folder_;
  bool isAlike_ = true;
};

int CompareAll(const std::string& inModel) {
  // One thread for each side.
  setenv("ZOR_PICTURE_THREADS", "1", 1);
  setenv("LP_NUM_THREADS", "1", 1);
  setenv("VTK_SMP_MAX_THREADS", "1", 1);
  std::printf("%-44s %9s %9s %7s   %9s %9s %7s   %s\n", "milliseconds", "wall", "other", "ratio",
              "processor", "other", "ratio", "wanted");
  Comparison comparison;
  comparison.WithToolkit("two-products", {1.3, 3});
  comparison.WithToolkit("one-part", {2.5, 2.5});
  comparison.WithToolkit("whole", {6, 6});
  comparison.WithViewer("one-part");
  if (!inModel.empty()) {
    comparison.WithToolkit(inModel, {2.5, 2.5});
    comparison.WithViewer(inModel);
  }
  return comparison.AreAnswersAlike() ? 0 : 1;
}

}  // namespace

int main(int inCount, char** inArguments) try {
  const bool isComparison =
      inCount == 1 || (inCount == 3 && inArguments[1] == std::string("--model"));
  if (isComparison) return CompareAll(inCount == 3 ? inArguments[2] : "");
  if (inCount != 2) {
    std::fprintf(stderr, "usage: zor_bench_pictures [--model FILE | SCENE]\n");
    return 2;
  }
  TimeScene(inArguments[1]);
  return 0;
} catch (const std::exception& error) {
  std::fprintf(stderr, "zor_bench_pictures: %s\n", error.what());
  return 1;
}
