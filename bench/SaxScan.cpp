#include "SaxScan.h"

#include <memory>
#include <string_view>
#include <xercesc/sax2/Attributes.hpp>
#include <xercesc/sax2/DefaultHandler.hpp>
#include <xercesc/sax2/SAX2XMLReader.hpp>
#include <xercesc/sax2/XMLReaderFactory.hpp>
#include <xercesc/util/XMLUni.hpp>

#include "ResultHash.h"

namespace {
using xercesc::XMLUni;

// Raises what is wrong and listens to nothing else.
class Quiet : public xercesc::DefaultHandler {
 public:
  void fatalError(const xercesc::SAXParseException& inError) override { throw inError; }
};

class Hashing : public Quiet {
 public:
  void startElement(const XMLCh* const, const XMLCh* const, const XMLCh* const inName,
                    const xercesc::Attributes& inAttributes) override {
    FlushText();
    hash_.AddElement(++depth_, std::u16string_view(inName));
    for (XMLSize_t i = 0; i < inAttributes.getLength(); ++i)
      hash_.AddAttribute(std::u16string_view(inAttributes.getQName(i)),
                         std::u16string_view(inAttributes.getValue(i)));
  }
  void endElement(const XMLCh* const, const XMLCh* const, const XMLCh* const) override {
    FlushText();
    --depth_;
  }
  void characters(const XMLCh* const inText, const XMLSize_t inCount) override {
    if (depth_ > 0) text_.append(inText, inCount);
  }
  std::uint64_t Value() const { return hash_.Value(); }

 private:
  void FlushText() {
    if (!text_.empty()) hash_.AddText(depth_ + 1, std::u16string_view(text_));
    text_.clear();
  }

  TreeHash hash_;
  std::size_t depth_ = 0;
  std::u16string text_;
};

std::unique_ptr<xercesc::SAX2XMLReader> NewReader(Quiet& ioErrors) {
  std::unique_ptr<xercesc::SAX2XMLReader> reader(xercesc::XMLReaderFactory::createXMLReader());
  reader->setFeature(XMLUni::fgSAX2CoreNameSpaces, false);
  reader->setFeature(XMLUni::fgSAX2CoreValidation, false);
  reader->setFeature(XMLUni::fgXercesDynamic, false);
  reader->setFeature(XMLUni::fgXercesSchema, false);
  reader->setFeature(XMLUni::fgXercesLoadExternalDTD, false);
  reader->setErrorHandler(&ioErrors);
  return reader;
}
}  // namespace

void ScanWithSax(const std::string& inPath) {
  Quiet quiet;
  NewReader(quiet)->parse(inPath.c_str());
}

std::uint64_t HashOfSaxScan(const std::string& inPath) {
  Hashing hashing;
  const auto reader = NewReader(hashing);
  reader->setContentHandler(&hashing);
  reader->parse(inPath.c_str());
  return hashing.Value();
}
