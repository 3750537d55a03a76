// Merging two documents.
#include <xercesc/util/XMLString.hpp>

#include "Measurement.h"
#include "XercesTree.h"
#include "ZORDocument.h"
#include "ZORTree.h"

namespace {
using xercesc::DOMDocument;
using xercesc::DOMElement;

bool IsNamed(const DOMElement& inElement, const char16_t* inName) {
  return xercesc::XMLString::equals(inElement.getNodeName(), inName);
}

DOMElement* FirstNamed(const DOMElement& inParent, const char16_t* inName) {
  DOMElement* child = inParent.getFirstElementChild();
  while (child != nullptr && !IsNamed(*child, inName)) child = child->getNextElementSibling();
  return child;
}

void AppendCopies(const DOMElement& inSource, const char16_t* inName, DOMElement& ioTarget) {
  const DOMElement* child = inSource.getFirstElementChild();
  for (; child != nullptr; child = child->getNextElementSibling())
    if (IsNamed(*child, inName))
      ioTarget.appendChild(ioTarget.getOwnerDocument()->importNode(child, true));
}

void AddCounts(const DOMElement& inSource, DOMElement& ioTarget) {
  const XMLCh* const name = u"NbInterf";
  const int sum = xercesc::XMLString::parseInt(ioTarget.getAttribute(name)) +
                  xercesc::XMLString::parseInt(inSource.getAttribute(name));
  XMLCh text[16];
  xercesc::XMLString::binToText(sum, text, 15, 10);
  ioTarget.setAttribute(name, text);
}

// What MergeDocuments does with two documents of one result set and one list of products each.
void MergeTrees(DOMDocument& ioFirst, const DOMDocument& inSecond) {
  const DOMElement& first = *ioFirst.getDocumentElement();
  const DOMElement& second = *inSecond.getDocumentElement();
  DOMElement& resultSet = *FirstNamed(first, u"ClashResult");
  const DOMElement& secondSet = *FirstNamed(second, u"ClashResult");
  AppendCopies(secondSet, u"Interference", resultSet);
  AddCounts(secondSet, resultSet);
  AppendCopies(*FirstNamed(second, u"ProductsInSpec"), u"Specification",
               *FirstNamed(first, u"ProductsInSpec"));
}
}  // namespace

Steps MergeWithZORLyra(const Arguments& inArguments) {
  Steps steps;
  DOM_Document first, second;
  TimeStep("load", steps, [&] {
    first = LoadDocument(inArguments.at(0));
    second = LoadDocument(inArguments.at(1));
  });
  ZORClashParsing reader(nullptr);
  TimeStep("merge", steps, [&] {
    ZORUnicodeString trace;
    if (FAILED(reader.MergeDocuments(first, second, trace)))
      throw std::runtime_error("the documents do not merge");
  });
  TreeHash hash;
  HashTree(first, 0, hash);
  steps.back().hash = hash.Value();
  return steps;
}

Steps MergeWithXerces(const Arguments& inArguments) {
  Steps steps;
  XercesParser first, second;
  TimeStep("load", steps, [&] {
    InitializeXerces();
    first = ParseWithXerces(inArguments.at(0));
    second = ParseWithXerces(inArguments.at(1));
  });
  TimeStep("merge", steps, [&] { MergeTrees(*first->getDocument(), *second->getDocument()); });
  TreeHash hash;
  HashTree(*first->getDocument(), 0, hash);
  steps.back().hash = hash.Value();
  return steps;
}
