#include "lyra/publish/OnlyFilter.h"

#include <sstream>

#include "lyra/CommandErrors.h"

namespace lyra {
namespace {

struct Conditions {
  std::vector<std::string> types, statuses;
  std::string result, product;
};

void Add(const std::string& inCondition, Conditions& ioConditions) {
  const std::size_t equals = inCondition.find('=');
  const std::string name = inCondition.substr(0, equals);
  const std::string word = equals == std::string::npos ? "" : inCondition.substr(equals + 1);
  if (word.empty())
    throw UsageError("--only: a condition is such as type=clash, not \"" + inCondition + "\"");
  if (name == "type")
    ioConditions.types.push_back(word);
  else if (name == "status")
    ioConditions.statuses.push_back(word);
  else if (name == "result" && ioConditions.result.empty())
    ioConditions.result = word;
  else if (name == "product" && ioConditions.product.empty())
    ioConditions.product = word;
  else if (name == "result" || name == "product")
    throw UsageError("--only: " + name + " is given twice");
  else
    throw UsageError("--only: unknown word \"" + name +
                     "\"; known are type, status, result, product");
}

}  // namespace

ListFilter ParseOnly(const std::vector<std::string>& inConditions) {
  Conditions conditions;
  for (const std::string& list : inConditions) {
    std::istringstream parts(list);
    for (std::string part; std::getline(parts, part, ',');) Add(part, conditions);
  }
  ListFilter filter;
  filter.SetTypes(conditions.types);
  filter.SetStatuses(conditions.statuses);
  if (!conditions.result.empty()) filter.SetResult(conditions.result);
  if (!conditions.product.empty()) filter.SetProduct(conditions.product);
  return filter;
}

}  // namespace lyra
