// From the shape of a part to bodies with measured triangles.
#include <BRepAdaptor_Curve.hxx>
#include <BRepAdaptor_Surface.hxx>
#include <BRepBndLib.hxx>
#include <BRepBuilderAPI_Sewing.hxx>
#include <BRepMesh_IncrementalMesh.hxx>
#include <BRep_Builder.hxx>
#include <BRep_Tool.hxx>
#include <Bnd_Box.hxx>
#include <Geom2d_Curve.hxx>
#include <Poly_PolygonOnTriangulation.hxx>
#include <Poly_Triangulation.hxx>
#include <Standard_ErrorHandler.hxx>
#include <Standard_Failure.hxx>
#include <TopExp_Explorer.hxx>
#include <TopoDS.hxx>
#include <TopoDS_Compound.hxx>
#include <TopoDS_Shell.hxx>
#include <TopoDS_Solid.hxx>
#include <exception>

#include "toolkit/detection/kernel/Body.h"

namespace ZORDetection {
namespace {

// The search starts from the triangles: their size affects its time, not the result.
constexpr double kDeflectionShare = 0.003;  // of the part's size
constexpr double kMaxDeflection = 0.5;      // millimetres
constexpr double kAngle = 0.45;             // radians
constexpr double kSinglePrecision = 6e-8;
constexpr double kSafety = 1.5;  // deflections are measured at a few points only

bool HasSurface(const TopoDS_Face& inFace) {
  TopLoc_Location location;
  return !BRep_Tool::Surface(inFace, location).IsNull();
}

double SizeOf(const TopoDS_Shape& inShape) {
  Bnd_Box box;
  BRepBndLib::Add(inShape, box, false);
  return box.IsVoid() ? 0 : std::sqrt(box.SquareExtent());
}

/// Fills one body from faces that have been given triangles.
class BodyBuilder {
 public:
  explicit BodyBuilder(bool inIsSolid) {
    body_.isSolid = inIsSolid;
    body_.isExact = true;
  }

  /// @return false when the face has no triangles.
  bool Add(const TopoDS_Face& inFace) {
    TopLoc_Location location;
    const Handle(Poly_Triangulation) mesh = BRep_Tool::Triangulation(inFace, location);
    if (mesh.IsNull() || mesh->NbTriangles() == 0 || !mesh->HasUVNodes()) return false;
    const auto first = static_cast<std::uint32_t>(body_.nodes.size());
    for (int i = 1; i <= mesh->NbNodes(); ++i) {
      body_.nodes.push_back(mesh->Node(i).Transformed(location.Transformation()).XYZ());
      body_.parameters.push_back(mesh->UVNode(i).XY());
    }
    const std::size_t firstTriangle = body_.triangles.size();
    AddTriangles(*mesh, inFace, first);
    BodyFace face;
    face.face = inFace;
    face.tolerance = BRep_Tool::Tolerance(inFace);
    AddEdges(inFace, mesh, location, first, face);
    Measure(firstTriangle, face);
    body_.faces.push_back(std::move(face));
    return true;
  }

  bool IsEmpty() const { return body_.triangles.empty(); }

  Body Take() {
    body_.Finish();
    return std::move(body_);
  }

 private:
  void AddTriangles(const Poly_Triangulation& inMesh, const TopoDS_Face& inFace,
                    std::uint32_t inFirst) {
    const auto face = static_cast<std::uint32_t>(body_.faces.size());
    for (int i = 1; i <= inMesh.NbTriangles(); ++i) {
      int a = 0, b = 0, c = 0;
      inMesh.Triangle(i).Get(a, b, c);
      if (inFace.Orientation() == TopAbs_REVERSED) std::swap(b, c);
      const auto at = [inFirst](int node) {
        return inFirst + static_cast<std::uint32_t>(node) - 1;
      };
      body_.triangles.push_back({{at(a), at(b), at(c)}, face});
    }
  }

