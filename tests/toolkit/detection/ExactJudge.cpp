#include "toolkit/detection/ExactJudge.h"

#include <BRepAdaptor_Surface.hxx>
#include <BRepAlgoAPI_Common.hxx>
#include <BRepBndLib.hxx>
#include <BRepBuilderAPI_MakeVertex.hxx>
#include <BRepExtrema_DistShapeShape.hxx>
#include <BRepGProp.hxx>
#include <BRepLib.hxx>
#include <BRepMesh_IncrementalMesh.hxx>
#include <BRep_Builder.hxx>
#include <BRep_Tool.hxx>
#include <Bnd_Box.hxx>
#include <GProp_GProps.hxx>
#include <Poly_Triangulation.hxx>
#include <TopExp_Explorer.hxx>
#include <TopoDS.hxx>
#include <TopoDS_Compound.hxx>
#include <TopoDS_Solid.hxx>
#include <algorithm>
#include <vector>

namespace ZORDetection {
namespace {

constexpr double kTouching = 1e-5;
constexpr std::size_t kMaxProbes = 240;

std::vector<TopoDS_Shape> SolidsOf(const TopoDS_Shape& inShape) {
  std::vector<TopoDS_Shape> solids;
  for (TopExp_Explorer solid(inShape, TopAbs_SOLID); solid.More(); solid.Next()) {
    TopoDS_Solid outward = TopoDS::Solid(solid.Current());
    BRepLib::OrientClosedSolid(outward);
    solids.push_back(outward);
  }
  return solids;
}

TopoDS_Compound FacesOf(const TopoDS_Shape& inShape) {
  TopoDS_Compound faces;
  BRep_Builder builder;
  builder.MakeCompound(faces);
  for (TopExp_Explorer face(inShape, TopAbs_FACE); face.More(); face.Next())
    builder.Add(faces, face.Current());
  return faces;
}

/// Corners first, then points of the faces.
std::vector<gp_Pnt> ProbesOn(const TopoDS_Shape& inCommon) {
  std::vector<gp_Pnt> corners, points;
  for (TopExp_Explorer corner(inCommon, TopAbs_VERTEX); corner.More(); corner.Next())
    corners.push_back(BRep_Tool::Pnt(TopoDS::Vertex(corner.Current())));
  Bnd_Box box;
  BRepBndLib::Add(inCommon, box, false);
  const double size = box.IsVoid() ? 1 : std::sqrt(box.SquareExtent());
  const BRepMesh_IncrementalMesh meshing(inCommon, 0.01 * size, false, 0.3);
  for (TopExp_Explorer face(inCommon, TopAbs_FACE); face.More(); face.Next()) {
    TopLoc_Location place;
    const auto mesh = BRep_Tool::Triangulation(TopoDS::Face(face.Current()), place);
    if (mesh.IsNull() || !mesh->HasUVNodes()) continue;
    // On the surface: a triangle's own middle lies beside it.
    const BRepAdaptor_Surface surface(TopoDS::Face(face.Current()), false);
    for (int i = 1; i <= mesh->NbTriangles(); ++i) {
      int a = 0, b = 0, c = 0;
      mesh->Triangle(i).Get(a, b, c);
      const gp_XY sum = mesh->UVNode(a).XY() + mesh->UVNode(b).XY() + mesh->UVNode(c).XY();
      points.push_back(surface.Value(sum.X() / 3, sum.Y() / 3));
    }
  }
  std::vector<gp_Pnt> probes;
  for (const auto* list : {&corners, &points}) {
    const std::size_t share = std::min(list->size(), kMaxProbes / 2);
    for (std::size_t i = 0; i < share; ++i) probes.push_back((*list)[i * list->size() / share]);
  }
  return probes;
}

double DistanceOf(const TopoDS_Shape& inFirst, const TopoDS_Shape& inSecond, bool& ioIsDone) {
  const BRepExtrema_DistShapeShape distance(inFirst, inSecond);
  ioIsDone = ioIsDone && distance.IsDone();
  return distance.IsDone() ? distance.Value() : 0;
}

/// A point on the boundary of what both share lies on one body's boundary, and in the other body.
double DepthOf(const TopoDS_Shape& inCommon, const TopoDS_Shape& inFirst,
               const TopoDS_Shape& inSecond, bool& ioIsDone) {
  const TopoDS_Compound first = FacesOf(inFirst), second = FacesOf(inSecond);
  double depth = 0;
  for (const gp_Pnt& probe : ProbesOn(inCommon)) {
    const TopoDS_Shape point = BRepBuilderAPI_MakeVertex(probe).Shape();
    depth =
        std::max({depth, DistanceOf(point, first, ioIsDone), DistanceOf(point, second, ioIsDone)});
  }
  return depth;
}

Bnd_Box BoxOf(const TopoDS_Shape& inShape) {
  Bnd_Box box;
  BRepBndLib::AddOptimal(inShape, box, false, false);
  return box;
}

void AddCommon(const TopoDS_Shape& inFirst, const TopoDS_Shape& inSecond, Judgement& ioJudgement) {
  if (BoxOf(inFirst).Distance(BoxOf(inSecond)) > kTouching) return;
  BRepAlgoAPI_Common common(inFirst, inSecond);
  if (!common.IsDone()) {
    ioJudgement.isDone = false;
    return;
  }
  GProp_GProps volume;
  BRepGProp::VolumeProperties(common.Shape(), volume);
  if (std::abs(volume.Mass()) <= 0) return;
  ioJudgement.volume += std::abs(volume.Mass());
  ioJudgement.depth =
      std::max(ioJudgement.depth, DepthOf(common.Shape(), inFirst, inSecond, ioJudgement.isDone));
}

}  // namespace

Judgement JudgeExactly(const TopoDS_Shape& inFirst, const TopoDS_Shape& inSecond,
                       double inFarthest) {
  Judgement judgement;
  for (const TopoDS_Shape* shape : {&inFirst, &inSecond})
    judgement.hasSheets =
        judgement.hasSheets || TopExp_Explorer(*shape, TopAbs_FACE, TopAbs_SOLID).More();
  judgement.distance = BoxOf(inFirst).Distance(BoxOf(inSecond));
  if (judgement.distance > inFarthest) return judgement;
  judgement.distance = DistanceOf(inFirst, inSecond, judgement.isDone);
  if (judgement.distance > kTouching) return judgement;
  for (const TopoDS_Shape& first : SolidsOf(inFirst))
    for (const TopoDS_Shape& second : SolidsOf(inSecond)) AddCommon(first, second, judgement);
  return judgement;
}

}  // namespace ZORDetection
