// General information, and interferences by number.
#include "ZORClashParsing.h"
#include "ZORLyraGeneralServices.h"
#include "clash_reading/ClashElements.h"
#include "clash_reading/NamedConstants.h"
#include "clash_reading/ZORClashDocumentIndex.h"
#include "platform/system/ZORSettingRepository.h"

namespace {

// A missing setting reads as the empty text, which removes the "..".
void ReplaceParentByPublishDirectory(ZORUnicodeString& ioPicture) {
  ZORSettingRepository* const settings =
      ZORSettingRepository::GetRepository("ClashPublish", 0, 1, nullptr);
  if (!settings) return;
  ZORString directory;
  settings->ReadSetting("PublishDefDir", &directory);
  ioPicture.ReplaceSubString("..", directory.CastToCharPtr());
}

}  // namespace

void ZORClashParsing::GetClashGeneralInfos(ZORUnicodeString& outVersion,
                                           ZORUnicodeString& outReference, DOM_Node& outDate,
                                           DOM_Node& outSpecification, int& outCount,
                                           ZORUnicodeString& outResponsible) {
  if (root_.isNull()) return;
  outVersion = GetAttrOnNode(root_, "Version");
  outReference = GetAttrOnNode(root_, names::ZORDocument.ConvertToChar());
  outResponsible = GetAttrOnNode(root_, "Responsible");
  ForEachElement(root_, [&](const DOM_Node& inChild) {
    const ZORUnicodeString name = ZORLyraGeneralServices::GetDOMName(inChild);
    if (name == "Date")
      outDate = inChild;
    else if (name == "ClashSpec")
      outSpecification = inChild;
    else if (name == "ClashResult")
      GetAttrOnNode(inChild, "NbInterf").ConvertToNum(&outCount, "%d");
  });
}

void ZORClashParsing::GetClashGeneralInfos(ZORUnicodeString& outResultName, int& outCount) {
  const DOM_Node resultSet = FirstElement(root_, "ClashResult");
  if (resultSet.isNull()) return;
  outResultName = GetAttrOnNode(resultSet, names::Name.ConvertToChar());
  outCount = TruncatedDeclaredCount(resultSet);
}

DOM_NodeList ZORClashParsing::GetClashResultGeneralInfo(DOM_NodeList inNodes,
                                                        ZORUnicodeString& outResultName,
                                                        ZORUnicodeString& outComputationCase) {
  DOM_Node node = inNodes.item(0);
  while (!node.isNull() && !IsElementNamed(node, "ClashResult")) node = node.getNextSibling();
  if (node.isNull()) return DOM_NodeList();
  outResultName = GetAttrOnNode(node, names::Name.ConvertToChar());
  outComputationCase = GetAttrOnNode(node, "ComputationCase");
  return node.getChildNodes();
}

HRESULT ZORClashParsing::GetithInterference(int inIndex, DOM_Node& outInterference,
                                            ZORUnicodeString& ioFirstLabel,
                                            ZORUnicodeString& outSecondLabel,
                                            ZORUnicodeString& outFirstPreview,
                                            ZORUnicodeString& outSecondPreview) {
  const auto& interferences = ZORClashDocumentIndex::Of(*this, root_).Interferences();
  if (inIndex < 1 || static_cast<std::size_t>(inIndex) > interferences.size()) return E_FAIL;
  const DOM_Node& interference = interferences[static_cast<std::size_t>(inIndex) - 1];
  outInterference = interference.cloneNode(true);
  GetInterferenceData(interference, ioFirstLabel, outSecondLabel, outFirstPreview,
                      outSecondPreview);
  return S_OK;
}

void ZORClashParsing::GetClashPreviewURL(int inIndex, ZORUnicodeString& outPicture) {
  if (documentKind_ == "InterferenceElement" || inIndex == -1) {
    const DOM_Node interference = FirstElement(root_, "Interference");
    if (interference.isNull()) return;
    GetInterferenceData(interference, outPicture);
    if (outPicture.GetLengthInChar() != 0) ReplaceParentByPublishDirectory(outPicture);
    return;
  }
  if (inIndex < 1) return;
  const std::size_t rank = static_cast<std::size_t>(inIndex) - 1;
  for (const DOM_Node& interference :
       ZORClashDocumentIndex::Of(*this, root_).InterferencesAtRank(rank))
    GetInterferenceData(interference, outPicture);
}

void ZORClashParsing::GetClashInfos(int inIndex, ZORUnicodeString& outValue,
                                    ZORUnicodeString& outResultType, ZORUnicodeString& outRuleName,
                                    ZORUnicodeString& outFirstAlias,
                                    ZORUnicodeString& outSecondAlias) {
  outFirstAlias = ZORUnicodeString();
  outSecondAlias = ZORUnicodeString();
  const auto& interferences = ZORClashDocumentIndex::Of(*this, root_).Interferences();
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

  ZORClashDocumentIndex& index = ZORClashDocumentIndex::Of(*this, root_);
  const auto nameResultSet = [&](const DOM_Node& inResultSet) {
    const ElementAttributes resultSet(inResultSet);
    resultSet.ReadText(names::Name, outResultName);
    resultSet.ReadText("ComputationCase", outComputationType);
  };
  const auto& resultSets = index.ResultSets();
  const auto& interferences = index.Interferences();
  if (resultSets.empty()) return;
  // Hosts rely on the last result set naming the result, whichever set the interference is in.
  if (inIndex < 1 || static_cast<std::size_t>(inIndex) > interferences.size()) {
    nameResultSet(resultSets.back());
    return;
  }
  const std::size_t position = static_cast<std::size_t>(inIndex) - 1;
  const DOM_Node& resultSet = index.ResultSetOf(position);
  nameResultSet(resultSet);
  if (inVersion == "1.2") read(interferences[position]);
  preferRuleClearance();
  // In the last set itself the interference's rule may have replaced the computation case.
  if (&resultSet != &resultSets.back()) nameResultSet(resultSets.back());
}
