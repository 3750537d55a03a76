// The fields by which records are handed on, under one name each, whatever holds them: JSON, or a
// scripting language's dictionaries.
#ifndef ZOR_TOOLKIT_RECORDS_RECORD_FIELDS_H
#define ZOR_TOOLKIT_RECORDS_RECORD_FIELDS_H

#include <optional>
#include <string>
#include <utility>

#include "toolkit/records/DocumentRecords.h"

namespace ZORToolkit {

/// What makes values of one kind. Derived has: a type Value; Text(string_view), Integer(long long),
/// Real(double), Written(const Number&), Null(); NewObject() and Set(Value& ioObject, const char*
/// inName, Value); NewArray() and Append(Value& ioArray, Value).
template <class Derived>
class FieldMaker {
 public:
  /// From names and values by turns.
  template <class... Fields>
  auto Object(Fields&&... inFields) {
    auto object = Self().NewObject();
    AddFields(object, std::forward<Fields>(inFields)...);
    return object;
  }
  template <class Items, class Make>
  auto Array(const Items& inItems, const Make& inMake) {
    auto array = Self().NewArray();
    for (const auto& item : inItems) Self().Append(array, inMake(item));
    return array;
  }
  template <class Items>  // of records
  auto Records(const Items& inItems) {
    return Array(inItems, [&](const auto& inItem) { return ValueOf(Self(), inItem); });
  }

