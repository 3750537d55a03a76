#include "lyra/terminal/KeyValueList.h"

#include <algorithm>

#include "lyra/terminal/SafeText.h"

namespace lyra {

KeyValueList::KeyValueList(const std::string& inHeading) : heading_(Printable(inHeading)) {}

void KeyValueList::Add(const std::string& inName, const std::string& inValue) {
  if (!inValue.empty()) pairs_.emplace_back(inName, Printable(inValue));
}

void KeyValueList::Add(std::initializer_list<std::pair<const char*, const std::string&>> inPairs) {
  for (const auto& [name, value] : inPairs) Add(name, value);
}

void KeyValueList::AddGroup(const std::string& inName) { pairs_.emplace_back(inName, ""); }

void KeyValueList::Print(Output& ioOutput) const {
  std::size_t width = 0;
  for (const auto& [name, value] : pairs_)
    if (!value.empty()) width = std::max(width, name.size());
  const auto bold = [&](const std::string& inText) {
    return ioOutput.IsStyled() ? "\033[1m" + inText + "\033[0m" : inText;
  };
  ioOutput.Write(bold(heading_) + "\n");
  std::string indent = "  ";
  for (const auto& [name, value] : pairs_) {
    if (value.empty()) {
      ioOutput.Write("  " + bold(name) + "\n");
      indent = "    ";
    } else {
      const std::string fill(width - name.size() + 2, ' ');
      ioOutput.Write(indent + name + fill + value + "\n");
    }
  }
}

}  // namespace lyra
