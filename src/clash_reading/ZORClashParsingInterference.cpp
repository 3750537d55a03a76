// Everything about one "Interference" element.
#include <string_view>

#include "ZORClashParsing.h"
#include "ZORLyraGeneralServices.h"
#include "clash_reading/ElementWalk.h"
#include "clash_reading/InterferenceWords.h"
#include "clash_reading/NamedConstants.h"
#include "clash_reading/ZORClashDocumentIndex.h"
#include "platform/system/ZORToken.h"

namespace {

constexpr std::u16string_view kPathSeparator = u" --++-- ";
constexpr const char* kManagedByPdm = "KORVAPDM";

std::u16string_view UnitsOf(const ZORUnicodeString& inText) {
  return {inText.ConvertToUCChar(), static_cast<std::size_t>(inText.GetLengthInChar())};
}

// An attribute that holds a number, with its decimal comma made a point. Only the first comma is
// one.
ZORUnicodeString NumberText(const DOM_Node& inNode, const char* inName) {
  ZORUnicodeString text = ZORLyraGeneralServices::GetAttrOnNode(inNode, inName);
  if (UnitsOf(text).find(u',') != std::u16string_view::npos) text.ReplaceSubString(",", ".");
  return text;
}

void AppendPoint(const DOM_Node& inPoint, ZORUnicodeString& ioPoints) {
  if (ioPoints.GetLengthInChar() != 0) ioPoints += "/";
  ioPoints += NumberText(inPoint, "Ux");
  ioPoints += "/";
  ioPoints += NumberText(inPoint, "Uy");
  ioPoints += "/";
  ioPoints += NumberText(inPoint, "Uz");
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
  outResultType = words.ResultType(inInterference);
  outClearance = NumberText(inInterference, "DistanceClearance");
  outStatus = words.Status(GetAttrOnNode(inInterference, "Status"));
  outRetrieve = words.Retrieve(GetAttrOnNode(inInterference, "RetrieveInf"));
  outPoints = ZORUnicodeString();
  outProjection = "NOVIEWPOINT";

  const auto readRule = [&](const DOM_Node& inRule) {
    outRuleName = GetAttrOnNode(inRule, names::Name.ConvertToChar());
    outRuleClearance = NumberText(inRule, "Clearance");
    outComputationType = GetAttrOnNode(inRule, "TypeCalc");
    outSeverity = GetAttrOnNode(inRule, "Severity");
    outPenetrationCandidate = GetAttrOnNode(inRule, "PenetrationCandidate");
  };
  // The first product leaves its Alien flag filled, and that is how the second is told from it.
  const auto readProduct = [&](const DOM_Node& inProduct) {
    const bool first = ioFirstAlien.GetLengthInChar() == 0;
    const ZORUnicodeString identifier = GetAttrOnNode(inProduct, "DescriptionID");
    ZORUnicodeString alien = GetAttrOnNode(inProduct, names::Alien.ConvertToChar());
    if (alien.GetLengthInChar() == 0) alien = "YES";
    const ZORUnicodeString processMode = GetAttrOnNode(inProduct, "ProcessMode");
    (first ? outFirstInstance : outSecondInstance) =
        processMode == kManagedByPdm ? GetAttrOnNode(inProduct, names::Alias.ConvertToChar())
                                     : GetInstanceNameFromDID(identifier);
    (first ? outFirstDescriptionId : outSecondDescriptionId) = identifier;
    (first ? ioFirstAlien : outSecondAlien) = alien;
    (first ? outFirstShapeSource : outSecondShapeSource) = GetAttrOnNode(inProduct, "ShapeSource");
    (first ? outFirstDescriptionIdAgain : outSecondDescriptionIdAgain) = identifier;
    (first ? outFirstProcessMode : outSecondProcessMode) = processMode;
    (first ? outFirstShapeName : outSecondShapeName) =
        GetAttrOnNode(inProduct, names::ShapeName.ConvertToChar());
  };
  const auto readViewpoint = [&](const DOM_Node& inViewpoint) {
    outFocusDistance = GetAttrOnNode(inViewpoint, "FocusDistance");  // its comma stays
    outNearPlane = NumberText(inViewpoint, "NearPlane");
    outFarPlane = NumberText(inViewpoint, "FarPlane");
    outProjection = NumberText(inViewpoint, "ProjectionType");
    ForEachElement(inViewpoint, "Point", [&](const DOM_Node& inPoint) {
      outViewpointX = NumberText(inPoint, "Ux");
      outViewpointY = NumberText(inPoint, "Uy");
      outViewpointZ = NumberText(inPoint, "Uz");
    });
    // No document carries a second vector under another name: the last three outputs stay the
    // caller's.
    ForEachElement(inViewpoint, "Vector", [&](const DOM_Node& inVector) {
      if (GetAttrOnNode(inVector, "CorrespondingData") != "Sight") return;
      outSightX = NumberText(inVector, "Vx");
      outSightY = NumberText(inVector, "Vy");
      outSightZ = NumberText(inVector, "Vz");
    });
  };
  const auto readGeometry = [&](const DOM_Node& inGeometry) {
    outCurveLength = NumberText(inGeometry, "IntersectCurveLength");
    outDistance = NumberText(inGeometry, "ExtractOrDistValue");
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
  outValue = GetAttrOnNode(inInterference, "Value");
  outResultType = GetAttrOnNode(inInterference, "ResultType");
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
    const bool first = ioFirstLabel.GetLengthInChar() == 0;
    ZORUnicodeString label =
        GetInstanceNameFromDID(GetAttrOnNode(inProduct, names::Alias.ConvertToChar()));
    label += " -- ";
    label += GetAttrOnNode(inProduct, names::ShapeName.ConvertToChar());
    (first ? ioFirstLabel : outSecondLabel) = label;
    (first ? outFirstPreview : outSecondPreview) = GetAttrOnNode(inProduct, "Preview");
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
