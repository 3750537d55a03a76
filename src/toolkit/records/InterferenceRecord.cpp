#include "toolkit/records/InterferenceRecord.h"

#include <algorithm>
#include <cctype>
#include <charconv>
#include <cmath>
#include <string_view>

#include "foundation/Hash.h"
#include "platform/system/ZORToken.h"
#include "toolkit/records/ElementWalk.h"

namespace ZORToolkit {
namespace {

constexpr char kPathSeparator[] = " --++-- ";

/// An interference and where it stands.
struct PlacedInterference {
  int number;
  DOM_Node set;      // its own "ClashResult"; null in a single-interference document
  DOM_Node element;  // the "Interference"
};

template <class Visit>
void ForEachPlaced(const ClashDocument& inDocument, const Visit& inVisit) {
  inDocument.RequireInterferences();
  if (inDocument.Kind() == DocumentKind::kInterference) {
    const DOM_Node only = FirstElement(inDocument.Root(), "Interference");
    if (!only.isNull()) inVisit(PlacedInterference{1, DOM_Node(), only});
    return;
  }
  int number = 0;
  ForEachElement(inDocument.Root(), "ClashResult", [&](const DOM_Node& inSet) {
    ForEachElement(inSet, "Interference", [&](const DOM_Node& inElement) {
      inVisit(PlacedInterference{++number, inSet, inElement});
    });
  });
}

/// The outputs of the reader's full reading. Empty at first, which is how the reader tells the first
/// product from the second.
struct ReaderTexts {
  ZORUnicodeString resultType, clearance, status, computationType, retrieve;
  ZORUnicodeString ruleName, ruleClearance, severity, penetrationCandidate;
  ZORUnicodeString id[2], idAgain[2], processMode[2], alien[2], instance[2], shape[2], source[2];
  ZORUnicodeString comment, curveLength, distance, reserved, points;
  ZORUnicodeString focusDistance, nearPlane, farPlane, projection;
  ZORUnicodeString viewpoint[3], sight[3], secondVector[3];

