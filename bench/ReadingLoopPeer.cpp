// The answers of the reading loop, worked out by hand over pugixml: the hash that the loop must
// have, and what a loop costs that knows its one purpose.
#include <bit>
#include <cstdlib>
#include <stdexcept>

#include "Measurement.h"
#include "PugixmlTree.h"

namespace {
using pugi::xml_node;
using Text = std::string_view;

Text Attribute(const xml_node& inNode, const char* inName) {
  return inNode.attribute(inName).value();
}

std::string Number(const xml_node& inNode, const char* inName) {
  std::string text(Attribute(inNode, inName));
  if (const auto comma = text.find(','); comma != std::string::npos) text[comma] = '.';
  return text;
}

Text LastSegment(Text inPath) {
  constexpr Text kSeparator = " --++-- ";
  const auto at = inPath.rfind(kSeparator);
  return at == Text::npos ? inPath : inPath.substr(at + kSeparator.size());
}

template <class Visit>
void ForEachInterference(const xml_node& inRoot, const Visit& inVisit) {
  for (const xml_node set : inRoot.children("ClashResult"))
    for (const xml_node interference : set.children("Interference")) inVisit(interference);
}

template <class Sink>
void AddGeneral(const xml_node& inRoot, Sink& ioSink) {
  ioSink.Add(Attribute(inRoot, "Version"));
  ioSink.Add(Attribute(inRoot, "ZORDocument"));
  ioSink.Add(Attribute(inRoot, "Responsible"));
  ioSink.Add(std::uint64_t{inRoot.child("ClashResult").attribute("NbInterf").as_uint()});
}

template <class Sink>
void AddShort(const xml_node& inRoot, Sink& ioSink) {
  ForEachInterference(inRoot, [&](const xml_node& inInterference) {
    const xml_node first = inInterference.child("Product");
    ioSink.Add(Attribute(inInterference, "Value"));
    ioSink.Add(Attribute(inInterference, "ResultType"));
    ioSink.Add(Attribute(inInterference.child("ViolatedRule"), "Name"));
    ioSink.Add(Attribute(first, "Alias"));
    ioSink.Add(Attribute(first.next_sibling("Product"), "Alias"));
  });
}

Text Instance(const xml_node& inProduct) {
  return Attribute(inProduct, "ProcessMode") == "KORVAPDM"
             ? Attribute(inProduct, "Alias")
             : LastSegment(Attribute(inProduct, "DescriptionID"));
}

std::string Points(const xml_node& inGeometry) {
  std::string points;
  for (const xml_node point : inGeometry.children("Point"))
    for (const char* name : {"Ux", "Uy", "Uz"})
      points.append(points.empty() ? "" : "/").append(Number(point, name));
  return points;
}

template <class Sink>
void AddNumbers(const xml_node& inNode, std::initializer_list<const char*> inNames, Sink& ioSink) {
  for (const char* name : inNames) ioSink.Add(Text(Number(inNode, name)));
}

template <class Sink>
void AddViewpoint(const xml_node& inViewpoint, Sink& ioSink) {
  ioSink.Add(Attribute(inViewpoint, "FocusDistance"));
  AddNumbers(inViewpoint, {"NearPlane", "FarPlane"}, ioSink);
  ioSink.Add(inViewpoint ? Attribute(inViewpoint, "ProjectionType") : "NOVIEWPOINT");
  AddNumbers(inViewpoint.child("Point"), {"Ux", "Uy", "Uz"}, ioSink);
  AddNumbers(inViewpoint.child("Vector"), {"Vx", "Vy", "Vz"}, ioSink);
  for (int i = 0; i < 3; ++i) ioSink.Add(Text());  // the second vector, which nothing fills
}

template <class Sink>
void AddFull(const xml_node& inRoot, Sink& ioSink) {
  ForEachInterference(inRoot, [&](const xml_node& inInterference) {
    const xml_node set = inInterference.parent();
    const xml_node rule = inInterference.child("ViolatedRule");
    const xml_node products[] = {inInterference.child("Product"),
                                 inInterference.child("Product").next_sibling("Product")};
    const xml_node geometry = inInterference.child("GeometricAspect");
    const auto addBoth = [&](const char* inName) {
      for (const xml_node& product : products) ioSink.Add(Attribute(product, inName));
    };
    ioSink.Add(Attribute(set, "Name"));
    ioSink.Add(Attribute(inInterference, "ResultTypeNoNLS"));
    ioSink.Add(
        Text(rule ? Number(rule, "Clearance") : Number(inInterference, "DistanceClearance")));
    ioSink.Add(Attribute(inInterference, "Status"));
    ioSink.Add(rule ? Attribute(rule, "TypeCalc") : Attribute(set, "ComputationCase"));
    ioSink.Add(Attribute(inInterference, "RetrieveInf"));
    ioSink.Add(Attribute(rule, "Name"));
    AddNumbers(rule, {"Clearance"}, ioSink);
    addBoth("DescriptionID");
    addBoth("ProcessMode");
    ioSink.Add(Attribute(inInterference.child("Comment"), "Value"));
    addBoth("Alien");
    addBoth("DescriptionID");
    for (const xml_node& product : products) ioSink.Add(Instance(product));
    addBoth("ShapeName");
    addBoth("ShapeSource");
    ioSink.Add(Attribute(rule, "Severity"));
    ioSink.Add(Attribute(rule, "PenetrationCandidate"));
    AddNumbers(geometry, {"IntersectCurveLength", "ExtractOrDistValue"}, ioSink);
    ioSink.Add(Text());  // reserved
    ioSink.Add(Text(Points(geometry)));
    AddViewpoint(geometry.child("Viewpoint"), ioSink);
  });
}

template <class Sink>
void AddCopies(const xml_node& inRoot, Sink& ioSink) {
  ForEachInterference(inRoot, [&](const xml_node& inInterference) {
    pugi::xml_document scratch;
    const xml_node copy = scratch.append_copy(inInterference);
    const xml_node first = inInterference.child("Product");
    const xml_node second = first.next_sibling("Product");
    for (const xml_node& product : {first, second})
      ioSink.Add(Text(std::string(LastSegment(Attribute(product, "Alias")))
                          .append(" -- ")
                          .append(Attribute(product, "ShapeName"))));
    for (const xml_node& product : {first, second}) ioSink.Add(Attribute(product, "Preview"));
    ioSink.Add(Attribute(copy, "Name"));
    std::uint64_t children = 0;
    for (xml_node child = copy.first_child(); child; child = child.next_sibling()) ++children;
    ioSink.Add(children);
  });
}

template <class Sink>
void AddSpecifications(const xml_node& inRoot, Sink& ioSink) {
  for (const xml_node products : inRoot.children("ProductsInSpec"))
    for (const xml_node specification : products.children("Specification"))
      for (const char* name : {"Alias", "DisplayableID", "DocumentVersion", "Alien", "ShapeName"})
        for (const char* set : {"ProdListe1", "ProdListe2"})
          ioSink.Add(Attribute(specification.child(set), name));
}

template <class Sink>
void AddComponents(const xml_node& inRoot, Sink& ioSink) {
  for (const xml_node component : inRoot.children("Component")) {
    const xml_node attributes = component.child("ComponentAttributes");
    for (const char* name : {"Alias", "ComponentType", "PartNumber"})
      ioSink.Add(Attribute(component, name));
    ioSink.Add(Attribute(
        attributes.find_child_by_attribute("ComponentAttribute", "Name", "Supplier"), "AttrValue"));
    for (const xml_node attribute : attributes.children("ComponentAttribute"))
      if (Attribute(attribute, "AttrType") != "Feature")
        for (const char* name : {"Name", "AttrType", "AttrValue"})
          ioSink.Add(Attribute(attribute, name));
    for (const xml_node shape : component.child("ComponentShapes").children("ComponentShape"))
      ioSink.Add(Attribute(shape, "ShapeName"));
    for (const char* triple : {"Rx", "Ry", "Rz", "T"})
      for (const char* name : {"Ux", "Uy", "Uz"})
        ioSink.Add(std::bit_cast<std::uint64_t>(std::strtod(
            component.child("ShapePosition").child(triple).attribute(name).value(), nullptr)));
  }
}

struct Loop {
  const char* name;
  void (*timed)(const xml_node& inRoot, LengthSum& ioSink);
  void (*hashed)(const xml_node& inRoot, ResultHash& ioSink);
};
constexpr Loop kClashLoops[] = {
    {"general", AddGeneral<LengthSum>, AddGeneral<ResultHash>},
    {"short", AddShort<LengthSum>, AddShort<ResultHash>},
    {"full", AddFull<LengthSum>, AddFull<ResultHash>},
    {"copy", AddCopies<LengthSum>, AddCopies<ResultHash>},
    {"specifications", AddSpecifications<LengthSum>, AddSpecifications<ResultHash>}};

void Load(const std::string& inPath, pugi::xml_document& outDocument) {
  const pugi::xml_parse_result result = outDocument.load_file(inPath.c_str(), kPugixmlOptions);
  if (!result) throw std::runtime_error(result.description());
}

std::uint64_t HashOf(const xml_node& inRoot, void (*inAdd)(const xml_node&, ResultHash&)) {
  ResultHash hash;
  inAdd(inRoot, hash);
  return hash.Value();
}
}  // namespace

Steps LoopWithPugixml(const Arguments& inArguments) {
  Steps steps;
  pugi::xml_document clashes, components;
  LengthSum lengths;
  TimeStep("load", steps, [&] { Load(inArguments.at(0), clashes); });
  const xml_node root = clashes.document_element();
  for (const Loop& loop : kClashLoops)
    TimeStep(loop.name, steps, [&] { loop.timed(root, lengths); });
  TimeStep("load components", steps, [&] { Load(inArguments.at(1), components); });
  const xml_node componentsRoot = components.document_element();
  TimeStep("components", steps, [&] { AddComponents(componentsRoot, lengths); });

  std::size_t step = 1;
  for (const Loop& loop : kClashLoops) steps[step++].hash = HashOf(root, loop.hashed);
  steps.back().hash = HashOf(componentsRoot, AddComponents<ResultHash>);
  return steps;
}
