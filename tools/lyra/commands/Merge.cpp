// lyra merge A B [C …] -o OUT
#include <memory>

#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/terminal/Terminal.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct MergeOptions {
  std::vector<std::string> files;
  std::string output;
  PrologueOptions prologue;
  bool sumCounts = false, withoutPrologue = false, verbose = false;
};

int Merge(MergeOptions& ioOptions, Output& ioOutput) {
  ioOptions.prologue.hasDeclaration = !ioOptions.withoutPrologue;
  ioOptions.prologue.Check();
  std::string trace;
  const std::unique_ptr<ClashDocument> merged =
      MergeClashes(ioOptions.files, ioOptions.sumCounts, trace);
  if (ioOptions.verbose) WriteError(trace);
  OutputFile output(ioOptions.output);
  output.Check(ClashDocumentEdit(*merged).Dump(ioOptions.prologue, output.Path()));
  output.Finish(ioOutput);
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
  ioArguments.Flag("--no-prologue", options->withoutPrologue, "Write no XML declaration");
  ioArguments.Flag("-v,--verbose", options->verbose, "Tell each step on standard error");
  return [options](Output& ioOutput) { return Merge(*options, ioOutput); };
}

}  // namespace lyra
