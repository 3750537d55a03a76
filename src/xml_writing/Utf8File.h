// Text written into a file as UTF-8.
#ifndef ZOR_XML_WRITING_UTF8_FILE_H
#define ZOR_XML_WRITING_UTF8_FILE_H

#include <cstddef>
#include <cstdlib>
#include <memory>
#include <string>
#include <string_view>

#include "platform/system/ZORResult.h"
#include "platform/system/ZORUnicodeString.h"

/// A text as UTF-8 bytes.
struct Utf8Bytes {
  struct Free {
    void operator()(char* inBytes) const { std::free(inBytes); }
  };
  std::unique_ptr<char, Free> bytes;
  std::size_t count = 0;
};

/// Raises std::bad_alloc when there is no memory for them.
Utf8Bytes ToUtf8(const ZORUnicodeString& inText);

/// A zero-terminated path as the platform's file operations take it, with some zeros to spare.
std::wstring ToWide(const ZORUnicodeString& inPath);

/// A file that is being written; closed when this ends at the latest.
class OutputFile {
 public:
  OutputFile() = default;
  ~OutputFile();
  OutputFile(const OutputFile&) = delete;
  OutputFile& operator=(const OutputFile&) = delete;

  /// Makes or empties the file. Each of the three passes the platform's code up.
  HRESULT Open(const ZORUnicodeString& inPath);
  HRESULT Write(const char* inBytes, std::size_t inCount);
  HRESULT Close();

 private:
  bool isOpen_ = false;
  int descriptor_ = 0;
};

/// Writes UTF-16 text into a file as UTF-8, a slice at a time: of a text of gigabytes there is no
/// second one in memory. What is shorter than a slice is written at once.
class Utf8Encoder {
 public:
  explicit Utf8Encoder(OutputFile& ioFile) : file_(ioFile) {}
  void Add(std::u16string_view inText);
  /// Writes what is left.
  /// @return the platform's code of the first writing that failed, behind which none was tried.
  HRESULT Finish();

 private:
  void WriteSlice();

  OutputFile& file_;
  ZORUnicodeString slice_;
  std::string bytes_;
  HRESULT result_ = S_OK;
};

#endif
