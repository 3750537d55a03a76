#include "toolkit/review/TomlFile.h"

#include <toml++/toml.h>

#include <algorithm>
#include <cctype>
#include <set>

#include "foundation/TomlNesting.h"

namespace ZORToolkit {

struct TomlTable::Data {
  std::shared_ptr<const toml::table> document;  // keeps the table alive
  const toml::table* table;
  std::string name;  // of the file
  std::set<std::string, std::less<>> known;
};

namespace {

FilePlace PlaceOf(const toml::source_region& inSource) {
  return {inSource.begin.line, inSource.begin.column};
}

std::string WordKey(const std::string& inWord) {
  std::string key = inWord;
  std::ranges::transform(key, key.begin(), [](unsigned char inByte) {
    return inByte == '-' || inByte == '_' ? ' ' : static_cast<char>(std::tolower(inByte));
  });
  return key;
}

}  // namespace

TomlTable::TomlTable(std::unique_ptr<Data> ioData) : data_(std::move(ioData)) {}
TomlTable::TomlTable(TomlTable&&) noexcept = default;
TomlTable::~TomlTable() = default;

TomlTable TomlTable::Parse(const std::string& inName, std::string_view inText) {
  if (const auto place = ZORFoundation::FindTooDeepToml(inText))
    throw Error(inName, ZORFoundation::kTomlTooDeep, FilePlace{place->line, place->column});
  try {
    auto document = std::make_shared<const toml::table>(toml::parse(inText, inName));
    const toml::table* const table = document.get();
    return TomlTable(std::make_unique<Data>(Data{std::move(document), table, inName, {}}));
  } catch (const toml::parse_error& error) {
    throw Error(inName, std::string(error.description()), PlaceOf(error.source()));
  }
}

void TomlTable::Fail(const char* inKey, const std::string& inReason) const {
  const toml::node* const node = inKey == nullptr ? nullptr : data_->table->get(inKey);
  const toml::source_region& source = node == nullptr ? data_->table->source() : node->source();
  const std::string key = inKey == nullptr ? "" : std::string("\"").append(inKey).append("\": ");
  throw Error(data_->name, key + inReason, PlaceOf(source));
}

std::optional<std::string> TomlTable::Text(const char* inKey) {
  data_->known.insert(inKey);
  const toml::node* const node = data_->table->get(inKey);
  if (node == nullptr) return std::nullopt;
  if (!node->is_string()) Fail(inKey, "is no text");
  return node->value<std::string>();
}

std::optional<double> TomlTable::Number(const char* inKey) {
  data_->known.insert(inKey);
  const toml::node* const node = data_->table->get(inKey);
  if (node == nullptr) return std::nullopt;
  if (!node->is_number()) Fail(inKey, "is no number");
  return node->value<double>();
}

std::optional<bool> TomlTable::Flag(const char* inKey) {
  data_->known.insert(inKey);
  const toml::node* const node = data_->table->get(inKey);
  if (node == nullptr) return std::nullopt;
  if (!node->is_boolean()) Fail(inKey, "is neither true nor false");
  return node->value<bool>();
}

std::vector<std::string> TomlTable::Texts(const char* inKey) {
  data_->known.insert(inKey);
  const toml::node* const node = data_->table->get(inKey);
  if (node == nullptr) return {};
  if (node->is_string()) return {*node->value<std::string>()};
  const toml::array* const array = node->as_array();
  if (array == nullptr || !(array->empty() || array->is_homogeneous(toml::node_type::string)))
    Fail(inKey, "is neither a text nor a list of texts");
  if (array->empty()) Fail(inKey, "is an empty list");
  std::vector<std::string> texts;
  for (const toml::node& text : *array) texts.push_back(*text.value<std::string>());
  return texts;
}

void TomlTable::ForEachTable(const char* inKey, const std::function<void(TomlTable&)>& inVisit) {
  data_->known.insert(inKey);
  const toml::node* const node = data_->table->get(inKey);
  if (node == nullptr) return;
  if (!node->is_array_of_tables()) Fail(inKey, "is not given as [[" + std::string(inKey) + "]]");
  for (const toml::node& element : *node->as_array()) {
    TomlTable table(
        std::make_unique<Data>(Data{data_->document, element.as_table(), data_->name, {}}));
    inVisit(table);
    table.Finish();
  }
}

std::string TomlTable::RequiredText(const char* inKey) {
  std::optional<std::string> text = Text(inKey);
  if (!text || text->empty()) Fail(nullptr, "\"" + std::string(inKey) + "\" is missing");
  return *text;
}

std::string TomlTable::Word(const char* inKey, const std::string& inText,
                            const std::vector<std::string>& inKnown) const {
  const auto found = std::ranges::find(inKnown, WordKey(inText), WordKey);
  if (found != inKnown.end()) return *found;
  std::string known;
  for (const std::string& word : inKnown) known += (known.empty() ? "" : ", ") + word;
  Fail(inKey, "unknown word \"" + inText + "\"; known are " + known);
}

std::vector<std::string> TomlTable::Words(const char* inKey,
                                          const std::vector<std::string>& inKnown) {
  std::vector<std::string> words = Texts(inKey);
  for (std::string& word : words) word = Word(inKey, word, inKnown);
  return words;
}

InterferenceCondition TomlTable::Condition() {
  InterferenceCondition condition;
  condition.products = Texts("product");
  condition.otherProducts = Texts("other-product");
  condition.parts = Texts("part");
  condition.otherParts = Texts("other-part");
  condition.types = Words("type", kTypesInToml);
  condition.statuses = Words("status", kStatusesInToml);
  condition.rules = Texts("rule");
  condition.minValue = Number("min-value");
  condition.maxValue = Number("max-value");
  return condition;
}

void TomlTable::Finish() const {
  for (const auto& [key, node] : *data_->table) {
    if (data_->known.contains(key.str())) continue;
    std::string known;
    for (const std::string& name : data_->known) known += (known.empty() ? "" : ", ") + name;
    throw Error(data_->name,
                std::string("unknown key \"").append(key.str()).append("\"; known are ") + known,
                PlaceOf(key.source()));
  }
}

}  // namespace ZORToolkit
