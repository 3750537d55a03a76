// General information, interferences by number, attributes of components.
#include "ZORClashParsing.h"
#include "ZORLyraGeneralServices.h"
#include "clash_reading/DeclaredCount.h"
#include "clash_reading/ElementWalk.h"
#include "clash_reading/NamedConstants.h"
#include "clash_reading/ZORClashDocumentIndex.h"
#include "platform/system/ZORSettingRepository.h"

namespace {

// The setting "PublishDefDir" replaces the ".." of a picture reference; unset, it is the empty
// text.
void ReplaceParentByPublishDirectory(ZORUnicodeString& ioPicture) {
  ZORSettingRepository* settings = ZORSettingRepository::GetRepository("ClashPublish");
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
  ForEachChild(root_, [&](const DOM_Node& inChild) {
    if (inChild.getNodeType() != DOM_Node::ELEMENT_NODE) return;
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
  index_->Refresh(root_);
  const auto& interferences = index_->Interferences();
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
  index_->Refresh(root_);
  for (const DOM_Node& interference :
       index_->InterferencesAtRank(static_cast<std::size_t>(inIndex) - 1))
    GetInterferenceData(interference, outPicture);
}

ZORUnicodeString ZORClashParsing::GetAttrValue(int inPosition, ZORUnicodeString inName) {
  const DOM_Node component = ComponentAt(inPosition);
  ZORUnicodeString value;
  bool found = false;
  ForEachElement(component, names::ComponentAttributes, [&](const DOM_Node& inAttributes) {
    DOM_Node attribute = inAttributes.getFirstChild();
    for (; !found && !attribute.isNull(); attribute = attribute.getNextSibling()) {
      if (!IsElementNamed(attribute, names::ComponentAttribute) ||
          GetAttrOnNode(attribute, names::Name.ConvertToChar()) != inName)
        continue;
      value = GetAttrOnNode(attribute, names::AttrValue.ConvertToChar());
      found = true;
    }
  });
  return value;
}

ZORUnicodeString ZORClashParsing::GetCompoAttr(int inPosition, ZORUnicodeString inName) {
  return GetAttrOnNode(ComponentAt(inPosition), inName.ConvertToChar());
}
