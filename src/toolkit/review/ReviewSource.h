// Where the records of a reviewed result come from; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_REVIEW_SOURCE_H
#define ZOR_TOOLKIT_REVIEW_REVIEW_SOURCE_H

#include <array>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "default_platform/TreeReader.h"
#include "foundation/Bytes.h"
#include "toolkit/review/ReviewRecords.h"

namespace ZORToolkit {

/// The names of elements and attributes that reviewing reads.
enum class Named : std::uint8_t {
  kOther,
  kAlias,
  kClashResult,
  kClashSpec,
  kClearance,
  kComment,
  kComputationCase,
  kCorrespondingData,
  kDescriptionId,
  kDisplayableId,
  kDistanceClearance,
  kGeometricAspect,
  kInterference,
  kMatrix,
  kName,
  kPoint,
  kProdListe1,
  kProdListe2,
  kProduct,
  kProductsInSpec,
  kResultType,
  kResultTypeNoNls,
  kRetrieveInf,
  kShapeName,
  kSpecification,
  kStatus,
  kType,
  kTypeCalc,
  kUx,
  kUy,
  kUz,
  kValue,
  kVector,
  kViolatedRule,
  kVx,
  kVy,
  kVz
};

/// A text of the document as it is stored, null where it is missing.
typedef const DOM_Text* StoredText;

inline bool IsSame(StoredText inA, StoredText inB) {
  if (inA == inB || inA == nullptr || inB == nullptr) return inA == inB;
  return inA->head == inB->head &&
         ZORFoundation::AreSameBytes(inA->Latin1(), inB->Latin1(), inA->View().Bytes());
}
inline std::uint64_t HashOf(StoredText inText) {
  return ZORFoundation::HashOfBytes(inText + 1, inText->View().Bytes()) ^ inText->head;
}

/// A step of a hash of numbers.
inline std::uint64_t Mix(std::uint64_t inHash, std::uint64_t inPart) {
  inHash = (inHash ^ inPart) * 0x9E3779B97F4A7C15u;
  return inHash ^ (inHash >> 31);
}

/// The document's tree, the texts that it does not hold as UTF-8, and its products by what tells
/// them apart.
class ReviewSource {
 public:
  typedef ZORDefault::TreeReader::Element Element;

  /// @param inUsualProducts about how many products there are, for the room that they need.
  ReviewSource(const DOM_Node& inRoot, std::size_t inUsualProducts);

  const ZORDefault::TreeReader& Tree() const { return tree_; }
  template <class Visit>  // Visit(Element, Named)
  void ForEachChild(Element inElement, const Visit& inVisit) const {
    tree_.ForEachChild(inElement, [&](Element inChild, ZORDefault::TreeReader::Name inName) {
      inVisit(inChild, Meaning(inName));
    });
  }
  template <class Visit>  // Visit(Named, StoredText)
  void ForEachAttribute(Element inElement, const Visit& inVisit) const {
    tree_.ForEachAttribute(inElement,
                           [&](ZORDefault::TreeReader::Name inName, const DOM_Text& inText) {
                             inVisit(Meaning(inName), &inText);
                           });
  }
  StoredText Attribute(Element inElement, Named inName) const;

  /// As UTF-8; valid as long as this.
  std::string_view Text(StoredText inText) {
    if (inText == nullptr) return {};
    if (!inText->IsWide() && IsAsciiText(inText->Latin1(), inText->head))
      return {inText->Latin1(), inText->head};
    return OtherText(inText);
  }
  std::string_view Keep(std::string_view inText);
  /// As Text, of one that is likely to be said by another text that is kept already.
  std::string_view Text(StoredText inText, StoredText inOther, std::string_view inKept) {
    return inText != nullptr && ZORToolkit::IsSame(inText, inOther) ? inKept : Text(inText);
  }

  // Products
  struct ProductKey {
    std::uint64_t hash = 0;
    std::array<StoredText, 2> texts{};  // the identifier alone, or alias and part
  };
  static ProductKey KeyOf(StoredText inId, StoredText inAlias, StoredText inPart);
  /// The position of a product; -1 where there is none.
  /// @param inGuess a position that is looked at first.
  int Find(const ProductKey& inKey, int inGuess) const;
  /// The position of a product, which is the next one where there was none.
  int FindOrAdd(const ProductKey& inKey);
  /// Has the memory that Find will look at fetched meanwhile.
  void Expect(const ProductKey& inKey) const {
    __builtin_prefetch(&slots_[inKey.hash & (slotCount_ - 1)]);
  }
  /// Has what Find will look at of a product here or elsewhere fetched meanwhile.
  void ExpectText(int inProduct) const {
    if (inProduct < ProductCount()) __builtin_prefetch(Key(inProduct).texts[0]);
  }
  const ProductKey& Key(int inProduct) const {
    return products_[static_cast<std::size_t>(inProduct)];
  }
  int ProductCount() const { return static_cast<int>(products_.size()); }

