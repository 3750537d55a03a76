// Where a parser reads from.
#ifndef ZOR_PLATFORM_XML_INPUTSOURCE_H
#define ZOR_PLATFORM_XML_INPUTSOURCE_H

#include "ZORPlatformExport.h"

/// A source of bytes for DOMParser; made by ZORXMLParser, deleted by the caller.
class ZOR_PLATFORM_EXPORT InputSource {
 public:
  virtual ~InputSource();
};

#endif
