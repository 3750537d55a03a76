#include "lyra/commands/RecordsJson.h"

#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/JsonFields.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

using Json = OrderedJson;

Json ToJson(const BcfTopic& inTopic) {
  return {{"guid", inTopic.guid},
          {"title", inTopic.title},
          {"type", inTopic.type},
          {"status", inTopic.status},
          {"comments", inTopic.comments.size()},
          {"viewpoints", inTopic.viewpoints.size()},
          {"snapshots", inTopic.Snapshots()}};
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

}  // namespace

std::string JsonText(const IdentifiedRecord& inRecord) { return JsonLine(JsonOf(inRecord)); }
std::string JsonText(const DocumentRecord& inRecord) { return JsonLine(JsonOf(inRecord)); }
std::string JsonText(const ComponentRecord& inRecord) { return JsonLine(JsonOf(inRecord)); }
std::string JsonText(const SpecificationRecord& inRecord) { return JsonLine(JsonOf(inRecord)); }
std::string JsonText(const LinkRecord& inRecord) { return JsonLine(JsonOf(inRecord)); }
std::string JsonText(const ModelProductRecord& inRecord) { return JsonLine(ToJson(inRecord)); }
std::string JsonText(const BcfProject& inProject) {
  Json topics = Json::array();
  for (const BcfTopic& topic : inProject.topics) topics.push_back(ToJson(topic));
  return JsonLine({{"version", inProject.version},
                   {"project", {{"guid", inProject.guid}, {"name", inProject.name}}},
                   {"topics", std::move(topics)}});
}

JsonArray::JsonArray(Output& ioOutput) : output_(ioOutput) { output_.Write("["); }

void JsonArray::AddText(const std::string& inText) {
  output_.Write(isEmpty_ ? "\n" : ",\n");
  output_.Write(inText);
  isEmpty_ = false;
}

void JsonArray::Finish() { output_.Write(isEmpty_ ? "]" : "\n]"); }

}  // namespace lyra
