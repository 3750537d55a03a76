#include "XercesTree.h"

#include <string_view>
#include <xercesc/sax/HandlerBase.hpp>
#include <xercesc/util/PlatformUtils.hpp>

namespace {
std::u16string_view Units(const XMLCh* inText) {
  return inText == nullptr ? std::u16string_view() : std::u16string_view(inText);
}
}  // namespace

void InitializeXerces() { xercesc::XMLPlatformUtils::Initialize(); }

XercesParser ParseWithXerces(const std::string& inPath) {
  static xercesc::HandlerBase raiseErrors;
  auto parser = std::make_unique<xercesc::XercesDOMParser>();
  parser->setValidationScheme(xercesc::XercesDOMParser::Val_Never);
  parser->setLoadExternalDTD(false);
  parser->setErrorHandler(&raiseErrors);
  parser->parse(inPath.c_str());
  return parser;
}

void HashTree(const xercesc::DOMNode& inNode, std::size_t inDepth, TreeHash& ioHash) {
  if (inNode.getNodeType() == xercesc::DOMNode::TEXT_NODE) {
    ioHash.AddText(inDepth, Units(inNode.getNodeValue()));
    return;
  }
  if (inNode.getNodeType() == xercesc::DOMNode::ELEMENT_NODE) {
    ioHash.AddElement(inDepth, Units(inNode.getNodeName()));
    const xercesc::DOMNamedNodeMap* const attributes = inNode.getAttributes();
    for (XMLSize_t i = 0; i < attributes->getLength(); ++i) {
      const xercesc::DOMNode* const attribute = attributes->item(i);
      ioHash.AddAttribute(Units(attribute->getNodeName()), Units(attribute->getNodeValue()));
    }
  }
  const xercesc::DOMNode* child = inNode.getFirstChild();
  for (; child != nullptr; child = child->getNextSibling()) HashTree(*child, inDepth + 1, ioHash);
}
