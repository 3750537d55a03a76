// What this program may open: the model, and regular files in its folder.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_FILESANDBOX_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_FILESANDBOX_H

#include <string>
#include <vector>

#include "default_platform/product_structure/ModelData.h"

namespace ZORDefault {

/// From now on whatever is opened in this process by fopen, open or a file stream is read only and
/// comes from here: the model's path gives the bytes in a descriptor; a regular file in the model's
/// folder or below it gives its bytes as they were when it was opened first; all else is refused.
/// The CAD kernel opens what a model names, which may be a pipe or a device, under names that only
/// it decodes.
void EnterFileSandbox(const std::string& inModelPath, int inModelBytes);

/// What became of a file that the model names, whether it was opened or not.
ReferencedFile ReferencedFileAt(const std::string& inName);

/// The first name in the model's folder that was refused since it is neither a file nor a folder;
/// "" when there was none.
std::string FirstNonRegularFile();

/// The files that were to be opened and were refused.
std::vector<std::string> RefusedFiles();

/// Whether a file changed while it was read.
bool HasChangedFile();

}  // namespace ZORDefault

#endif
