#include "lyra/commands/RecordsJson.h"

#include <nlohmann/json.hpp>

#include "lyra/terminal/SafeText.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

using Json = nlohmann::ordered_json;

Json TextsOf(const NumberTriple& inTriple) {
  return {inTriple[0].text, inTriple[1].text, inTriple[2].text};
}

Json PointsJson(const std::vector<NumberTriple>& inPoints) {
  Json array = Json::array();
  for (const NumberTriple& point : inPoints) array.push_back(TextsOf(point));
  return array;
}

Json ToJson(const ProductRecord& inProduct) {
  return {{"id", inProduct.id},
          {"alias", inProduct.alias},
          {"instance", inProduct.instance},
          {"label", inProduct.label},
          {"alien", inProduct.alien},
          {"processMode", inProduct.processMode},
          {"shape", inProduct.shape},
          {"shapeSource", inProduct.shapeSource},
          {"preview", inProduct.preview},
          {"position", inProduct.exists ? Json(inProduct.placement) : Json(nullptr)}};
}

Json ToJson(const std::optional<ViewpointRecord>& inViewpoint) {
  if (!inViewpoint) return nullptr;
  return {
      {"projection", inViewpoint->projection}, {"focusDistance", inViewpoint->focusDistance.text},
      {"near", inViewpoint->nearPlane.text},   {"far", inViewpoint->farPlane.text},
      {"point", TextsOf(inViewpoint->point)},  {"sight", TextsOf(inViewpoint->sight)}};
}

Json ToJson(const ComponentAttributeRecord& inAttribute) {
  return {{"name", inAttribute.name}, {"type", inAttribute.type}, {"value", inAttribute.value}};
}

Json ToJson(const ShapeRecord& inShape) {
  return {{"type", inShape.type},
          {"id", inShape.id},
          {"name", inShape.name},
          {"onDisk", inShape.onDisk}};
}

Json ToJson(const ResultSetRecord& inSet) {
  return {{"name", inSet.name},
          {"computationCase", inSet.computationCase},
          {"declared", inSet.declared},
          {"found", inSet.found}};
}

Json ToJson(const SpecifiedProducts& inProducts) {
  return {{"alias", inProducts.alias},
          {"id", inProducts.id},
          {"version", inProducts.version},
          {"alien", inProducts.alien},
          {"shape", inProducts.shape}};
}

Json ToJson(const LinkedProduct& inProduct) {
  return {{"name", inProduct.name}, {"id", inProduct.id}, {"url", inProduct.url}};
}

Json ToJson(const BcfTopic& inTopic) {
  return {{"guid", inTopic.guid},
          {"title", inTopic.title},
          {"comments", inTopic.comments.size()},
          {"viewpoints", inTopic.viewpoints.size()},
          {"snapshots", inTopic.Snapshots()}};
}

template <class Records>
Json ArrayJson(const Records& inRecords) {
  Json array = Json::array();
  for (const auto& record : inRecords) array.push_back(ToJson(record));
  return array;
}

Json ToJson(const IdentifiedRecord& inIdentified) {
  const InterferenceRecord& record = inIdentified.record;
  return {{"index", record.index},
          {"id", inIdentified.id},
          {"result", record.result},
          {"name", record.name},
          {"value", record.value.text},
          {"type", record.type},
          {"clearance", record.clearance.text},
          {"status", record.status},
          {"computationCase", record.computationCase},
          {"retrieve", record.retrieve},
          {"rule",
           {{"name", record.rule.name},
            {"clearance", record.rule.clearance.text},
            {"severity", record.rule.severity},
            {"penetrationCandidate", record.rule.penetrationCandidate}}},
          {"products", ArrayJson(record.products)},
          {"comment", record.comment},
          {"picture", record.picture},
          {"geometry",
           {{"curveLength", record.curveLength.text},
            {"value", record.distance.text},
            {"points", PointsJson(record.points)}}},
          {"viewpoint", ToJson(record.viewpoint)}};
}

Json ToJson(const DocumentRecord& inRecord) {
  Json json = {{"file", inRecord.file}, {"kind", RootName(inRecord.kind)}};
  if (inRecord.error) {
    json["error"] = {{"id", inRecord.error->id}, {"message", inRecord.error->message}};
    return json;
  }
  json["version"] = inRecord.version;
  json["document"] = inRecord.reference;
  json["responsible"] = inRecord.responsible;
  json["results"] = ArrayJson(inRecord.results);
  json["interferences"] = inRecord.interferences;
  json["specifications"] = inRecord.specifications;
  json["serverMarker"] = inRecord.serverMarker;
  json["transaction"] = inRecord.transaction;
  json["prcName"] = inRecord.prcName;
  if (inRecord.kind == DocumentKind::kComponents) json["components"] = inRecord.components;
  if (inRecord.kind == DocumentKind::kFederator) json["links"] = inRecord.links;
  return json;
}

Json ToJson(const ComponentRecord& inRecord) {
  return {{"position", inRecord.position},
          {"id", inRecord.id},
          {"type", inRecord.type},
          {"partNumber", inRecord.partNumber},
          {"uuid", inRecord.uuid},
          {"documentVersion", inRecord.documentVersion},
          {"alien", inRecord.alien},
          {"attributes", ArrayJson(inRecord.attributes)},
          {"features", ArrayJson(inRecord.features)},
          {"shapes", ArrayJson(inRecord.shapes)},
          {"placement", inRecord.placement ? Json(*inRecord.placement) : Json(nullptr)}};
}

Json ToJson(const SpecificationRecord& inRecord) {
  return {{"index", inRecord.index}, {"products", ArrayJson(inRecord.products)}};
}

Json ToJson(const LinkRecord& inRecord) {
  Json json = {{"link", inRecord.link}, {"products", ArrayJson(inRecord.products)}};
  if (inRecord.check) json["check"] = *inRecord.check;
  return json;
}

Json ToJson(const ModelProductRecord& inRecord) {
  Json json = Json::object();
  if (inRecord.path) json["path"] = *inRecord.path;
  json["alias"] = inRecord.alias;
  json["part"] = inRecord.part;
  json["placement"] = inRecord.placement;
  json["triangles"] = inRecord.triangles;
  json["colour"] = inRecord.colour ? Json(*inRecord.colour) : Json(nullptr);
  return json;
}

std::string LineOf(const Json& inValue) {
  return EscapedForJson(inValue.dump(-1, ' ', false, Json::error_handler_t::replace));
}

}  // namespace

std::string JsonText(const IdentifiedRecord& inRecord) { return LineOf(ToJson(inRecord)); }
std::string JsonText(const DocumentRecord& inRecord) { return LineOf(ToJson(inRecord)); }
std::string JsonText(const ComponentRecord& inRecord) { return LineOf(ToJson(inRecord)); }
std::string JsonText(const SpecificationRecord& inRecord) { return LineOf(ToJson(inRecord)); }
std::string JsonText(const LinkRecord& inRecord) { return LineOf(ToJson(inRecord)); }
std::string JsonText(const ModelProductRecord& inRecord) { return LineOf(ToJson(inRecord)); }
std::string JsonText(const BcfProject& inProject) {
  return LineOf({{"version", inProject.version}, {"topics", ArrayJson(inProject.topics)}});
}

JsonArray::JsonArray(Output& ioOutput) : output_(ioOutput) { output_.Write("["); }

void JsonArray::AddText(const std::string& inText) {
  output_.Write(isEmpty_ ? "\n" : ",\n");
  output_.Write(inText);
  isEmpty_ = false;
}

void JsonArray::Finish() { output_.Write(isEmpty_ ? "]" : "\n]"); }

}  // namespace lyra
