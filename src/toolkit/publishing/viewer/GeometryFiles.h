// The geometry of a published folder's 3D views: scripts beside the page, since a page that was
// opened from disk may load nothing else.
#ifndef ZOR_TOOLKIT_PUBLISHING_VIEWER_GEOMETRY_FILES_H
#define ZOR_TOOLKIT_PUBLISHING_VIEWER_GEOMETRY_FILES_H

#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/publishing/OneFile.h"

namespace ZORToolkit {

/// The path of the script with this block, as the page refers to it.
std::string GeometryPath(const PageBlock& inBlock);

/// The script with this block.
std::string GeometryScript(const PageBlock& inBlock);

/// Whether a text begins as such a script does.
bool IsGeometryScript(std::string_view inText);

/// The files in a publication's folder that have the name of such a script.
std::vector<std::filesystem::path> GeometryFilesIn(const std::string& inFolder);

/// Writes a script for each block, and removes those of a former publication. Raises FileError.
/// @param inWorkFolder where the files are made.
void WriteGeometry(const std::vector<PageBlock>& inBlocks, const std::string& inFolder,
                   const std::string& inWorkFolder);

}  // namespace ZORToolkit

#endif
