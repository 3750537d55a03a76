#include "platform/xml/ZORXMLParser.h"

#include <limits>
#include <xercesc/util/PlatformUtils.hpp>
#include <xercesc/util/XMLException.hpp>

#include "default_platform/xml/ByteSource.h"
#include "default_platform/xml/DOM_HandleAccess.h"
#include "default_platform/xml/TreeWriter.h"

namespace {
HRESULT Prepare() {
  try {
    xercesc::XMLPlatformUtils::Initialize();
    return S_OK;
  } catch (const xercesc::XMLException&) {
    return E_FAIL;
  }
}
}  // namespace

HRESULT ZORXMLParser::Initialize() {
  // Never ended: documents may be read while the process ends.
  static const HRESULT result = Prepare();
  return result;
}

HRESULT ZORXMLParser::CreateMemBufInputSource(const unsigned char* inBytes, unsigned int inCount,
                                              const ZORUnicodeString& inIdentifier,
                                              unsigned char inAdopt, InputSource*& outSource) {
  outSource = nullptr;
  if ((inBytes == nullptr && inCount != 0) || inCount > std::numeric_limits<std::int32_t>::max())
    return E_INVALIDARG;
  outSource = new MemorySource(inBytes, inCount, inIdentifier, inAdopt != 0);
  return S_OK;
}

HRESULT ZORXMLParser::WriteXML(const DOM_Node& inNode, const ZORUnicodeString& inEncoding,
                               DOMString& outText) {
  if (inNode.isNull() || !IsWritableEncoding(inEncoding)) return E_INVALIDARG;
  return WriteTree(inNode, outText) ? S_OK : E_FAIL;
}
