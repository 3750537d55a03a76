// Components, specification, linked documents, rebuilding a session.
#include "ZORClashParsing.h"
#include "ZORLyraGeneralServices.h"
#include "clash_reading/ClashElements.h"
#include "clash_reading/NamedConstants.h"
#include "clash_reading/ZORClashDocumentIndex.h"

int ZORClashParsing::GetNbProd() { return static_cast<int>(root_.getChildNodes().getLength()); }

ZORUnicodeString ZORClashParsing::GetPrdId(int inPosition) {
  return GetAttrOnNode(ChildAt(root_, inPosition), names::Alias.ConvertToChar());
}

ZORUnicodeString ZORClashParsing::GetPrdName(int inPosition) { return GetPrdId(inPosition); }

ZORUnicodeString ZORClashParsing::GetPrdType(int inPosition) {
  return GetAttrOnNode(ChildAt(root_, inPosition), names::ComponentType.ConvertToChar());
}

ZORUnicodeString ZORClashParsing::GetAttrValue(int inPosition, ZORUnicodeString inName) {
  const DOM_Node component = ChildAt(root_, inPosition);
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
  return GetAttrOnNode(ChildAt(root_, inPosition), inName.ConvertToChar());
}

int ZORClashParsing::GetNbRealAttr(int inPosition) {
  const DOM_Node component = ChildAt(root_, inPosition);
  return static_cast<int>(ZORClashDocumentIndex::Of(*this, root_).RealAttributes(component).size());
}

void ZORClashParsing::GetSetOfRealAttr(int inPosition, int inNumber, ZORUnicodeString& outName,
                                       ZORUnicodeString& outType, ZORUnicodeString& outValue) {
  const DOM_Node component = ChildAt(root_, inPosition);
  const auto& attributes = ZORClashDocumentIndex::Of(*this, root_).RealAttributes(component);
  if (inNumber < 1 || static_cast<std::size_t>(inNumber) > attributes.size()) return;
  const DOM_Node& attribute = attributes[static_cast<std::size_t>(inNumber) - 1];
  const ElementAttributes read(attribute);
  read.ReadText(names::Name, outName);
  read.ReadText(names::AttrType, outType);
  read.ReadText(names::AttrValue, outValue);
}

int ZORClashParsing::GetNbShapes(int inPosition) {
  const DOM_Node component = ChildAt(root_, inPosition);
  return static_cast<int>(ZORClashDocumentIndex::Of(*this, root_).Shapes(component).size());
}

ZORUnicodeString ZORClashParsing::GetShapeAttrValue(int inPosition, int inShape,
                                                    ZORUnicodeString inName) {
  const DOM_Node component = ChildAt(root_, inPosition);
  const auto& shapes = ZORClashDocumentIndex::Of(*this, root_).Shapes(component);
  if (inShape < 0 || static_cast<std::size_t>(inShape) >= shapes.size()) return ZORUnicodeString();
  return GetAttrOnNode(shapes[static_cast<std::size_t>(inShape)], inName.ConvertToChar());
}

void ZORClashParsing::GetPosition(int inPosition, double*& outPosition) {
  outPosition = new double[12];
  const DOM_Node component = ChildAt(root_, inPosition);
  char ux[] = "Ux", uy[] = "Uy", uz[] = "Uz";
  const ZORUnicodeString* triples[] = {&names::Rx, &names::Ry, &names::Rz, &names::T};
  ForEachElement(component, names::ShapePosition, [&](const DOM_Node& inPlacement) {
    ForEachElement(inPlacement, [&](const DOM_Node& inTriple) {
      for (int i = 0; i < 4; ++i) {
        if (!adapter::HasName(inTriple, *triples[i])) continue;
        const DOM_NamedNodeMap attributes = inTriple.getAttributes();
        outPosition[3 * i] = TransDouble(attributes, ux);
        outPosition[3 * i + 1] = TransDouble(attributes, uy);
        outPosition[3 * i + 2] = TransDouble(attributes, uz);
      }
    });
  });
}

// ---- Specification

void ZORClashParsing::GetSpecInfos(int& outCount) {
  outCount = static_cast<int>(ZORClashDocumentIndex::Of(*this, root_).Specifications().size());
}

