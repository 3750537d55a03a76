// Pairs under headings: "name  value", aligned.
#ifndef ZOR_TOOLS_LYRA_TERMINAL_KEY_VALUE_LIST_H
#define ZOR_TOOLS_LYRA_TERMINAL_KEY_VALUE_LIST_H

#include <initializer_list>
#include <string>
#include <utility>
#include <vector>

#include "lyra/terminal/Output.h"

namespace lyra {

/// Collects what is known of one thing and prints it under a heading.
class KeyValueList {
 public:
  /// @param inHeading, inValue as documents have them: they are made printable here.
  explicit KeyValueList(const std::string& inHeading);
  /// A pair whose value is empty is left out.
  void Add(const std::string& inName, const std::string& inValue);
  void Add(std::initializer_list<std::pair<const char*, const std::string&>> inPairs);
  /// A line of its own for a group of the pairs that follow.
  void AddGroup(const std::string& inName);
  void Print(Output& ioOutput) const;

 private:
  std::string heading_;
  std::vector<std::pair<std::string, std::string>> pairs_;  // a group has no value
};

}  // namespace lyra

#endif