  void AddEdges(const TopoDS_Face& inFace, const Handle(Poly_Triangulation) & inMesh,
                const TopLoc_Location& inLocation, std::uint32_t inFirst, BodyFace& ioFace) {
    bool isWhole = true;
    const TopoDS_Shape forward = inFace.Oriented(TopAbs_FORWARD);
    const BRepAdaptor_Surface surface(TopoDS::Face(forward), false);
    for (TopExp_Explorer edges(forward, TopAbs_EDGE); edges.More(); edges.Next()) {
      const TopoDS_Edge& edge = TopoDS::Edge(edges.Current());
      if (edge.Orientation() == TopAbs_INTERNAL || edge.Orientation() == TopAbs_EXTERNAL) continue;
      if (BRep_Tool::Degenerated(edge)) {
        AddDegenerated(edge, TopoDS::Face(forward), ioFace);
        continue;
      }
      const Handle(Poly_PolygonOnTriangulation) polygon =
          BRep_Tool::PolygonOnTriangulation(edge, inMesh, inLocation);
      if (polygon.IsNull() || !polygon->HasParameters()) {
        isWhole = false;
        continue;
      }
      BorderEdge border;
      border.edge = edge;
      border.tolerance = BRep_Tool::Tolerance(edge);
      border.isForward = edge.Orientation() == TopAbs_FORWARD;
      border.isSeam = BRep_Tool::IsClosed(edge, TopoDS::Face(forward));
      for (int i = 1; i <= polygon->NbNodes(); ++i) {
        border.nodes.push_back(inFirst + static_cast<std::uint32_t>(polygon->Node(i)) - 1);
        border.parameters.push_back(polygon->Parameter(i));
        border.box.Add(body_.nodes[border.nodes.back()]);
        if (i > 1)
          ioFace.outline.push_back({body_.parameters[border.nodes[border.nodes.size() - 2]],
                                    body_.parameters[border.nodes.back()]});
      }
      MeasureBorder(surface, border);
      ioFace.deflection = std::max(ioFace.deflection, border.deflection);
      ioFace.edges.push_back(std::move(border));
    }
    if (!isWhole) ioFace.outline.clear();
    ioFace.outlineLow = gp_XY(1e100, 1e100);
    for (const auto& [start, end] : ioFace.outline)
      ioFace.outlineLow = gp_XY(std::min({ioFace.outlineLow.X(), start.X(), end.X()}),
                                std::min({ioFace.outlineLow.Y(), start.Y(), end.Y()}));
  }

  /// How far the curve is from its chords in space, and from the surface's image of those in its
  /// parameters: a straight line across a cone is a spiral there.
  void MeasureBorder(const BRepAdaptor_Surface& inSurface, BorderEdge& ioBorder) const {
    const BRepAdaptor_Curve curve(ioBorder.edge);
    for (std::size_t i = 0; i + 1 < ioBorder.nodes.size(); ++i) {
      const std::uint32_t from = ioBorder.nodes[i], to = ioBorder.nodes[i + 1];
      for (const double share : {0.25, 0.5, 0.75}) {
        const double parameter =
            ioBorder.parameters[i] + share * (ioBorder.parameters[i + 1] - ioBorder.parameters[i]);
        const gp_XYZ point = curve.Value(parameter).XYZ();
        const gp_XYZ foot = ClosestOnSegment(point, body_.nodes[from], body_.nodes[to]);
        ioBorder.deflection = std::max(ioBorder.deflection, (point - foot).Modulus());
        const gp_XY at =
            body_.parameters[from] + (body_.parameters[to] - body_.parameters[from]) * share;
        const gp_XYZ image = inSurface.Value(at.X(), at.Y()).XYZ();
        ioBorder.outlineError = std::max(ioBorder.outlineError, (point - image).Modulus());
      }
    }
    ioBorder.deflection *= kSafety;
    ioBorder.outlineError = kSafety * ioBorder.outlineError + ioBorder.deflection;
  }

  /// The tip of a cone is a point, but a side of the face's outline.
  static void AddDegenerated(const TopoDS_Edge& inEdge, const TopoDS_Face& inFace,
                             BodyFace& ioFace) {
    double first = 0, last = 0;
    const Handle(Geom2d_Curve) curve = BRep_Tool::CurveOnSurface(inEdge, inFace, first, last);
    if (!curve.IsNull())
      ioFace.outline.push_back({curve->Value(first).XY(), curve->Value(last).XY()});
  }

