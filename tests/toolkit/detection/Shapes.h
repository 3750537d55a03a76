// Small shapes for tests of the detection, and its answer for two of them.
#ifndef ZOR_TESTS_TOOLKIT_DETECTION_SHAPES_H
#define ZOR_TESTS_TOOLKIT_DETECTION_SHAPES_H

#include <BRepAlgoAPI_Cut.hxx>
#include <BRepBuilderAPI_Copy.hxx>
#include <BRepBuilderAPI_NurbsConvert.hxx>
#include <BRepBuilderAPI_Transform.hxx>
#include <BRepPrimAPI_MakeBox.hxx>
#include <BRepPrimAPI_MakeCone.hxx>
#include <BRepPrimAPI_MakeCylinder.hxx>
#include <BRepPrimAPI_MakeSphere.hxx>
#include <BRepPrimAPI_MakeTorus.hxx>
#include <BRep_Builder.hxx>
#include <TopExp_Explorer.hxx>
#include <TopoDS.hxx>
#include <TopoDS_Compound.hxx>
#include <TopoDS_Shell.hxx>
#include <gp_Ax1.hxx>
#include <gp_Ax2.hxx>
#include <optional>
#include <vector>

#include "toolkit/detection/kernel/FindInterferences.h"

namespace ZORDetection::Shapes {

inline TopoDS_Shape Block(double x, double y, double z, double dx, double dy, double dz) {
  return BRepPrimAPI_MakeBox(gp_Pnt(x, y, z), dx, dy, dz).Shape();
}

inline TopoDS_Shape Cube(double x, double y, double z, double size = 10) {
  return Block(x, y, z, size, size, size);
}

inline TopoDS_Shape Rod(gp_Pnt start, gp_Dir direction, double radius, double length) {
  return BRepPrimAPI_MakeCylinder(gp_Ax2(start, direction), radius, length).Shape();
}

inline TopoDS_Shape Ball(double x, double y, double z, double radius) {
  return BRepPrimAPI_MakeSphere(gp_Pnt(x, y, z), radius).Shape();
}

inline TopoDS_Shape Minus(const TopoDS_Shape& a, const TopoDS_Shape& b) {
  return BRepAlgoAPI_Cut(a, b).Shape();
}

inline TopoDS_Shape Transformed(const TopoDS_Shape& shape, const gp_Trsf& motion) {
  return BRepBuilderAPI_Transform(shape, motion, true).Shape();
}

inline TopoDS_Shape Shifted(const TopoDS_Shape& shape, double x, double y, double z) {
  gp_Trsf motion;
  motion.SetTranslation(gp_Vec(x, y, z));
  return Transformed(shape, motion);
}

inline TopoDS_Shape Turned(const TopoDS_Shape& shape, gp_Pnt centre, gp_Dir axis, double angle) {
  gp_Trsf motion;
  motion.SetRotation(gp_Ax1(centre, axis), angle);
  return Transformed(shape, motion);
}

inline TopoDS_Shape Together(const std::vector<TopoDS_Shape>& shapes) {
  TopoDS_Compound all;
  BRep_Builder builder;
  builder.MakeCompound(all);
  for (const TopoDS_Shape& shape : shapes) builder.Add(all, shape);
  return all;
}

inline TopoDS_Shape AsNurbs(const TopoDS_Shape& shape) {
  return BRepBuilderAPI_NurbsConvert(shape).Shape();
}

/// A block without its upper face: a surface that encloses nothing.
inline TopoDS_Shape OpenBox(double x, double y, double z, double dx, double dy, double dz) {
  BRepPrimAPI_MakeBox box(gp_Pnt(x, y, z), dx, dy, dz);
  TopoDS_Shell shell;
  BRep_Builder builder;
  builder.MakeShell(shell);
  for (TopExp_Explorer face(box.Shape(), TopAbs_FACE); face.More(); face.Next())
    if (!face.Current().IsSame(box.TopFace())) builder.Add(shell, face.Current());
  return shell;
}

inline Findings FindIn(const std::vector<TopoDS_Shape>& shapes, const Options& options = {}) {
  std::vector<Part> parts;
  std::vector<Product> products;
  for (const TopoDS_Shape& shape : shapes) {
    Part part;
    part.shape = &shape;
    products.push_back(
        {static_cast<std::uint32_t>(parts.size()), {{{1, 0, 0, 0}, {0, 1, 0, 0}, {0, 0, 1, 0}}}});
    parts.push_back(part);
  }
  return FindInterferences(parts, products, options);
}

}  // namespace ZORDetection::Shapes

#endif
