#include "clash_reading/ZORClashDocumentIndex.h"

#include <algorithm>
#include <atomic>
#include <cstdint>
#include <memory>
#include <mutex>
#include <unordered_map>
#include <utility>

#include "PlatformAdapter.h"
#include "clash_reading/ClashElements.h"
#include "clash_reading/NamedConstants.h"

namespace {

// Hosts create readers by value, so their layout is fixed and their indexes are kept here. Locked
// because readers may live on different threads.
struct ReaderIndexes {
  std::mutex mutex;
  std::unordered_map<const ZORClashParsing*, std::unique_ptr<ZORClashDocumentIndex>> byReader;
  std::atomic<std::uint64_t> discards = 0;
};

// Never deleted: a host's static reader may outlive the library's own static objects.
ReaderIndexes& AllIndexes() {
  static auto* const indexes = new ReaderIndexes;
  return *indexes;
}

// The thread's last look-up, which spares the next one the lock; valid until any index is discarded.
struct LastLookup {
  const ZORClashParsing* reader = nullptr;
  ZORClashDocumentIndex* index = nullptr;
  std::uint64_t discards = 0;
};
thread_local LastLookup lastLookup;

ZORClashDocumentIndex* FindOrCreate(ReaderIndexes& ioIndexes, const ZORClashParsing& inReader) {
  const std::lock_guard lock(ioIndexes.mutex);
  auto entry = ioIndexes.byReader.find(&inReader);
  if (entry == ioIndexes.byReader.end())
    entry = ioIndexes.byReader.emplace(&inReader, std::make_unique<ZORClashDocumentIndex>()).first;
  return entry->second.get();
}

}  // namespace

ZORClashDocumentIndex& ZORClashDocumentIndex::Of(const ZORClashParsing& inReader,
                                                 const DOM_Element& inRoot) {
  ReaderIndexes& indexes = AllIndexes();
  LastLookup& last = lastLookup;
  const std::uint64_t discards = indexes.discards.load(std::memory_order_acquire);
  if (last.reader != &inReader || last.discards != discards)
    last = {&inReader, FindOrCreate(indexes, inReader), discards};
  ZORClashDocumentIndex& index = *last.index;
  index.Refresh(inRoot);
  return index;
}

void ZORClashDocumentIndex::Discard(const ZORClashParsing& inReader) {
  ReaderIndexes& indexes = AllIndexes();
  std::unique_ptr<ZORClashDocumentIndex> discarded;  // freed unlocked: it may own a whole document
  const std::lock_guard lock(indexes.mutex);
  if (const auto entry = indexes.byReader.find(&inReader); entry != indexes.byReader.end()) {
    discarded = std::move(entry->second);
    indexes.byReader.erase(entry);
    indexes.discards.fetch_add(1, std::memory_order_release);
  }
}

void ZORClashDocumentIndex::Refresh(const DOM_Element& inRoot) {
  const std::optional<std::uint64_t> changeCount = adapter::ChangeCount(inRoot);
  // Changes below a root that the caller has detached are not counted.
  if (changeCount && changeCount_ == changeCount && adapter::AreSame(root_, inRoot) &&
      IsInDocument(inRoot))
    return;
  *this = ZORClashDocumentIndex();
  root_ = inRoot;
  changeCount_ = changeCount;
}

bool IsInDocument(const DOM_Node& inNode) {
  DOM_Node top = inNode;
  for (DOM_Node up = top.getParentNode(); !up.isNull(); up = top.getParentNode()) top = up;
  return top.getNodeType() == DOM_Node::DOCUMENT_NODE;
}

const std::vector<DOM_Node>& ZORClashDocumentIndex::ResultSets() {
  BuildInterferences();
  return resultSets_;
}

const std::vector<DOM_Node>& ZORClashDocumentIndex::Interferences() {
  BuildInterferences();
  return interferences_;
}

const DOM_Node& ZORClashDocumentIndex::ResultSetOf(std::size_t inInterference) {
  BuildInterferences();
  const auto next =
      std::upper_bound(firstInterference_.begin(), firstInterference_.end(), inInterference);
  return resultSets_[static_cast<std::size_t>(next - firstInterference_.begin()) - 1];
}

