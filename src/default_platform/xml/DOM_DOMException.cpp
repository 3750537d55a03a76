#include "platform/xml/DOM_DOMException.h"

DOM_DOMException::DOM_DOMException(ExceptionCode inCode, const std::string& inReason)
    : std::runtime_error(inReason), code(inCode) {}

DOM_DOMException::~DOM_DOMException() = default;
