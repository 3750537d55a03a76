#include "default_platform/OpenModel.h"

#include <cerrno>
#include <cmath>
#include <filesystem>
#include <optional>

#include "default_platform/ModelProgram.h"
#include "default_platform/product_structure/ModelCache.h"
#include "default_platform/product_structure/ModelDocument.h"
#include "default_platform/product_structure/ModelFormat.h"
#include "default_platform/product_structure/ModelReader.h"
#include "foundation/Descriptor.h"
#include "foundation/ReadWholeFile.h"

namespace ZORDefault {
namespace {

/// The limits of the options; where they have none, those for a file of this size.
ModelLimits LimitsFor(const ModelOptions& inOptions, std::size_t inFileSize) {
  constexpr double kSeconds = 6, kSecondsPerByte = 10e-6;
  constexpr std::uint64_t kMemory = std::uint64_t{512} << 20, kMemoryPerByte = 256;
  const auto size = static_cast<double>(inFileSize);
  return {inOptions.maxSeconds > 0 ? inOptions.maxSeconds : kSeconds + kSecondsPerByte * size,
          inOptions.maxMemory > 0 ? inOptions.maxMemory : kMemory + kMemoryPerByte * inFileSize};
}

constexpr double kMaxDeflection = 0.1;

std::string ReasonOf(const ZORFoundation::FileError& inError) {
  switch (inError.Code()) {
    case ENOENT:
    case ENOTDIR:
      return "does not exist";
    case EISDIR:
      return "is a directory";
    case ESPIPE:
      return inError.Reason();
    default:
      return "cannot be read: " + inError.Reason();
  }
}

/// A consistent state of the file, which another program may be saving.
std::string ReadBytes(const std::string& inPath) try {
  constexpr int kAttempts = 5;
  for (int attempt = 0; attempt < kAttempts; ++attempt) {
    ZORFoundation::WholeFile whole = ZORFoundation::ReadWholeFile(inPath);
    if (!whole.IsConsistent()) continue;
    if (whole.bytes.empty()) throw ModelError(inPath, "is empty", ModelErrorKind::kFile);
    return std::move(whole.bytes);
  }
  throw ModelError(inPath, "changes while it is read", ModelErrorKind::kFile);
} catch (const ZORFoundation::FileError& error) {
  throw ModelError(inPath, ReasonOf(error), ModelErrorKind::kFile);
}

ModelFormat CheckedFormat(const std::string& inPath, const std::string& inBytes) {
  std::string reason;
  const ModelFormat format = DecideFormat(inPath, inBytes, reason);
  if (format == ModelFormat::kUnknown) throw ModelError(inPath, reason, ModelErrorKind::kFormat);
  if (!IsWhole(format, inBytes)) {
    throw ModelError(inPath,
                     std::string("is cut off: its ") + NameOfFormat(format) + " data has no end",
                     ModelErrorKind::kFormat);
  }
  return format;
}

ModelRequest RequestFor(const std::string& inPath, ModelFormat inFormat,
                        const ModelOptions& inOptions) {
  std::error_code error;
  const auto path = std::filesystem::absolute(inPath, error);
  return {error ? inPath : path.string(), inFormat, inOptions.deflection, inOptions.progress};
}

/// From the cache when it is there and whole, else from the bytes and into the cache.
ModelData ReadModel(const std::string& inPath, const std::string& inBytes,
                    const ModelOptions& inOptions, bool& outIsFromCache) try {
  const ModelRequest request = RequestFor(inPath, CheckedFormat(inPath, inBytes), inOptions);
  ModelData model;
  std::optional<ModelCache> cache;
  if (inOptions.useCache) cache.emplace(inBytes, request);
  const auto lookup = cache ? cache->Load(model) : ModelCache::Lookup::kMiss;
  if (lookup == ModelCache::Lookup::kDamaged && inOptions.warn)
    inOptions.warn(inPath + ": its entry in the cache was damaged and is made anew");
  outIsFromCache = lookup == ModelCache::Lookup::kHit;
  if (outIsFromCache) return model;
  const std::string encoded =
      ReadModelInChild(request, inBytes, LimitsFor(inOptions, inBytes.size()));
  if (!DecodeModel(encoded, model))
    throw ModelError(inPath, "cannot be read: the model reader gave no model",
                     ModelErrorKind::kCrash);
  if (cache && !model.hadFailure) cache->Store(encoded);
  return model;
} catch (const ModelReaderError& error) {
  throw ModelError(inPath, error.reason, error.kind);
}

void ReportDamages(const std::string& inPath, const ModelData& inModel,
                   const ModelOptions& inOptions) {
  for (const std::string& damage : inModel.damages) {
    if (inOptions.isStrict)
      throw ModelError(inPath, "is damaged: " + damage, ModelErrorKind::kDamaged);
    if (inOptions.warn) inOptions.warn(inPath + ": is damaged: " + damage);
  }
}

std::u16string NameOfFile(const std::string& inPath) {
  return std::filesystem::path(inPath).stem().u16string();
}

}  // namespace

ModelError::ModelError(const std::string& inPath, const std::string& inReason,
                       ModelErrorKind inKind)
    : std::runtime_error(inPath + ": " + inReason),
      path_(inPath),
      reason_(inReason),
      kind_(inKind) {}

ModelError::~ModelError() = default;

std::string RunOnModel(const std::string& inPath, const ModelProgram& inProgram,
                       const ModelOptions& inOptions) try {
  const std::string bytes = ReadBytes(inPath);
  ModelLimits limits = LimitsFor(inOptions, bytes.size());
  if (inOptions.maxMemory == 0) limits.memory += inProgram.memory;
  return ReadModelInChild(RequestFor(inPath, CheckedFormat(inPath, bytes), inOptions), bytes,
                          limits, inProgram);
} catch (const ModelReaderError& error) {
  throw ModelError(inPath, error.reason, error.kind);
}

OpenedModel OpenModel(const std::string& inPath, const ModelOptions& inOptions) {
  if (!(inOptions.deflection > 0 && inOptions.deflection <= kMaxDeflection))
    throw ModelError(inPath, "cannot be tessellated with a deflection outside 0 to 0.1");
  OpenedModel opened;
  ModelData model = ReadModel(inPath, ReadBytes(inPath), inOptions, opened.isFromCache);
  ReportDamages(inPath, model, inOptions);
  if (inOptions.warn)
    for (const std::string& warning : model.warnings) inOptions.warn(inPath + ": " + warning);
  if (inOptions.progress) inOptions.progress(1);
  auto* const document = new ModelDocument(std::move(model), NameOfFile(inPath));
  opened.document = ZORDocument_var(document->GetInterface());
  opened.root = ZORIProduct_var(document->GetRoot().GetInterface());
  return opened;
}

}  // namespace ZORDefault
