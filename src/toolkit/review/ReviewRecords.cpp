#include "toolkit/review/ReviewRecords.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <unordered_map>

#include "toolkit/records/ElementWalk.h"
#include "toolkit/review/LanguageWords.h"

namespace ZORToolkit {
namespace {

// Texts are taken out of the document: its own units would be kept by it from then on.
ZORUnicodeString AttributeOf(const DOM_Node& inElement, const char* inName) {
  return inElement.getAttributes()
      .getNamedItem(inName)
      .getNodeValue()
      .DOMStringToZORUnicodeString();
}

std::u16string_view Units(const ZORUnicodeString& inText) {
  return {inText.ConvertToUCChar(), static_cast<std::size_t>(inText.GetLengthInChar())};
}

std::string Text(const ZORUnicodeString& inText) {
  const std::u16string_view units = Units(inText);
  if (std::ranges::all_of(units, [](char16_t inUnit) { return inUnit < 0x80; }))
    return std::string(units.begin(), units.end());
  return Utf8(inText);
}

/// A number as a record has it, by the short way where its text is a plain decimal number.
std::optional<double> NumberIn(const ZORUnicodeString& inText) {
  char digits[40];
  const std::u16string_view units = Units(inText);
  if (units.size() < sizeof digits) {
    std::size_t count = 0;
    bool isPlain = !units.empty();
    for (const char16_t unit : units) {
      isPlain = isPlain && ((unit >= '0' && unit <= '9') || unit == '-' || unit == '.' ||
                            unit == ',' || unit == 'e' || (unit == '+' && count > 0));
      digits[count++] = unit == ',' ? '.' : static_cast<char>(unit);
    }
    double value = 0;
    const auto [end, error] = std::from_chars(digits, digits + count, value);
    if (isPlain && error == std::errc() && end == digits + count) return value;
  }
  return Number(inText).value;
}

bool ReadTriple(const DOM_Node& inNode, const std::array<const char*, 3>& inNames,
                double* outTriple) {
  for (std::size_t i = 0; i < 3; ++i) {
    const std::optional<double> number = NumberIn(AttributeOf(inNode, inNames[i]));
    if (!number) return false;
    outTriple[i] = *number;
  }
  return true;
}

std::optional<Placement> PlacementIn(const DOM_Node& inMatrix) {
  Placement placement{};
  unsigned int found = 0;  // a bit for each column and the translation
  bool isWhole = true;
  ForEachElement(inMatrix, nullptr, [&](const DOM_Node& inChild) {
    const DOMString name = inChild.getNodeName();
    if (name.equals("Point")) {
      isWhole = ReadTriple(inChild, {"Ux", "Uy", "Uz"}, &placement[9]) && isWhole;
      found |= 8;
    } else if (name.equals("Vector")) {
      const ZORUnicodeString column = AttributeOf(inChild, "CorrespondingData");
      for (unsigned int i = 0; i < 3; ++i) {
        constexpr const char* kColumns[] = {"Rx", "Ry", "Rz"};
        if (column != kColumns[i]) continue;
        isWhole = ReadTriple(inChild, {"Vx", "Vy", "Vz"}, &placement[3 * i]) && isWhole;
        found |= 1u << i;
      }
    }
  });
  if (!isWhole || found != 15) return std::nullopt;
  return placement;
}

std::optional<Placement> PlacementOf(const DOM_Node& inProduct) {
  std::optional<Placement> placement;
  ForEachElement(inProduct, "Matrix",
                 [&](const DOM_Node& inMatrix) { placement = PlacementIn(inMatrix); });
  return placement;
}

/// The mean of the points that have all their numbers.
class MeanPlace {
 public:
  void AddPointsOf(const DOM_Node& inGeometry) {
    ForEachElement(inGeometry, "Point", [&](const DOM_Node& inPoint) {
      Position point;
      if (!ReadTriple(inPoint, {"Ux", "Uy", "Uz"}, point.data())) return;
      for (std::size_t i = 0; i < 3; ++i) sum_[i] += point[i];
      ++count_;
    });
  }
  std::optional<Position> Get() const {
    if (count_ == 0) return std::nullopt;
    Position mean = sum_;
    for (double& coordinate : mean) coordinate /= count_;
    return mean;
  }

 private:
  Position sum_{};
  int count_ = 0;
};

class ReviewReader {
 public:
  explicit ReviewReader(ClashDocument& ioDocument) : document_(ioDocument) {}

  ReviewedResult Read() {
    document_.RequireInterferences();
    result_.name = document_.Name();
    result_.kind = document_.Kind();
    if (result_.kind == DocumentKind::kInterference) {
      ReadOne(DOM_Node(), FirstElement(document_.Root(), "Interference"));
      return std::move(result_);
    }
    ForEachElement(document_.Root(), nullptr, [&](const DOM_Node& inChild) {
      const DOMString name = inChild.getNodeName();
      if (name.equals("ClashResult")) ReadSet(inChild);
      if (name.equals("ProductsInSpec")) result_.hasSpecification = true;
      if (!name.equals("ClashSpec")) return;
      result_.computedTypes = Text(AttributeOf(inChild, "Type"));
      result_.clearance = Number(Text(AttributeOf(inChild, "Clearance")));
    });
    result_.specifications = ReadSpecifications(document_);
    return std::move(result_);
  }

