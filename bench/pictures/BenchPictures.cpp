// zor_bench_pictures: milliseconds a picture, beside the same scenes in a toolkit's window and
// beside a viewer's whole process. Ratios of processor time hold on a busy machine too; both sides
// are given one thread.
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
#include "platform/visualisation/ZORPrint3DRepImage.h"

namespace fs = std::filesystem;

namespace {

constexpr int kPictures = 15;

/// The server must not start anew when a window's connection ends, or the next one may fail.
constexpr char kScreen[] = "-noreset -screen 0 1280x1024x24";

/// @return the directory of this program, where the other one lies too.
fs::path Here() { return fs::read_symlink("/proc/self/exe").parent_path(); }

void DrawOne(ZOR3DRep* inRep, int inNumber) {
  auto* const image = new ZORPrint3DRepImage(inRep, kPictureWidth, kPictureHeight);
  ZOR3DViewpoint& viewpoint = *image->GetViewpoint();
  const double angle = 0.4 + 0.07 * inNumber;
  viewpoint.sight = {-std::cos(angle), -std::sin(angle), -0.6};
  viewpoint.Reframe(kPictureWidth, kPictureHeight, 1, 1);
  ZORPixelImage* const pixels = image->Rasterize();
  if (!pixels) throw std::runtime_error("no picture was drawn");
  pixels->Release();
  image->Release();
}

void TimeScene(const std::string& inName) {
  support::MeshScene scene;
  FillScene(inName, scene);
  PrintMedian("first", 1, [&](int) { DrawOne(scene.Bag(), 0); });
  PrintMedian("next", kPictures, [&](int inNumber) { DrawOne(scene.Bag(), inNumber); });
}

/// As Wavefront text, for the viewer.
void WriteObj(const std::string& inScene, const fs::path& inPath) {
  support::MeshScene scene;
  FillScene(inScene, scene);
  std::ofstream file(inPath);
  std::size_t first = 1;
  for (const auto* const child : scene.Bag()->GetChildren()) {
    const auto& rep = dynamic_cast<const PlacedMeshRep&>(*child);
    for (const auto& point : rep.GetMesh()->points) {
      const ZORMathVector p = rep.GetRootFromPart() * ZORMathVector(point[0], point[1], point[2]);
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
  std::printf("%-44s %9.1f %9.1f %7.2f   %9.1f %9.1f %7.2f   %.1f\n", inName.c_str(), inOurs.wall,
              inTheirs.wall, inTheirs.wall / inOurs.wall, inOurs.processor, inTheirs.processor,
              inTheirs.processor / inOurs.processor, inTarget);
}

void CompareWithToolkit(const std::string& inScene, double inTargetKept, double inTargetNew) {
  const std::string ours = (Here() / "zor_bench_pictures").string();
  const std::string theirs = (Here() / "zor_bench_pictures_vtk").string();
  auto mine = Measure({ours, inScene});
  auto other = Measure({"/usr/bin/xvfb-run", "-a", "-s", kScreen, theirs, inScene});
  if (other.empty()) {
    std::printf("%-44s %9.1f         -       -   %9.1f (no toolkit)\n", inScene.c_str(),
                mine["next"].wall, mine["next"].processor);
    return;
  }
  PrintRow(inScene + ", one window kept", mine["next"], other["next"], inTargetKept);
  PrintRow(inScene + ", a new window a picture", mine["next"], other["window"], inTargetNew);
  PrintRow(inScene + ", the first picture", mine["first"], other["first"], 1);
}

/// The first picture of a part in memory beside the whole process of a viewer.
void CompareWithViewer() {
  if (!fs::exists("/usr/bin/f3d")) return;
  const fs::path folder = fs::temp_directory_path();
  const fs::path model = folder / "zor_bench_pictures.obj", picture = folder / "zor_bench_f3d.png";
  WriteObj("one-part", model);
  auto mine = Measure({(Here() / "zor_bench_pictures").string(), "one-part"});
  const ChildOutcome viewer =
      RunChild({"/usr/bin/xvfb-run", "-a", "-s", kScreen, "/usr/bin/f3d", model.string(),
                "--output", picture.string(), "--resolution", "756,506", "--quiet"});
  if (viewer.exitCode == 0)
    PrintRow("one-part, first picture beside f3d's process", mine["first"],
             {viewer.milliseconds, NAN}, 3);
  else
    std::printf("f3d ended with %d\n", viewer.exitCode);
  fs::remove(model);
  fs::remove(picture);
}

void CompareAll() {
  // One thread for each side.
  setenv("ZOR_PICTURE_THREADS", "1", 1);
  setenv("LP_NUM_THREADS", "1", 1);
  setenv("VTK_SMP_MAX_THREADS", "1", 1);
  std::printf("%-44s %9s %9s %7s   %9s %9s %7s   %s\n", "milliseconds", "wall", "other", "ratio",
              "processor", "other", "ratio", "wanted");
  CompareWithToolkit("two-products", 1.3, 3);
  CompareWithToolkit("one-part", 2.5, 2.5);
  CompareWithToolkit("whole", 6, 6);
  CompareWithViewer();
}

}  // namespace

int main(int inCount, char** inArguments) try {
  if (inCount == 2)
    TimeScene(inArguments[1]);
  else
    CompareAll();
  return 0;
} catch (const std::exception& error) {
  std::fprintf(stderr, "zor_bench_pictures: %s\n", error.what());
  return 1;
}
