// Everything about one "Interference" element.
#include <string_view>

#include "ZORClashParsing.h"
#include "ZORLyraGeneralServices.h"
#include "clash_reading/ElementWalk.h"
#include "clash_reading/InterferenceWords.h"
#include "clash_reading/NamedConstants.h"
#include "clash_reading/ZORClashDocumentIndex.h"
#include "platform/system/ZORToken.h"
#include "platform/xml/DOM_NamedNodeMap.h"

namespace {

constexpr std::u16string_view kPathSeparator = u" --++-- ";
constexpr const char* kManagedByPdm = "KORVAPDM";

std::u16string_view UnitsOf(const ZORUnicodeString& inText) {
  return {inText.ConvertToUCChar(), static_cast<std::size_t>(inText.GetLengthInChar())};
}

// What an element says in its attributes, asked for once for all that are read of it.
class ElementAttributes {
 public:
  explicit ElementAttributes(const DOM_Node& inElement) : attributes_(inElement.getAttributes()) {}

  // Empty where the attribute is missing.
  ZORUnicodeString Text(const char* inName) const {
    return ZORLyraGeneralServices::GetDOMName(attributes_.getNamedItem(inName).getNodeValue());
  }
  ZORUnicodeString Text(const ZORUnicodeString& inName) const {
    return Text(inName.ConvertToChar());
  }
  // An attribute that holds a number, with its decimal comma made a point. Only the first comma is
  // one.
  ZORUnicodeString Number(const char* inName) const {
    ZORUnicodeString text = Text(inName);
    if (UnitsOf(text).find(u',') != std::u16string_view::npos) text.ReplaceSubString(",", ".");
    return text;
  }

 private:
  DOM_NamedNodeMap attributes_;
};

void AppendPoint(const DOM_Node& inPoint, ZORUnicodeString& ioPoints) {
  const ElementAttributes attributes(inPoint);
  if (ioPoints.GetLengthInChar() != 0) ioPoints += "/";
  ioPoints += attributes.Number("Ux");
  ioPoints += "/";
  ioPoints += attributes.Number("Uy");
  ioPoints += "/";
  ioPoints += attributes.Number("Uz");
}

// The last segment of a path; empty where a segment is empty or holds a line feed, since there the
// platform's tokenizer decides.
std::u16string_view LastPlainSegment(std::u16string_view inPath) {
  if (inPath.find(u'\n') != std::u16string_view::npos) return {};
  for (std::size_t end = 0; (end = inPath.find(kPathSeparator)) != std::u16string_view::npos;) {
    if (end == 0) return {};
    inPath.remove_prefix(end + kPathSeparator.size());
  }
  return inPath;
}

// Replaces every separator by a line feed, in one pass: texts may hold many.
ZORUnicodeString SegmentsAsLines(const ZORUnicodeString& inIdentifier) {
  ZORUnicodeString separator;
  separator.BuildFromUTF16(kPathSeparator.data(), kPathSeparator.size());
  ZORUnicodeString lines;
  int from = 0;
  for (int at = inIdentifier.SearchSubString(separator); at >= 0;
       at = inIdentifier.SearchSubString(separator, from)) {
    lines.AppendUTF16(inIdentifier.ConvertToUCChar() + from, static_cast<std::size_t>(at - from));
    lines += "\n";
    from = at + separator.GetLengthInChar();
  }
  return from == 0 ? inIdentifier : lines.Append(inIdentifier.SubString(from));
}

}  // namespace

// ---- Finding an interference

void ZORClashParsing::GetClashInfos(int inIndex, ZORUnicodeString& outValue,
                                    ZORUnicodeString& outResultType, ZORUnicodeString& outRuleName,
                                    ZORUnicodeString& outFirstAlias,
                                    ZORUnicodeString& outSecondAlias) {
  outFirstAlias = ZORUnicodeString();
  outSecondAlias = ZORUnicodeString();
  index_->Refresh(root_);
  const auto& interferences = index_->Interferences();
  if (inIndex < 1 || static_cast<std::size_t>(inIndex) > interferences.size()) return;
  GetInterferenceData(interferences[static_cast<std::size_t>(inIndex) - 1], outValue, outResultType,
                      outRuleName, outFirstAlias, outSecondAlias);
}

