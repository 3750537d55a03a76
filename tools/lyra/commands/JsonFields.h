// Records' fields as JSON.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_JSON_FIELDS_H
#define ZOR_TOOLS_LYRA_COMMANDS_JSON_FIELDS_H

#include <nlohmann/json.hpp>
#include <string_view>
#include <utility>

#include "toolkit/records/RecordFields.h"

namespace lyra {

/// Numbers of documents stay texts, as they are written.
class JsonFields : public ZORToolkit::FieldMaker<JsonFields> {
 public:
  using Value = nlohmann::ordered_json;

  Value Text(std::string_view inText) { return inText; }
  Value Integer(long long inNumber) { return inNumber; }
  Value Real(double inNumber) { return inNumber; }
  Value Written(const ZORToolkit::Number& inNumber) { return inNumber.text; }
  Value Null() { return nullptr; }
  Value NewObject() { return Value::object(); }
  Value NewArray() { return Value::array(); }
  // All names are different, so none is looked for.
  void Set(Value& ioObject, const char* inName, Value inValue) {
    ioObject.get_ref<Value::object_t&>().emplace_back(inName, std::move(inValue));
  }
  void Append(Value& ioArray, Value inValue) { ioArray.push_back(std::move(inValue)); }
};

template <class Record>
nlohmann::ordered_json JsonOf(const Record& inRecord) {
  JsonFields fields;
  return ValueOf(fields, inRecord);
}

}  // namespace lyra

#endif
