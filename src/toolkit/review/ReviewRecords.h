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
/// @return where the last one begins, npos for none.
inline std::size_t LastSeparator(std::string_view inPath) {
  constexpr std::size_t kMiddle = 4;  // its last '+', which few names have
  for (std::size_t at = inPath.rfind('+'); at != std::string_view::npos && at >= kMiddle;
       at = inPath.rfind('+', at - 1))
    if (inPath.substr(at - kMiddle).starts_with(kPathSeparator)) return at - kMiddle;
  return std::string_view::npos;
}
inline std::string_view LastName(std::string_view inPath) {
  const std::size_t at = LastSeparator(inPath);
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
  ElementNumber element = 0;    ///< the first in the result
  std::uint64_t placement = 0;  ///< as WrittenGeometry, where that was read

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

/// What a document says of an interference's geometry, hashed: equal where it is written alike, and
/// then the same; others may still be the same numbers.
struct WrittenGeometry {
  static constexpr std::uint64_t kNeverAlike = 0, kNoGeometry = 1, kNoPoints = 2;
  std::array<std::uint64_t, 2> placements{};  ///< of its products
  std::uint64_t points = kNeverAlike;
};

/// What is read along with the records, while their memory is at hand, for who will ask for all of
/// it. What is not read is answered from the document.
struct ReviewReading {
  bool geometries = false, identities = false;
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
  std::vector<ReviewRecord> interferences;  ///< in document order
  // Of each interference, where they were read
  std::vector<WrittenGeometry> geometries;
  std::vector<std::optional<Position>> places;
  std::vector<std::uint64_t> identities;      ///< what their identifiers are made of
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
  bool HasPlacement(ElementNumber inProduct) const;  ///< whole or not
  /// As WrittenGeometry.
  std::uint64_t WrittenPlacement(ElementNumber inProduct) const;
  std::uint64_t WrittenPlacementOf(int inProduct) const;  ///< by its position
  WrittenGeometry GeometryOf(const ReviewRecord& inRecord) const;
  /// The position of a product of another result that is the same by identifier, -1 for none.
  /// @param inProduct a position in that result.
  /// @param inGuess a position in this one that is likely.
  int FindProduct(const ReviewedResult& inOther, int inProduct, int inGuess = -1) const;
};

/// Reads all that reviewing needs, in one pass; numbers and placements wait until they are asked
/// for. Raises Error for a document of a kind that has no interferences.
ZOR_TOOLKIT_EXPORT ReviewedResult ReadForReview(ClashDocument& ioDocument,
                                                const ReviewReading& inReading = {});

}  // namespace ZORToolkit

#endif
