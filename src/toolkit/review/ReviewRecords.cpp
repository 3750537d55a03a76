#include "toolkit/review/ReviewRecords.h"

#include <unordered_map>

#include "toolkit/records/ElementWalk.h"
#include "toolkit/review/LanguageWords.h"
#include "toolkit/review/ReviewSource.h"

namespace ZORToolkit {
namespace {

class ReviewReader {
 public:
  explicit ReviewReader(ClashDocument& ioDocument)
      : document_(ioDocument), source_(std::make_shared<ReviewSource>(ioDocument.Root())) {}

  ReviewedResult Read() {
    result_.name = document_.Name();
    result_.kind = document_.Kind();
    result_.source = source_;
    constexpr std::size_t kUsualNodes = 44;  // of an interference
    result_.interferences.reserve(source_->Tree().ElementEnd() / kUsualNodes);
    const Element root = ZORDefault::TreeReader::ElementOf(document_.Root());
    if (result_.kind == DocumentKind::kInterference) {
      ReadSingle(root);
      return std::move(result_);
    }
    source_->ForEachChild(root, [&](Element inChild, Named inNamed) {
      if (inNamed == Named::kClashResult) ReadSet(inChild);
      if (inNamed == Named::kProductsInSpec) ReadSpecifications(inChild);
      if (inNamed == Named::kClashSpec) ReadComputation(inChild);
    });
    return std::move(result_);
  }

 private:
  typedef ReviewSource::Element Element;

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
    ReviewRecord& record = result_.interferences.emplace_back();
    record.index = static_cast<int>(result_.interferences.size());
    record.computationCase = inComputationCase;
    record.element = inElement;
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
        ioRecord.products[i] = ProductOf(ioRecord.productElements[i]);
  }

  void ReadRule(Element inRule, const WrittenNumber& inClearance, ReviewRecord& ioRecord) {
    ioRecord.rule = source_->Text(source_->Attribute(inRule, Named::kName));
    const StoredText clearance = source_->Attribute(inRule, Named::kClearance);
    const bool hasClearance = clearance != nullptr && clearance->Length() != 0;
    ioRecord.clearance = hasClearance ? ClearanceOf(clearance) : inClearance;
    ioRecord.computationCase = CaseOf(TextOf(inRule, Named::kTypeCalc));
  }

  int ProductOf(Element inElement) {
    StoredText id = nullptr, alias = nullptr, part = nullptr;
    source_->ForEachAttribute(inElement, [&](Named inNamed, StoredText inText) {
      if (inNamed == Named::kDescriptionId) id = inText;
      if (inNamed == Named::kAlias) alias = inText;
      if (inNamed == Named::kShapeName) part = inText;
    });
    const ReviewSource::ProductKey key = ReviewSource::KeyOf(id, alias, part);
    const int known = source_->Find(key, -1);
    if (known >= 0) return known;
    source_->Add(key);
    result_.products.push_back(
        {source_->Text(id), source_->Text(alias), source_->Text(part), inElement});
    return source_->ProductCount() - 1;
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
  std::shared_ptr<ReviewSource> source_;
  ReviewedResult result_;
  std::array<RecentWords, 256> recentWords_;
  std::unordered_map<std::string, Words> words_;
  std::unordered_map<std::string, int> cases_;
};

}  // namespace

ReviewedResult ReadForReview(ClashDocument& ioDocument) {
  ioDocument.RequireInterferences();
  return ReviewReader(ioDocument).Read();
}

}  // namespace ZORToolkit
