// Writing a tree into a file.
#include <stdexcept>
#include <xercesc/framework/LocalFileFormatTarget.hpp>

#include "Measurement.h"
#include "PugixmlTree.h"
#include "XercesTree.h"
#include "ZORDocument.h"
#include "ZORLyraXMLServices.h"

namespace {
// The files differ in their bytes, not in what they hold.
std::uint64_t HashOfFile(const std::string& inPath) {
  pugi::xml_document document;
  const pugi::xml_parse_result result = document.load_file(inPath.c_str(), kPugixmlOptions);
  if (!result) throw std::runtime_error(result.description());
  TreeHash hash;
  HashTree(document, 0, hash);
  return hash.Value();
}
}  // namespace

Steps DumpWithZORLyra(const Arguments& inArguments) {
  Steps steps;
  DOM_Document document;
  TimeStep("load", steps, [&] { document = LoadDocument(inArguments.at(0)); });
  ZORLyraXMLServices writer;
  TimeStep("dump", steps, [&] {
    if (FAILED(writer.DumpDocument(document, inArguments.at(1).c_str(), "", "", "", 0, 0)))
      throw std::runtime_error("the document was not written");
  });
  steps.back().hash = HashOfFile(inArguments.at(1));
  return steps;
}

Steps DumpWithXerces(const Arguments& inArguments) {
  Steps steps;
  XercesParser parser;
  TimeStep("load", steps, [&] {
    InitializeXerces();
    parser = ParseWithXerces(inArguments.at(0));
  });
  xercesc::DOMImplementation* const implementation =
      xercesc::DOMImplementation::getImplementation();
  xercesc::DOMLSSerializer* const serializer = implementation->createLSSerializer();
  xercesc::DOMLSOutput* const output = implementation->createLSOutput();
  TimeStep("dump", steps, [&] {
    xercesc::LocalFileFormatTarget file(inArguments.at(1).c_str());
    output->setByteStream(&file);
    output->setEncoding(u"UTF-8");
    if (!serializer->write(parser->getDocument(), output))
      throw std::runtime_error("the document was not written");
  });
  output->release();
  serializer->release();
  steps.back().hash = HashOfFile(inArguments.at(1));
  return steps;
}
