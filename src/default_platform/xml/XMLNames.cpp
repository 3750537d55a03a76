#include "default_platform/xml/XMLNames.h"

#include <xercesc/util/XMLChar.hpp>

#include "platform/xml/DOM_DOMException.h"

bool IsXMLName(std::u16string_view inName) {
  return !inName.empty() && xercesc::XMLChar1_0::isValidName(inName.data(), inName.size());
}

void RequireXMLName(std::u16string_view inName) {
  if (!IsXMLName(inName))
    throw DOM_DOMException(DOM_DOMException::INVALID_CHARACTER_ERR, "not a name of XML");
}

bool IsReservedTarget(std::u16string_view inTarget) {
  return inTarget.size() == 3 && (inTarget[0] | 0x20) == u'x' && (inTarget[1] | 0x20) == u'm' &&
         (inTarget[2] | 0x20) == u'l';
}
