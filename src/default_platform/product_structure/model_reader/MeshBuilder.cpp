#include "default_platform/product_structure/model_reader/MeshBuilder.h"

#include <BRep_Tool.hxx>
#include <Poly_Polygon3D.hxx>
#include <Poly_PolygonOnTriangulation.hxx>
#include <TopExp.hxx>
#include <TopTools_IndexedDataMapOfShapeListOfShape.hxx>
#include <TopTools_ListOfShape.hxx>
#include <TopoDS.hxx>
#include <TopoDS_Edge.hxx>
#include <TopoDS_Face.hxx>
#include <algorithm>
#include <cmath>
#include <numeric>

namespace ZORDefault {
namespace {

constexpr double kCreaseCosine = 0.8660254037844386;  // 30 degrees

/// @return a number per point, equal for coincident points.
std::vector<std::uint32_t> WeldPoints(const std::vector<gp_XYZ>& inPoints) {
  const auto key = [&](std::uint32_t point) {
    const gp_XYZ& at = inPoints[point];
    return std::array<double, 3>{at.X(), at.Y(), at.Z()};
  };
  std::vector<std::uint32_t> order(inPoints.size());
  std::iota(order.begin(), order.end(), 0u);
  std::ranges::sort(order, [&](std::uint32_t a, std::uint32_t b) { return key(a) < key(b); });
  std::vector<std::uint32_t> places(inPoints.size());
  std::uint32_t place = 0;
  for (std::size_t i = 0; i < order.size(); ++i) {
    if (i > 0 && key(order[i]) != key(order[i - 1])) ++place;
    places[order[i]] = place;
  }
  return places;
}

struct Corner {
  std::uint32_t place;
  std::uint32_t triangle;
  double angle;
};

double AngleAt(const TriangleSoup& inMesh, const Triangle& inTriangle, std::size_t inCorner) {
  const gp_XYZ& at = inMesh.points[inTriangle[inCorner]];
  const gp_XYZ one = UnitOf(inMesh.points[inTriangle[(inCorner + 1) % 3]] - at);
  const gp_XYZ two = UnitOf(inMesh.points[inTriangle[(inCorner + 2) % 3]] - at);
  return std::acos(std::clamp(one.Dot(two), -1.0, 1.0));
}

/// All corners, sorted by place.
std::vector<Corner> CornersOf(const TriangleSoup& inMesh,
                              const std::vector<std::uint32_t>& inPlaces) {
  std::vector<Corner> corners;
  for (std::uint32_t t = 0; t < inMesh.triangles.size(); ++t)
    for (std::size_t c = 0; c < 3; ++c)
      corners.push_back(
          {inPlaces[inMesh.triangles[t][c]], t, AngleAt(inMesh, inMesh.triangles[t], c)});
  std::ranges::stable_sort(corners, {}, &Corner::place);
  return corners;
}

class Creaser {
 public:
  Creaser(const TriangleSoup& inMesh, MeshBuilder& ioBuilder)
      : mesh_(inMesh), builder_(ioBuilder), places_(WeldPoints(inMesh.points)) {
    for (const Triangle& triangle : mesh_.triangles)
      faceNormals_.push_back(UnitOf(AreaNormal(mesh_.points[triangle[0]], mesh_.points[triangle[1]],
                                               mesh_.points[triangle[2]])));
  }

  void AddTriangles() {
    const bool hasAllNormals = std::ranges::all_of(
        mesh_.normals, [](const gp_XYZ& normal) { return normal.SquareModulus() > 0; });
    if (!hasAllNormals) IndexCorners();
    for (std::uint32_t t = 0; t < mesh_.triangles.size(); ++t) {
      Triangle corners;
      for (std::size_t c = 0; c < 3; ++c) corners[c] = AddCorner(t, mesh_.triangles[t][c]);
      builder_.triangles.push_back(corners);
      builder_.triangleColours.push_back(mesh_.triangleColours[t]);
    }
  }

