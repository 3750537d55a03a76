#include "lyra/DocumentText.h"

#include "ZORLyraGeneralServices.h"

namespace lyra {

std::string Utf8(const ZORUnicodeString& inText) {
  std::string bytes(3 * static_cast<std::size_t>(inText.GetLengthInChar()), '\0');
  std::size_t count = 0;
  inText.ConvertToUTF8(bytes.data(), &count);
  bytes.resize(count);
  return bytes;
}

ZORUnicodeString FromUtf8(std::string_view inBytes) {
  ZORUnicodeString text;
  text.BuildFromUTF8(inBytes.data(), inBytes.size());
  return text;
}

std::string AttributeText(const DOM_Node& inNode, const char* inName) {
  return Utf8(ZORLyraGeneralServices::GetAttrOnNode(inNode, inName));
}

std::string NumberText(const DOM_Node& inNode, const char* inName) {
  std::string text = AttributeText(inNode, inName);
  const std::size_t comma = text.find(',');
  if (comma != std::string::npos) text[comma] = '.';
  return text;
}

}  // namespace lyra