void ZORClashParsing::GetClashInfos(
    ZORUnicodeString inVersion, int inIndex, ZORUnicodeString& outResultName,
    ZORUnicodeString& outResultType, ZORUnicodeString& outClearance, ZORUnicodeString& outStatus,
    ZORUnicodeString& outComputationType, ZORUnicodeString& outRetrieve,
    ZORUnicodeString& outRuleName, ZORUnicodeString& outRuleClearance,
    ZORUnicodeString& outFirstDescriptionId, ZORUnicodeString& outSecondDescriptionId,
    ZORUnicodeString& outFirstProcessMode, ZORUnicodeString& outSecondProcessMode,
    ZORUnicodeString& outComment, ZORUnicodeString& outFirstAlien, ZORUnicodeString& outSecondAlien,
    ZORUnicodeString& outFirstDescriptionIdAgain, ZORUnicodeString& outSecondDescriptionIdAgain,
    ZORUnicodeString& outFirstInstance, ZORUnicodeString& outSecondInstance,
    ZORUnicodeString& outFirstShapeName, ZORUnicodeString& outSecondShapeName,
    ZORUnicodeString& outFirstShapeSource, ZORUnicodeString& outSecondShapeSource,
    ZORUnicodeString& outSeverity, ZORUnicodeString& outPenetrationCandidate,
    ZORUnicodeString& outCurveLength, ZORUnicodeString& outDistance, ZORUnicodeString& outReserved,
    ZORUnicodeString& outPoints, ZORUnicodeString& outFocusDistance, ZORUnicodeString& outNearPlane,
    ZORUnicodeString& outFarPlane, ZORUnicodeString& outProjection, ZORUnicodeString& outViewpointX,
    ZORUnicodeString& outViewpointY, ZORUnicodeString& outViewpointZ, ZORUnicodeString& outSightX,
    ZORUnicodeString& outSightY, ZORUnicodeString& outSightZ, ZORUnicodeString& outSecondVectorX,
    ZORUnicodeString& outSecondVectorY, ZORUnicodeString& outSecondVectorZ) {
  outFirstDescriptionId = ZORUnicodeString();
  outSecondDescriptionId = ZORUnicodeString();
  outFirstAlien = ZORUnicodeString();
  outSecondAlien = ZORUnicodeString();

  const auto read = [&](const DOM_Node& inInterference) {
    GetInterferenceDataV12(
        inInterference, outResultType, outClearance, outStatus, outComputationType, outRetrieve,
        outRuleName, outRuleClearance, outFirstDescriptionId, outSecondDescriptionId,
        outFirstProcessMode, outSecondProcessMode, outComment, outFirstAlien, outSecondAlien,
        outFirstDescriptionIdAgain, outSecondDescriptionIdAgain, outFirstInstance,
        outSecondInstance, outFirstShapeName, outSecondShapeName, outFirstShapeSource,
        outSecondShapeSource, outSeverity, outPenetrationCandidate, outCurveLength, outDistance,
        outReserved, outPoints, outFocusDistance, outNearPlane, outFarPlane, outProjection,
        outViewpointX, outViewpointY, outViewpointZ, outSightX, outSightY, outSightZ,
        outSecondVectorX, outSecondVectorY, outSecondVectorZ);
  };
  const auto preferRuleClearance = [&] {
    if (outRuleClearance.GetLengthInChar() != 0) outClearance = outRuleClearance;
  };

  if (documentKind_ != "ClashElement") {
    outResultName = ZORUnicodeString();
    const DOM_Node interference = FirstElement(root_, "Interference");
    if (interference.isNull()) return;
    read(interference);
    preferRuleClearance();
    return;
  }

  index_->Refresh(root_);
  if (index_->ResultSets().empty()) return;
  // Hosts rely on the last result set naming the result whichever set the interference is in. Where
  // that set is the interference's own, its rule still replaces the computation case.
  const auto nameLastResultSet = [&] {
    const DOM_Node& resultSet = index_->ResultSets().back();
    outResultName = GetAttrOnNode(resultSet, names::Name.ConvertToChar());
    outComputationType = GetAttrOnNode(resultSet, "ComputationCase");
  };
  const auto& interferences = index_->Interferences();
  if (inIndex < 1 || static_cast<std::size_t>(inIndex) > interferences.size()) {
    nameLastResultSet();
    return;
  }
  const std::size_t position = static_cast<std::size_t>(inIndex) - 1;
  const bool inLast = index_->IsInLastResultSet(position);
  if (inLast) nameLastResultSet();
  if (inVersion == "1.2") read(interferences[position]);
  preferRuleClearance();
  if (!inLast) nameLastResultSet();
}

