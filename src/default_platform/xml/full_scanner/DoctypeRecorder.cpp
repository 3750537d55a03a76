#include "default_platform/xml/full_scanner/DoctypeRecorder.h"

#include <string>
#include <string_view>
#include <vector>
#include <xercesc/validators/common/ContentSpecNode.hpp>

namespace {

using xercesc::ContentSpecNode;
using xercesc::DTDElementDecl;
using xercesc::XMLAttDef;

std::u16string_view OrEmpty(const char16_t* inText) {
  return inText == nullptr ? std::u16string_view() : std::u16string_view(inText);
}

void AppendReference(std::u16string& ioText, char16_t inUnit) {
  ioText += u"&#";
  for (const char digit : std::to_string(static_cast<unsigned int>(inUnit)))
    ioText += static_cast<char16_t>(digit);
  ioText += u';';
}

constexpr std::u16string_view kSpecialInEntity = u"&%\"\r";
constexpr std::u16string_view kSpecialInDefault = u"&<\"\t\n\r";

std::u16string_view SuffixOf(const ContentSpecNode& inNode) {
  switch (inNode.getType()) {
    case ContentSpecNode::ZeroOrOne:
      return u"?";
    case ContentSpecNode::ZeroOrMore:
      return u"*";
    case ContentSpecNode::OneOrMore:
      return u"+";
    default:
      return {};
  }
}

std::u16string_view NameOf(const ContentSpecNode& inLeaf) {
  const xercesc::QName* const name = inLeaf.getElement();
  const bool isText =
      name == nullptr || inLeaf.getElement()->getURI() == xercesc::XMLElementDecl::fgPCDataElemId;
  return isText ? std::u16string_view(u"#PCDATA") : OrEmpty(name->getRawName());
}

// What is still to be written, last first: a part of the model, or a word when that is null.
struct Pending {
  const ContentSpecNode* part;
  std::u16string_view word;
  ContentSpecNode::NodeTypes list;  // the kind of list that the part continues
};

void WriteList(const ContentSpecNode& inList, ContentSpecNode::NodeTypes inContinued,
               std::u16string& ioText, std::vector<Pending>& ioPending) {
  const ContentSpecNode::NodeTypes type = inList.getType();
  if (type != inContinued) {
    ioText += u"(";
    ioPending.push_back({nullptr, u")", type});
  }
  if (inList.getSecond() != nullptr) {
    ioPending.push_back({inList.getSecond(), {}, type});
    ioPending.push_back({nullptr, type == ContentSpecNode::Choice ? u"|" : u",", type});
  }
  ioPending.push_back({inList.getFirst(), {}, type});
}

// Without recursion: a hostile model may nest or list a hundred thousand names.
std::u16string ModelText(const ContentSpecNode& inModel) {
  const std::u16string_view suffix = SuffixOf(inModel);
  const ContentSpecNode& core = suffix.empty() ? inModel : *inModel.getFirst();
  if (core.getType() == ContentSpecNode::Leaf)
    return std::u16string(u"(").append(NameOf(core)).append(u")").append(suffix);
  std::u16string text;
  std::vector<Pending> pending{{&inModel, {}, ContentSpecNode::Leaf}};
  while (!pending.empty()) {
    const Pending next = pending.back();
    pending.pop_back();
    if (next.part == nullptr) {
      text += next.word;
    } else if (next.part->getType() == ContentSpecNode::Leaf) {
      text += NameOf(*next.part);
    } else if (!SuffixOf(*next.part).empty()) {
      pending.push_back({nullptr, SuffixOf(*next.part), ContentSpecNode::Leaf});
      pending.push_back({next.part->getFirst(), {}, ContentSpecNode::Leaf});
    } else {
      WriteList(*next.part, next.list, text, pending);
    }
  }
  return text;
}

}  // namespace

void DoctypeRecorder::AddComment(const char16_t* inText) {
  text_.append(u"<!--").append(inText).append(u"-->");
}

void DoctypeRecorder::AddProcessingInstruction(const char16_t* inTarget, const char16_t* inData) {
  const std::u16string_view data = OrEmpty(inData);
  text_.append(u"<?").append(inTarget);
  if (!data.empty()) text_.append(u" ").append(data);
  text_ += u"?>";
}

void DoctypeRecorder::AddWhitespace(const char16_t* inText, std::size_t inCount) {
  if (!isInAttributes_) text_.append(inText, inCount);
}

