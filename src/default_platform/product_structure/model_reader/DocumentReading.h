// Reading a file of any format into one kind of document.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_DOCUMENTREADING_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_DOCUMENTREADING_H

#include <Message_ProgressRange.hxx>
#include <TDocStd_Document.hxx>
#include <string>
#include <vector>

#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

/// Silences the kernel and sets what its readers take from process-wide parameters.
void PrepareReaders();

/// @param outReferencedFiles the files that the model refers to, as it names them.
/// @return null when the file cannot be read; outReason says why.
Handle(TDocStd_Document)
    ReadDocument(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
                 std::vector<std::string>& outReferencedFiles, std::string& outReason);

}  // namespace ZORDefault

#endif
