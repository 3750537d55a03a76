#include <BRepBndLib.hxx>
#include <BRepMesh_IncrementalMesh.hxx>
#include <BRep_Tool.hxx>
#include <Bnd_Box.hxx>
#include <GeomLib.hxx>
#include <Geom_Plane.hxx>
#include <Poly_Triangulation.hxx>
#include <Standard_Failure.hxx>
#include <Standard_OutOfMemory.hxx>
#include <TopExp.hxx>
#include <TopExp_Explorer.hxx>
#include <TopoDS.hxx>
#include <TopoDS_Face.hxx>
#include <XCAFDoc_ShapeTool.hxx>
#include <algorithm>
#include <cmath>
#include <exception>
#include <new>

#include "default_platform/product_structure/model_reader/MeshBuilder.h"
#include "default_platform/product_structure/model_reader/TreeWalk.h"

namespace ZORDefault {
namespace {

constexpr double kAngularDeflection = 0.5;  // radians
constexpr double kNormalTolerance = 1e-7;

/// Mesh formats give faces with triangles but without a surface.
bool HasSurfaces(const TopoDS_Shape& inShape) {
  TopLoc_Location location;
  TopExp_Explorer face(inShape, TopAbs_FACE);
  if (!face.More()) return true;  // curves alone are tessellated too
  for (; face.More(); face.Next())
    if (!BRep_Tool::Surface(TopoDS::Face(face.Current()), location).IsNull()) return true;
  return false;
}

void Tessellate(const TopoDS_Shape& inShape, double inDeflection) {
  if (!HasSurfaces(inShape)) return;
  Bnd_Box box;
  BRepBndLib::Add(inShape, box, false);
  if (box.IsVoid()) return;
  const double diagonal = std::sqrt(box.SquareExtent());
  if (diagonal > 0 && std::isfinite(diagonal))
    BRepMesh_IncrementalMesh(inShape, diagonal * inDeflection, false, kAngularDeflection, false);
}

/// One face with triangles.
class FaceMesh {
 public:
  FaceMesh(const TopoDS_Face& inFace, std::uint16_t inColour)
      : face_(inFace), triangles_(BRep_Tool::Triangulation(inFace, location_)), colour_(inColour) {
    if (HasTriangles()) surface_ = BRep_Tool::Surface(face_, surfaceLocation_);
  }

  bool HasTriangles() const { return !triangles_.IsNull() && triangles_->NbTriangles() > 0; }
  bool HasSurface() const { return !surface_.IsNull() && triangles_->HasUVNodes(); }

  void AddTo(MeshBuilder& ioBuilder) const {
    const auto first = static_cast<std::uint32_t>(ioBuilder.points.size());
    for (int i = 1; i <= triangles_->NbNodes(); ++i) ioBuilder.points.push_back(PointAt(i));
    for (int i = 1; i <= triangles_->NbTriangles(); ++i) {
      ioBuilder.triangles.push_back(TriangleAt(i, first));
      ioBuilder.triangleColours.push_back(colour_);
    }
    AddNormals(first, ioBuilder);
  }

  void AddTo(TriangleSoup& ioMesh) const {
    const auto first = static_cast<std::uint32_t>(ioMesh.points.size());
    for (int i = 1; i <= triangles_->NbNodes(); ++i) {
      ioMesh.points.push_back(PointAt(i));
      ioMesh.normals.push_back(triangles_->HasNormals() ? Placed(triangles_->Normal(i))
                                                        : gp_XYZ(0, 0, 0));
    }
    for (int i = 1; i <= triangles_->NbTriangles(); ++i) {
      ioMesh.triangles.push_back(TriangleAt(i, first));
      ioMesh.triangleColours.push_back(colour_);
    }
  }

 private:
  bool IsReversed() const { return face_.Orientation() == TopAbs_REVERSED; }

  gp_XYZ PointAt(int inNode) const {
    gp_Pnt point = triangles_->Node(inNode);
    if (!location_.IsIdentity()) point.Transform(location_.Transformation());
    return point.XYZ();
  }

  Triangle TriangleAt(int inTriangle, std::uint32_t inFirst) const {
    int a = 0, b = 0, c = 0;
    triangles_->Triangle(inTriangle).Get(a, b, c);
    if (IsReversed()) std::swap(b, c);
    const auto position = [inFirst](int node) {
      return inFirst + static_cast<std::uint32_t>(node) - 1;
    };
    return {position(a), position(b), position(c)};
  }

  gp_XYZ Placed(gp_Dir inNormal) const {
    if (!location_.IsIdentity()) inNormal.Transform(location_.Transformation());
    return IsReversed() ? inNormal.Reversed().XYZ() : inNormal.XYZ();
  }

  void AddNormals(std::uint32_t inFirst, MeshBuilder& ioBuilder) const {
    const std::vector<gp_XYZ> means = MeanNormals(inFirst, ioBuilder);
    for (int i = 1; i <= triangles_->NbNodes(); ++i) {
      gp_Dir normal;
      const gp_XYZ& mean = means[static_cast<std::size_t>(i) - 1];
      // At a singularity, such as the apex of a cone, the triangles' normals are used.
      const bool isFound =
          GeomLib::NormEstim(surface_, triangles_->UVNode(i), kNormalTolerance, normal) <= 1;
      ioBuilder.normals.push_back(isFound ? Placed(normal) : UnitOf(mean));
    }
  }

