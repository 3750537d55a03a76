#include "lyra/InterferenceRecord.h"

#include "lyra/DocumentText.h"

namespace lyra {
namespace {

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

/// The first and the last of the other "Product" elements, which are those that the reader keeps;
/// null where there are none.
std::array<DOM_Node, 2> ProductElements(const DOM_Node& inInterference) {
  std::array<DOM_Node, 2> products;
  ForEachElement(inInterference, "Product", [&](const DOM_Node& inProduct) {
    (products[0].isNull() ? products[0] : products[1]) = inProduct;
  });
  return products;
}

// The reader gives labels for the interferences under result sets only. The one directly under the
// root gets its instance names, which are taken from identifiers, out of a copy whose identifiers
// are the aliases.
std::array<ZORUnicodeString, 2> LabelsOfSingle(ZORClashParsing& ioReader,
                                               const DOM_Node& inInterference) {
  const DOM_Node copy = inInterference.cloneNode(true);
  ForEachElement(copy, "Product", [&](const DOM_Node& inProduct) {
    DOM_Element product(inProduct);
    product.setAttribute("DescriptionID", product.getAttribute("Alias"));
    product.removeAttribute("ProcessMode");
  });
  ReaderTexts texts;
  texts.Read(ioReader, copy);
  const std::array<DOM_Node, 2> products = ProductElements(copy);
  std::array<ZORUnicodeString, 2> labels;
  for (std::size_t i = 0; i < 2; ++i) {
    if (products[i].isNull()) continue;
    labels[i] = texts.instance[i] + " -- " + texts.shape[i];
  }
  return labels;
}

std::array<ZORUnicodeString, 2> Labels(ZORClashParsing& ioReader,
                                       const PlacedInterference& inPlaced) {
  if (inPlaced.set.isNull()) return LabelsOfSingle(ioReader, inPlaced.element);
  std::array<ZORUnicodeString, 2> labels, previews;
  DOM_Node copy;
  ioReader.GetithInterference(inPlaced.number, copy, labels[0], labels[1], previews[0],
                              previews[1]);
  return labels;
}

/// Three numbers as the reader takes them: -1 for what is none.
void ReadTriple(const DOM_Node& inNode, const std::array<const char*, 3>& inNames,
                double* outTriple) {
  for (std::size_t i = 0; i < 3; ++i) {
    outTriple[i] = -1.0;
    FromUtf8(AttributeText(inNode, inNames[i])).ConvertToNum(&outTriple[i], "%le");
  }
}

/// The reader hands placements out for whole documents only, and for as many interferences as
/// these declare; this is its rule for one product. All zeros without "Matrix".
Placement ReadPlacement(const DOM_Node& inProduct) {
  constexpr const char* kColumns[] = {"Rx", "Ry", "Rz"};
  Placement placement{};
  ForEachElement(inProduct, "Matrix", [&](const DOM_Node& inMatrix) {
    ForEachElement(inMatrix, "Point", [&](const DOM_Node& inPoint) {
      ReadTriple(inPoint, {"Ux", "Uy", "Uz"}, &placement[9]);
    });
    ForEachElement(inMatrix, "Vector", [&](const DOM_Node& inVector) {
      const std::string column = AttributeText(inVector, "CorrespondingData");
      for (std::size_t i = 0; i < 3; ++i)
        if (column == kColumns[i]) ReadTriple(inVector, {"Vx", "Vy", "Vz"}, &placement[3 * i]);
    });
  });
  return placement;
}

// The reader joins all coordinates by "/", which cannot be told from a "/" inside one.
std::vector<TextTriple> ReadPoints(const DOM_Node& inInterference) {
  std::vector<TextTriple> points;
  ForEachElement(inInterference, "GeometricAspect", [&](const DOM_Node& inGeometry) {
    ForEachElement(inGeometry, "Point", [&](const DOM_Node& inPoint) {
      points.push_back(
          {NumberText(inPoint, "Ux"), NumberText(inPoint, "Uy"), NumberText(inPoint, "Uz")});
    });
  });
  return points;
}

std::optional<ViewpointRecord> ViewpointOf(const ReaderTexts& inTexts) {
  if (inTexts.projection == "NOVIEWPOINT") return std::nullopt;
  ViewpointRecord viewpoint{Utf8(inTexts.projection),
                            Utf8(inTexts.focusDistance),
                            Utf8(inTexts.nearPlane),
                            Utf8(inTexts.farPlane),
                            {},
                            {}};
  for (std::size_t i = 0; i < 3; ++i) {
    viewpoint.point[i] = Utf8(inTexts.viewpoint[i]);
    viewpoint.sight[i] = Utf8(inTexts.sight[i]);
  }
  return viewpoint;
}

// What is read from the document itself, beside the reader's texts.
void ReadTheRest(ClashResultFile& ioFile, const PlacedInterference& inPlaced,
                 const std::array<DOM_Node, 2>& inProducts, InterferenceRecord& ioRecord) {
  const std::array<ZORUnicodeString, 2> labels = Labels(ioFile.Reader(), inPlaced);
  for (std::size_t i = 0; i < 2; ++i) {
    if (inProducts[i].isNull()) continue;
    ioRecord.products[i].label = Utf8(labels[i]);
    ioRecord.products[i].preview = AttributeText(inProducts[i], "Preview");
    ioRecord.products[i].position = ReadPlacement(inProducts[i]);
  }
  ioRecord.picture = AttributeText(FirstElement(inPlaced.element, "Picture"), "HRef");
  ioRecord.points = ReadPoints(inPlaced.element);
}

}  // namespace

InterferenceRecord ReadInterference(ClashResultFile& ioFile, const PlacedInterference& inPlaced,
                                    RecordPart inPart) {
  ReaderTexts texts;
  // A violated rule's computation type replaces that of the result set.
  texts.computationType = FromUtf8(AttributeText(inPlaced.set, "ComputationCase"));
  texts.Read(ioFile.Reader(), inPlaced.element);

  InterferenceRecord record;
  record.index = inPlaced.number;
  record.result = AttributeText(inPlaced.set, "Name");
  record.name = AttributeText(inPlaced.element, "Name");
  record.value = AttributeText(inPlaced.element, "Value");
  record.type = Utf8(texts.resultType);
  record.rule = {Utf8(texts.ruleName), Utf8(texts.ruleClearance), Utf8(texts.severity),
                 Utf8(texts.penetrationCandidate)};
  record.clearance = record.rule.clearance.empty() ? Utf8(texts.clearance) : record.rule.clearance;
  record.status = Utf8(texts.status);
  record.computationCase = Utf8(texts.computationType);
  record.retrieve = Utf8(texts.retrieve);

  const std::array<DOM_Node, 2> products = ProductElements(inPlaced.element);
  for (std::size_t i = 0; i < 2; ++i) {
    if (products[i].isNull()) continue;
    record.products[i] = {Utf8(texts.id[i]),
                          AttributeText(products[i], "Alias"),
                          Utf8(texts.instance[i]),
                          "",
                          Utf8(texts.alien[i]),
                          Utf8(texts.processMode[i]),
                          Utf8(texts.shape[i]),
                          Utf8(texts.source[i]),
                          "",
                          std::nullopt};
  }
  record.comment = Utf8(texts.comment);
  if (inPart == RecordPart::kRow) return record;
  record.curveLength = Utf8(texts.curveLength);
  record.distance = Utf8(texts.distance);
  record.viewpoint = ViewpointOf(texts);
  ReadTheRest(ioFile, inPlaced, products, record);
  return record;
}

}  // namespace lyra
