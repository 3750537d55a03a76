#include "default_platform/product_structure/model_reader/SurfaceEdges.h"

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

namespace ZORDefault {
namespace {

constexpr double kTangentCosine = 0.9990482;  // 2.5 degrees

typedef std::vector<std::uint32_t> Nodes;  // positions in the builder, along the edge

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

  /// Both faces have the edge's points in the same order.
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
