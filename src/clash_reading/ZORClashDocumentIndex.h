// Where things stand in a loaded document.
#ifndef ZOR_CLASH_READING_ZORCLASHDOCUMENTINDEX_H
#define ZOR_CLASH_READING_ZORCLASHDOCUMENTINDEX_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Element.h"

/// Finds numbered things of a document in constant time, where walking to each would make a host's
/// loop quadratic. The index belongs to one state of the document: Refresh forgets everything as
/// soon as the document has changed, and each list is made again when it is next asked for.
/// All numbers here count from 0.
class ZORClashDocumentIndex {
 public:
  /// To be called before each question, with the root that the question is about.
  void Refresh(const DOM_Element& inRoot);

  /// All "ClashResult" elements of the root.
  const std::vector<DOM_Node>& ResultSets();
  /// All "Interference" elements of all result sets.
  const std::vector<DOM_Node>& Interferences();
  /// Whether an interference belongs to the last result set.
  bool IsInLastResultSet(std::size_t inInterference);
  /// The interferences that stand at the same place, counted from 0, of their own result set, in
  /// document order.
  std::vector<DOM_Node> InterferencesAtRank(std::size_t inRank);
  /// All "Specification" elements of all "ProductsInSpec".
  const std::vector<DOM_Node>& Specifications();
  /// The attributes of a component that are no features.
  const std::vector<DOM_Node>& RealAttributes(const DOM_Node& inComponent);
  /// The shapes of a component.
  const std::vector<DOM_Node>& Shapes(const DOM_Node& inComponent);
  /// The child elements of a name of any node of the document.
  const std::vector<DOM_Node>& NamedChildren(const DOM_Node& inParent,
                                             const ZORUnicodeString& inName);

 private:
  void Forget();
  void BuildInterferences();
  void BuildRanks();

  DOM_Element root_;
  std::uint64_t changeCount_ = 0;

  bool interferencesBuilt_ = false;
  std::vector<DOM_Node> resultSets_;
  std::vector<DOM_Node> interferences_;
  std::vector<std::size_t> firstInterference_;  // of each result set

  bool ranksBuilt_ = false;
  std::vector<std::size_t> rankStart_;         // where each rank begins in rankInterference_
  std::vector<std::size_t> rankInterference_;  // interferences ordered by rank

  bool specificationsBuilt_ = false;
  std::vector<DOM_Node> specifications_;

  // Of the component, or parent and name, that was asked for last.
  DOM_Node attributesOf_;
  std::vector<DOM_Node> realAttributes_;
  DOM_Node shapesOf_;
  std::vector<DOM_Node> shapes_;
  DOM_Node childrenOf_;
  ZORUnicodeString childrenName_;
  std::vector<DOM_Node> namedChildren_;
};

#endif
