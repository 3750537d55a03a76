// What reviewing looks at: the interferences of a result, compact, with their products told apart.
#ifndef ZOR_TOOLKIT_REVIEW_REVIEW_RECORDS_H
#define ZOR_TOOLKIT_REVIEW_REVIEW_RECORDS_H

#include <array>
#include <optional>
#include <string>
#include <vector>

#include "toolkit/records/DocumentRecords.h"

namespace ZORToolkit {

typedef std::array<double, 3> Position;  ///< millimetres

/// A product, once for a result. Two are the same when their identifiers are; without identifiers,
/// when alias and part are.
struct ZOR_TOOLKIT_EXPORT ReviewProduct {
  std::string id, alias, part;
  std::optional<Placement> placement;  ///< the first in the result

  /// What a person calls it: its alias, or its identifier when it has none.
  const std::string& Name() const { return alias.empty() ? id : alias; }
  /// What tells it from all others of its result.
  std::string Key() const;
};

/// One interference. Texts as in InterferenceRecord, but a status or an age that the current
/// language does not know is understood in any other.
struct ReviewRecord {
  int index = 0;                        ///< the number in the document, from 1
  std::array<int, 2> products{-1, -1};  ///< positions in ReviewedResult::products, -1 for none
  std::string type, status, retrieve, rule, comment;
  int computationCase = -1;  ///< position in ReviewedResult::computationCases
  Number value, clearance;
  /// With decimal points or commas; nothing where the result has no whole, finite placement.
  std::array<std::optional<Placement>, 2> placements;
  std::optional<Position> place;  ///< the mean of its points
  ElementHandle element;
};

struct ReviewedResult {
  std::string name;  ///< of the document
  DocumentKind kind = DocumentKind::kClash;
  std::vector<ReviewProduct> products;
  std::vector<ReviewRecord> interferences;    ///< in document order
  std::vector<std::string> computationCases;  ///< of result sets and of violated rules, each once
  std::vector<SpecificationRecord> specifications;
  bool hasSpecification = false;   ///< there is an element for them, however empty
  std::vector<std::string> words;  ///< statuses and ages as the document has them, some repeated
  /// "Type" and "Clearance" of the "ClashSpec".
  std::string computedTypes;
  Number clearance;
};

/// Reads all that reviewing needs, in one pass. Raises Error for a document of a kind that has no
/// interferences. The document must outlive the handles' use.
ZOR_TOOLKIT_EXPORT ReviewedResult ReadForReview(ClashDocument& ioDocument);

}  // namespace ZORToolkit

#endif
