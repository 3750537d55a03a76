// lyra federate -o OUT LINK…
#include <algorithm>
#include <memory>

#include "ZORLyraXMLServices.h"
#include "lyra/CommandErrors.h"
#include "lyra/DocumentText.h"
#include "lyra/InterferenceRecord.h"
#include "lyra/LinkedFiles.h"
#include "lyra/Prologue.h"
#include "lyra/ReplacedFile.h"
#include "lyra/Verbs.h"

namespace lyra {
namespace {

struct FederateOptions {
  std::vector<std::string> files;
  std::string output;
  Prologue prologue;
};

/// The products of a document's first interference; empty texts without one.
std::array<LinkedProduct, 2> FirstProducts(ClashResultFile& ioFile) {
  std::array<LinkedProduct, 2> products;
  if (CountInterferences(ioFile) == 0) return products;
  const InterferenceRecord first = ReadInterference(ioFile, FindInterference(ioFile, 1));
  for (std::size_t i = 0; i < 2; ++i)
    products[i] = {first.products[i].alias, first.products[i].id, first.products[i].shapeSource};
  return products;
}

std::vector<LinkRecord> GatherLinks(const FederateOptions& inOptions) {
  std::vector<LinkRecord> links;
  for (const std::string& path : inOptions.files) {
    if (path == "-") throw UsageError("federate: standard input cannot be linked");
    ClashResultFile file(path);
    LinkRecord link{LinkTo(path, inOptions.output), FirstProducts(file)};
    const bool isKnown = std::any_of(links.begin(), links.end(), [&](const LinkRecord& inKnown) {
      return inKnown.link == link.link;
    });
    if (isKnown) throw InputError(path + ": is given twice");
    links.push_back(std::move(link));
  }
  return links;
}

DOM_Element LinkElement(const LinkRecord& inLink, DOM_Document& ioDocument) {
  DOM_Element element = ioDocument.createElement("Element");
  const auto set = [&](const char* inName, const std::string& inText) {
    const ZORUnicodeString text = FromUtf8(inText);
    element.setAttribute(inName, DOMString(text.ConvertToUCChar(),
                                           static_cast<unsigned int>(text.GetLengthInChar())));
  };
  set("Link", inLink.link);
  set("FirstProductName", inLink.products[0].name);
  set("SecondProductName", inLink.products[1].name);
  set("FirstProductId", inLink.products[0].id);
  set("SecondProductId", inLink.products[1].id);
  set("FirstProductURL", inLink.products[0].url);
  set("SecondProductURL", inLink.products[1].url);
  return element;
}

/// The empty federator document that was just written, loaded for the links to be put in.
std::unique_ptr<ClashResultFile> LoadNew(const std::string& inPath, const std::string& inOutput) {
  try {
    return std::make_unique<ClashResultFile>(inPath);
  } catch (const InputError&) {
    // The library does not tell when writing an opened file fails.
    throw InputError(inOutput + ": the file could not be written");
  }
}

int Federate(const FederateOptions& inOptions, Output& ioOutput) {
  inOptions.prologue.Check();
  const std::vector<LinkRecord> links = GatherLinks(inOptions);
  ReplacedFile output(inOptions.output);
  const ZORUnicodeString path = FromUtf8(output.TemporaryPath());
  const ZORUnicodeString dtd = inOptions.prologue.Dtd();
  const ZORUnicodeString styleSheet = inOptions.prologue.StyleSheet();
  ZORLyraXMLServices services;
  output.Check(services.CreateNewFederatorDocument(path, dtd, styleSheet, 0));

  const std::unique_ptr<ClashResultFile> file = LoadNew(output.TemporaryPath(), inOptions.output);
  DOM_Node elements = file->Reader().GetElementsNode();
  for (const LinkRecord& link : links) elements.appendChild(LinkElement(link, file->Document()));
  output.Check(services.DumpDocument(file->Root(), path, dtd, styleSheet,
                                     RootName(DocumentKind::kFederator), 1, 0));
  output.Finish(ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareFederate(Arguments& ioArguments) {
  const auto options = std::make_shared<FederateOptions>();
  ioArguments.Positionals("LINK", options->files, "Clash documents to link");
  ioArguments.RequiredText("-o,--output", "OUT", options->output,
                           "Where the federator document is written");
  options->prologue.Declare(ioArguments);
  return [options](Output& ioOutput) { return Federate(*options, ioOutput); };
}

}  // namespace lyra
