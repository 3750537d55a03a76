// The files of a publication except its pictures.
#ifndef ZOR_TOOLKIT_PUBLISHING_FOLDER_PUBLISHED_FILES_H
#define ZOR_TOOLKIT_PUBLISHING_FOLDER_PUBLISHED_FILES_H

#include <string>

#include "toolkit/publishing/Publication.h"
#include "toolkit/publishing/ReportWriter.h"

namespace ZORToolkit {

inline constexpr char kPageFile[] = "index.html";
inline constexpr char kReportFile[] = "report.xml";
inline constexpr char kReportType[] = "clash-report.dtd";

/// The style sheet that was asked for, or that of the setting "XslTemplate"; empty: the page's own.
std::string StyleSheetPath(const PublicationOptions& inOptions);

/// The style sheet that makes the page.
struct PageStyleSheet {
  /// Raises Error for one that cannot be read or is no style sheet, before anything is drawn.
  explicit PageStyleSheet(const PublicationOptions& inOptions);

  std::string path;  // empty: the page's own
  std::string text;
};

/// The name of its file beside the report.
std::string FileNameOf(const PageStyleSheet& inSheet);

/// The page of a result. Raises Error.
std::string MakePageOf(const PublicationOptions& inOptions, const PageStyleSheet& inSheet,
                       const ClashDocument& inDocument, PublishedResult& ioPublished);

/// Raises Error that names the file where one stands in the way of a publication's page, report,
/// style sheet, document type, manifest or geometry that no lyra publish made. Files of former
/// versions are recognised by their content.
void RequireOwnFiles(const PublicationOptions& inOptions, const PageStyleSheet& inSheet);

/// Writes page, report and what they need. Raises Error and ZORFoundation::FileError.
/// @param inWorkFolder where files are until they are complete.
void WritePublishedFiles(const PublicationOptions& inOptions, const PageStyleSheet& inSheet,
                         const ClashDocument& inDocument, const std::string& inPage,
                         const std::string& inManifest, const std::string& inWorkFolder);

}  // namespace ZORToolkit

#endif
