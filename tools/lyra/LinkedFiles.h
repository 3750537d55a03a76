// The documents that a federator document links.
#ifndef ZOR_TOOLS_LYRA_LINKED_FILES_H
#define ZOR_TOOLS_LYRA_LINKED_FILES_H

#include <string>
#include <vector>

#include "lyra/DocumentRecords.h"

namespace lyra {

/// The reference by which a federator document links a file: relative to the federator document
/// where the file's path is relative. @param inFederator "-" stands in the current directory.
std::string LinkTo(const std::string& inFile, const std::string& inFederator);
/// The path of a linked file: logical names are resolved, and what is relative is so to the
/// federator document. Empty when there is no such path.
std::string LinkedPath(const std::string& inLink, const std::string& inFederator);

/// For each link what is wrong with it: missing, unreadable, of the wrong kind or listed twice;
/// empty when nothing is.
std::vector<std::string> CheckLinks(const std::vector<LinkRecord>& inLinks,
                                    const std::string& inFederator);

}  // namespace lyra

#endif
