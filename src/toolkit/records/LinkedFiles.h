// The documents that a federator document links.
#ifndef ZOR_TOOLKIT_RECORDS_LINKED_FILES_H
#define ZOR_TOOLKIT_RECORDS_LINKED_FILES_H

#include <string>
#include <vector>

#include "toolkit/records/DocumentRecords.h"

namespace ZORToolkit {

/// The reference by which a federator document links a file: relative to the federator document
/// where the file's path is relative. @param inFederator "-" stands in the current directory.
ZOR_TOOLKIT_EXPORT std::string LinkTo(const std::string& inFile, const std::string& inFederator);
/// The path of a linked file: logical names are resolved, and what is relative is so to the
/// federator document. Empty when there is no such path.
ZOR_TOOLKIT_EXPORT std::string LinkedPath(const std::string& inLink,
                                          const std::string& inFederator);

/// For each link what is wrong with it: missing, unreadable, of the wrong kind or listed twice;
/// empty when nothing is.
ZOR_TOOLKIT_EXPORT std::vector<std::string> CheckLinks(const std::vector<LinkRecord>& inLinks,
                                                       const std::string& inFederator);

}  // namespace ZORToolkit

#endif
