// Loading: the tree of a file, by our handles and by the peers.
#include <libxml/parser.h>

#include <memory>
#include <stdexcept>

#include "FormerTree.h"
#include "Measurement.h"
#include "PugixmlTree.h"
#include "SaxScan.h"
#include "XercesTree.h"
#include "ZORDocument.h"
#include "ZORTree.h"

namespace {
template <class Node>
std::uint64_t HashOf(const Node& inDocument) {
  TreeHash hash;
  HashTree(inDocument, 0, hash);
  return hash.Value();
}

std::string_view Utf8(const xmlChar* inText) {
  return inText == nullptr ? std::string_view() : reinterpret_cast<const char*>(inText);
}

void HashTree(const xmlNode& inNode, std::size_t inDepth, TreeHash& ioHash) {
  if (inNode.type == XML_TEXT_NODE) {
    ioHash.AddText(inDepth, Utf8(inNode.content));
    return;
  }
  if (inNode.type == XML_ELEMENT_NODE) {
    ioHash.AddElement(inDepth, Utf8(inNode.name));
    for (const xmlAttr* attribute = inNode.properties; attribute != nullptr;
         attribute = attribute->next)
      ioHash.AddAttribute(Utf8(attribute->name),
                          Utf8(attribute->children ? attribute->children->content : nullptr));
  }
  for (const xmlNode* child = inNode.children; child != nullptr; child = child->next)
    HashTree(*child, inDepth + 1, ioHash);
}

typedef std::unique_ptr<xmlDoc, decltype(&xmlFreeDoc)> Libxml2Document;

Libxml2Document ReadWithLibxml2(const std::string& inPath, Steps& ioSteps) {
  Libxml2Document document(nullptr, &xmlFreeDoc);
  TimeStep("load", ioSteps, [&] {
    document.reset(xmlReadFile(inPath.c_str(), nullptr, XML_PARSE_NONET | XML_PARSE_HUGE));
  });
  if (!document) throw std::runtime_error("libxml2 refused the document");
  return document;
}
}  // namespace

Steps LoadWithZORLyra(const Arguments& inArguments) {
  Steps steps;
  DOM_Document document;
  TimeStep("load", steps, [&] { document = LoadDocument(inArguments.at(0)); });
  steps[0].hash = HashOf(document);
  return steps;
}

Steps LoadAsFormerly(const Arguments& inArguments) {
  Steps steps;
  std::unique_ptr<former::Tree> tree;
  TimeStep("load", steps, [&] { tree = former::Load(inArguments.at(0)); });
  TreeHash hash;
  former::HashTree(*tree, 1, 0, hash);
  steps[0].hash = hash.Value();
  return steps;
}

Steps LoadWithXerces(const Arguments& inArguments) {
  Steps steps;
  XercesParser parser;
  TimeStep("load", steps, [&] {
    InitializeXerces();
    parser = ParseWithXerces(inArguments.at(0));
  });
  steps[0].hash = HashOf(*parser->getDocument());
  return steps;
}

Steps ScanWithXerces(const Arguments& inArguments) {
  Steps steps;
  TimeStep("load", steps, [&] {
    InitializeXerces();
    ScanWithSax(inArguments.at(0));
  });
  steps[0].hash = HashOfSaxScan(inArguments.at(0));
  return steps;
}

Steps LoadWithLibxml2(const Arguments& inArguments) {
  Steps steps;
  const Libxml2Document document = ReadWithLibxml2(inArguments.at(0), steps);
  TreeHash hash;
  HashTree(*xmlDocGetRootElement(document.get()), 1, hash);
  steps[0].hash = hash.Value();
  return steps;
}

Steps LoadAloneWithLibxml2(const Arguments& inArguments) {
  Steps steps;
  ReadWithLibxml2(inArguments.at(0), steps);
  return steps;
}

Steps LoadWithPugixml(const Arguments& inArguments) {
  Steps steps;
  pugi::xml_document document;
  pugi::xml_parse_result result;
  TimeStep("load", steps,
           [&] { result = document.load_file(inArguments.at(0).c_str(), kPugixmlOptions); });
  if (!result) throw std::runtime_error(result.description());
  steps[0].hash = HashOf(document);
  return steps;
}