  /// Measures how far the surface is from its triangles, and which way its normal points.
  void Measure(std::size_t inFirstTriangle, BodyFace& ioFace) const {
    const BRepAdaptor_Surface surface(ioFace.face, false);
    ioFace.isPlane = surface.GetType() == GeomAbs_Plane;
    double farthest = 0, agreement = 0;
    for (std::size_t i = inFirstTriangle; i < body_.triangles.size(); ++i) {
      const auto& [a, b, c] = body_.triangles[i].nodes;
      const Corners corners{body_.nodes[a], body_.nodes[b], body_.nodes[c]};
      const gp_XY centre = (body_.parameters[a] + body_.parameters[b] + body_.parameters[c]) / 3;
      if (!ioFace.isPlane || agreement == 0) {
        gp_Pnt point;
        gp_Vec du, dv;
        surface.D1(centre.X(), centre.Y(), point, du, dv);
        const gp_XYZ normal = (corners[1] - corners[0]) ^ (corners[2] - corners[0]);
        agreement += normal * (du.XYZ() ^ dv.XYZ()) > 0 ? 1 : -1;
      }
      if (ioFace.isPlane) continue;
      const std::array<gp_XY, 4> probes{centre, (body_.parameters[a] + body_.parameters[b]) / 2,
                                        (body_.parameters[b] + body_.parameters[c]) / 2,
                                        (body_.parameters[c] + body_.parameters[a]) / 2};
      for (const gp_XY& probe : probes) {
        const gp_XYZ point = surface.Value(probe.X(), probe.Y()).XYZ();
        farthest = std::max(farthest, (ClosestOnTriangle(point, corners) - point).Modulus());
      }
    }
    ioFace.normalSign = agreement < 0 ? -1 : 1;
    ioFace.deflection = std::max(ioFace.deflection, kSafety * farthest) + ioFace.tolerance;
  }

  Body body_;
};

/// Sorts the faces of a shape into solids and the rest, and makes bodies of both.
class ShapeReading {
 public:
  ShapeReading(const TopoDS_Shape& inShape, double inMeshSize, PartGeometry& outPart)
      : part_(outPart) {
    BRep_Builder builder;
    builder.MakeCompound(free_);
    for (TopExp_Explorer solid(inShape, TopAbs_SOLID); solid.More(); solid.Next())
      AddSolid(solid.Current());
    for (TopExp_Explorer face(inShape, TopAbs_FACE, TopAbs_SOLID); face.More(); face.Next())
      AddFree(TopoDS::Face(face.Current()));
    SewFreeFaces();
    const double size = SizeOf(inShape);
    deflection_ = std::clamp(kDeflectionShare * size, 1e-4, kMaxDeflection) * inMeshSize;
    angle_ = std::min(kAngle * inMeshSize, 1.0);
    for (const TopoDS_Shape& solid : solids_) AddBody(solid, true);
    for (const TopoDS_Shape& sheet : sheets_) AddBody(sheet, false);
    AddTriangleBodies();
    if (facesWithoutTriangles_ != 0)
      part_.problems.push_back({0,
                                {},
                                part_.bodies.empty(),
                                std::to_string(facesWithoutTriangles_) +
                                    (facesWithoutTriangles_ == 1 ? " face without triangles"
                                                                 : " faces without triangles")});
  }

 private:
  void AddSolid(const TopoDS_Shape& inSolid) {
    bool isClosed = true;
    for (TopExp_Explorer shell(inSolid, TopAbs_SHELL); shell.More(); shell.Next())
      isClosed = isClosed && BRep_Tool::IsClosed(shell.Current());
    bool hasSurfaces = true;
    for (TopExp_Explorer face(inSolid, TopAbs_FACE); face.More(); face.Next())
      hasSurfaces = hasSurfaces && HasSurface(TopoDS::Face(face.Current()));
    if (isClosed && hasSurfaces) {
      solids_.push_back(inSolid);
      return;
    }
    for (TopExp_Explorer face(inSolid, TopAbs_FACE); face.More(); face.Next())
      AddFree(TopoDS::Face(face.Current()));
  }

