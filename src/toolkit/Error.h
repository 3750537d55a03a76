// What the toolkit raises.
#ifndef ZOR_TOOLKIT_ERROR_H
#define ZOR_TOOLKIT_ERROR_H

#include <cstddef>
#include <stdexcept>
#include <string>

#include "ZORToolkitExport.h"

namespace ZORToolkit {

/// A place in a file, from 1; 0 where there is none.
struct FilePlace {
  std::size_t line = 0, column = 0;
};

/// What was asked for cannot be done with this input or output. what() is one line of UTF-8 that
/// names the file and the reason.
class ZOR_TOOLKIT_EXPORT Error : public std::runtime_error {
 public:
  /// Where it is about no file.
  using std::runtime_error::runtime_error;
  /// "FILE:LINE:COLUMN: REASON", as far as there is a place.
  Error(const std::string& inFile, const std::string& inReason, FilePlace inPlace = {})
      : std::runtime_error(inFile + Text(inPlace.line) + Text(inPlace.column) + ": " + inReason),
        place_(inPlace),
        fileLength_(inFile.size()) {}

  std::string File() const { return std::string(what(), fileLength_); }
  FilePlace Place() const { return place_; }

 private:
  static std::string Text(std::size_t inNumber) {
    return inNumber == 0 ? std::string() : std::string(":").append(std::to_string(inNumber));
  }

  FilePlace place_;
  std::size_t fileLength_ = 0;
};

/// A call was given what it does not take. what() is one line of UTF-8.
class ZOR_TOOLKIT_EXPORT UsageError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

}  // namespace ZORToolkit

#endif
