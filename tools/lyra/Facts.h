// Facts under headings: "name  value", aligned.
#ifndef ZOR_TOOLS_LYRA_FACTS_H
#define ZOR_TOOLS_LYRA_FACTS_H

#include <initializer_list>
#include <string>
#include <utility>
#include <vector>

#include "lyra/Output.h"

namespace lyra {

/// Collects the facts about one thing and prints them under its heading.
class Facts {
 public:
  /// @param inHeading, inValue as documents have them: they are made printable here.
  explicit Facts(const std::string& inHeading);
  /// A fact whose value is empty is left out.
  void Add(const std::string& inName, const std::string& inValue);
  void Add(std::initializer_list<std::pair<const char*, const std::string&>> inFacts);
  /// A line of its own for a group of the facts that follow.
  void AddGroup(const std::string& inName);
  void Print(Output& ioOutput) const;

 private:
  std::string heading_;
  std::vector<std::pair<std::string, std::string>> facts_;  // a group has no value
};

}  // namespace lyra

#endif