  void AddEdges() {
    struct Side {
      std::uint32_t low, high, triangle;
      std::uint32_t from, to;
    };
    std::vector<Side> sides;
    for (std::uint32_t t = 0; t < mesh_.triangles.size(); ++t) {
      for (std::size_t c = 0; c < 3; ++c) {
        const std::uint32_t from = mesh_.triangles[t][c], to = mesh_.triangles[t][(c + 1) % 3];
        const auto [low, high] = std::minmax(places_[from], places_[to]);
        if (low != high) sides.push_back({low, high, t, from, to});
      }
    }
    const auto key = [](const Side& side) { return std::pair(side.low, side.high); };
    std::ranges::stable_sort(sides, {}, key);
    for (auto first = sides.begin(); first != sides.end();) {
      const auto last = std::find_if(first, sides.end(),
                                     [&](const Side& side) { return key(side) != key(*first); });
      const bool isSmooth =
          last - first == 2 && AreSmooth(first->triangle, std::next(first)->triangle);
      if (!isSmooth) builder_.edges.push_back({mesh_.points[first->from], mesh_.points[first->to]});
      first = last;
    }
  }

 private:
  void IndexCorners() {
    corners_ = CornersOf(mesh_, places_);
    for (std::size_t i = 0; i < corners_.size(); ++i) {
      if (corners_[i].place >= firstCorners_.size()) firstCorners_.resize(corners_[i].place + 1, i);
    }
    made_.resize(places_.size());
  }

  bool AreSmooth(std::uint32_t inOne, std::uint32_t inTwo) const {
    return faceNormals_[inOne].Dot(faceNormals_[inTwo]) >= kCreaseCosine;
  }

  gp_XYZ MeanNormal(std::uint32_t inTriangle, std::uint32_t inPoint) const {
    gp_XYZ sum(0, 0, 0);
    const std::uint32_t place = places_[inPoint];
    for (std::size_t i = firstCorners_[place]; i < corners_.size() && corners_[i].place == place;
         ++i)
      if (AreSmooth(inTriangle, corners_[i].triangle))
        sum += faceNormals_[corners_[i].triangle] * corners_[i].angle;
    return sum.SquareModulus() > 0 ? UnitOf(sum) : faceNormals_[inTriangle];
  }

  /// Corners of one point share a vertex when their normals are equal.
  std::uint32_t AddCorner(std::uint32_t inTriangle, std::uint32_t inPoint) {
    const bool isGiven = mesh_.normals[inPoint].SquareModulus() > 0;
    const gp_XYZ normal =
        isGiven ? UnitOf(mesh_.normals[inPoint]) : MeanNormal(inTriangle, inPoint);
    if (made_.size() < mesh_.points.size()) made_.resize(mesh_.points.size());
    std::vector<std::uint32_t>& made = made_[inPoint];
    for (const std::uint32_t point : made)
      if (builder_.normals[point].IsEqual(normal, 1e-12)) return point;
    made.push_back(static_cast<std::uint32_t>(builder_.points.size()));
    builder_.points.push_back(mesh_.points[inPoint]);
    builder_.normals.push_back(normal);
    return made.back();
  }

  const TriangleSoup& mesh_;
  MeshBuilder& builder_;
  std::vector<std::uint32_t> places_;
  std::vector<gp_XYZ> faceNormals_;
  std::vector<Corner> corners_;
  std::vector<std::size_t> firstCorners_;         // by place
  std::vector<std::vector<std::uint32_t>> made_;  // new points, by old point
};

constexpr double kTangentCosine = 0.9990482;  // 2.5 degrees

typedef std::vector<std::uint32_t> Nodes;  // indices in the builder, along the edge

class EdgeDrawer {
 public:
  EdgeDrawer(const TopTools_IndexedMapOfShape& inFaces,
             const std::vector<std::uint32_t>& inFirstPoints, MeshBuilder& ioBuilder)
      : faces_(inFaces), firstPoints_(inFirstPoints), builder_(ioBuilder) {}