void ZORClashDocumentIndex::BuildInterferences() {
  if (interferencesBuilt_) return;
  ForEachElement(root_, "ClashResult", [&](const DOM_Node& inResultSet) {
    resultSets_.push_back(inResultSet);
    firstInterference_.push_back(interferences_.size());
    ForEachElement(inResultSet, "Interference", [&](const DOM_Node& inInterference) {
      interferences_.push_back(inInterference);
    });
  });
  interferencesBuilt_ = true;
}

// A counting sort of the interferences by their place in their own result set; it is stable, so
// that each rank keeps document order.
void ZORClashDocumentIndex::BuildRanks() {
  if (ranksBuilt_) return;
  BuildInterferences();
  std::vector<std::size_t> ranks(interferences_.size());
  std::size_t rankCount = 0;
  for (std::size_t set = 0; set < resultSets_.size(); ++set) {
    const std::size_t first = firstInterference_[set];
    const std::size_t end =
        set + 1 < resultSets_.size() ? firstInterference_[set + 1] : interferences_.size();
    for (std::size_t i = first; i < end; ++i) ranks[i] = i - first;
    rankCount = std::max(rankCount, end - first);
  }
  rankStart_.assign(rankCount + 1, 0);
  for (std::size_t rank : ranks) ++rankStart_[rank + 1];
  for (std::size_t rank = 0; rank < rankCount; ++rank) rankStart_[rank + 1] += rankStart_[rank];
  std::vector<std::size_t> next = rankStart_;
  rankInterference_.resize(ranks.size());
  for (std::size_t i = 0; i < ranks.size(); ++i) rankInterference_[next[ranks[i]]++] = i;
  ranksBuilt_ = true;
}

std::vector<DOM_Node> ZORClashDocumentIndex::InterferencesAtRank(std::size_t inRank) {
  BuildRanks();
  std::vector<DOM_Node> found;
  if (inRank + 1 >= rankStart_.size()) return found;
  for (std::size_t i = rankStart_[inRank]; i < rankStart_[inRank + 1]; ++i)
    found.push_back(interferences_[rankInterference_[i]]);
  return found;
}

const std::vector<DOM_Node>& ZORClashDocumentIndex::Specifications() {
  if (!specificationsBuilt_) {
    ForEachElement(root_, "ProductsInSpec", [&](const DOM_Node& inProducts) {
      ForEachElement(inProducts, "Specification", [&](const DOM_Node& inSpecification) {
        specifications_.push_back(inSpecification);
      });
    });
    specificationsBuilt_ = true;
  }
  return specifications_;
}

const std::vector<DOM_Node>& ZORClashDocumentIndex::RealAttributes(const DOM_Node& inComponent) {
  if (attributesOf_.isNull() || !adapter::AreSame(attributesOf_, inComponent)) {
    realAttributes_.clear();
    ForEachElement(inComponent, names::ComponentAttributes, [&](const DOM_Node& inAttributes) {
      ForEachElement(inAttributes, names::ComponentAttribute, [&](const DOM_Node& inAttribute) {
        if (ZORLyraGeneralServices::GetAttrOnNode(inAttribute, names::AttrType.ConvertToChar()) !=
            "Feature")
          realAttributes_.push_back(inAttribute);
      });
    });
    attributesOf_ = inComponent;
  }
  return realAttributes_;
}

const std::vector<DOM_Node>& ZORClashDocumentIndex::Shapes(const DOM_Node& inComponent) {
  if (shapesOf_.isNull() || !adapter::AreSame(shapesOf_, inComponent)) {
    shapes_.clear();
    ForEachElement(inComponent, names::ComponentShapes, [&](const DOM_Node& inShapes) {
      ForEachElement(inShapes, names::ComponentShape,
                     [&](const DOM_Node& inShape) { shapes_.push_back(inShape); });
    });
    shapesOf_ = inComponent;
  }
  return shapes_;
}

const std::vector<DOM_Node>& ZORClashDocumentIndex::NamedChildren(const DOM_Node& inParent,
                                                                  const ZORUnicodeString& inName) {
  if (childrenOf_.isNull() || !adapter::AreSame(childrenOf_, inParent) ||
      !(childrenName_ == inName)) {
    namedChildren_.clear();
    ForEachElement(inParent, inName,
                   [&](const DOM_Node& inChild) { namedChildren_.push_back(inChild); });
    childrenOf_ = inParent;
    childrenName_ = inName;
  }
  return namedChildren_;
}
