#include "default_platform/xml/full_scanner/DocumentEntity.h"

#include <unicode/ucnv.h>

#include <algorithm>
#include <array>
#include <bit>
#include <cstdio>
#include <cstring>
#include <memory>
#include <string_view>
#include <vector>
#include <xercesc/util/BinInputStream.hpp>

#include "foundation/Utf8.h"

namespace {

constexpr std::size_t kBeginSize = 4096;  // a declaration lies in it

struct CloseConverter {
  void operator()(UConverter* inConverter) const { ucnv_close(inConverter); }
};
using Converter = std::unique_ptr<UConverter, CloseConverter>;

// ---- what a document says of its encoding

std::string_view WithoutMark(std::string_view inBegin) {
  constexpr std::string_view kMark = "\xEF\xBB\xBF";
  return inBegin.substr(inBegin.starts_with(kMark) ? kMark.size() : 0);
}

bool IsEbcdic(std::string_view inBegin) { return inBegin.starts_with("\x4C\x6F\xA7\x94\x93"); }

/// Whether a document is not in a wide encoding or in EBCDIC, which the library tells by the first
/// bytes.
bool IsBytewise(std::string_view inBegin) {
  const std::string_view two = inBegin.substr(0, 2);
  return two != "\xFE\xFF" && two != "\xFF\xFE" && two.find('\0') == std::string_view::npos &&
         !IsEbcdic(inBegin);
}

/// In small letters; empty without a declaration of it.
std::string DeclaredEncoding(std::string_view inBegin) {
  inBegin = WithoutMark(inBegin);
  constexpr std::size_t kWord = 5;
  if (!inBegin.starts_with("<?xml") || inBegin.find_first_of(" \t\r\n", kWord) != kWord) return {};
  const std::string_view declaration = inBegin.substr(0, inBegin.find("?>"));
  const bool isAscii =
      std::ranges::all_of(declaration, [](char inUnit) { return (inUnit & 0x80) == 0; });
  if (!isAscii) return {};
  const std::size_t encoding = declaration.find("encoding");
  if (encoding == std::string_view::npos) return {};
  const std::size_t quote = declaration.find_first_of("'\"", encoding);
  if (quote == std::string_view::npos) return {};
  const std::size_t end = declaration.find(declaration[quote], quote + 1);
  std::string name(declaration.substr(quote + 1, end - quote - 1));
  for (char& unit : name)
    if (unit >= 'A' && unit <= 'Z') unit = static_cast<char>(unit + ('a' - 'A'));
  return name;
}

/// Wide encodings declared in text of bytes are passed over: it is UTF-8.
bool IsUtf8(std::string_view inBegin) {
  const std::string declared = DeclaredEncoding(inBegin);
  return IsBytewise(inBegin) && (declared.empty() || declared == "utf-8" || declared == "utf8" ||
                                 declared.starts_with("utf-16") || declared.starts_with("ucs-4") ||
                                 declared.starts_with("iso-10646-ucs"));
}

std::string AsciiFromEbcdic(std::string_view inBegin) {
  std::string text(inBegin.size() + 1, '\0');
  UErrorCode error = U_ZERO_ERROR;
  const auto size =
      ucnv_convert("US-ASCII", "ibm-37", text.data(), static_cast<std::int32_t>(text.size()),
                   inBegin.data(), static_cast<std::int32_t>(inBegin.size()), &error);
  text.resize(U_SUCCESS(error) ? static_cast<std::size_t>(size) : 0);
  return text;
}

bool IsEncodingName(std::string_view inName) {
  constexpr std::string_view kUnits = "abcdefghijklmnopqrstuvwxyz0123456789._-";
  return !inName.empty() && inName.find_first_not_of(kUnits) == std::string_view::npos;
}

/// Whether an encoding has these bytes for the beginning of a declaration.
bool DecodesDeclaration(const std::string& inEncoding, std::string_view inBegin) {
  UErrorCode error = U_ZERO_ERROR;
  const Converter converter(ucnv_open(inEncoding.c_str(), &error));
  if (U_FAILURE(error)) return false;
  constexpr std::u16string_view kStart = u"<?xml";
  char16_t units[2 * kStart.size()] = {};
  ucnv_toUChars(converter.get(), units, static_cast<std::int32_t>(std::size(units)), inBegin.data(),
                static_cast<std::int32_t>(kStart.size()), &error);
  return U_SUCCESS(error) && std::u16string_view(units).starts_with(kStart);
}

/// The declared encoding when it is one that the library leaves to ICU, else empty.
std::string EncodingForIcu(std::string_view inBegin) {
  // The library reads these itself; every byte is a character or is refused.
  static constexpr std::array<std::string_view, 8> kReadByLibrary = {
      "us-ascii", "ascii", "iso-8859-1", "latin1", "ebcdic-cp-us", "ibm037", "ibm1047", "ibm1140"};
  if ((!IsBytewise(inBegin) || IsUtf8(inBegin)) && !IsEbcdic(inBegin)) return {};
  std::string declared =
      DeclaredEncoding(IsEbcdic(inBegin) ? AsciiFromEbcdic(inBegin) : std::string(inBegin));
  const bool isReadByLibrary = std::ranges::find(kReadByLibrary, declared) != kReadByLibrary.end();
  return !isReadByLibrary && IsEncodingName(declared) && DecodesDeclaration(declared, inBegin)
             ? declared
             : std::string();
}

// ---- streams

/// The bytes as they are, the beginning from where it was put.
class ReaderStream : public xercesc::BinInputStream {
 public:
  ReaderStream(ByteReader& ioReader, const std::string& inBegin)
      : reader_(ioReader), begin_(inBegin) {}
  XMLFilePos curPos() const override { return reader_.BytesRead(); }
  XMLSize_t readBytes(XMLByte* const outBytes, const XMLSize_t inMax) override {
    return Read(outBytes, inMax);
  }
  const XMLCh* getContentType() const override { return nullptr; }

