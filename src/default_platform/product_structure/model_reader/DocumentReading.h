// Reading a file of any format into an XDE document.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_DOCUMENTREADING_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_MODEL_READER_DOCUMENTREADING_H

#include <Message_ProgressRange.hxx>
#include <TDocStd_Document.hxx>
#include <functional>
#include <string>
#include <vector>

#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

/// Silences the kernel and sets what its readers take from process-wide parameters.
void PrepareReaders();

/// What a file was read into.
struct LoadedDocument {
  Handle(TDocStd_Document) document;         ///< null when the file cannot be read
  std::vector<std::string> referencedFiles;  ///< relative to the model's folder, or absolute
  std::vector<std::string> damages;          ///< what the kernel left out, one line each
};

/// @param inTellStage called with what is done next; may be empty.
LoadedDocument ReadDocument(const ModelRequest& inRequest, const Message_ProgressRange& inProgress,
                            const std::function<void(const char*)>& inTellStage = {});

}  // namespace ZORDefault

#endif
