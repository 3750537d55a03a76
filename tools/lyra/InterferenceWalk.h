// The interferences of a document, each with its number and its own result set.
#ifndef ZOR_TOOLS_LYRA_INTERFERENCE_WALK_H
#define ZOR_TOOLS_LYRA_INTERFERENCE_WALK_H

#include <optional>

#include "lyra/ClashResultFile.h"
#include "lyra/ElementChildren.h"

namespace lyra {

/// An interference and where it stands.
struct PlacedInterference {
  int number;        ///< from 1, in document order over all result sets
  DOM_Node set;      ///< its own "ClashResult"; null in a single-interference document
  DOM_Node element;  ///< the "Interference"
};

/// Calls inVisit for each interference in the order of their numbers. A single-interference document
/// has the first one directly under its root. Raises InputError for a document of another kind.
template <class Visit>
void ForEachInterference(const ClashResultFile& inFile, const Visit& inVisit) {
  inFile.Require({DocumentKind::kClash, DocumentKind::kInterference}, "interferences");
  if (inFile.Kind() == DocumentKind::kInterference) {
    const DOM_Node only = FirstElement(inFile.Root(), "Interference");
    if (!only.isNull()) inVisit(PlacedInterference{1, DOM_Node(), only});
    return;
  }
  int number = 0;
  ForEachElement(inFile.Root(), "ClashResult", [&](const DOM_Node& inSet) {
    ForEachElement(inSet, "Interference", [&](const DOM_Node& inElement) {
      inVisit(PlacedInterference{++number, inSet, inElement});
    });
  });
}

int CountInterferences(const ClashResultFile& inFile);
/// The interference of a number. Raises InputError, which says how many there are, when there is
/// none of that number.
PlacedInterference FindInterference(const ClashResultFile& inFile, long long inNumber);

}  // namespace lyra

#endif
