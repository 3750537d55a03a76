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
      {"merge", "Merge clash documents into one", DeclareMerge},
      {"federate", "Write a federator document that links clash documents", DeclareFederate},
      {"report", "Write a result as an XML report with a style sheet", DeclareReport},
      {"publish", "Write a page of a result, with pictures of a CAD model", DeclarePublish},
      {"tree", "List the products of a CAD model", DeclareTree},
      {"render", "Draw a picture of a CAD model", DeclareRender},
      {"path", "Say which path a logical name stands for", DeclarePath},
      {"escape", "Escape a text for XML", DeclareEscape},
      {"filename", "Make a text fit for the name of a file", DeclareFilename},
  };
  return kVerbs;
}

}  // namespace lyra
