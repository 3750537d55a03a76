// A clash result as an XML report.
#ifndef ZOR_TOOLKIT_PUBLISHING_REPORT_WRITER_H
#define ZOR_TOOLKIT_PUBLISHING_REPORT_WRITER_H

#include <array>
#include <optional>
#include <string>
#include <vector>

#include "toolkit/records/ClashDocumentEdit.h"

namespace ZORToolkit {

/// Writes a result as a report: all elements and attributes that reports have (those of the
/// document type clash-report.dtd), in document order. The report reads back as the same result.
/// @param inPrologue without a document type: clash-report.dtd; without a style sheet: that of the
///                   setting "XslTemplate".
/// @param inPath     UTF-8.
/// @return a negative code when the file cannot be written.
/// Raises Error for a document without interferences.
ZOR_TOOLKIT_EXPORT HRESULT WriteReport(const ClashDocument& inDocument, const Prologue& inPrologue,
                                       const std::string& inPath);

/// What a page knows of a product besides the report. UTF-8.
struct PublishedProduct {
  ElementHandle element;
  std::string colour;   ///< "#rrggbb" as in the picture; empty when it has none of its own
  std::string preview;  ///< relative to the page; empty when there is none
  bool isMissing = false;
};

/// The same of an interference.
struct PublishedInterference {
  ElementHandle element;
  int number = 0;  ///< in the whole result, from 1
  std::string id;  ///< the stable one; may be empty
  std::string type, status;
  std::string picture;  ///< relative to the page; empty when there is none
  std::vector<std::string> thumbnails;
  std::string change;  ///< since the baseline: "new", "persisting", …; empty without one
  std::string reason;  ///< of the change
  std::vector<std::array<std::string, 3>> changes;  ///< what changed, from what, to what
  std::string before;        ///< the picture in the baseline, relative to the page; may be empty
  std::string whyAsInModel;  ///< why the picture does not have the result's placements; else empty
  std::optional<std::array<double, 2>> mapPlace;  ///< shares of the map's width and height
  std::array<PublishedProduct, 2> products;
};

/// The same of a result.
struct PublishedResult {
  std::string model;         ///< name of the model; empty for none
  bool isAsInModel = false;  ///< all pictures have the model's placements, as was asked for
  std::string map;           ///< the overview's picture, relative to the page; may be empty
  double mapRatio = 1;       ///< its height by its width
  std::string policy;        ///< what the page may load: a content security policy
  std::string style, script, data;
  std::vector<PublishedInterference> interferences;  ///< in document order
  std::string baseline;                              ///< its name; empty without one
  const ClashDocument* baselineDocument = nullptr;
  std::vector<PublishedInterference> gone;  ///< of the baseline, in its order
};

/// The elements of the report with what a page knows besides, as attributes and elements of the
/// namespace "urn:zorlyra:page". UTF-8.
ZOR_TOOLKIT_EXPORT std::string AnnotatedReport(const ClashDocument& inDocument,
                                               const PublishedResult& inPublished);

/// A text as the value of an attribute that reads back as it was: markup characters escaped, tabs
/// and line ends as references. What XML cannot carry becomes U+FFFD.
ZOR_TOOLKIT_EXPORT ZORUnicodeString AttributeValue(const ZORUnicodeString& inText);

}  // namespace ZORToolkit

#endif
