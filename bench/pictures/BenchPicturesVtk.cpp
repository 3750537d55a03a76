// The same scenes drawn by the toolkit: surfaces smoothly shaded, lines over them, four samples a
// pixel, the pixels read back.
#include <vtkActor.h>
#include <vtkCamera.h>
#include <vtkCellArray.h>
#include <vtkCellData.h>
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

vtkSmartPointer<vtkUnsignedCharArray> ColoursOf(const PartMesh& inMesh,
                                                const unsigned int* inColour) {
  auto colours = vtkSmartPointer<vtkUnsignedCharArray>::New();
  colours->SetNumberOfComponents(3);
  for (const std::uint16_t number : inMesh.triangleColours) {
    const bool isOwn = number < inMesh.colours.size();
    unsigned char colour[3];
    for (std::size_t i = 0; i < 3; ++i)
      colour[i] = isOwn ? inMesh.colours[number][i] : static_cast<unsigned char>(inColour[i]);
    colours->InsertNextTypedTuple(colour);
  }
  return colours;
}

/// @param inColour of triangles that have none of their own.
vtkSmartPointer<vtkPolyData> SurfaceOf(const PartMesh& inMesh, const unsigned int* inColour) {
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
  if (!inMesh.triangleColours.empty())
    surface->GetCellData()->SetScalars(ColoursOf(inMesh, inColour));
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
  const ZORMathTransformation placement = RootFromPoints(inRep);
  vtkNew<vtkMatrix4x4> matrix;
  for (int i = 0; i < 4; ++i) {
    const ZORMathVector& column =
        i < 3 ? placement.GetMatrix().GetColumn(i) : placement.GetVector();
    matrix->SetElement(0, i, column.x);
    matrix->SetElement(1, i, column.y);
    matrix->SetElement(2, i, column.z);
  }
  actor->SetUserMatrix(matrix);
  return actor;
}

struct ToolkitScene {
  explicit ToolkitScene(const support::MeshScene& inScene) {
    for (const auto* const child : inScene.Bag()->GetChildren()) {
      const auto& rep = dynamic_cast<const PlacedMeshRep&>(*child);
      unsigned int colour[4];
      rep.GetColorRGBA(colour);
      auto surface = MakeActor(SurfaceOf(*rep.GetMesh(), colour), rep);
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

/// From where the other side sees the scene too.
void PlaceCamera(vtkRenderer& ioRenderer, const ZOR3DRep& inScene, int inNumber) {
  ZOR3DViewpoint viewpoint;
  SetViewpoint(inScene, inNumber, viewpoint);
  const ZORMathVector& eye = viewpoint.origin;
  const ZORMathVector& sight = viewpoint.sight;
  const double distance = viewpoint.focusDistance;
  vtkCamera* const camera = ioRenderer.GetActiveCamera();
  camera->SetPosition(eye.x, eye.y, eye.z);
  camera->SetFocalPoint(eye.x + distance * sight.x, eye.y + distance * sight.y,
                        eye.z + distance * sight.z);
  camera->SetViewUp(viewpoint.up.x, viewpoint.up.y, viewpoint.up.z);
  camera->SetViewAngle(viewpoint.viewAngle * 180 / support::kPi);
  ioRenderer.ResetCameraClippingRange();
}

vtkSmartPointer<vtkUnsignedCharArray> DrawOne(const ZOR3DRep& inScene, ToolkitScene& ioToolkit,
                                              vtkRenderWindow& ioWindow, int inNumber) {
  PlaceCamera(*ioToolkit.renderer, inScene, inNumber);
  ioWindow.Render();
  auto pixels = vtkSmartPointer<vtkUnsignedCharArray>::New();
  ioWindow.GetPixelData(0, 0, kPictureWidth - 1, kPictureHeight - 1, 1, pixels);
  if (pixels->GetNumberOfTuples() != vtkIdType{kPictureWidth} * kPictureHeight)
    throw std::runtime_error("no picture was drawn");
  return pixels;
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
      DrawOne(*scene.Bag(), *toolkit, *window, 0);
    });
    PrintMedian("next", kPictures,
                [&](int inNumber) { DrawOne(*scene.Bag(), *toolkit, *window, inNumber); });
    PrintCovered(DrawOne(*scene.Bag(), *toolkit, *window, 0)->GetPointer(0));
    window->Finalize();
  }
  ToolkitScene toolkit(scene);
  PrintMedian("window", kPictures, [&](int inNumber) {
    const auto window = MakeWindow(toolkit);
    DrawOne(*scene.Bag(), toolkit, *window, inNumber);
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
