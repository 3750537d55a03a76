// lyra report FILE -o OUT
#include <memory>

#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "toolkit/publishing/ReportWriter.h"
#include "toolkit/records/ClashDocument.h"
#include "toolkit/records/DocumentText.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct ReportOptions {
  std::string file, output;
  PrologueOptions prologue;
};

int Report(const ReportOptions& inOptions, Output& ioOutput) {
  inOptions.prologue.Check();
  const ClashDocument document(inOptions.file);
  document.RequireInterferences();
  OutputFile output(inOptions.output);
  output.Check(WriteReport(document, inOptions.prologue, output.Path()));
  output.Finish(ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareReport(Arguments& ioArguments) {
  const auto options = std::make_shared<ReportOptions>();
  ioArguments.Positional("FILE", options->file, "A clash result, or - for standard input");
  ioArguments.RequiredText("-o,--output", "OUT", options->output, "Where the report is written");
  options->prologue.Declare(ioArguments);
  return [options](Output& ioOutput) { return Report(*options, ioOutput); };
}

}  // namespace lyra
