#include "toolkit/review/ReviewRecords.h"

#include <unordered_map>

#include "toolkit/records/ElementWalk.h"
#include "toolkit/review/LanguageWords.h"
#include "toolkit/review/ReviewSource.h"
#include "toolkit/review/StableIds.h"

namespace ZORToolkit {
namespace {

class ReviewReader {
 public:
  ReviewReader(ClashDocument& ioDocument, const ReviewReading& inReading)
      : document_(ioDocument),
        reading_(inReading),
        identityHasher_(result_),
        usualCount_(ZORDefault::TreeReader(ioDocument.Root()).ElementEnd() / kUsualNodes),
        source_(std::make_shared<ReviewSource>(ioDocument.Root(), 2 * usualCount_)) {}

  ReviewedResult Read() {
    result_.name = document_.Name();
    result_.kind = document_.Kind();
    result_.source = source_;
    result_.interferences.reserve(usualCount_);
    result_.products.reserve(2 * usualCount_);  // memory that is not used costs nothing
    if (reading_.geometries) result_.geometries.reserve(usualCount_);
    if (reading_.identities) {
      result_.places.reserve(usualCount_);
      result_.identities.reserve(usualCount_);
    }
    const Element root = ZORDefault::TreeReader::ElementOf(document_.Root());
    if (result_.kind == DocumentKind::kInterference) {
      ReadSingle(root);
      FinishBlock();
      return std::move(result_);
    }
    source_->ForEachChild(root, [&](Element inChild, Named inNamed) {
      if (inNamed == Named::kClashResult) ReadSet(inChild);
      if (inNamed == Named::kProductsInSpec) ReadSpecifications(inChild);
      if (inNamed == Named::kClashSpec) ReadComputation(inChild);
    });
    FinishBlock();
    return std::move(result_);
  }

 private:
  typedef ReviewSource::Element Element;
  static constexpr std::size_t kUsualNodes = 44;  // of an interference

  std::string TextOf(Element inElement, Named inAttribute) {
    return std::string(source_->Text(source_->Attribute(inElement, inAttribute)));
  }

  /// The first interference alone.
  void ReadSingle(Element inRoot) {
    source_->ForEachChild(inRoot, [&](Element inChild, Named inNamed) {
      if (inNamed == Named::kInterference && result_.interferences.empty())
        ReadInterference(inChild, CaseOf(""));
    });
  }

  void ReadSet(Element inSet) {
    const int computationCase = CaseOf(TextOf(inSet, Named::kComputationCase));
    source_->ForEachChild(inSet, [&](Element inChild, Named inNamed) {
      if (inNamed == Named::kInterference) ReadInterference(inChild, computationCase);
    });
  }

  void ReadComputation(Element inElement) {
    result_.computedTypes = TextOf(inElement, Named::kType);
    result_.clearance = Number(TextOf(inElement, Named::kClearance));
  }

  void ReadSpecifications(Element inProducts) {
    result_.hasSpecification = true;
    source_->ForEachChild(inProducts, [&](Element inSpecification, Named inNamed) {
      if (inNamed != Named::kSpecification) return;
      SpecifiedPair& pair = result_.specifications.emplace_back();
      source_->ForEachChild(inSpecification, [&](Element inSide, Named inSideNamed) {
        if (inSideNamed != Named::kProdListe1 && inSideNamed != Named::kProdListe2) return;
        SpecifiedPair::Names& names = pair.products[inSideNamed == Named::kProdListe1 ? 0 : 1];
        names = {};
        source_->ForEachAttribute(inSide, [&](Named inAttribute, StoredText inText) {
          if (inAttribute == Named::kAlias) names.alias = source_->Text(inText);
          if (inAttribute == Named::kDisplayableId) names.id = source_->Text(inText);
        });
      });
    });
  }

  void ReadInterference(Element inElement, int inComputationCase) {
    if (awaitedCount_ + 2 > awaited_.size()) FinishBlock();
    ReviewRecord& record = result_.interferences.emplace_back();
    record.index = static_cast<int>(result_.interferences.size());
    record.computationCase = inComputationCase;
    record.element = inElement;
    ExpectNext(inElement);
    WordTexts words{};
    source_->ForEachAttribute(inElement, [&](Named inNamed, StoredText inText) {
      switch (inNamed) {
        case Named::kValue:
          record.value.text = source_->Text(inText);
          break;
        case Named::kDistanceClearance:
          record.clearance = ClearanceOf(inText);
          break;
        case Named::kResultTypeNoNls:
          words[0] = inText;
          break;
        case Named::kResultType:
          words[1] = inText;
          break;
        case Named::kStatus:
          words[2] = inText;
          break;
        case Named::kRetrieveInf:
          words[3] = inText;
          break;
        default:
          break;
      }
    });
    const Words& meanings = WordsOf(inElement, words);
    record.type = meanings.type;
    record.status = meanings.status;
    record.retrieve = meanings.retrieve;
    ReadChildren(inElement, record);
  }