// ---- Reading one interference

void ZORClashParsing::GetInterferenceDataV12(
    DOM_Node inInterference, ZORUnicodeString& outResultType, ZORUnicodeString& outClearance,
    ZORUnicodeString& outStatus, ZORUnicodeString& outComputationType,
    ZORUnicodeString& outRetrieve, ZORUnicodeString& outRuleName,
    ZORUnicodeString& outRuleClearance, ZORUnicodeString& outFirstDescriptionId,
    ZORUnicodeString& outSecondDescriptionId, ZORUnicodeString& outFirstProcessMode,
    ZORUnicodeString& outSecondProcessMode, ZORUnicodeString& outComment,
    ZORUnicodeString& ioFirstAlien, ZORUnicodeString& outSecondAlien,
    ZORUnicodeString& outFirstDescriptionIdAgain, ZORUnicodeString& outSecondDescriptionIdAgain,
    ZORUnicodeString& outFirstInstance, ZORUnicodeString& outSecondInstance,
    ZORUnicodeString& outFirstShapeName, ZORUnicodeString& outSecondShapeName,
    ZORUnicodeString& outFirstShapeSource, ZORUnicodeString& outSecondShapeSource,
    ZORUnicodeString& outSeverity, ZORUnicodeString& outPenetrationCandidate,
    ZORUnicodeString& outCurveLength, ZORUnicodeString& outDistance, ZORUnicodeString& outReserved,
    ZORUnicodeString& outPoints, ZORUnicodeString& outFocusDistance, ZORUnicodeString& outNearPlane,
    ZORUnicodeString& outFarPlane, ZORUnicodeString& outProjection, ZORUnicodeString& outViewpointX,
    ZORUnicodeString& outViewpointY, ZORUnicodeString& outViewpointZ, ZORUnicodeString& outSightX,
    ZORUnicodeString& outSightY, ZORUnicodeString& outSightZ, ZORUnicodeString&, ZORUnicodeString&,
    ZORUnicodeString&) {
  const InterferenceWords words;
  const ElementAttributes interference(inInterference);
  outResultType = words.ResultType(inInterference);
  outClearance = interference.Number("DistanceClearance");
  outStatus = words.Status(interference.Text("Status"));
  outRetrieve = words.Retrieve(interference.Text("RetrieveInf"));
  outPoints = ZORUnicodeString();
  outProjection = "NOVIEWPOINT";

  const auto readRule = [&](const DOM_Node& inRule) {
    const ElementAttributes rule(inRule);
    outRuleName = rule.Text(names::Name);
    outRuleClearance = rule.Number("Clearance");
    outComputationType = rule.Text("TypeCalc");
    outSeverity = rule.Text("Severity");
    outPenetrationCandidate = rule.Text("PenetrationCandidate");
  };
  // The first product leaves its Alien flag filled, and that is how the second is told from it.
  const auto readProduct = [&](const DOM_Node& inProduct) {
    const ElementAttributes product(inProduct);
    const bool first = ioFirstAlien.GetLengthInChar() == 0;
    const ZORUnicodeString identifier = product.Text("DescriptionID");
    ZORUnicodeString alien = product.Text(names::Alien);
    if (alien.GetLengthInChar() == 0) alien = "YES";
    const ZORUnicodeString processMode = product.Text("ProcessMode");
    (first ? outFirstInstance : outSecondInstance) = processMode == kManagedByPdm
                                                         ? product.Text(names::Alias)
                                                         : GetInstanceNameFromDID(identifier);
    (first ? outFirstDescriptionId : outSecondDescriptionId) = identifier;
    (first ? ioFirstAlien : outSecondAlien) = alien;
    (first ? outFirstShapeSource : outSecondShapeSource) = product.Text("ShapeSource");
    (first ? outFirstDescriptionIdAgain : outSecondDescriptionIdAgain) = identifier;
    (first ? outFirstProcessMode : outSecondProcessMode) = processMode;
    (first ? outFirstShapeName : outSecondShapeName) = product.Text(names::ShapeName);
  };
  const auto readViewpoint = [&](const DOM_Node& inViewpoint) {
    const ElementAttributes viewpoint(inViewpoint);
    outFocusDistance = viewpoint.Text("FocusDistance");  // its comma stays
    outNearPlane = viewpoint.Number("NearPlane");
    outFarPlane = viewpoint.Number("FarPlane");
    outProjection = viewpoint.Number("ProjectionType");
    ForEachElement(inViewpoint, "Point", [&](const DOM_Node& inPoint) {
      const ElementAttributes point(inPoint);
      outViewpointX = point.Number("Ux");
      outViewpointY = point.Number("Uy");
      outViewpointZ = point.Number("Uz");
    });
    // No document carries a second vector under another name: the last three outputs stay the
    // caller's.
    ForEachElement(inViewpoint, "Vector", [&](const DOM_Node& inVector) {
      const ElementAttributes vector(inVector);
      if (vector.Text("CorrespondingData") != "Sight") return;
      outSightX = vector.Number("Vx");
      outSightY = vector.Number("Vy");
      outSightZ = vector.Number("Vz");
    });
  };
  const auto readGeometry = [&](const DOM_Node& inGeometry) {
    const ElementAttributes geometry(inGeometry);
    outCurveLength = geometry.Number("IntersectCurveLength");
    outDistance = geometry.Number("ExtractOrDistValue");
    outReserved = ZORUnicodeString();
    ForEachChild(inGeometry, [&](const DOM_Node& inChild) {
      if (IsElementNamed(inChild, "Point"))
        AppendPoint(inChild, outPoints);
      else if (IsElementNamed(inChild, "Viewpoint"))
        readViewpoint(inChild);
    });
  };

  ForEachChild(inInterference, [&](const DOM_Node& inChild) {
    if (inChild.getNodeType() != DOM_Node::ELEMENT_NODE) return;
    const DOMString name = inChild.getNodeName();
    if (IsText(name, "ViolatedRule"))
      readRule(inChild);
    else if (IsText(name, "Product"))
      readProduct(inChild);
    else if (IsText(name, "GeometricAspect"))
      readGeometry(inChild);
    else if (IsText(name, "Comment"))
      outComment = GetAttrOnNode(inChild, "Value");
  });
}

