// An index of a loaded document.
#ifndef ZOR_CLASH_READING_ZORCLASHDOCUMENTINDEX_H
#define ZOR_CLASH_READING_ZORCLASHDOCUMENTINDEX_H

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Element.h"

class ZORClashParsing;

/// Looks elements up by number in constant time, where a walk to each would make a host's loop
/// quadratic. Each list is built when it is first needed and dropped by the first Refresh after the
/// document has changed; on a platform that does not count changes, by every Refresh. All numbers
/// here count from 0.
class ZORClashDocumentIndex {
 public:
  /// A reader's index, refreshed. The reference is valid until Discard.
  static ZORClashDocumentIndex& Of(const ZORClashParsing& inReader, const DOM_Element& inRoot);
  /// Deletes a reader's index, which keeps its document alive.
  static void Discard(const ZORClashParsing& inReader);

  /// To be called before the lists are used.
  void Refresh(const DOM_Element& inRoot);

  /// All "ClashResult" elements of the root.
  const std::vector<DOM_Node>& ResultSets();
  /// All "Interference" elements of all result sets.
  const std::vector<DOM_Node>& Interferences();
  /// The result set that holds one of Interferences().
  const DOM_Node& ResultSetOf(std::size_t inInterference);
  /// From each result set the interference of this number within the set, where there is one.
  std::vector<DOM_Node> InterferencesAtRank(std::size_t inRank);
  /// All "Specification" elements of all "ProductsInSpec".
  const std::vector<DOM_Node>& Specifications();
  /// The attributes of a component, features excluded.
  const std::vector<DOM_Node>& RealAttributes(const DOM_Node& inComponent);
  /// The shapes of a component.
  const std::vector<DOM_Node>& Shapes(const DOM_Node& inComponent);
  /// The child elements of a name of any node of the document.
  const std::vector<DOM_Node>& NamedChildren(const DOM_Node& inParent,
                                             const ZORUnicodeString& inName);

 private:
  void BuildInterferences();
  void BuildRanks();

  DOM_Element root_;
  std::optional<std::uint64_t> changeCount_;

  bool interferencesBuilt_ = false;
  std::vector<DOM_Node> resultSets_;
  std::vector<DOM_Node> interferences_;
  std::vector<std::size_t> firstInterference_;  // of each result set

  bool ranksBuilt_ = false;
  std::vector<std::size_t> rankStart_;         // where each rank begins in rankInterference_
  std::vector<std::size_t> rankInterference_;  // interferences ordered by rank

  bool specificationsBuilt_ = false;
  std::vector<DOM_Node> specifications_;

  // For the component, or the parent and name, of the last query.
  DOM_Node attributesOf_;
  std::vector<DOM_Node> realAttributes_;
  DOM_Node shapesOf_;
  std::vector<DOM_Node> shapes_;
  DOM_Node childrenOf_;
  ZORUnicodeString childrenName_;
  std::vector<DOM_Node> namedChildren_;
};

/// Whether a node is in its document's tree. Changes of a detached node are not counted.
bool IsInDocument(const DOM_Node& inNode);

#endif