void ZORClashParsing::GetProductsInSpec(
    int inNumber, ZORUnicodeString& outFirstAlias, ZORUnicodeString& outSecondAlias,
    ZORUnicodeString& outFirstId, ZORUnicodeString& outSecondId, ZORUnicodeString& outFirstVersion,
    ZORUnicodeString& outSecondVersion, ZORUnicodeString& outFirstAlien,
    ZORUnicodeString& outSecondAlien, ZORUnicodeString& outFirstShapeName,
    ZORUnicodeString& outSecondShapeName) {
  const auto& specifications = ZORClashDocumentIndex::Of(*this, root_).Specifications();
  if (inNumber < 1 || static_cast<std::size_t>(inNumber) > specifications.size()) return;
  const DOM_Node& specification = specifications[static_cast<std::size_t>(inNumber) - 1];

  const auto readSet = [&](const char* inSetName, ZORUnicodeString& outAlias,
                           ZORUnicodeString& outId, ZORUnicodeString& outVersion,
                           ZORUnicodeString& outAlien, ZORUnicodeString& outShapeName) {
    ForEachElement(specification, inSetName, [&](const DOM_Node& inSet) {
      const ElementAttributes set(inSet);
      set.ReadText(names::Alias, outAlias);
      set.ReadText("DisplayableID", outId);
      set.ReadText("DocumentVersion", outVersion);
      set.ReadText(names::Alien, outAlien);
      set.ReadText(names::ShapeName, outShapeName);
    });
  };
  readSet("ProdListe1", outFirstAlias, outFirstId, outFirstVersion, outFirstAlien,
          outFirstShapeName);
  readSet("ProdListe2", outSecondAlias, outSecondId, outSecondVersion, outSecondAlien,
          outSecondShapeName);
}

// ---- Linked documents

DOM_NodeList ZORClashParsing::GetListOfLinkedElements() {
  return GetElementsNode().getChildNodes();
}

void ZORClashParsing::GetAttOfLinkedElement(
    DOM_Node inElement, ZORUnicodeString& outLink, ZORUnicodeString& outFirstName,
    ZORUnicodeString& outSecondName, ZORUnicodeString& outFirstId, ZORUnicodeString& outSecondId,
    ZORUnicodeString& outFirstURL, ZORUnicodeString& outSecondURL) {
  outLink = GetAttrOnNode(inElement, "Link");
  outFirstName = GetAttrOnNode(inElement, "FirstProductName");
  outSecondName = GetAttrOnNode(inElement, "SecondProductName");
  outFirstId = GetAttrOnNode(inElement, "FirstProductId");
  outSecondId = GetAttrOnNode(inElement, "SecondProductId");
  outFirstURL = GetAttrOnNode(inElement, "FirstProductURL");
  outSecondURL = GetAttrOnNode(inElement, "SecondProductURL");
}

// ---- Rebuilding a session

void ZORClashParsing::GetReBuildSessionInfos(ZORListValZORUnicodeString& ioAliases,
                                             ZORListValZORUnicodeString& ioDescriptionIds,
                                             ZORMathTransformation*& outPositions) {
  ForEachElement(root_, "ClashResult", [&](const DOM_Node& inResultSet) {
    int declared = 0;
    GetAttrOnNode(inResultSet, "NbInterf").ConvertToNum(&declared, "%d");
    if (declared < 1) return;
    // Abandons an earlier result set's array: the contract is that the caller gets the last.
    outPositions = new ZORMathTransformation[2 * static_cast<std::size_t>(declared)];

    int taken = 0;
    DOM_Node child = inResultSet.getFirstChild();
    for (; taken < declared && !child.isNull(); child = child.getNextSibling()) {
      if (!IsElementNamed(child, "Interference")) continue;
      ZORUnicodeString firstAlias, secondAlias, firstId, secondId;
      ZORMathTransformation firstPosition, secondPosition;
      GetInterferenceData(child, firstAlias, secondAlias, firstId, secondId, firstPosition,
                          secondPosition);
      ioAliases.Append(firstAlias);
      ioAliases.Append(secondAlias);
      ioDescriptionIds.Append(firstId);
      ioDescriptionIds.Append(secondId);
      outPositions[2 * static_cast<std::size_t>(taken)] = firstPosition;
      outPositions[2 * static_cast<std::size_t>(taken) + 1] = secondPosition;
      ++taken;
    }
  });
}