void DoctypeRecorder::AddElement(const DTDElementDecl& inElement) {
  text_.append(u"<!ELEMENT ").append(inElement.getFullName()).append(u" ");
  AddContentModel(inElement);
  text_ += u">";
}

void DoctypeRecorder::AddContentModel(const DTDElementDecl& inElement) {
  switch (inElement.getModelType()) {
    case DTDElementDecl::Empty:
      text_ += u"EMPTY";
      return;
    case DTDElementDecl::Any:
      text_ += u"ANY";
      return;
    default:
      text_ += inElement.getContentSpec() == nullptr ? std::u16string(u"ANY")
                                                     : ModelText(*inElement.getContentSpec());
  }
}

void DoctypeRecorder::StartAttributes(const DTDElementDecl& inElement) {
  text_.append(u"<!ATTLIST ").append(inElement.getFullName());
  isInAttributes_ = true;
}

void DoctypeRecorder::EndAttributes() {
  text_ += u">";
  isInAttributes_ = false;
}

void DoctypeRecorder::AddAttribute(const XMLAttDef& inAttribute) {
  text_.append(u" ").append(inAttribute.getFullName()).append(u" ");
  const XMLAttDef::AttTypes type = inAttribute.getType();
  if (type == XMLAttDef::Notation) text_ += u"NOTATION ";
  if (type == XMLAttDef::Notation || type == XMLAttDef::Enumeration) {
    std::u16string names(OrEmpty(inAttribute.getEnumeration()));
    for (char16_t& unit : names)
      if (unit == u' ') unit = u'|';
    text_.append(u"(").append(names).append(u")");
  } else {
    text_ += OrEmpty(XMLAttDef::getAttTypeString(type));
  }
  const XMLAttDef::DefAttTypes defaultType = inAttribute.getDefaultType();
  if (defaultType == XMLAttDef::Required) text_ += u" #REQUIRED";
  if (defaultType == XMLAttDef::Implied) text_ += u" #IMPLIED";
  if (defaultType == XMLAttDef::Fixed) text_ += u" #FIXED";
  if (defaultType == XMLAttDef::Fixed || defaultType == XMLAttDef::Default)
    AddValue(OrEmpty(inAttribute.getValue()), kSpecialInDefault);
}

void DoctypeRecorder::AddEntity(const xercesc::DTDEntityDecl& inEntity, bool inIsParameter) {
  text_.append(inIsParameter ? u"<!ENTITY % " : u"<!ENTITY ").append(inEntity.getName());
  if (inEntity.isExternal()) {
    AddExternalId(inEntity.getPublicId(), inEntity.getSystemId());
    if (inEntity.isUnparsed()) text_.append(u" NDATA ").append(inEntity.getNotationName());
  } else {
    AddValue(OrEmpty(inEntity.getValue()), kSpecialInEntity);
  }
  text_ += u">";
}

void DoctypeRecorder::AddNotation(const xercesc::XMLNotationDecl& inNotation) {
  text_.append(u"<!NOTATION ").append(inNotation.getName());
  AddExternalId(inNotation.getPublicId(), inNotation.getSystemId());
  text_ += u">";
}

void DoctypeRecorder::AddExternalId(const char16_t* inPublicId, const char16_t* inSystemId) {
  const bool hasPublicId = !OrEmpty(inPublicId).empty();
  text_ += hasPublicId ? u" PUBLIC" : u" SYSTEM";
  if (hasPublicId) AddIdLiteral(inPublicId);
  if (!hasPublicId || inSystemId != nullptr) AddIdLiteral(inSystemId);
}

void DoctypeRecorder::AddIdLiteral(const char16_t* inText) {
  const std::u16string_view id = OrEmpty(inText);
  const char16_t quote = id.find(u'"') == std::u16string_view::npos ? u'"' : u'\'';
  text_ += u' ';
  text_.append(1, quote).append(id).append(1, quote);
}

// What the literal would not give back as it is becomes a reference.
void DoctypeRecorder::AddValue(std::u16string_view inText, std::u16string_view inSpecial) {
  text_ += u" \"";
  for (const char16_t unit : inText) {
    if (inSpecial.find(unit) != std::u16string_view::npos)
      AppendReference(text_, unit);
    else
      text_ += unit;
  }
  text_ += u"\"";
}