 private:
  void ReadSet(const DOM_Node& inSet) {
    const int computationCase = CaseOf(Text(AttributeOf(inSet, "ComputationCase")));
    ForEachElement(inSet, "Interference", [&](const DOM_Node& inElement) {
      ReadOne(inSet, inElement);
      int& itsCase = result_.interferences.back().computationCase;
      if (itsCase < 0) itsCase = computationCase;
    });
  }

  void ReadOne(const DOM_Node& inSet, const DOM_Node& inElement) {
    if (inElement.isNull()) return;
    ReviewRecord& record = result_.interferences.emplace_back();
    record.index = static_cast<int>(result_.interferences.size());
    record.element = ElementHandle(inElement);
    const ZORUnicodeString value = AttributeOf(inElement, "Value");
    record.value.text = Text(value);
    record.value.value = NumberIn(value);
    SetNumber(AttributeOf(inElement, "DistanceClearance"), record.clearance);
    ReadWords(inElement, record);
    ReadChildren(inElement, record);
    if (inSet.isNull() && record.computationCase < 0) record.computationCase = CaseOf("");
  }

  /// As the reader answers numbers: with the first comma made a point.
  static void SetNumber(const ZORUnicodeString& inText, Number& outNumber) {
    outNumber.text = Text(inText);
    const std::size_t comma = outNumber.text.find(',');
    if (comma != std::string::npos) outNumber.text[comma] = '.';
    outNumber.value = NumberIn(inText);
  }

  /// Results repeat a few words, which are understood once.
  void ReadWords(const DOM_Node& inElement, ReviewRecord& ioRecord) {
    wordKey_.clear();
    for (const char* const name : {"ResultTypeNoNLS", "ResultType", "Status", "RetrieveInf"}) {
      wordKey_ += Units(AttributeOf(inElement, name));
      wordKey_ += u'\0';
    }
    const auto [known, isNew] = words_.try_emplace(wordKey_);
    Words& words = known->second;
    if (isNew) {
      const InterferenceRecord row = ReadRow(document_, inElement);
      words = {row.type, row.status, row.retrieve};
      const std::string statusText = AttributeText(inElement, "Status");
      const std::string ageText = AttributeText(inElement, "RetrieveInf");
      const std::string status = EnglishWord(statusText), age = EnglishWord(ageText);
      if (words.status == "error" && !status.empty()) words.status = status;
      if (!age.empty()) words.retrieve = age;
      result_.words.insert(result_.words.end(), {statusText, ageText});
    }
    ioRecord.type = words.type;
    ioRecord.status = words.status;
    ioRecord.retrieve = words.retrieve;
  }

  void ReadChildren(const DOM_Node& inElement, ReviewRecord& ioRecord) {
    DOM_Node products[2];
    MeanPlace place;
    ForEachElement(inElement, nullptr, [&](const DOM_Node& inChild) {
      const DOMString name = inChild.getNodeName();
      if (name.equals("Product")) {
        products[products[0].isNull() ? 0 : 1] = inChild;
      } else if (name.equals("GeometricAspect")) {
        place.AddPointsOf(inChild);
      } else if (name.equals("Comment")) {
        ioRecord.comment = Text(AttributeOf(inChild, "Value"));
      } else if (name.equals("ViolatedRule")) {
        ioRecord.rule = Text(AttributeOf(inChild, "Name"));
        const ZORUnicodeString clearance = AttributeOf(inChild, "Clearance");
        if (clearance.GetLengthInChar() != 0) SetNumber(clearance, ioRecord.clearance);
        ioRecord.computationCase = CaseOf(Text(AttributeOf(inChild, "TypeCalc")));
      }
    });
    ioRecord.place = place.Get();
    for (std::size_t i = 0; i < 2; ++i) {
      if (products[i].isNull()) continue;
      ioRecord.placements[i] = PlacementOf(products[i]);
      ioRecord.products[i] = ProductOf(products[i], ioRecord.placements[i]);
    }
  }

  int ProductOf(const DOM_Node& inProduct, const std::optional<Placement>& inPlacement) {
    const ZORUnicodeString id = AttributeOf(inProduct, "DescriptionID");
    productKey_.assign(Units(id));
    if (productKey_.empty()) {
      productKey_ = u'\0';
      productKey_ += Units(AttributeOf(inProduct, "Alias"));
      productKey_ += u'\0';
      productKey_ += Units(AttributeOf(inProduct, "ShapeName"));
    }
    const auto [known, isNew] =
        products_.try_emplace(productKey_, static_cast<int>(result_.products.size()));
    if (isNew)
      result_.products.push_back({Text(id), Text(AttributeOf(inProduct, "Alias")),
                                  Text(AttributeOf(inProduct, "ShapeName")), inPlacement});
    return known->second;
  }

  int CaseOf(const std::string& inName) {
    const auto [known, isNew] =
        cases_.try_emplace(inName, static_cast<int>(result_.computationCases.size()));
    if (isNew) result_.computationCases.push_back(inName);
    return known->second;
  }

  struct Words {
    std::string type, status, retrieve;
  };

  ClashDocument& document_;
  ReviewedResult result_;
  std::u16string wordKey_, productKey_;
  std::unordered_map<std::u16string, Words> words_;
  std::unordered_map<std::u16string, int> products_;
  std::unordered_map<std::string, int> cases_;
};

}  // namespace

std::string ReviewProduct::Key() const {
  return id.empty() ? std::string(1, '\0') + alias + '\0' + part : id;
}

ReviewedResult ReadForReview(ClashDocument& ioDocument) { return ReviewReader(ioDocument).Read(); }

}  // namespace ZORToolkit
