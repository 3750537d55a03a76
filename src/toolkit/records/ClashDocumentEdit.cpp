#include "toolkit/records/ClashDocumentEdit.h"

#include <algorithm>
#include <iterator>
#include <utility>

#include "BuildPath.h"
#include "ZORLyraXMLServices.h"
#include "platform/system/ZORMsgCatalog.h"
#include "platform/xml/DOM_DOMException.h"
#include "toolkit/records/ElementWalk.h"

namespace ZORToolkit {
namespace {

struct ValueWord {
  const char* word;
  const char* key;  // in the message catalogue
};
constexpr ValueWord kWords[] = {{"Relevant", "Relevant"},
                                {"Irrelevant", "Irrelevant"},
                                {"Not inspected", "NotInspected"},
                                {"Old", "Old"},
                                {"New", "New"}};

/// The reference is written as an attribute's value.
ZORUnicodeString StyleSheetOf(const Prologue& inPrologue) {
  ZORUnicodeString text = FromUtf8(inPrologue.styleSheet), escaped;
  BuildPath::CheckXMLString(text, escaped);
  return escaped;
}

}  // namespace

bool IsXmlName(const std::string& inText) {
  try {
    DOM_Document::createDocument().createElement(FromUtf8(inText).ConvertToChar());
    return true;
  } catch (const DOM_DOMException&) {
    return false;
  }
}

void ClashDocumentEdit::SetWord(const ElementHandle& inInterference, const char* inAttribute,
                                const std::string& inWord) {
  const auto known = std::ranges::find(kWords, inWord, &ValueWord::word);
  const std::string word =
      known == std::end(kWords)
          ? inWord
          : Utf8(ZORMsgCatalog::BuildMessage("ZORLyraITFClashDialog3", known->key).Strip());
  DOM_Element(inInterference.element_).setAttribute(inAttribute, DocumentString(word));
}

void ClashDocumentEdit::SetStatus(const ElementHandle& inInterference,
                                  const std::string& inStatus) {
  SetWord(inInterference, "Status", inStatus);
}

void ClashDocumentEdit::SetRetrieve(const ElementHandle& inInterference,
                                    const std::string& inRetrieve) {
  SetWord(inInterference, "RetrieveInf", inRetrieve);
}

const DOMString& ClashDocumentEdit::WordText(const std::string& inText) {
  KnownWord& known = words_[inText.size() % words_.size()];
  if (known.text.isNull() || known.word != inText) known = {inText, DocumentString(inText)};
  return known.text;
}

void ClashDocumentEdit::SetStatusAsWritten(const ElementHandle& inInterference,
                                           const std::string& inText) {
  static const DOMString kName("Status");
  DOM_Element(inInterference.element_).setAttribute(kName, WordText(inText));
}

void ClashDocumentEdit::SetRetrieveAsWritten(const ElementHandle& inInterference,
                                             const std::string& inText) {
  static const DOMString kName("RetrieveInf");
  DOM_Element(inInterference.element_).setAttribute(kName, WordText(inText));
}

void ClashDocumentEdit::SetOnlyChild(const ElementHandle& inParent, const char* inName,
                                     const char* inAttribute, const std::string& inValue) {
  DOM_Node parent = inParent.element_;
  for (DOM_Node old = FirstElement(parent, inName); !old.isNull();
       old = FirstElement(parent, inName))
    parent.removeChild(old);
  if (inValue.empty()) return;
  DOM_Element child = document_.Document().createElement(inName);
  child.setAttribute(inAttribute, DocumentString(inValue));
  parent.appendChild(child);
}

void ClashDocumentEdit::SetComment(const ElementHandle& inInterference,
                                   const std::string& inComment) {
  DOM_Node interference = inInterference.element_;
  DOM_Node kept = FirstElement(interference, "Comment");
  if (kept.isNull() || inComment.empty())
    return SetOnlyChild(inInterference, "Comment", "Value", inComment);
  // The last one counts; it keeps whatever else it has.
  for (DOM_Node next = ElementFrom(kept.getNextSibling(), "Comment"); !next.isNull();
       next = ElementFrom(kept.getNextSibling(), "Comment")) {
    interference.removeChild(kept);
    kept = next;
  }
  DOM_Element(kept).setAttribute("Value", DocumentString(inComment));
}

void ClashDocumentEdit::SetPicture(const ElementHandle& inInterference,
                                   const std::string& inReference) {
  SetOnlyChild(inInterference, "Picture", "HRef", inReference);
}

void ClashDocumentEdit::RemovePreviews(const ElementHandle& inInterference) {
  ForEachElement(inInterference.element_, "Product", [&](const DOM_Node& inProduct) {
    DOM_Element(inProduct).removeAttribute("Preview");
  });
}

void ClashDocumentEdit::SetPreview(const ElementHandle& inProduct, const std::string& inReference) {
  DOM_Element product(inProduct.element_);
  if (inReference.empty())
    product.removeAttribute("Preview");
  else
    product.setAttribute("Preview", DocumentString(inReference));
}

void ClashDocumentEdit::Remove(const ElementHandle& inInterference) {
  inInterference.element_.getParentNode().removeChild(inInterference.element_);
}

void ClashDocumentEdit::RecountInterferences() {
  if (document_.Kind() != DocumentKind::kClash) return;
  ForEachElement(document_.Root(), "ClashResult", [](const DOM_Node& inSet) {
    DOM_Element(inSet).setAttribute(
        "NbInterf", ZORLyraGeneralServices::GetDOMString(CountElements(inSet, "Interference")));
  });
}

void ClashDocumentEdit::TakeIn(ClashDocument& inOther, std::string& ioTrace) {
  ZORUnicodeString trace;
  try {
    inOther.Reader().MergeDocuments(document_.Document(), inOther.Document(), trace);
  } catch (const DOM_DOMException& error) {
    throw Error(inOther.Name(),
                std::string("there is no result set to take its interferences: ") + error.what());
  }
  ioTrace += Utf8(trace);
}

void ClashDocumentEdit::AddLink(const LinkRecord& inLink) {
  DOM_Element element = document_.Document().createElement("Element");
  const auto& [first, second] = inLink.products;
  element.setAttribute("Link", DocumentString(inLink.link));
  element.setAttribute("FirstProductName", DocumentString(first.name));
  element.setAttribute("SecondProductName", DocumentString(second.name));
  element.setAttribute("FirstProductId", DocumentString(first.id));
  element.setAttribute("SecondProductId", DocumentString(second.id));
  element.setAttribute("FirstProductURL", DocumentString(first.url));
  element.setAttribute("SecondProductURL", DocumentString(second.url));
  document_.Reader().GetElementsNode().appendChild(element);
}

void ClashDocumentEdit::RemoveReplaced(const Prologue& inPrologue) {
  DOM_Document& document = document_.Document();
  for (DOM_Node node = document.getFirstChild(); !node.isNull();) {
    const DOM_Node next = node.getNextSibling();
    const bool isType = node.getNodeType() == DOM_Node::DOCUMENT_TYPE_NODE;
    const bool isSheet = node.getNodeType() == DOM_Node::PROCESSING_INSTRUCTION_NODE &&
                         node.getNodeName().equals("xml-stylesheet");
    if ((isType && !inPrologue.dtd.empty()) || (isSheet && !inPrologue.styleSheet.empty()))
      document.removeChild(node);
    node = next;
  }
}

HRESULT ClashDocumentEdit::Dump(const Prologue& inPrologue, const std::string& inPath) {
  RemoveReplaced(inPrologue);
  const ZORUnicodeString typeName = inPrologue.typeName.empty()
                                        ? ZORLyraGeneralServices::GetDOMName(document_.Root())
                                        : FromUtf8(inPrologue.typeName);
  return ZORLyraXMLServices().DumpDocument(document_.Document(), FromUtf8(inPath),
                                           FromUtf8(inPrologue.dtd), StyleSheetOf(inPrologue),
                                           typeName, inPrologue.hasDeclaration ? 1 : 0, 0);
}

std::unique_ptr<ClashDocument> MergeClashes(const std::vector<std::string>& inPaths,
                                            bool inSumsCounts, std::string& ioTrace) {
  std::unique_ptr<ClashDocument> merged;
  for (const std::string& path : inPaths) {
    auto document = std::make_unique<ClashDocument>(path);
    document->Require({DocumentKind::kClash}, "result sets");
    if (merged)
      ClashDocumentEdit(*merged).TakeIn(*document, ioTrace);
    else
      merged = std::move(document);
  }
  if (inSumsCounts && merged) ClashDocumentEdit(*merged).RecountInterferences();
  return merged;
}

HRESULT CreateFederator(const Prologue& inPrologue, const std::string& inPath) {
  return ZORLyraXMLServices().CreateNewFederatorDocument(FromUtf8(inPath), FromUtf8(inPrologue.dtd),
                                                         StyleSheetOf(inPrologue), 0);
}

}  // namespace ZORToolkit
