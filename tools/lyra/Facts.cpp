#include "lyra/Facts.h"

#include <algorithm>

#include "lyra/SafeText.h"

namespace lyra {

Facts::Facts(const std::string& inHeading) : heading_(Printable(inHeading)) {}

void Facts::Add(const std::string& inName, const std::string& inValue) {
  if (!inValue.empty()) facts_.emplace_back(inName, Printable(inValue));
}

void Facts::Add(std::initializer_list<std::pair<const char*, const std::string&>> inFacts) {
  for (const auto& [name, value] : inFacts) Add(name, value);
}

void Facts::AddGroup(const std::string& inName) { facts_.emplace_back(inName, ""); }

void Facts::Print(Output& ioOutput) const {
  std::size_t width = 0;
  for (const auto& [name, value] : facts_)
    if (!value.empty()) width = std::max(width, name.size());
  const auto bold = [&](const std::string& inText) {
    return ioOutput.IsStyled() ? "\033[1m" + inText + "\033[0m" : inText;
  };
  ioOutput.Write(bold(heading_) + "\n");
  std::string indent = "  ";
  for (const auto& [name, value] : facts_) {
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