 private:
  Derived& Self() { return static_cast<Derived&>(*this); }
  template <class Value>
  void AddFields(Value&) {}
  template <class Value, class... Rest>
  void AddFields(Value& ioObject, const char* inName, Value inValue, Rest&&... inRest) {
    Self().Set(ioObject, inName, std::move(inValue));
    AddFields(ioObject, std::forward<Rest>(inRest)...);
  }
};

/// An interference with its stable identifier.
struct IdentifiedRecord {
  const InterferenceRecord& record;
  const std::string& id;
};

template <class Maker>
auto ValueOf(Maker& m, const NumberTriple& inTriple) {
  return m.Array(inTriple, [&](const Number& inNumber) { return m.Written(inNumber); });
}

template <class Maker>
auto ValueOf(Maker& m, const Placement& inPlacement) {
  return m.Array(inPlacement, [&](double inNumber) { return m.Real(inNumber); });
}

template <class Maker>
auto ValueOf(Maker& m, const ProductRecord& inProduct) {
  return m.Object("id", m.Text(inProduct.id), "alias", m.Text(inProduct.alias), "instance",
                  m.Text(inProduct.instance), "label", m.Text(inProduct.label), "alien",
                  m.Text(inProduct.alien), "processMode", m.Text(inProduct.processMode), "shape",
                  m.Text(inProduct.shape), "shapeSource", m.Text(inProduct.shapeSource), "preview",
                  m.Text(inProduct.preview), "position",
                  inProduct.exists ? ValueOf(m, inProduct.placement) : m.Null());
}

template <class Maker>
auto ValueOf(Maker& m, const std::optional<ViewpointRecord>& inViewpoint) {
  if (!inViewpoint) return m.Null();
  return m.Object("projection", m.Text(inViewpoint->projection), "focusDistance",
                  m.Written(inViewpoint->focusDistance), "near", m.Written(inViewpoint->nearPlane),
                  "far", m.Written(inViewpoint->farPlane), "point", ValueOf(m, inViewpoint->point),
                  "sight", ValueOf(m, inViewpoint->sight));
}

template <class Maker>
auto ValueOf(Maker& m, const RuleRecord& inRule) {
  return m.Object("name", m.Text(inRule.name), "clearance", m.Written(inRule.clearance), "severity",
                  m.Text(inRule.severity), "penetrationCandidate",
                  m.Text(inRule.penetrationCandidate));
}

template <class Maker>
auto ValueOf(Maker& m, const IdentifiedRecord& inIdentified) {
  const InterferenceRecord& record = inIdentified.record;
  return m.Object("index", m.Integer(record.index), "id", m.Text(inIdentified.id), "result",
                  m.Text(record.result), "name", m.Text(record.name), "value",
                  m.Written(record.value), "type", m.Text(record.type), "clearance",
                  m.Written(record.clearance), "status", m.Text(record.status), "computationCase",
                  m.Text(record.computationCase), "retrieve", m.Text(record.retrieve), "rule",
                  ValueOf(m, record.rule), "products", m.Records(record.products), "comment",
                  m.Text(record.comment), "picture", m.Text(record.picture), "geometry",
                  m.Object("curveLength", m.Written(record.curveLength), "value",
                           m.Written(record.distance), "points", m.Records(record.points)),
                  "viewpoint", ValueOf(m, record.viewpoint));
}

template <class Maker>
auto ValueOf(Maker& m, const ComponentAttributeRecord& inAttribute) {
  return m.Object("name", m.Text(inAttribute.name), "type", m.Text(inAttribute.type), "value",
                  m.Text(inAttribute.value));
}

template <class Maker>
auto ValueOf(Maker& m, const ShapeRecord& inShape) {
  return m.Object("type", m.Text(inShape.type), "id", m.Text(inShape.id), "name",
                  m.Text(inShape.name), "onDisk", m.Text(inShape.onDisk));
}

template <class Maker>
auto ValueOf(Maker& m, const ResultSetRecord& inSet) {
  return m.Object("name", m.Text(inSet.name), "computationCase", m.Text(inSet.computationCase),
                  "declared", m.Integer(inSet.declared), "found", m.Integer(inSet.found));
}

template <class Maker>
auto ValueOf(Maker& m, const DocumentRecord& inRecord) {
  auto value = m.Object("file", m.Text(inRecord.file), "kind", m.Text(RootName(inRecord.kind)));
  if (inRecord.error) {
    m.Set(
        value, "error",
        m.Object("id", m.Integer(inRecord.error->id), "message", m.Text(inRecord.error->message)));
    return value;
  }
  m.Set(value, "version", m.Text(inRecord.version));
  m.Set(value, "document", m.Text(inRecord.reference));
  m.Set(value, "responsible", m.Text(inRecord.responsible));
  m.Set(value, "results", m.Records(inRecord.results));
  m.Set(value, "interferences", m.Integer(inRecord.interferences));
  m.Set(value, "specifications", m.Integer(inRecord.specifications));
  m.Set(value, "serverMarker", m.Text(inRecord.serverMarker));
  m.Set(value, "transaction", m.Text(inRecord.transaction));
  m.Set(value, "prcName", m.Text(inRecord.prcName));
  if (inRecord.kind == DocumentKind::kComponents)
    m.Set(value, "components", m.Integer(inRecord.components));
  if (inRecord.kind == DocumentKind::kFederator) m.Set(value, "links", m.Integer(inRecord.links));
  return value;
}

template <class Maker>
auto ValueOf(Maker& m, const ComponentRecord& inRecord) {
  return m.Object("position", m.Integer(inRecord.position), "id", m.Text(inRecord.id), "type",
                  m.Text(inRecord.type), "partNumber", m.Text(inRecord.partNumber), "uuid",
                  m.Text(inRecord.uuid), "documentVersion", m.Text(inRecord.documentVersion),
                  "alien", m.Text(inRecord.alien), "attributes", m.Records(inRecord.attributes),
                  "features", m.Records(inRecord.features), "shapes", m.Records(inRecord.shapes),
                  "placement", inRecord.placement ? ValueOf(m, *inRecord.placement) : m.Null());
}

template <class Maker>
auto ValueOf(Maker& m, const SpecifiedProducts& inProducts) {
  return m.Object("alias", m.Text(inProducts.alias), "id", m.Text(inProducts.id), "version",
                  m.Text(inProducts.version), "alien", m.Text(inProducts.alien), "shape",
                  m.Text(inProducts.shape));
}

template <class Maker>
auto ValueOf(Maker& m, const SpecificationRecord& inRecord) {
  return m.Object("index", m.Integer(inRecord.index), "products", m.Records(inRecord.products));
}

template <class Maker>
auto ValueOf(Maker& m, const LinkedProduct& inProduct) {
  return m.Object("name", m.Text(inProduct.name), "id", m.Text(inProduct.id), "url",
                  m.Text(inProduct.url));
}

template <class Maker>
auto ValueOf(Maker& m, const LinkRecord& inRecord) {
  auto value = m.Object("link", m.Text(inRecord.link), "products", m.Records(inRecord.products));
  if (inRecord.check) m.Set(value, "check", m.Text(*inRecord.check));
  return value;
}

}  // namespace ZORToolkit

#endif
