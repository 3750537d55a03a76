#include "default_platform/OpenModel.h"

#include <cerrno>
#include <cmath>
#include <filesystem>

#include "default_platform/product_structure/ModelCache.h"
#include "default_platform/product_structure/ModelDocument.h"
#include "default_platform/product_structure/ModelFormat.h"
#include "default_platform/product_structure/ModelReader.h"
#include "foundation/ReadWholeFile.h"

namespace ZORDefault {
namespace {

constexpr double kMaxDeflection = 0.1;

std::string ReadBytes(const std::string& inPath) {
  try {
    std::string bytes = ZORFoundation::ReadWholeFile(inPath).bytes;
    if (bytes.empty()) throw ModelError(inPath, "is empty");
    return bytes;
  } catch (const ZORFoundation::FileError& error) {
    const bool isMissing = error.Code() == ENOENT, isFolder = error.Code() == EISDIR;
    throw ModelError(inPath, isMissing  ? "does not exist"
                             : isFolder ? "is a directory"
                                        : "cannot be read");
  }
}

ModelFormat CheckedFormat(const std::string& inPath, const std::string& inBytes) {
  std::string reason;
  const ModelFormat format = DecideFormat(inPath, inBytes, reason);
  if (format == ModelFormat::kUnknown) throw ModelError(inPath, reason);
  if (!IsWhole(format, inBytes)) {
    throw ModelError(inPath,
                     std::string("is cut off: its ") + NameOfFormat(format) + " data has no end");
  }
  return format;
}

ModelRequest RequestFor(const std::string& inPath, ModelFormat inFormat,
                        const ModelOptions& inOptions) {
  std::error_code error;
  const auto path = std::filesystem::absolute(inPath, error);
  return {error ? inPath : path.string(), inFormat, inOptions.deflection, inOptions.progress};
}

ModelData ReadFromFile(const std::string& inPath, const ModelRequest& inRequest) {
  ModelData model;
  std::string reason;
  if (!ReadModelWithLibrary(inRequest, model, reason)) throw ModelError(inPath, reason);
  return model;
}

/// From the cache when it is there and whole, else from the file and into the cache.
ModelData ReadModel(const std::string& inPath, const std::string& inBytes,
                    const ModelOptions& inOptions, bool& outIsFromCache) {
  const ModelRequest request = RequestFor(inPath, CheckedFormat(inPath, inBytes), inOptions);
  ModelData model;
  outIsFromCache = false;
  if (!inOptions.useCache) return ReadFromFile(inPath, request);
  const ModelCache cache(inBytes, request);
  const ModelCache::Finding finding = cache.Load(model);
  if (finding == ModelCache::Finding::kDamaged && inOptions.warn)
    inOptions.warn(inPath + ": its entry in the cache was damaged and is made anew");
  outIsFromCache = finding == ModelCache::Finding::kFound;
  if (outIsFromCache) return model;
  model = ReadFromFile(inPath, request);
  cache.Store(model);
  return model;
}

std::u16string NameOfFile(const std::string& inPath) {
  return std::filesystem::path(inPath).stem().u16string();
}

}  // namespace

ModelError::ModelError(const std::string& inPath, const std::string& inReason)
    : std::runtime_error(inPath + ": " + inReason), path_(inPath), reason_(inReason) {}

ModelError::~ModelError() = default;

OpenedModel OpenModel(const std::string& inPath, const ModelOptions& inOptions) {
  if (!(inOptions.deflection > 0 && inOptions.deflection <= kMaxDeflection))
    throw ModelError(inPath, "cannot be tessellated with a deflection outside 0 to 0.1");
  OpenedModel opened;
  ModelData model = ReadModel(inPath, ReadBytes(inPath), inOptions, opened.isFromCache);
  if (inOptions.warn)
    for (const std::string& warning : model.warnings) inOptions.warn(inPath + ": " + warning);
  if (inOptions.progress) inOptions.progress(1);
  auto* const document = new ModelDocument(std::move(model), NameOfFile(inPath));
  opened.document = ZORDocument_var(document->GetInterface());
  opened.root = ZORIProduct_var(document->GetRoot().GetInterface());
  document->ReleaseReference();  // the handles have theirs
  return opened;
}

}  // namespace ZORDefault
