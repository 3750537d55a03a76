#include "xml_writing/Utf8File.h"

#include <algorithm>
#include <new>

#include "platform/system/ZORFile.h"

namespace {
constexpr std::size_t kSlice = std::size_t{64} * 1024;  // units

bool IsHighSurrogate(char16_t inUnit) { return (inUnit & 0xFC00) == 0xD800; }
}  // namespace

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

HRESULT OutputFile::Write(const char* inBytes, std::size_t inCount) {
  std::size_t written = 0;
  return ZORFWrite(descriptor_, inBytes, inCount, &written);
}

HRESULT OutputFile::Close() {
  if (!isOpen_) return S_OK;
  isOpen_ = false;
  return ZORFClose(descriptor_);
}

void Utf8Encoder::Add(std::u16string_view inText) {
  while (!inText.empty() && SUCCEEDED(result_)) {
    const std::size_t room = kSlice - static_cast<std::size_t>(slice_.GetLengthInChar());
    std::size_t count = std::min(inText.size(), room);
    // The halves of a character stay together.
    if (count > 0 && count < inText.size() && IsHighSurrogate(inText[count - 1])) --count;
    slice_.AppendUTF16(inText.data(), count);
    inText.remove_prefix(count);
    if (!inText.empty()) WriteSlice();
  }
}

void Utf8Encoder::WriteSlice() {
  const std::size_t room = 4 * static_cast<std::size_t>(slice_.GetLengthInChar()) + 4;
  if (bytes_.size() < room) bytes_.resize(room);
  std::size_t count = 0;
  slice_.ConvertToUTF8(bytes_.data(), &count);
  result_ = file_.Write(bytes_.data(), count);
  slice_.BuildFromUTF16(nullptr, 0);  // keeps its room
}

HRESULT Utf8Encoder::Finish() {
  if (SUCCEEDED(result_)) WriteSlice();
  return result_;
}
