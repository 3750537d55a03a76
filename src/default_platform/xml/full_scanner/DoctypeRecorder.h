// The text of a document type's internal subset.
#ifndef ZOR_DEFAULT_PLATFORM_XML_FULL_SCANNER_DOCTYPERECORDER_H
#define ZOR_DEFAULT_PLATFORM_XML_FULL_SCANNER_DOCTYPERECORDER_H

#include <string>
#include <string_view>
#include <xercesc/framework/XMLAttDef.hpp>
#include <xercesc/framework/XMLNotationDecl.hpp>
#include <xercesc/validators/DTD/DTDElementDecl.hpp>
#include <xercesc/validators/DTD/DTDEntityDecl.hpp>

/// Writes the declarations that a scanner reports as text that declares the same again. Nothing is
/// resolved or looked up.
class DoctypeRecorder {
 public:
  void AddComment(const char16_t* inText);
  void AddProcessingInstruction(const char16_t* inTarget, const char16_t* inData);
  /// White space between declarations; that within one is not kept.
  void AddWhitespace(const char16_t* inText, std::size_t inCount);
  void AddElement(const xercesc::DTDElementDecl& inElement);
  void StartAttributes(const xercesc::DTDElementDecl& inElement);
  void AddAttribute(const xercesc::XMLAttDef& inAttribute);
  void EndAttributes();
  void AddEntity(const xercesc::DTDEntityDecl& inEntity, bool inIsParameter);
  void AddNotation(const xercesc::XMLNotationDecl& inNotation);

  const std::u16string& Text() const { return text_; }

 private:
  void AddContentModel(const xercesc::DTDElementDecl& inElement);
  void AddExternalId(const char16_t* inPublicId, const char16_t* inSystemId);
  void AddValue(std::u16string_view inText, std::u16string_view inSpecial);
  void AddIdLiteral(const char16_t* inText);

  std::u16string text_;
  bool isInAttributes_ = false;
};

#endif