  std::vector<gp_XYZ> MeanNormals(std::uint32_t inFirst, const MeshBuilder& inBuilder) const {
    const auto count = static_cast<std::size_t>(triangles_->NbTriangles());
    std::vector<gp_XYZ> means(inBuilder.points.size() - inFirst, gp_XYZ(0, 0, 0));
    for (std::size_t i = inBuilder.triangles.size() - count; i < inBuilder.triangles.size(); ++i) {
      const auto& [a, b, c] = inBuilder.triangles[i];
      const gp_XYZ normal =
          AreaNormal(inBuilder.points[a], inBuilder.points[b], inBuilder.points[c]);
      for (const std::uint32_t node : {a, b, c}) means[node - inFirst] += normal;
    }
    return means;
  }

  TopoDS_Face face_;
  TopLoc_Location location_;
  TopLoc_Location surfaceLocation_;
  Handle(Poly_Triangulation) triangles_;
  Handle(Geom_Surface) surface_;
  std::uint16_t colour_;
};

double AreaOf(const MeshBuilder& inBuilder) {
  double area = 0;
  for (const auto& [a, b, c] : inBuilder.triangles)
    area += AreaNormal(inBuilder.points[a], inBuilder.points[b], inBuilder.points[c]).Modulus() / 2;
  return area;
}

std::array<float, 3> ToFloats(const gp_XYZ& inVector) {
  return {static_cast<float>(inVector.X()), static_cast<float>(inVector.Y()),
          static_cast<float>(inVector.Z())};
}

/// The centre of the bounding box.
gp_XYZ CentreOf(const MeshBuilder& inBuilder) {
  Bnd_Box box;
  for (const gp_XYZ& point : inBuilder.points) box.Add(gp_Pnt(point));
  for (const Polyline& edge : inBuilder.edges)
    for (const gp_XYZ& point : edge) box.Add(gp_Pnt(point));
  if (box.IsVoid()) return gp_XYZ(0, 0, 0);
  gp_XYZ low, high;
  box.Get(low.ChangeCoord(1), low.ChangeCoord(2), low.ChangeCoord(3), high.ChangeCoord(1),
          high.ChangeCoord(2), high.ChangeCoord(3));
  return (low + high) / 2;
}

std::shared_ptr<const PartMesh> ToPartMesh(const MeshBuilder& inBuilder,
                                           std::vector<PartColour> inColours) {
  auto mesh = std::make_shared<PartMesh>();
  const gp_XYZ centre = CentreOf(inBuilder);
  mesh->origin = {centre.X(), centre.Y(), centre.Z()};
  double radius = 0;
  const auto relative = [&](const gp_XYZ& point) {
    radius = std::max(radius, (point - centre).Modulus());
    return ToFloats(point - centre);
  };
  for (const gp_XYZ& point : inBuilder.points) mesh->points.push_back(relative(point));
  for (const gp_XYZ& normal : inBuilder.normals) mesh->normals.push_back(ToFloats(normal));
  mesh->triangles = inBuilder.triangles;
  if (!inColours.empty()) mesh->triangleColours = inBuilder.triangleColours;
  mesh->colours = std::move(inColours);
  mesh->lineStarts.push_back(0);
  for (const Polyline& edge : inBuilder.edges) {
    for (const gp_XYZ& point : edge) mesh->edgePoints.push_back(relative(point));
    mesh->lineStarts.push_back(static_cast<std::uint32_t>(mesh->edgePoints.size()));
  }
  mesh->sphere = ZOR3DBoundingSphere(mesh->origin, radius);
  return mesh;
}

void FillMesh(const TDF_Label& inLabel, const TopoDS_Shape& inShape, ModelPart& ioPart) {
  TopTools_IndexedMapOfShape faces;
  TopExp::MapShapes(inShape, TopAbs_FACE, faces);
  FaceColours colours = FaceColoursOf(inLabel, faces);
  MeshBuilder builder;
  TriangleSoup soup;
  std::vector<std::uint32_t> firstPoints;
  for (int i = 1; i <= faces.Extent(); ++i) {
    const auto position = static_cast<std::size_t>(i) - 1;
    const FaceMesh face(TopoDS::Face(faces(i)),
                        colours.ofFace.empty() ? PartMesh::kNoColour : colours.ofFace[position]);
    firstPoints.push_back(kNoPoints);
    if (!face.HasTriangles()) {
      ++ioPart.facesWithoutTriangles;
    } else if (face.HasSurface()) {
      firstPoints.back() = static_cast<std::uint32_t>(builder.points.size());
      face.AddTo(builder);
    } else {
      face.AddTo(soup);
    }
  }
  AddSurfaceEdges(inShape, faces, firstPoints, builder);
  AddCreasedMesh(soup, builder);
  ioPart.area = AreaOf(builder);
  ioPart.failedToTessellate = !faces.IsEmpty() && builder.triangles.empty();
  if (!builder.triangles.empty() || !builder.edges.empty())
    ioPart.mesh = ToPartMesh(builder, std::move(colours.colours));
}

}  // namespace

bool MeshPart(const TDF_Label& inPart, double inDeflection, ModelPart& ioPart) {
  const TopoDS_Shape shape = XCAFDoc_ShapeTool::GetShape(inPart);
  if (shape.IsNull()) return true;
  try {
    Tessellate(shape, inDeflection);
    FillMesh(inPart, shape, ioPart);
    return true;
  } catch (const Standard_OutOfMemory&) {
    throw std::bad_alloc();
  } catch (const std::bad_alloc&) {
    throw;
  } catch (const Standard_Failure&) {
    ioPart.failedToTessellate = true;
  } catch (const std::exception&) {
    ioPart.failedToTessellate = true;
  }
  return false;
}

}  // namespace ZORDefault