  void AddFree(const TopoDS_Face& inFace) {
    if (HasSurface(inFace)) {
      BRep_Builder().Add(free_, inFace);
      ++freeFaces_;
      return;
    }
    TopLoc_Location location;
    const Handle(Poly_Triangulation) mesh = BRep_Tool::Triangulation(inFace, location);
    if (mesh.IsNull()) {
      ++facesWithoutTriangles_;
      return;
    }
    const auto first = static_cast<std::uint32_t>(points_.size());
    for (int i = 1; i <= mesh->NbNodes(); ++i)
      points_.push_back(mesh->Node(i).Transformed(location.Transformation()).XYZ());
    for (int i = 1; i <= mesh->NbTriangles(); ++i) {
      int a = 0, b = 0, c = 0;
      mesh->Triangle(i).Get(a, b, c);
      if (inFace.Orientation() == TopAbs_REVERSED) std::swap(b, c);
      const auto at = [first](int node) { return first + static_cast<std::uint32_t>(node) - 1; };
      triangles_.push_back({at(a), at(b), at(c)});
    }
  }

  /// In formats without solids, faces that enclose a volume once they are sewn together are one.
  void SewFreeFaces() {
    if (freeFaces_ == 0) return;
    BRepBuilderAPI_Sewing sewing(1e-4);
    sewing.Add(free_);
    sewing.Perform();
    const TopoDS_Shape& sewn = sewing.SewedShape();
    BRep_Builder builder;
    TopoDS_Compound open;
    builder.MakeCompound(open);
    bool isOpen = false;
    for (TopExp_Explorer shell(sewn, TopAbs_SHELL); shell.More(); shell.Next()) {
      if (BRep_Tool::IsClosed(shell.Current())) {
        solids_.push_back(shell.Current());
      } else {
        builder.Add(open, shell.Current());
        isOpen = true;
      }
    }
    for (TopExp_Explorer face(sewn, TopAbs_FACE, TopAbs_SHELL); face.More(); face.Next()) {
      builder.Add(open, face.Current());
      isOpen = true;
    }
    if (isOpen) sheets_.push_back(open);
  }

  void AddBody(const TopoDS_Shape& inShape, bool inIsSolid) {
    const BRepMesh_IncrementalMesh meshing(inShape, deflection_, false, angle_, false);
    BodyBuilder builder(inIsSolid);
    for (TopExp_Explorer face(inShape, TopAbs_FACE); face.More(); face.Next())
      if (!builder.Add(TopoDS::Face(face.Current()))) ++facesWithoutTriangles_;
    if (!builder.IsEmpty()) part_.bodies.push_back(builder.Take());
  }

  void AddTriangleBodies() {
    // Such formats have numbers of single precision.
    double largest = 0;
    for (const gp_XYZ& point : points_)
      for (int i = 1; i <= 3; ++i) largest = std::max(largest, std::abs(point.Coord(i)));
    part_.pointPrecision = std::max(part_.pointPrecision, largest * kSinglePrecision);
    for (Body& body : BodiesOfTriangles(points_, triangles_))
      part_.bodies.push_back(std::move(body));
  }

  PartGeometry& part_;
  std::vector<TopoDS_Shape> solids_, sheets_;
  TopoDS_Compound free_;
  int freeFaces_ = 0, facesWithoutTriangles_ = 0;
  double deflection_ = 0, angle_ = 0;
  std::vector<gp_XYZ> points_;
  std::vector<std::array<std::uint32_t, 3>> triangles_;
};

void Read(const Part& inPart, double inMeshSize, PartGeometry& outPart) {
  if (inPart.shape != nullptr && !inPart.shape->IsNull()) {
    const ShapeReading reading(*inPart.shape, inMeshSize, outPart);
    return;
  }
  std::vector<gp_XYZ> points;
  for (const Point& point : inPart.points) points.emplace_back(point[0], point[1], point[2]);
  outPart.bodies = BodiesOfTriangles(points, inPart.triangles);
}

}  // namespace

PartGeometry GeometryOf(const Part& inPart, double inMeshSize) {
  PartGeometry part;
  part.pointPrecision = inPart.pointPrecision;
  try {
    OCC_CATCH_SIGNALS
    Read(inPart, inMeshSize, part);
  } catch (const Standard_Failure& failure) {
    part.problems.push_back({0, {}, part.bodies.empty(), failure.GetMessageString()});
  } catch (const std::exception& error) {
    part.problems.push_back({0, {}, part.bodies.empty(), error.what()});
  }
  for (const Body& body : part.bodies) part.box.Add(body.box);
  if (part.bodies.empty() && part.problems.empty())
    part.problems.push_back({0, {}, true, "no triangles"});
  return part;
}

}  // namespace ZORDetection