 protected:
  std::size_t Read(XMLByte* outBytes, std::size_t inMax) {
    const std::size_t count = std::min(inMax, begin_.size());
    std::copy_n(begin_.begin(), count, outBytes);
    begin_.erase(0, count);
    return count + (count < inMax ? reader_.Read(outBytes + count, inMax - count) : 0);
  }

 private:
  ByteReader& reader_;
  std::string begin_;
};

/// Whether a byte begins a sequence of UTF-8 beyond Unicode, as far as its bytes are there.
bool IsBeyondUnicode(const XMLByte* inPlace, const XMLByte* inEnd) {
  if (*inPlace < 0xF5 || *inPlace > 0xF7) return false;
  const XMLByte* const end = std::min(inPlace + 4, inEnd);
  return std::all_of(inPlace + 1, end, [](XMLByte inByte) { return (inByte & 0xC0) == 0x80; });
}

/// The library drops sequences of UTF-8 that begin with F5 to F7: it gets a byte instead that it
/// refuses.
class Utf8Stream : public ReaderStream {
 public:
  using ReaderStream::ReaderStream;
  XMLSize_t readBytes(XMLByte* const outBytes, const XMLSize_t inMax) override {
    const std::size_t kept = held_.size();
    std::copy(held_.begin(), held_.end(), outBytes);
    held_.clear();
    const std::size_t added = Read(outBytes + kept, inMax - kept);
    XMLByte* const end = outBytes + kept + added;
    for (XMLByte* at = outBytes; at != end; ++at) {
      if (!IsBeyondUnicode(at, end)) continue;
      if (end - at < 4 && added != 0 && at != outBytes) {  // the rest of it comes next
        held_.assign(at, end);
        return static_cast<XMLSize_t>(at - outBytes);
      }
      if (end - at >= 4) *at = 0xFF;
    }
    return kept + added;
  }