void ZORClashParsing::GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& outValue,
                                          ZORUnicodeString& outResultType,
                                          ZORUnicodeString& outRuleName,
                                          ZORUnicodeString& ioFirstAlias,
                                          ZORUnicodeString& outSecondAlias) {
  const ElementAttributes interference(inInterference);
  outValue = interference.Text("Value");
  outResultType = interference.Text("ResultType");
  ForEachChild(inInterference, [&](const DOM_Node& inChild) {
    if (IsElementNamed(inChild, "ViolatedRule"))
      outRuleName = GetAttrOnNode(inChild, names::Name.ConvertToChar());
    else if (IsElementNamed(inChild, "Product"))
      (ioFirstAlias.GetLengthInChar() == 0 ? ioFirstAlias : outSecondAlias) =
          GetAttrOnNode(inChild, names::Alias.ConvertToChar());
  });
}

void ZORClashParsing::GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& ioFirstLabel,
                                          ZORUnicodeString& outSecondLabel,
                                          ZORUnicodeString& outFirstPreview,
                                          ZORUnicodeString& outSecondPreview) {
  ForEachElement(inInterference, "Product", [&](const DOM_Node& inProduct) {
    const ElementAttributes product(inProduct);
    const bool first = ioFirstLabel.GetLengthInChar() == 0;
    ZORUnicodeString label = GetInstanceNameFromDID(product.Text(names::Alias));
    label += " -- ";
    label += product.Text(names::ShapeName);
    (first ? ioFirstLabel : outSecondLabel) = label;
    (first ? outFirstPreview : outSecondPreview) = product.Text("Preview");
  });
}