  // Geometry
  std::uint64_t WrittenPlacement(Element inProduct) const;
  WrittenGeometry GeometryOf(const ReviewRecord& inRecord) const;
  bool HasPlacement(Element inProduct) const { return FirstNamed(inProduct, Named::kMatrix) != 0; }
  std::optional<Placement> PlacementOf(Element inProduct) const;
  /// Calls inVisit(Element) for each "GeometricAspect" of an interference.
  template <class Visit>
  void ForEachGeometry(const ReviewRecord& inRecord, const Visit& inVisit) const {
    if (!inRecord.hasMoreGeometry) {
      if (inRecord.geometry != 0) inVisit(inRecord.geometry);
      return;
    }
    ForEachChild(inRecord.element, [&](Element inChild, Named inNamed) {
      if (inNamed == Named::kGeometricAspect) inVisit(inChild);
    });
  }
  std::optional<Position> PlaceOf(const ReviewRecord& inRecord) const;

 private:
  Named Meaning(ZORDefault::TreeReader::Name inName) const {
    return inName < meanings_.size() ? meanings_[inName] : Named::kOther;
  }
  Element NextNamed(Element inElement, Named inName) const;
  Element FirstNamed(Element inParent, Named inName) const {
    return NextNamed(tree_.FirstElement(inParent), inName);
  }
  void AddAttributes(Element inElement, std::uint64_t& ioHash) const;
  std::uint64_t WrittenPoints(const ReviewRecord& inRecord) const;
  /// Reads the three attributes from inFirst on and calls inOther(Named, StoredText) for the rest.
  /// @return whether all three are numbers.
  template <class Other>
  bool ReadTriple(Element inElement, Named inFirst, double* outTriple, const Other& inOther) const;
  bool ReadTriple(Element inElement, Named inFirst, double* outTriple) const;
  std::optional<Placement> PlacementIn(Element inMatrix) const;
  static bool IsAsciiText(const char* inBytes, std::size_t inCount) {
    constexpr std::uint64_t kHighBits = 0x8080808080808080u;
    if (inCount <= 8) return (ZORFoundation::ShortBytes(inBytes, inCount) & kHighBits) == 0;
    std::uint64_t all = 0, part = 0;
    for (std::size_t at = 0; at + 8 < inCount; at += 8) {
      std::memcpy(&part, inBytes + at, sizeof part);
      all |= part;
    }
    std::memcpy(&part, inBytes + inCount - 8, sizeof part);
    return ((all | part) & kHighBits) == 0;
  }
  std::string_view OtherText(StoredText inText);
  static bool IsSame(const ProductKey& inA, const ProductKey& inB) {
    return inA.hash == inB.hash && ZORToolkit::IsSame(inA.texts[0], inB.texts[0]) &&
           ZORToolkit::IsSame(inA.texts[1], inB.texts[1]);
  }
  std::string_view Encoded(const DOM_Text& inText);
  char* RoomFor(std::size_t inBytes);
  std::string_view Kept(std::size_t inBytes);  ///< what was written there
  std::size_t SlotOf(const ProductKey& inKey) const;

  ZORDefault::TreeReader tree_;
  std::vector<Named> meanings_;                  // of each name of the document
  std::vector<std::unique_ptr<char[]>> blocks_;  // of texts that are kept
  char* free_ = nullptr;
  std::size_t room_ = 0;
  std::vector<ProductKey> products_;
  // Open addressing; a position and one, and the upper half of the hash.
  struct Slot {
    std::uint32_t tag, product;
  };
  struct FreeSlots {
    void operator()(Slot* inSlots) const { std::free(inSlots); }
  };
  void MakeSlots(std::size_t inCount);
  void GrowSlots();
  std::unique_ptr<Slot[], FreeSlots> slots_;
  std::size_t slotCount_ = 0;  // a power of two
  struct RecentText {
    StoredText stored = nullptr;
    std::string_view text;
  };
  std::array<RecentText, 64> recentTexts_;  // those that were encoded, by their place
};

}  // namespace ZORToolkit

#endif
