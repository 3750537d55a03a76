#include "ResultHash.h"

#include <vector>

#include "foundation/ReadWholeFile.h"
#include "foundation/Utf8.h"

void ResultHash::Add(std::string_view inUtf8) {
  constexpr char kEndOfText = '\xFF';
  AddPart(inUtf8);
  AddPart({&kEndOfText, 1});
}

void ResultHash::Add(std::u16string_view inUtf16) {
  std::string utf8(ZORFoundation::Utf8Length(inUtf16), '\0');
  ZORFoundation::EncodeUtf8(inUtf16, utf8.data());
  Add(std::string_view(utf8));
}

std::uint64_t HashOfBytes(const std::string& inPath) {
  const auto file = ZORFoundation::OpenForReading(inPath);
  ResultHash hash;
  std::vector<char> part(std::size_t{1} << 20);
  while (const std::size_t count =
             ZORFoundation::ReadSome(file.Get(), part.data(), part.size(), inPath))
    hash.AddPart({part.data(), count});
  hash.Add(std::string_view());
  return hash.Value();
}