void ZORClashParsing::GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& outPicture) {
  const DOM_Node picture = FirstElement(inInterference, "Picture");
  if (!picture.isNull()) outPicture = GetAttrOnNode(picture, "HRef");
}

void ZORClashParsing::GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& outFirstAlias,
                                          ZORUnicodeString& outSecondAlias,
                                          ZORUnicodeString& ioFirstDescriptionId,
                                          ZORUnicodeString& outSecondDescriptionId,
                                          ZORMathTransformation& outFirstPosition,
                                          ZORMathTransformation& outSecondPosition) {
  const auto readVector = [&](const DOM_Node& inNode, const char* inX, const char* inY,
                              const char* inZ) {
    return ZORMathVector(GetAttrDoubleOnNode(inNode, inX), GetAttrDoubleOnNode(inNode, inY),
                         GetAttrDoubleOnNode(inNode, inZ));
  };
  // Without "Matrix" everything stays zero: no rotation at all, which tells it from a placement at
  // the origin.
  const auto readPosition = [&](const DOM_Node& inProduct) {
    ZORMathVector translation, columns[3];
    ForEachElement(inProduct, "Matrix", [&](const DOM_Node& inMatrix) {
      ForEachElement(inMatrix, "Point", [&](const DOM_Node& inPoint) {
        translation = readVector(inPoint, "Ux", "Uy", "Uz");
      });
      ForEachElement(inMatrix, "Vector", [&](const DOM_Node& inVector) {
        const ZORUnicodeString column = GetAttrOnNode(inVector, "CorrespondingData");
        const int place = column == names::Rx   ? 0
                          : column == names::Ry ? 1
                          : column == names::Rz ? 2
                                                : -1;
        if (place >= 0) columns[place] = readVector(inVector, "Vx", "Vy", "Vz");
      });
    });
    ZORMathTransformation position;
    position.SetVector(translation);
    position.SetMatrix(ZORMath3x3Matrix(columns[0], columns[1], columns[2]));
    return position;
  };

  ForEachElement(inInterference, "Product", [&](const DOM_Node& inProduct) {
    const bool first = ioFirstDescriptionId.GetLengthInChar() == 0;
    (first ? ioFirstDescriptionId : outSecondDescriptionId) =
        GetAttrOnNode(inProduct, "DescriptionID");
    (first ? outFirstAlias : outSecondAlias) =
        GetAttrOnNode(inProduct, names::Alias.ConvertToChar());
    (first ? outFirstPosition : outSecondPosition) = readPosition(inProduct);
  });
}

ZORUnicodeString ZORClashParsing::GetInstanceNameFromDID(ZORUnicodeString inDescriptionId) {
  ZORUnicodeString last;
  if (const std::u16string_view plain = LastPlainSegment(UnitsOf(inDescriptionId));
      !plain.empty()) {
    last.BuildFromUTF16(plain.data(), plain.size());
    return last;
  }
  ZORToken segments(SegmentsAsLines(inDescriptionId));
  for (ZORUnicodeString segment = segments.GetNextToken("\n"); segment.GetLengthInChar() != 0;
       segment = segments.GetNextToken("\n"))
    last = segment;
  return last;
}