  void Draw(const TopoDS_Edge& inEdge, const TopTools_ListOfShape& inAncestors) {
    if (BRep_Tool::Degenerated(inEdge)) return;
    std::vector<Nodes> lines;
    TopTools_IndexedMapOfShape seen;
    for (const TopoDS_Shape& face : inAncestors) {
      if (seen.Contains(face)) continue;
      seen.Add(face);
      if (BRep_Tool::IsClosed(inEdge, TopoDS::Face(face))) return;
      Nodes nodes = NodesOn(inEdge, TopoDS::Face(face));
      if (!nodes.empty()) lines.push_back(std::move(nodes));
    }
    if (lines.empty() || (lines.size() == 2 && AreTangent(lines[0], lines[1]))) return;
    Polyline line;
    for (const std::uint32_t node : lines[0]) line.push_back(builder_.points[node]);
    builder_.edges.push_back(std::move(line));
  }

 private:
  Nodes NodesOn(const TopoDS_Edge& inEdge, const TopoDS_Face& inFace) const {
    const int position = faces_.FindIndex(inFace);
    if (position < 1) return {};
    const std::uint32_t first = firstPoints_[static_cast<std::size_t>(position) - 1];
    if (first == kNoPoints) return {};
    TopLoc_Location location;
    const Handle(Poly_Triangulation) triangles = BRep_Tool::Triangulation(inFace, location);
    const Handle(Poly_PolygonOnTriangulation) polygon =
        BRep_Tool::PolygonOnTriangulation(inEdge, triangles, location);
    if (polygon.IsNull()) return {};
    Nodes nodes;
    for (int i = 1; i <= polygon->NbNodes(); ++i)
      nodes.push_back(first + static_cast<std::uint32_t>(polygon->Node(i)) - 1);
    return nodes;
  }

  /// Both polygons have the same points in the same order.
  bool AreTangent(const Nodes& inOne, const Nodes& inTwo) const {
    return inOne.size() == inTwo.size() &&
           std::ranges::equal(inOne, inTwo, [&](std::uint32_t a, std::uint32_t b) {
             return builder_.normals[a].Dot(builder_.normals[b]) >= kTangentCosine;
           });
  }

  const TopTools_IndexedMapOfShape& faces_;
  const std::vector<std::uint32_t>& firstPoints_;
  MeshBuilder& builder_;
};

void AddFreeCurve(const TopoDS_Edge& inEdge, MeshBuilder& ioBuilder) {
  TopLoc_Location location;
  const Handle(Poly_Polygon3D) polygon = BRep_Tool::Polygon3D(inEdge, location);
  if (polygon.IsNull()) return;
  Polyline line;
  for (gp_Pnt point : polygon->Nodes())
    line.push_back(point.Transformed(location.Transformation()).XYZ());
  ioBuilder.edges.push_back(std::move(line));
}

}  // namespace

void AddCreasedMesh(const TriangleSoup& inMesh, MeshBuilder& ioBuilder) {
  Creaser creaser(inMesh, ioBuilder);
  creaser.AddTriangles();
  creaser.AddEdges();
}

void AddSurfaceEdges(const TopoDS_Shape& inShape, const TopTools_IndexedMapOfShape& inFaces,
                     const std::vector<std::uint32_t>& inFirstPoints, MeshBuilder& ioBuilder) {
  TopTools_IndexedDataMapOfShapeListOfShape edges;
  TopExp::MapShapesAndAncestors(inShape, TopAbs_EDGE, TopAbs_FACE, edges);
  EdgeDrawer drawer(inFaces, inFirstPoints, ioBuilder);
  for (int i = 1; i <= edges.Extent(); ++i) {
    const TopoDS_Edge& edge = TopoDS::Edge(edges.FindKey(i));
    if (inFaces.IsEmpty())
      AddFreeCurve(edge, ioBuilder);
    else
      drawer.Draw(edge, edges.FindFromIndex(i));
  }
}

}  // namespace ZORDefault