  /// Has the memory fetched of the second interference from here: as far away as two times the one
  /// before this is. Reading one meanwhile takes about as long.
  void ExpectNext(Element inElement) {
    constexpr std::uintptr_t kMost = 4096, kLine = 64;
    const std::array<const char*, 3> places = source_->Tree().PlacesOf(inElement);
    for (std::size_t i = 0; i < places.size(); ++i) {
      const std::uintptr_t step = reinterpret_cast<std::uintptr_t>(places[i]) -
                                  reinterpret_cast<std::uintptr_t>(places_[i]);
      if (places[i] == nullptr || places_[i] == nullptr || step > kMost) continue;
      for (std::uintptr_t at = 2 * step; at < 3 * step; at += kLine)
        __builtin_prefetch(places[i] + at);
    }
    places_ = places;
  }

  /// As the reader answers numbers: with the first comma made a point.
  WrittenNumber ClearanceOf(StoredText inText) {
    const std::string_view text = source_->Text(inText);
    const std::size_t comma = text.find(',');
    if (comma == std::string_view::npos) return {text};
    std::string withPoint(text);
    withPoint[comma] = '.';
    return {source_->Keep(withPoint)};
  }

  void ReadChildren(Element inElement, ReviewRecord& ioRecord) {
    const WrittenNumber itsOwn = ioRecord.clearance;
    source_->ForEachChild(inElement, [&](Element inChild, Named inNamed) {
      switch (inNamed) {
        case Named::kProduct:
          ioRecord.productElements[ioRecord.productElements[0] == 0 ? 0 : 1] = inChild;
          break;
        case Named::kGeometricAspect:
          ioRecord.hasMoreGeometry = ioRecord.geometry != 0;
          if (ioRecord.geometry == 0) ioRecord.geometry = inChild;
          break;
        case Named::kComment:
          ioRecord.comment = source_->Text(source_->Attribute(inChild, Named::kValue));
          break;
        case Named::kViolatedRule:
          ReadRule(inChild, itsOwn, ioRecord);
          break;
        default:
          break;
      }
    });
    for (std::size_t i = 0; i < 2; ++i)
      if (ioRecord.productElements[i] != 0)
        Await(ioRecord.index - 1, i, ioRecord.productElements[i]);
  }

  void ReadRule(Element inRule, const WrittenNumber& inClearance, ReviewRecord& ioRecord) {
    ioRecord.rule = source_->Text(source_->Attribute(inRule, Named::kName));
    const StoredText clearance = source_->Attribute(inRule, Named::kClearance);
    const bool hasClearance = clearance != nullptr && clearance->Length() != 0;
    ioRecord.clearance = hasClearance ? ClearanceOf(clearance) : inClearance;
    ioRecord.computationCase = CaseOf(TextOf(inRule, Named::kTypeCalc));
  }

  // Products are looked for some at a time, since each is at another place in memory

  struct AwaitedProduct {
    StoredText id = nullptr, alias = nullptr, part = nullptr;
    ReviewSource::ProductKey key;
    int position = 0;  // of the interference
    std::size_t which = 0;
    Element element = 0;
  };

  void Await(int inPosition, std::size_t inWhich, Element inElement) {
    AwaitedProduct& awaited = awaited_[awaitedCount_++];
    awaited = {};
    source_->ForEachAttribute(inElement, [&](Named inNamed, StoredText inText) {
      if (inNamed == Named::kDescriptionId) awaited.id = inText;
      if (inNamed == Named::kAlias) awaited.alias = inText;
      if (inNamed == Named::kShapeName) awaited.part = inText;
    });
    awaited.key = ReviewSource::KeyOf(awaited.id, awaited.alias, awaited.part);
    awaited.position = inPosition;
    awaited.which = inWhich;
    awaited.element = inElement;
    source_->Expect(awaited.key);
  }

  /// What is left to do of some interferences, while their memory is near.
  void FinishBlock() {
    FindProducts();
    for (; finishedCount_ < result_.interferences.size(); ++finishedCount_) {
      const ReviewRecord& record = result_.interferences[finishedCount_];
      if (reading_.geometries) ReadGeometry(record);
      if (!reading_.identities) continue;
      result_.places.push_back(source_->PlaceOf(record));
      result_.identities.push_back(identityHasher_.OfInterference(record, result_.places.back()));
    }
  }

