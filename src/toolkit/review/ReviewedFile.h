// A result as a file that review work is written into.
#ifndef ZOR_TOOLKIT_REVIEW_REVIEWED_FILE_H
#define ZOR_TOOLKIT_REVIEW_REVIEWED_FILE_H

#include <span>
#include <string>

#include "toolkit/review/Carry.h"

namespace ZORToolkit {

/// The bytes of a file, or of standard input for "-". Raises ZORFoundation::FileError.
ZOR_TOOLKIT_EXPORT std::string BytesOfInput(const std::string& inPath);

/// A result with its bytes, which are written where nothing changes.
struct ZOR_TOOLKIT_EXPORT ReviewedFile {
  /// @param inPath a file, or "-" for standard input. Raises Error or ZORFoundation::FileError.
  explicit ReviewedFile(const std::string& inPath, const ReviewReading& inReading = {});

  /// @return how many interferences changed.
  int Apply(std::span<const ReviewEdit> inEdits);
  /// As it was read when nothing in it changed, else as the document is now.
  /// @return a negative code when the file cannot be written.
  HRESULT Write(const std::string& inPath);

  std::string bytes;
  ClashDocument document;
  ReviewedResult result;
  bool isChanged = false;

 private:
  ReviewedFile(const std::string& inPath, std::string inBytes, const ReviewReading& inReading);
};

/// Takes the decisions of an old result over into a new one, see PlanCarry. One that was not computed
/// again, byte for byte the old one, stays as it is.
ZOR_TOOLKIT_EXPORT CarryPlan CarryInto(ReviewedFile& ioNew, const ReviewedFile& inOld,
                                       const DiffOptions& inOptions = {},
                                       bool inKeepChanged = false);

/// The same for a result that was just computed: what was decided holds for the file too.
/// @return a negative code when the file cannot be written.
ZOR_TOOLKIT_EXPORT HRESULT SettleAsBefore(const ReviewedFile& inPrevious,
                                          const std::string& inPath);

}  // namespace ZORToolkit

#endif
