// lyra merge A B [C …] -o OUT
#include <cstdio>
#include <memory>

#include "ZORLyraGeneralServices.h"
#include "ZORLyraXMLServices.h"
#include "lyra/ClashResultFile.h"
#include "lyra/CommandErrors.h"
#include "lyra/DocumentText.h"
#include "lyra/ElementChildren.h"
#include "lyra/Prologue.h"
#include "lyra/ReplacedFile.h"
#include "lyra/Verbs.h"
#include "platform/xml/DOM_DOMException.h"

namespace lyra {
namespace {

struct MergeOptions {
  std::vector<std::string> files;
  std::string output;
  Prologue prologue;
  bool sumCounts = false, verbose = false;
};

std::unique_ptr<ClashResultFile> LoadClash(const std::string& inPath) {
  auto file = std::make_unique<ClashResultFile>(inPath);
  file->Require({DocumentKind::kClash}, "result sets");
  return file;
}

void MergeInto(DOM_Document& ioMerged, const std::string& inPath, ZORUnicodeString& ioTrace) {
  const std::unique_ptr<ClashResultFile> file = LoadClash(inPath);
  try {
    file->Reader().MergeDocuments(ioMerged, file->Document(), ioTrace);
  } catch (const DOM_DOMException& error) {
    throw InputError(inPath +
                     ": there is no result set to take its interferences: " + error.what());
  }
}

void SumCounts(const DOM_Document& inDocument) {
  ForEachElement(inDocument.getDocumentElement(), "ClashResult", [](const DOM_Node& inSet) {
    int count = 0;
    ForEachElement(inSet, "Interference", [&](const DOM_Node&) { ++count; });
    DOM_Element(inSet).setAttribute("NbInterf", ZORLyraGeneralServices::GetDOMString(count));
  });
}

void Write(const MergeOptions& inOptions, DOM_Document& ioMerged, Output& ioOutput) {
  RemoveReplaced(inOptions.prologue, ioMerged);
  const ZORUnicodeString rootName =
      ZORLyraGeneralServices::GetDOMName(ioMerged.getDocumentElement());
  ReplacedFile output(inOptions.output);
  ZORLyraXMLServices services;
  output.Check(services.DumpDocument(ioMerged, FromUtf8(output.TemporaryPath()),
                                     inOptions.prologue.Dtd(), inOptions.prologue.StyleSheet(),
                                     inOptions.prologue.TypeName(rootName),
                                     inOptions.prologue.without ? 0 : 1, 0));
  output.Finish(ioOutput);
}

int Merge(const MergeOptions& inOptions, Output& ioOutput) {
  inOptions.prologue.Check();
  ZORUnicodeString trace;
  DOM_Document merged = LoadClash(inOptions.files.front())->Document();
  for (std::size_t i = 1; i < inOptions.files.size(); ++i)
    MergeInto(merged, inOptions.files[i], trace);
  if (inOptions.verbose) std::fputs(Utf8(trace).c_str(), stderr);
  if (inOptions.sumCounts) SumCounts(merged);
  Write(inOptions, merged, ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareMerge(Arguments& ioArguments) {
  const auto options = std::make_shared<MergeOptions>();
  ioArguments.Positionals("FILE", options->files,
                          "Two or more clash documents; the first takes in the others", 2);
  ioArguments.RequiredText("-o,--output", "OUT", options->output, "Where the result is written");
  ioArguments.Flag("--sum-counts", options->sumCounts,
                   "Declare the interferences that are there, not the sum of what was declared");
  options->prologue.Declare(ioArguments);
  ioArguments.Text("--type-name", "NAME", options->prologue.typeName,
                   "Name in the document type (default: that of the root)");
  ioArguments.Flag("--no-prologue", options->prologue.without, "Write no XML declaration");
  ioArguments.Flag("-v,--verbose", options->verbose, "Tell each step on standard error");
  return [options](Output& ioOutput) { return Merge(*options, ioOutput); };
}

}  // namespace lyra
