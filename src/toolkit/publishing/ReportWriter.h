// A clash result as an XML report.
#ifndef ZOR_TOOLKIT_PUBLISHING_REPORT_WRITER_H
#define ZOR_TOOLKIT_PUBLISHING_REPORT_WRITER_H

#include <string>

#include "toolkit/records/ClashDocumentEdit.h"

namespace ZORToolkit {

/// Writes a result as a report: all elements and attributes that reports have (those of the document
/// type clash-report.dtd), in document order. The report reads back as the same result.
/// @param inPrologue without a document type: clash-report.dtd; without a style sheet: that of the
///                   setting "XslTemplate".
/// @param inPath     UTF-8.
/// @return a negative code when the file cannot be written.
/// Raises Error for a document without interferences.
ZOR_TOOLKIT_EXPORT HRESULT WriteReport(const ClashDocument& inDocument, const Prologue& inPrologue,
                                       const std::string& inPath);

/// A text as the value of an attribute that reads back as it was: markup characters escaped, tabs
/// and line ends as references. What XML cannot carry becomes U+FFFD.
ZOR_TOOLKIT_EXPORT ZORUnicodeString AttributeValue(const ZORUnicodeString& inText);

}  // namespace ZORToolkit

#endif
