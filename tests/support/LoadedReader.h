// Readers that have loaded a document given as text.
#ifndef ZOR_TESTS_SUPPORT_LOADED_READER_H
#define ZOR_TESTS_SUPPORT_LOADED_READER_H

#include <array>
#include <string>
#include <tuple>
#include <utility>

#include "ZORClashParsing.h"

namespace support {

/// A text as the tests compare and print it.
inline std::string Text(const ZORUnicodeString& inText) { return inText.ConvertToChar(); }

/// What an output holds before a call, so that one that was left untouched can be told.
inline constexpr const char* kUntouched = "untouched";

/// A reader on a text in memory, loaded by the operation that recognises the kind.
class LoadedReader {
 public:
  explicit LoadedReader(std::string inXml)
      : text_(std::move(inXml)), reader_(text_.data(), static_cast<int>(text_.size())) {
    result = reader_.LoadSequence(kind, reference, version);
  }
  LoadedReader(const LoadedReader&) = delete;
  LoadedReader& operator=(const LoadedReader&) = delete;

  ZORClashParsing* operator->() { return &reader_; }
  ZORClashParsing& operator*() { return reader_; }

  HRESULT result = 1;
  ZORUnicodeString kind = kUntouched;
  ZORUnicodeString reference = kUntouched;
  ZORUnicodeString version = kUntouched;

 private:
  std::string text_;
  ZORClashParsing reader_;
};

/// A reader on a text in memory, loaded by the operation that hands the document out.
class SharedReader {
 public:
  explicit SharedReader(std::string inXml)
      : text_(std::move(inXml)), reader_(text_.data(), static_cast<int>(text_.size())) {
    result = reader_.LoadSequence(document, kind);
    root = document.getDocumentElement();
  }
  SharedReader(const SharedReader&) = delete;
  SharedReader& operator=(const SharedReader&) = delete;

  ZORClashParsing* operator->() { return &reader_; }
  ZORClashParsing& operator*() { return reader_; }

  HRESULT result = 1;
  ZORUnicodeString kind = kUntouched;
  DOM_Document document;
  DOM_Element root;

 private:
  std::string text_;
  ZORClashParsing reader_;
};

/// The outputs of the full reading of an interference: the result's name, and 41 that are counted
/// from 1.
class ClashInfos {
 public:
  explicit ClashInfos(const char* inBefore = kUntouched) : resultName(inBefore) {
    outputs_.fill(inBefore);
  }
  std::string operator[](int inNumber) const { return Text(At(inNumber)); }
  ClashInfos& Set(int inNumber, const char* inText) {
    outputs_.at(Place(inNumber)) = inText;
    return *this;
  }

  /// Calls the full form of GetClashInfos on these outputs.
  ClashInfos& Read(ZORClashParsing& ioReader, const char* inVersion, int inIndex) {
    std::apply(
        [&](auto&... outTexts) {
          ioReader.GetClashInfos(inVersion, inIndex, resultName, outTexts...);
        },
        outputs_);
    return *this;
  }
  /// Calls GetInterferenceDataV12 on these outputs.
  ClashInfos& ReadElement(ZORClashParsing& ioReader, const DOM_Node& inInterference) {
    std::apply(
        [&](auto&... outTexts) { ioReader.GetInterferenceDataV12(inInterference, outTexts...); },
        outputs_);
    return *this;
  }

  ZORUnicodeString resultName;

 private:
  static std::size_t Place(int inNumber) { return static_cast<std::size_t>(inNumber) - 1; }
  const ZORUnicodeString& At(int inNumber) const { return outputs_.at(Place(inNumber)); }

  std::array<ZORUnicodeString, 41> outputs_;
};

/// The outputs of GetithInterference.
struct IthInterference {
  IthInterference& Read(ZORClashParsing& ioReader, int inIndex) {
    result = ioReader.GetithInterference(inIndex, interference, firstLabel, secondLabel,
                                         firstPreview, secondPreview);
    return *this;
  }

  HRESULT result = 1;
  DOM_Node interference;
  ZORUnicodeString firstLabel, secondLabel, firstPreview, secondPreview;
};

/// The outputs of the short form of GetClashInfos.
struct ShortInfos {
  ShortInfos& Read(ZORClashParsing& ioReader, int inIndex) {
    ioReader.GetClashInfos(inIndex, value, resultType, ruleName, firstAlias, secondAlias);
    return *this;
  }
  std::array<std::string, 5> Texts() const {
    return {Text(value), Text(resultType), Text(ruleName), Text(firstAlias), Text(secondAlias)};
  }

  ZORUnicodeString value = kUntouched;
  ZORUnicodeString resultType = kUntouched;
  ZORUnicodeString ruleName = kUntouched;
  ZORUnicodeString firstAlias = kUntouched;
  ZORUnicodeString secondAlias = kUntouched;
};

/// The outputs of GetProductsInSpec, in its order.
struct SpecifiedProducts {
  SpecifiedProducts() { outputs.fill(kUntouched); }
  SpecifiedProducts& Read(ZORClashParsing& ioReader, int inNumber) {
    std::apply([&](auto&... outTexts) { ioReader.GetProductsInSpec(inNumber, outTexts...); },
               outputs);
    return *this;
  }
  std::array<std::string, 10> Texts() const {
    std::array<std::string, 10> texts;
    for (std::size_t i = 0; i < texts.size(); ++i) texts[i] = Text(outputs[i]);
    return texts;
  }

  std::array<ZORUnicodeString, 10> outputs;
};

/// The name and the value of one attribute of a node, "" when it is missing.
inline std::string Attribute(const DOM_Node& inNode, const char* inName) {
  return Text(
      inNode.getAttributes().getNamedItem(inName).getNodeValue().DOMStringToZORUnicodeString());
}

inline std::string Name(const DOM_Node& inNode) {
  return Text(inNode.getNodeName().DOMStringToZORUnicodeString());
}

}  // namespace support

#endif
