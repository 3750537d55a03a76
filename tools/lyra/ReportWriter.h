// A clash result as an XML report.
#ifndef ZOR_TOOLS_LYRA_REPORT_WRITER_H
#define ZOR_TOOLS_LYRA_REPORT_WRITER_H

#include "ZORLyraXMLServices.h"
#include "platform/xml/DOM_Node.h"

namespace lyra {

/// Writes an element of a clash result and what is below it through a marker writer: all elements
/// and attributes that reports have (those of the document type clash-report.dtd), in document
/// order. The report reads back as the same result.
void WriteReportElement(const DOM_Node& inElement, ZORLyraXMLServices& ioWriter);

/// A text as the value of an attribute that reads back as it was: markup characters escaped, tabs
/// and line ends as references. What XML cannot carry becomes U+FFFD.
ZORUnicodeString AttributeValue(const ZORUnicodeString& inText);

}  // namespace lyra

#endif
