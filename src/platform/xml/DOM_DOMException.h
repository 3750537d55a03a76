// The error that a change of a document raises.
#ifndef ZOR_PLATFORM_XML_DOM_DOMEXCEPTION_H
#define ZOR_PLATFORM_XML_DOM_DOMEXCEPTION_H

#include <stdexcept>
#include <string>

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"

#if ZOR_PLATFORM_ADDITIONS
/// A change that a document refuses. Nothing has been changed.
class ZOR_PLATFORM_EXPORT DOM_DOMException : public std::runtime_error {
 public:
  /// The codes and numbers of DOM Level 1, and NULL_HANDLE_ERR for a change through a null handle.
  enum ExceptionCode {
    INDEX_SIZE_ERR = 1,
    HIERARCHY_REQUEST_ERR = 3,
    WRONG_DOCUMENT_ERR = 4,
    INVALID_CHARACTER_ERR = 5,
    NO_MODIFICATION_ALLOWED_ERR = 7,
    NOT_FOUND_ERR = 8,
    NOT_SUPPORTED_ERR = 9,
    NULL_HANDLE_ERR = 100
  };

  DOM_DOMException(ExceptionCode inCode, const std::string& inReason);
  ~DOM_DOMException() override;

  ExceptionCode code;
};
#endif

#endif