 private:
  std::vector<XMLByte> held_;
};

/// UTF-16 made by ICU. Where a byte is none of the encoding it ends with U+FFFF, which no document
/// may have.
class IcuStream : public ReaderStream {
 public:
  IcuStream(ByteReader& ioReader, const std::string& inBegin, const std::string& inEncoding,
            std::string& outFault)
      : ReaderStream(ioReader, inBegin), encoding_(inEncoding), fault_(outFault) {
    UErrorCode error = U_ZERO_ERROR;
    converter_.reset(ucnv_open(encoding_.c_str(), &error));
    ucnv_setToUCallBack(converter_.get(), UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr,
                        &error);
    if (U_FAILURE(error)) throw std::bad_alloc();  // it could be opened before
  }

  XMLSize_t readBytes(XMLByte* const outBytes, const XMLSize_t inMax) override {
    while (taken_ == made_ && !isOver_) Decode();
    const std::size_t count = std::min(inMax / sizeof(char16_t), made_ - taken_);
    std::memcpy(outBytes, units_.data() + taken_, count * sizeof(char16_t));
    taken_ += count;
    return count * sizeof(char16_t);
  }

 private:
  void Decode() {
    if (source_ == sourceEnd_ && !isLast_) {
      const std::size_t count = Read(bytes_.data(), bytes_.size());
      source_ = reinterpret_cast<const char*>(bytes_.data());
      sourceEnd_ = source_ + count;
      isLast_ = count == 0;
    }
    char16_t* target = units_.data();
    UErrorCode error = U_ZERO_ERROR;
    // One unit stays free for the mark of a fault.
    ucnv_toUnicode(converter_.get(), &target, units_.data() + units_.size() - 1, &source_,
                   sourceEnd_, nullptr, static_cast<UBool>(isLast_), &error);
    if (U_FAILURE(error) && error != U_BUFFER_OVERFLOW_ERROR) {
      NoteFault();
      *target++ = 0xFFFF;
      isOver_ = true;
    }
    isOver_ = isOver_ || (isLast_ && error != U_BUFFER_OVERFLOW_ERROR);
    taken_ = 0;
    made_ = static_cast<std::size_t>(target - units_.data());
  }

  void NoteFault() {
    char bad[32];
    std::int8_t count = sizeof bad;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_getInvalidChars(converter_.get(), bad, &count, &error);
    fault_ = count == 1 ? "invalid byte" : "invalid bytes";
    for (std::int8_t i = 0; U_SUCCESS(error) && i < count; ++i) {
      char text[8];
      std::snprintf(text, sizeof text, " %02X", static_cast<unsigned char>(bad[i]));
      fault_ += text;
    }
    fault_ += " in the encoding " + encoding_;
  }

  const std::string& encoding_;
  std::string& fault_;
  Converter converter_;
  std::array<XMLByte, 8192> bytes_{};
  const char* source_ = nullptr;
  const char* sourceEnd_ = nullptr;
  bool isLast_ = false;  // all bytes are in the converter
  bool isOver_ = false;
  std::array<char16_t, 8192> units_{};
  std::size_t taken_ = 0, made_ = 0;
};

}  // namespace

DocumentEntity::DocumentEntity(ByteReader& ioReader, const std::string& inName)
    : reader_(ioReader), begin_(kBeginSize, '\0') {
  std::size_t size = 0, count = 0;
  do {
    count =
        reader_.Read(reinterpret_cast<unsigned char*>(begin_.data()) + size, begin_.size() - size);
    size += count;
  } while (count != 0 && size < begin_.size());
  begin_.resize(size);
  encoding_ = EncodingForIcu(begin_);
  if (!encoding_.empty())
    setEncoding(std::endian::native == std::endian::little ? u"UTF-16LE" : u"UTF-16BE");
  std::u16string name(inName.size(), u'\0');
  name.resize(ZORFoundation::DecodeUtf8(inName, name.data()));
  setSystemId(name.c_str());
}

xercesc::BinInputStream* DocumentEntity::makeStream() const {
  if (!encoding_.empty()) return new IcuStream(reader_, begin_, encoding_, fault_);
  if (IsUtf8(begin_)) return new Utf8Stream(reader_, begin_);
  return new ReaderStream(reader_, begin_);
}
