#include "toolkit/review/ReviewedFile.h"

#include <filesystem>
#include <fstream>
#include <utility>

#include "foundation/NativePath.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/records/ClashDocumentEdit.h"

namespace ZORToolkit {
namespace {

constexpr std::uint64_t kMaxSize = 0x7fffffff;  // what the library reads from memory

HRESULT WriteBytes(const std::string& inBytes, const std::string& inPath) {
  std::ofstream file(ZORFoundation::NativePath(inPath), std::ios::binary);
  file.write(inBytes.data(), static_cast<std::streamsize>(inBytes.size()));
  return file.flush() ? S_OK : E_FAIL;
}

}  // namespace

std::string BytesOfInput(const std::string& inPath) {
  constexpr int kStandardInput = 0;
  if (inPath == "-") return ZORFoundation::ReadToEnd(kStandardInput, "-", kMaxSize);
  ZORFoundation::ReadOptions options;
  options.maxSize = kMaxSize;
  return ZORFoundation::ReadWholeFile(inPath, options).bytes;
}

ReviewedFile::ReviewedFile(const std::string& inPath, const ReviewReading& inReading)
    : ReviewedFile(inPath, BytesOfInput(inPath), inReading) {}

ReviewedFile::ReviewedFile(const std::string& inPath, std::string inBytes,
                           const ReviewReading& inReading)
    : bytes(std::move(inBytes)),
      document(inPath, bytes),
      result(ReadForReview(document, inReading)) {}

int ReviewedFile::Apply(std::span<const ReviewEdit> inEdits) {
  const int changed = ApplyReviewEdits(document, result, inEdits);
  isChanged = isChanged || changed > 0;
  return changed;
}

HRESULT ReviewedFile::Write(const std::string& inPath) {
  return isChanged ? ClashDocumentEdit(document).Dump({}, inPath) : WriteBytes(bytes, inPath);
}

CarryPlan CarryInto(ReviewedFile& ioNew, const ReviewedFile& inOld, const DiffOptions& inOptions,
                    bool inKeepChanged) {
  if (inOld.bytes == ioNew.bytes) return {};
  CarryPlan plan = PlanCarry(inOld.result, ioNew.result,
                             Diff(inOld.result, ioNew.result, inOptions), inKeepChanged);
  ioNew.Apply(plan.edits);
  return plan;
}

HRESULT SettleAsBefore(const ReviewedFile& inPrevious, const std::string& inPath) {
  ReviewedFile now(inPath, {.geometries = true});
  CarryInto(now, inPrevious);
  return now.isChanged ? now.Write(inPath) : S_OK;
}

}  // namespace ZORToolkit
