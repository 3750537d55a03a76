// The C library's functions that open files, which take what they open from the sandbox.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_SANDBOXEDCALLS_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_SANDBOXEDCALLS_H

#include <optional>

namespace ZORDefault {

/// What these functions ask.
/// @param inPath in UTF-8; may be null.
/// @return a descriptor, or -1 and errno; nothing where the file is to be opened directly.
std::optional<int> OpenInSandbox(const char* inPath, bool inWrites);

/// Opens what a descriptor refers to once more for reading, with a position of its own, past the
/// sandbox. @return -1 when that failed; errno says why.
int Reopen(int inDescriptor);

}  // namespace ZORDefault

#endif
