#include "lyra/Verbs.h"

namespace lyra {

std::span<const Verb> Verbs() {
  static constexpr Verb kVerbs[] = {
      {"info", "Say what documents are and what they hold", DeclareInfo},
      {"list", "List the interferences of a result, a row each", DeclareList},
      {"show", "Show everything about one interference", DeclareShow},
      {"components", "List the components of a component list", DeclareComponents},
      {"specs", "List the pairs of products that a computation was asked to check", DeclareSpecs},
      {"links", "List the clash documents that a federator document links", DeclareLinks},
      {"convert", "Write a whole document in another format", DeclareConvert},
  };
  return kVerbs;
}

}  // namespace lyra
