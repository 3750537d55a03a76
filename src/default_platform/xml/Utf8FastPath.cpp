#include "default_platform/xml/Utf8FastPath.h"

#include <algorithm>
#include <bit>
#include <cstring>
#include <xercesc/util/XMLUni.hpp>

#include "foundation/Utf8.h"

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
constexpr std::string_view kFirstBytes = "< \t\r\n";  // of documents that can be read

bool IsUtf8Name(std::string_view inName) {
  constexpr std::string_view kName = "utf-8";
  return std::equal(inName.begin(), inName.end(), kName.begin(), kName.end(),
                    [](char inA, char inB) { return inA == inB || (inA | 0x20) == inB; });
}

/// Whether a text's XML declaration, if there is one, leaves it UTF-8.
bool DeclaresUtf8(std::string_view inText) {
  constexpr std::string_view kStart = "<?xml";
  if (!inText.starts_with(kStart)) return true;
  const std::string_view declaration = inText.substr(0, inText.find("?>"));
  const std::size_t encoding = declaration.find("encoding");
  if (encoding == std::string_view::npos) return declaration.size() < inText.size();
  const std::size_t quote = declaration.find_first_of("'\"", encoding);
  if (quote == std::string_view::npos) return false;
  const std::size_t end = declaration.find(declaration[quote], quote + 1);
  return end != std::string_view::npos &&
         IsUtf8Name(declaration.substr(quote + 1, end - quote - 1));
}

/// How many bytes at the end of a text begin a character without ending it.
std::size_t UnfinishedBytes(std::string_view inText) {
  for (std::size_t count = 1; count <= std::min<std::size_t>(3, inText.size()); ++count) {
    const auto byte = static_cast<unsigned char>(inText[inText.size() - count]);
    if (byte < 0x80) return 0;
    if (byte < 0xC0) continue;
    // The ones at the head of a lead byte count the character's bytes.
    return static_cast<std::size_t>(std::countl_one(byte)) > count ? count : 0;
  }
  return 0;
}

// A block at a time without branches, which compilers turn into vector instructions.
bool HasReplacement(std::u16string_view inText) {
  constexpr std::size_t kBlock = 64;
  while (inText.size() >= kBlock) {
    unsigned int hits = 0;
    for (std::size_t i = 0; i < kBlock; ++i)
      hits |= inText[i] == ZORFoundation::kReplacementCharacter;
    if (hits) return true;
    inText.remove_prefix(kBlock);
  }
  return inText.find(ZORFoundation::kReplacementCharacter) != std::u16string_view::npos;
}

class Utf8Stream : public xercesc::BinInputStream {
 public:
  explicit Utf8Stream(Utf8FastPath& ioText) : text_(ioText) {}
  XMLFilePos curPos() const override { return bytesRead_; }
  XMLSize_t readBytes(XMLByte* const outBytes, const XMLSize_t inMax) override {
    const XMLSize_t count =
        text_.Read(reinterpret_cast<char16_t*>(outBytes), inMax / sizeof(char16_t)) *
        sizeof(char16_t);
    bytesRead_ += count;
    return count;
  }
  const XMLCh* getContentType() const override { return nullptr; }

 private:
  Utf8FastPath& text_;
  XMLFilePos bytesRead_ = 0;
};

}  // namespace

Utf8FastPath::Utf8FastPath(ByteReader& ioReader) : reader_(ioReader), bytes_(new char[kMaxBytes]) {}

std::size_t Utf8FastPath::Read(char16_t* outUnits, std::size_t inMax) {
  std::string_view bytes = NextBytes(std::min(inMax, kMaxBytes));
  if (bytes.empty()) return 0;
  if (++reads_ == 1) bytes = WithoutMark(bytes);
  last_ = bytes;
  const std::size_t count = ZORFoundation::DecodeUtf8(bytes, outUnits);
  if (HasReplacement({outUnits, count})) throw NeedsFullScanner();
  return count;
}

// Whole characters only; the start of one whose end has not been read stays for the next time.
std::string_view Utf8FastPath::NextBytes(std::size_t inMax) {
  std::size_t count = filled_ - used_;
  std::memmove(bytes_.get(), bytes_.get() + used_, count);
  std::size_t unfinished = 0;
  do {
    const std::size_t added =
        reader_.Read(reinterpret_cast<unsigned char*>(bytes_.get()) + count, inMax - count);
    if (added == 0 && count != 0) throw NeedsFullScanner();  // ends within a character
    count += added;
    unfinished = UnfinishedBytes({bytes_.get(), count});
  } while (count != 0 && unfinished == count);
  filled_ = count;
  used_ = count - unfinished;
  return {bytes_.get(), used_};
}

std::string_view Utf8FastPath::WithoutMark(std::string_view inText) {
  if (inText.starts_with(kByteOrderMark)) inText.remove_prefix(kByteOrderMark.size());
  const bool isText = !inText.empty() && kFirstBytes.find(inText[0]) != std::string_view::npos;
  if (!isText || !DeclaresUtf8(inText)) throw NeedsFullScanner();
  return inText;
}

bool Utf8FastPath::MayHaveDoctype() const {
  return reads_ != 1 || last_.find("<!DOCTYPE") != std::string_view::npos;
}

Utf8Entity::Utf8Entity(Utf8FastPath& ioText) : text_(ioText) {
  setEncoding(std::endian::native == std::endian::little ? xercesc::XMLUni::fgUTF16LEncodingString
                                                         : xercesc::XMLUni::fgUTF16BEncodingString);
}

xercesc::BinInputStream* Utf8Entity::makeStream() const { return new Utf8Stream(text_); }
