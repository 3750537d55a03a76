#include "lyra/commands/RecordsJson.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "foundation/Utf8.h"
#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/JsonFields.h"
#include "lyra/terminal/SafeText.h"

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

/// The text of JsonLine(JsonOf(record)), written at once: a document has too many records to make
/// and take apart a tree of values for each.
class JsonTextFields : public FieldMaker<JsonTextFields> {
 public:
  struct Value {
    std::string text;
  };

  Value Text(std::string_view inText) {
    bool isAscii = true, hasEscape = false;
    for (const char byte : inText) {
      isAscii = isAscii && static_cast<unsigned char>(byte) < 0x7F;
      hasEscape =
          hasEscape || static_cast<unsigned char>(byte) < ' ' || byte == '"' || byte == '\\';
    }
    if (hasEscape || !(isAscii || ZORFoundation::IsUtf8(inText))) return {JsonLine(inText)};
    std::string quoted;
    quoted.reserve(inText.size() + 2);
    quoted.append(1, '"').append(inText).append(1, '"');
    return {isAscii ? std::move(quoted) : EscapedForJson(std::move(quoted))};
  }
  Value Integer(long long inNumber) { return {std::to_string(inNumber)}; }
  Value Real(double inNumber) {
    constexpr double kMaxPlain = 1e15;  // from there on with an exponent
    if (!(std::abs(inNumber) < kMaxPlain) || inNumber != std::trunc(inNumber))
      return {JsonLine(inNumber)};
    std::string text(std::signbit(inNumber) ? "-" : "");
    text.append(std::to_string(static_cast<long long>(std::abs(inNumber)))).append(".0");
    return {std::move(text)};
  }
  Value Written(const Number& inNumber) { return Text(inNumber.text); }
  Value Null() { return {"null"}; }
  Value NewObject() { return {"{}"}; }
  Value NewArray() { return {"[]"}; }
  void Set(Value& ioObject, const char* inName, const Value& inValue) {
    Reopen(ioObject.text);
    ioObject.text.append(1, '"').append(inName).append("\":").append(inValue.text).append(1, '}');
  }
  void Append(Value& ioArray, const Value& inValue) {
    Reopen(ioArray.text);
    ioArray.text.append(inValue.text).append(1, ']');
  }

 private:
  static void Reopen(std::string& ioText) {
    ioText.pop_back();
    if (ioText.size() > 1) ioText += ',';
  }
};

template <class Record>
std::string TextOf(const Record& inRecord) {
  JsonTextFields fields;
  return ValueOf(fields, inRecord).text;
}

}  // namespace

std::string JsonText(const IdentifiedRecord& inRecord) { return TextOf(inRecord); }
std::string JsonText(const DocumentRecord& inRecord) { return TextOf(inRecord); }
std::string JsonText(const ComponentRecord& inRecord) { return TextOf(inRecord); }
std::string JsonText(const SpecificationRecord& inRecord) { return TextOf(inRecord); }
std::string JsonText(const LinkRecord& inRecord) { return TextOf(inRecord); }
std::string JsonText(const InterferenceGroup& inGroup) { return TextOf(inGroup); }
std::string JsonText(const IdentifiedEntry& inEntry) { return TextOf(inEntry); }
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