  void Read(ZORClashParsing& ioReader, const DOM_Node& inInterference) {
    ioReader.GetInterferenceDataV12(
        inInterference, resultType, clearance, status, computationType, retrieve, ruleName,
        ruleClearance, id[0], id[1], processMode[0], processMode[1], comment, alien[0], alien[1],
        idAgain[0], idAgain[1], instance[0], instance[1], shape[0], shape[1], source[0], source[1],
        severity, penetrationCandidate, curveLength, distance, reserved, points, focusDistance,
        nearPlane, farPlane, projection, viewpoint[0], viewpoint[1], viewpoint[2], sight[0],
        sight[1], sight[2], secondVector[0], secondVector[1], secondVector[2]);
  }
};

bool HasComma(const ZORUnicodeString& inText) {
  const std::u16string_view units(inText.ConvertToUCChar(),
                                  static_cast<std::size_t>(inText.GetLengthInChar()));
  return units.find(u',') != std::u16string_view::npos;
}

/// An attribute that holds a number: its first comma, which is a decimal one, becomes a point.
Number NumberIn(const DOM_Node& inNode, const char* inName) {
  ZORUnicodeString text = ZORLyraGeneralServices::GetAttrOnNode(inNode, inName);
  if (HasComma(text)) text.ReplaceSubString(",", ".");
  return Number(text);
}

/// The last segment before an empty one of a path of aliases, as the reader takes instance names.
ZORUnicodeString LastSegment(const ZORUnicodeString& inPath) {
  const ZORUnicodeString separator(kPathSeparator);
  ZORUnicodeString lines, last;
  int from = 0;
  for (int at = inPath.SearchSubString(separator); at >= 0;
       at = inPath.SearchSubString(separator, from)) {
    lines += inPath.SubString(from, at - from);
    lines += "\n";
    from = at + separator.GetLengthInChar();
  }
  lines += inPath.SubString(from);
  ZORToken segments(lines);
  for (ZORUnicodeString segment = segments.GetNextToken("\n"); segment.GetLengthInChar() != 0;
       segment = segments.GetNextToken("\n"))
    last = segment;
  return last;
}

/// Three numbers of a "Matrix" as the reader takes them: -1 for what is none. It hands placements
/// out for whole documents only, and for as many interferences as these declare.
void ReadTriple(const DOM_Node& inNode, const std::array<const char*, 3>& inNames,
                double* outTriple, std::string& ioWhyMisread) {
  for (std::size_t i = 0; i < 3; ++i) {
    const ZORUnicodeString text = ZORLyraGeneralServices::GetAttrOnNode(inNode, inNames[i]);
    double number = -1;
    if (text.ConvertToNum(&number, "%le") != 1) ioWhyMisread = "a number of its matrix is missing";
    if (HasComma(text)) ioWhyMisread = "its numbers are cut at a decimal comma";
    if (outTriple) outTriple[i] = number;
  }
}

void ReadPlacement(const DOM_Node& inElement, ProductRecord& ioProduct) {
  constexpr const char* kColumns[] = {"Rx", "Ry", "Rz"};
  Placement& placement = ioProduct.placement;
  ioProduct.whyMisread = "the result has no matrix of it";
  ForEachElement(inElement, "Matrix", [&](const DOM_Node& inMatrix) {
    std::string& why = ioProduct.whyMisread;
    why.clear();
    ForEachElement(inMatrix, "Point", [&](const DOM_Node& inPoint) {
      ReadTriple(inPoint, {"Ux", "Uy", "Uz"}, &placement[9], why);
    });
    ForEachElement(inMatrix, "Vector", [&](const DOM_Node& inVector) {
      const std::string name = AttributeText(inVector, "CorrespondingData");
      const auto column = std::find(std::begin(kColumns), std::end(kColumns), name);
      double* const numbers =
          column == std::end(kColumns) ? nullptr : &placement[3 * (column - std::begin(kColumns))];
      ReadTriple(inVector, {"Vx", "Vy", "Vz"}, numbers, why);
    });
  });
}

// The reader joins all coordinates by "/", which cannot be told from a "/" inside one.
void ReadPoints(const DOM_Node& inGeometry, std::vector<NumberTriple>& ioPoints) {
  ForEachElement(inGeometry, "Point", [&](const DOM_Node& inPoint) {
    ioPoints.push_back({NumberIn(inPoint, "Ux"), NumberIn(inPoint, "Uy"), NumberIn(inPoint, "Uz")});
  });
}

ProductRecord ProductOf(const ReaderTexts& inTexts, std::size_t inProduct,
                        const DOM_Node& inElement) {
  ProductRecord product;
  product.exists = true;
  product.id = Utf8(inTexts.id[inProduct]);
  product.alias = AttributeText(inElement, "Alias");
  product.instance = Utf8(inTexts.instance[inProduct]);
  product.alien = Utf8(inTexts.alien[inProduct]);
  product.processMode = Utf8(inTexts.processMode[inProduct]);
  product.shape = Utf8(inTexts.shape[inProduct]);
  product.shapeSource = Utf8(inTexts.source[inProduct]);
  product.element = ElementHandle(inElement);
  return product;
}

/// What the reader does not answer for one interference, by one walk over its elements.
void ReadChildren(const PlacedInterference& inPlaced, const ReaderTexts& inTexts, RecordPart inPart,
                  InterferenceRecord& ioRecord) {
  DOM_Node products[2];
  bool hasPicture = false;
  ForEachElement(inPlaced.element, nullptr, [&](const DOM_Node& inChild) {
    const DOMString name = inChild.getNodeName();
    if (name.equals("Product")) {
      products[products[0].isNull() ? 0 : 1] = inChild;
    } else if (inPart == RecordPart::kAll && name.equals("GeometricAspect")) {
      ReadPoints(inChild, ioRecord.points);
    } else if (inPart == RecordPart::kAll && !hasPicture && name.equals("Picture")) {
      ioRecord.picture = AttributeText(inChild, "HRef");
      hasPicture = true;
    }
  });
  for (std::size_t i = 0; i < 2; ++i) {
    if (products[i].isNull()) continue;
    ioRecord.products[i] = ProductOf(inTexts, i, products[i]);
    if (inPart == RecordPart::kRow) continue;
    ProductRecord& product = ioRecord.products[i];
    // As the reader makes it, which would copy the whole element.
    product.label = Utf8(LastSegment(FromUtf8(product.alias))) + " -- " + product.shape;
    product.preview = AttributeText(products[i], "Preview");
    ReadPlacement(products[i], product);
  }
}

std::optional<ViewpointRecord> ViewpointOf(const ReaderTexts& inTexts) {
  if (inTexts.projection == "NOVIEWPOINT") return std::nullopt;
  ViewpointRecord viewpoint{Utf8(inTexts.projection),
                            Number(inTexts.focusDistance),
                            Number(inTexts.nearPlane),
                            Number(inTexts.farPlane),
                            {},
                            {}};
  for (std::size_t i = 0; i < 3; ++i) {
    viewpoint.point[i] = Number(inTexts.viewpoint[i]);
    viewpoint.sight[i] = Number(inTexts.sight[i]);
  }
  return viewpoint;
}

InterferenceRecord Read(ClashDocument& ioDocument, const PlacedInterference& inPlaced,
                        RecordPart inPart) {
  ReaderTexts texts;
  // A violated rule's computation type replaces that of the result set.
  texts.computationType = ZORLyraGeneralServices::GetAttrOnNode(inPlaced.set, "ComputationCase");
  texts.Read(ioDocument.Reader(), inPlaced.element);

  InterferenceRecord record;
  record.index = inPlaced.number;
  record.result = AttributeText(inPlaced.set, "Name");
  record.name = AttributeText(inPlaced.element, "Name");
  record.value = Number(ZORLyraGeneralServices::GetAttrOnNode(inPlaced.element, "Value"));
  record.type = Utf8(texts.resultType);
  record.rule = {Utf8(texts.ruleName), Number(texts.ruleClearance), Utf8(texts.severity),
                 Utf8(texts.penetrationCandidate)};
  record.clearance =
      record.rule.clearance.text.empty() ? Number(texts.clearance) : record.rule.clearance;
  record.status = Utf8(texts.status);
  record.computationCase = Utf8(texts.computationType);
  record.retrieve = Utf8(texts.retrieve);
  record.comment = Utf8(texts.comment);
  record.element = ElementHandle(inPlaced.element);
  ReadChildren(inPlaced, texts, inPart, record);
  if (inPart == RecordPart::kRow) return record;
  record.typeAsWritten = AttributeText(inPlaced.element, "ResultType");
  record.statusAsWritten = AttributeText(inPlaced.element, "Status");
  record.curveLength = Number(texts.curveLength);
  record.distance = Number(texts.distance);
  record.viewpoint = ViewpointOf(texts);
  return record;
}

void AddTo(ZORFoundation::Hash64& ioHash, const NumberTriple& inTriple) {
  for (const Number& number : inTriple) ioHash.AddText(number.text);
}

void AddTo(ZORFoundation::Hash64& ioHash, const ProductRecord& inProduct) {
  ioHash.Add(std::uint64_t{inProduct.exists});
  for (const std::string* const text :
       {&inProduct.id, &inProduct.alias, &inProduct.instance, &inProduct.label, &inProduct.alien,
        &inProduct.processMode, &inProduct.shape, &inProduct.shapeSource, &inProduct.preview,
        &inProduct.whyMisread})
    ioHash.AddText(*text);
  for (const double number : inProduct.placement) ioHash.Add(number);
}

void AddTo(ZORFoundation::Hash64& ioHash, const std::optional<ViewpointRecord>& inViewpoint) {
  ioHash.Add(std::uint64_t{inViewpoint.has_value()});
  if (!inViewpoint) return;
  ioHash.AddText(inViewpoint->projection);
  AddTo(ioHash, {inViewpoint->focusDistance, inViewpoint->nearPlane, inViewpoint->farPlane});
  AddTo(ioHash, inViewpoint->point);
  AddTo(ioHash, inViewpoint->sight);
}

}  // namespace

std::uint64_t HashOf(const InterferenceRecord& inRecord) {
  ZORFoundation::Hash64 hash;
  hash.Add(static_cast<std::uint64_t>(inRecord.index));
  const RuleRecord& rule = inRecord.rule;
  for (const std::string* const text :
       {&inRecord.result, &inRecord.name, &inRecord.value.text, &inRecord.type,
        &inRecord.typeAsWritten, &inRecord.clearance.text, &inRecord.status,
        &inRecord.statusAsWritten, &inRecord.computationCase, &inRecord.retrieve, &rule.name,
        &rule.clearance.text, &rule.severity, &rule.penetrationCandidate, &inRecord.comment,
        &inRecord.picture, &inRecord.curveLength.text, &inRecord.distance.text})
    hash.AddText(*text);
  for (const ProductRecord& product : inRecord.products) AddTo(hash, product);
  hash.Add(inRecord.points.size());
  for (const NumberTriple& point : inRecord.points) AddTo(hash, point);
  AddTo(hash, inRecord.viewpoint);
  return hash.Get();
}

Number::Number(std::string inText) : Number(FromUtf8(inText)) { text = std::move(inText); }

Number::Number(const ZORUnicodeString& inText) : text(Utf8(inText)) {
  if (text.empty()) return;
  double number = 0;
  if (text.find(',') != std::string::npos) {
    ZORUnicodeString withPoint = inText;
    withPoint.ReplaceSubString(",", ".");
    if (withPoint.ConvertToNum(&number, "%le") != 1) return;
  } else if (inText.ConvertToNum(&number, "%le") != 1) {
    return;
  }
  if (std::isfinite(number)) value = number;
}

Number::Number(double inValue) {
  char digits[32];
  text.assign(digits, std::to_chars(digits, digits + sizeof digits, inValue).ptr);
  if (std::isfinite(inValue)) value = inValue;
}

Projection ProjectionNamed(const std::string& inText) {
  static constexpr std::string_view kStarts[] = {
      "cylind", "parall", "zylind", "cilind", "cilínd", "orthog", "ortog", "円筒", "平行",
  };
  std::string text = inText.substr(std::min(inText.find_first_not_of(' '), inText.size()));
  std::ranges::transform(text, text.begin(), [](unsigned char inByte) {
    return static_cast<char>(inByte < 0x80 ? std::tolower(inByte) : inByte);
  });
  const bool isOrthographic = std::ranges::any_of(
      kStarts, [&](std::string_view inStart) { return text.starts_with(inStart); });
  return isOrthographic ? Projection::kOrthographic : Projection::kPerspective;
}

void ForEachInterference(ClashDocument& ioDocument, RecordPart inPart,
                         const std::function<void(const InterferenceRecord&)>& inVisit) {
  ForEachPlaced(ioDocument, [&](const PlacedInterference& inPlaced) {
    inVisit(Read(ioDocument, inPlaced, inPart));
  });
}

InterferenceRecord ReadRow(ClashDocument& ioDocument, const DOM_Node& inInterference) {
  const DOM_Node parent = inInterference.getParentNode();
  const bool isInSet = parent.getNodeName().equals("ClashResult");
  return Read(ioDocument, PlacedInterference{0, isInSet ? parent : DOM_Node(), inInterference},
              RecordPart::kRow);
}

InterferenceRecord ReadInterference(ClashDocument& ioDocument, long long inNumber) {
  std::optional<PlacedInterference> found;
  int count = 0;
  ForEachPlaced(ioDocument, [&](const PlacedInterference& inPlaced) {
    ++count;
    if (inPlaced.number == inNumber) found = inPlaced;
  });
  if (found) return Read(ioDocument, *found, RecordPart::kAll);
  const std::string held = count == 0   ? "no interference"
                           : count == 1 ? "1 interference"
                                        : std::to_string(count) + " interferences";
  throw Error(ioDocument.Name(), std::string("there is no interference ") +
                                     std::to_string(inNumber) + ": the document has " + held);
}

InterferenceIndex::InterferenceIndex(ClashDocument& ioDocument) : document_(ioDocument) {
  ForEachPlaced(ioDocument, [&](const PlacedInterference& inPlaced) {
    places_.push_back({inPlaced.set, inPlaced.element});
  });
}

InterferenceRecord InterferenceIndex::Read(int inNumber) const {
  const Place& place = places_[static_cast<std::size_t>(inNumber - 1)];
  return ZORToolkit::Read(document_, {inNumber, place.set, place.element}, RecordPart::kAll);
}

int CountInterferences(const ClashDocument& inDocument) {
  int count = 0;
  ForEachPlaced(inDocument, [&](const PlacedInterference&) { ++count; });
  return count;
}

}  // namespace ZORToolkit
