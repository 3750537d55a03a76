// What reviewing looks at: the interferences of a result, compact, with their products told apart.
#ifndef ZOR_TOOLKIT_REVIEW_REVIEW_RECORDS_H
#define ZOR_TOOLKIT_REVIEW_REVIEW_RECORDS_H

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/records/InterferenceRecord.h"

namespace ZORToolkit {

class ReviewSource;

typedef std::array<double, 3> Position;  ///< millimetres

/// Between the names of a path of instances.
inline constexpr std::string_view kPathSeparator = " --++-- ";
inline std::string_view LastName(std::string_view inPath) {
  const std::size_t at = inPath.rfind(kPathSeparator);
  return at == std::string_view::npos ? inPath : inPath.substr(at + kPathSeparator.size());
}

/// A number as a document has it, understood when asked.
struct ZOR_TOOLKIT_EXPORT WrittenNumber {
  std::string_view text;  ///< empty where it is missing
  /// As Number::value.
  std::optional<double> Value() const;
};

/// Where something of a result stands in its document; 0 for nowhere.
typedef std::uint32_t ElementNumber;

/// A product, once for a result. Two are the same when their identifiers are; without identifiers,
/// when alias and part are.
struct ZOR_TOOLKIT_EXPORT ReviewProduct {
  std::string_view id, alias, part;
  ElementNumber element = 0;  ///< the first in the result

  /// What a person calls it: its alias, or its identifier when it has none.
  std::string_view Name() const { return alias.empty() ? id : alias; }
  /// What tells it from all others of its result.
  std::string Key() const;
};

/// One interference. Texts as in InterferenceRecord, but a status or an age that the current
/// language does not know is understood in any other.
struct ReviewRecord {
  int index = 0;                        ///< the number in the document, from 1
  std::array<int, 2> products{-1, -1};  ///< positions in ReviewedResult::products, -1 for none
  int computationCase = -1;             ///< position in ReviewedResult::computationCases
  std::string_view type, status, retrieve, rule, comment;
  WrittenNumber value, clearance;
  ElementNumber element = 0;
  std::array<ElementNumber, 2> productElements{};
  ElementNumber geometry = 0;  ///< the first of them
  bool hasMoreGeometry = false;
};

/// Identifiers and aliases of the products of both sides of a specification.
struct SpecifiedPair {
  struct Names {
    std::string_view alias, id;
  };
  std::array<Names, 2> products;
};

/// Its texts live as long as it, or a copy of it, does.
struct ZOR_TOOLKIT_EXPORT ReviewedResult {
  std::string name;  ///< of the document
  DocumentKind kind = DocumentKind::kClash;
  std::vector<ReviewProduct> products;
  std::vector<ReviewRecord> interferences;    ///< in document order
  std::vector<std::string> computationCases;  ///< of result sets and of violated rules, each once
  std::vector<SpecifiedPair> specifications;
  bool hasSpecification = false;   ///< there is an element for them, however empty
  std::vector<std::string> words;  ///< statuses and ages as the document has them, some repeated
  /// "Type" and "Clearance" of the "ClashSpec".
  std::string computedTypes;
  Number clearance;
  std::shared_ptr<const ReviewSource> source;

  // Read from the document at each call
  ElementHandle ElementOf(const ReviewRecord& inRecord) const;
  /// With decimal points or commas; nothing where the product has no whole, finite placement.
  std::optional<Placement> PlacementOf(ElementNumber inProduct) const;
  /// The mean of its points.
  std::optional<Position> PlaceOf(const ReviewRecord& inRecord) const;
  bool HasPoints(const ReviewRecord& inRecord) const;
  bool HasPlacement(ElementNumber inProduct) const;  ///< whole or not
  /// Whether the placements of two products, or the points of two interferences, are written alike:
  /// then they are the same; others may still be the same numbers.
  bool HasPlacementOf(ElementNumber inProduct, const ReviewedResult& inOther,
                      ElementNumber inOtherProduct) const;
  bool HasPointsOf(const ReviewRecord& inRecord, const ReviewedResult& inOther,
                   const ReviewRecord& inOtherRecord) const;
  /// The position of a product of another result that is the same by identifier, -1 for none.
  /// @param inProduct a position in that result.
  /// @param inGuess a position in this one that is likely.
  int FindProduct(const ReviewedResult& inOther, int inProduct, int inGuess = -1) const;
};

/// Reads all that reviewing needs, in one pass; numbers and placements wait until they are asked
/// for. Raises Error for a document of a kind that has no interferences.
ZOR_TOOLKIT_EXPORT ReviewedResult ReadForReview(ClashDocument& ioDocument);

}  // namespace ZORToolkit

#endif
