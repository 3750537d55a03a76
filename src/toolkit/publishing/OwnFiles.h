// Whose files stand in a publication's folder.
#ifndef ZOR_TOOLKIT_PUBLISHING_OWN_FILES_H
#define ZOR_TOOLKIT_PUBLISHING_OWN_FILES_H

#include "toolkit/publishing/PublishedFiles.h"

namespace ZORToolkit {

/// Raises Error that names the file where one stands in the way of a publication's page, report,
/// style sheet, document type, manifest or geometry that no lyra publish made. Those of former
/// versions are known by what they say.
void RequireOwnFiles(const PublicationOptions& inOptions, const PageStyleSheet& inSheet);

}  // namespace ZORToolkit

#endif
