#include "xml_writing/Utf8File.h"

#include <new>

#include "platform/system/ZORFile.h"

// Zeroed memory of the C library costs nothing where it is not touched, and of four bytes a
// character most texts touch one.
Utf8Bytes ToUtf8(const ZORUnicodeString& inText) {
  const std::size_t length = static_cast<std::size_t>(inText.GetLengthInChar());
  Utf8Bytes utf8;
  utf8.bytes.reset(static_cast<char*>(std::calloc(4 * length + 4, 1)));
  if (utf8.bytes == nullptr) throw std::bad_alloc();
  inText.ConvertToUTF8(utf8.bytes.get(), &utf8.count);
  return utf8;
}

std::wstring ToWide(const ZORUnicodeString& inPath) {
  std::wstring wide(static_cast<std::size_t>(inPath.GetLengthInChar()) + 10, L'\0');
  inPath.ConvertToWChar(wide.data());
  return wide;
}

OutputFile::~OutputFile() { Close(); }

HRESULT OutputFile::Open(const ZORUnicodeString& inPath) {
  const HRESULT result = ZORFOpen(ToWide(inPath).c_str(), "wb", &descriptor_);
  isOpen_ = SUCCEEDED(result);
  return result;
}

HRESULT OutputFile::Write(const Utf8Bytes& inText) {
  std::size_t written = 0;
  return ZORFWrite(descriptor_, inText.bytes.get(), inText.count, &written);
}

HRESULT OutputFile::Close() {
  if (!isOpen_) return S_OK;
  isOpen_ = false;
  return ZORFClose(descriptor_);
}