  void ReadGeometry(const ReviewRecord& inRecord) {
    const WrittenGeometry& geometry =
        result_.geometries.emplace_back(source_->GeometryOf(inRecord));
    for (std::size_t i = 0; i < 2; ++i) {
      if (inRecord.products[i] < 0) continue;
      ReviewProduct& product = result_.products[static_cast<std::size_t>(inRecord.products[i])];
      if (product.element == inRecord.productElements[i])
        product.placement = geometry.placements[i];
    }
  }

  void FindProducts() {
    for (std::size_t i = 0; i < awaitedCount_; ++i) {
      const AwaitedProduct& awaited = awaited_[i];
      const auto position = static_cast<std::size_t>(awaited.position);
      result_.interferences[position].products[awaited.which] = PositionOf(awaited);
    }
    awaitedCount_ = 0;
  }

  int PositionOf(const AwaitedProduct& inProduct) {
    const int position = source_->FindOrAdd(inProduct.key);
    if (static_cast<std::size_t>(position) < result_.products.size()) return position;
    const std::string_view id = source_->Text(inProduct.id);
    result_.products.push_back({id, source_->Text(inProduct.alias, inProduct.id, id),
                                source_->Text(inProduct.part), inProduct.element, 0});
    return position;
  }

  int CaseOf(const std::string& inName) {
    const auto [known, isNew] =
        cases_.try_emplace(inName, static_cast<int>(result_.computationCases.size()));
    if (isNew) result_.computationCases.push_back(inName);
    return known->second;
  }

  // Results repeat a few words, which are understood once

  /// "ResultTypeNoNLS", "ResultType", "Status" and "RetrieveInf".
  typedef std::array<StoredText, 4> WordTexts;
  struct Words {
    std::string_view type, status, retrieve;
  };
  struct RecentWords {
    WordTexts texts{};
    Words words;
    bool isKnown = false;
  };

  const Words& WordsOf(Element inElement, const WordTexts& inTexts) {
    std::uintptr_t sum = 0;
    for (const StoredText text : inTexts) sum = sum * 31 + reinterpret_cast<std::uintptr_t>(text);
    RecentWords& recent = recentWords_[(sum ^ (sum >> 9)) % recentWords_.size()];
    if (!recent.isKnown || recent.texts != inTexts)
      recent = {inTexts, UnderstoodWords(inElement, inTexts), true};
    return recent.words;
  }

  Words UnderstoodWords(Element inElement, const WordTexts& inTexts) {
    std::string key;
    for (const StoredText text : inTexts)  // one that is missing is none that is empty
      key.append(source_->Text(text)).append(1, text == nullptr ? '\1' : '\0');
    const auto [known, isNew] = words_.try_emplace(key);
    if (isNew) known->second = ReadWords(inElement);
    return known->second;
  }

  Words ReadWords(Element inElement) {
    const DOM_Node element = source_->Tree().Handle(inElement);
    InterferenceRecord row = ReadRow(document_, element);
    const std::string statusText = AttributeText(element, "Status");
    const std::string ageText = AttributeText(element, "RetrieveInf");
    const std::string status = EnglishWord(statusText), age = EnglishWord(ageText);
    result_.words.insert(result_.words.end(), {statusText, ageText});
    return {source_->Keep(row.type),
            source_->Keep(row.status == "error" && !status.empty() ? status : row.status),
            source_->Keep(age.empty() ? row.retrieve : age)};
  }

  ClashDocument& document_;
  ReviewReading reading_;
  ReviewedResult result_;
  IdentityHasher identityHasher_;
  std::size_t usualCount_;  // of interferences
  std::shared_ptr<ReviewSource> source_;
  std::array<AwaitedProduct, 16> awaited_;
  std::size_t awaitedCount_ = 0;
  std::array<const char*, 3> places_{};  // of the interference before
  std::size_t finishedCount_ = 0;        // of the interferences
  std::array<RecentWords, 256> recentWords_;
  std::unordered_map<std::string, Words> words_;
  std::unordered_map<std::string, int> cases_;
};

}  // namespace

ReviewedResult ReadForReview(ClashDocument& ioDocument, const ReviewReading& inReading) {
  ioDocument.RequireInterferences();
  return ReviewReader(ioDocument, inReading).Read();
}

}  // namespace ZORToolkit
