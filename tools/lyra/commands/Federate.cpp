// lyra federate -o OUT LINK…
#include <algorithm>
#include <memory>

#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "toolkit/records/DocumentRecords.h"
#include "toolkit/records/DocumentText.h"
#include "toolkit/records/InterferenceRecord.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct FederateOptions {
  std::vector<std::string> files;
  std::string output;
  PrologueOptions prologue;
};

/// The products of a document's first interference; empty texts without one.
std::array<LinkedProduct, 2> FirstProducts(ClashDocument& ioDocument) {
  std::array<LinkedProduct, 2> products;
  if (CountInterferences(ioDocument) == 0) return products;
  const InterferenceRecord first = ReadInterference(ioDocument, 1);
  for (std::size_t i = 0; i < 2; ++i)
    products[i] = {first.products[i].alias, first.products[i].id, first.products[i].shapeSource};
  return products;
}

std::vector<LinkRecord> GatherLinks(const FederateOptions& inOptions) {
  std::vector<LinkRecord> links;
  for (const std::string& path : inOptions.files) {
    if (path == "-") throw UsageError("federate: standard input cannot be linked");
    ClashDocument document(path);
    LinkRecord link{LinkTo(path, inOptions.output), FirstProducts(document)};
    const bool isKnown = std::any_of(links.begin(), links.end(), [&](const LinkRecord& inKnown) {
      return inKnown.link == link.link;
    });
    if (isKnown) throw InputError(path + ": is given twice");
    links.push_back(std::move(link));
  }
  return links;
}

/// The empty federator document that was just written, loaded for the links to be put in.
std::unique_ptr<ClashDocument> LoadNew(const std::string& inPath, const std::string& inOutput) {
  try {
    return std::make_unique<ClashDocument>(inPath);
  } catch (const InputError&) {
    // The library does not report when writing an opened file fails.
    throw InputError(inOutput + ": the file could not be written");
  }
}

int Federate(const FederateOptions& inOptions, Output& ioOutput) {
  inOptions.prologue.Check();
  const std::vector<LinkRecord> links = GatherLinks(inOptions);
  OutputFile output(inOptions.output);
  const std::string path = output.Path();
  output.Check(CreateFederator(inOptions.prologue, path));
  const std::unique_ptr<ClashDocument> federator = LoadNew(path, inOptions.output);
  ClashDocumentEdit edit(*federator);
  for (const LinkRecord& link : links) edit.AddLink(link);
  output.Check(edit.Dump(inOptions.prologue, path));
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
