// The same scenes drawn by the toolkit: surfaces smoothly shaded, lines over them, four samples a
// pixel, the pixels read back.
#include <vtkActor.h>
#include <vtkCamera.h>
#include <vtkCellArray.h>
#include <vtkFloatArray.h>
#include <vtkImageData.h>
#include <vtkMapper.h>
#include <vtkMatrix4x4.h>
#include <vtkNew.h>
#include <vtkPointData.h>
#include <vtkPoints.h>
#include <vtkPolyData.h>
#include <vtkPolyDataMapper.h>
#include <vtkProperty.h>
#include <vtkRenderWindow.h>
#include <vtkRenderer.h>
#include <vtkSmartPointer.h>
#include <vtkUnsignedCharArray.h>

#include <cmath>
#include <cstdio>
#include <exception>

#include "PictureScenes.h"

namespace {

constexpr int kPictures = 7;

vtkSmartPointer<vtkPoints> ToPoints(const std::vector<std::array<float, 3>>& inPoints) {
  auto points = vtkSmartPointer<vtkPoints>::New();
  points->SetNumberOfPoints(static_cast<vtkIdType>(inPoints.size()));
  for (std::size_t i = 0; i < inPoints.size(); ++i)
    points->SetPoint(static_cast<vtkIdType>(i), inPoints[i].data());
  return points;
}

vtkSmartPointer<vtkPolyData> SurfaceOf(const PartMesh& inMesh) {
  auto surface = vtkSmartPointer<vtkPolyData>::New();
  surface->SetPoints(ToPoints(inMesh.points));
  vtkNew<vtkFloatArray> normals;
  normals->SetNumberOfComponents(3);
  for (const auto& normal : inMesh.normals) normals->InsertNextTuple(normal.data());
  surface->GetPointData()->SetNormals(normals);
  vtkNew<vtkCellArray> triangles;
  for (const auto& triangle : inMesh.triangles)
    triangles->InsertNextCell(
        {vtkIdType{triangle[0]}, vtkIdType{triangle[1]}, vtkIdType{triangle[2]}});
  surface->SetPolys(triangles);
  return surface;
}

vtkSmartPointer<vtkPolyData> LinesOf(const PartMesh& inMesh) {
  auto lines = vtkSmartPointer<vtkPolyData>::New();
  lines->SetPoints(ToPoints(inMesh.edgePoints));
  vtkNew<vtkCellArray> cells;
  for (std::size_t line = 0; line + 1 < inMesh.lineStarts.size(); ++line) {
    cells->InsertNextCell(static_cast<int>(inMesh.lineStarts[line + 1] - inMesh.lineStarts[line]));
    for (std::uint32_t i = inMesh.lineStarts[line]; i < inMesh.lineStarts[line + 1]; ++i)
      cells->InsertCellPoint(vtkIdType{i});
  }
  lines->SetLines(cells);
  return lines;
}

vtkSmartPointer<vtkActor> MakeActor(vtkPolyData* inData, const PlacedMeshRep& inRep) {
  vtkNew<vtkPolyDataMapper> mapper;
  mapper->SetInputData(inData);
  auto actor = vtkSmartPointer<vtkActor>::New();
  actor->SetMapper(mapper);
  const ZORMathVector& move = inRep.GetRootFromPart().GetVector();
  actor->SetPosition(move.x, move.y, move.z);
  return actor;
}

struct ToolkitScene {
  explicit ToolkitScene(const support::MeshScene& inScene) {
    for (const auto* const child : inScene.Bag()->GetChildren()) {
      const auto& rep = dynamic_cast<const PlacedMeshRep&>(*child);
      auto surface = MakeActor(SurfaceOf(*rep.GetMesh()), rep);
      unsigned int colour[4];
      rep.GetColorRGBA(colour);
      surface->GetProperty()->SetColor(colour[0] / 255.0, colour[1] / 255.0, colour[2] / 255.0);
      surface->GetProperty()->SetInterpolationToGouraud();
      auto lines = MakeActor(LinesOf(*rep.GetMesh()), rep);
      lines->GetProperty()->SetColor(0, 0, 0);
      renderer->AddActor(surface);
      renderer->AddActor(lines);
    }
    renderer->SetBackground(1, 1, 1);
    vtkMapper::SetResolveCoincidentTopologyToPolygonOffset();
  }
  vtkNew<vtkRenderer> renderer;
};

vtkSmartPointer<vtkRenderWindow> MakeWindow(ToolkitScene& inScene) {
  auto window = vtkSmartPointer<vtkRenderWindow>::New();
  window->SetOffScreenRendering(1);
  window->SetMultiSamples(4);
  window->SetSize(kPictureWidth, kPictureHeight);
  window->AddRenderer(inScene.renderer);
  return window;
}

void DrawOne(ToolkitScene& inScene, vtkRenderWindow& ioWindow, int inNumber) {
  vtkCamera* const camera = inScene.renderer->GetActiveCamera();
  const double angle = 0.4 + 0.07 * inNumber;
  camera->SetFocalPoint(0, 0, 0);
  camera->SetPosition(std::cos(angle), std::sin(angle), 0.6);
  camera->SetViewUp(0, 0, 1);
  inScene.renderer->ResetCamera();
  ioWindow.Render();
  vtkNew<vtkUnsignedCharArray> pixels;
  ioWindow.GetPixelData(0, 0, kPictureWidth - 1, kPictureHeight - 1, 1, pixels);
  if (pixels->GetNumberOfTuples() != vtkIdType{kPictureWidth} * kPictureHeight)
    throw std::runtime_error("no picture was drawn");
}

void TimeScene(const std::string& inName) {
  support::MeshScene scene;
  FillScene(inName, scene);
  {
    vtkSmartPointer<vtkRenderWindow> window;
    std::unique_ptr<ToolkitScene> toolkit;
    PrintMedian("first", 1, [&](int) {
      toolkit = std::make_unique<ToolkitScene>(scene);
      window = MakeWindow(*toolkit);
      DrawOne(*toolkit, *window, 0);
    });
    PrintMedian("next", kPictures, [&](int inNumber) { DrawOne(*toolkit, *window, inNumber); });
    window->Finalize();
  }
  ToolkitScene toolkit(scene);
  PrintMedian("window", kPictures, [&](int inNumber) {
    const auto window = MakeWindow(toolkit);
    DrawOne(toolkit, *window, inNumber);
    window->RemoveRenderer(toolkit.renderer);
    window->Finalize();
  });
}

}  // namespace

int main(int inCount, char** inArguments) try {
  if (inCount != 2) return 2;
  TimeScene(inArguments[1]);
  return 0;
} catch (const std::exception& error) {
  std::fprintf(stderr, "zor_bench_pictures_vtk: %s\n", error.what());
  return 1;
}
