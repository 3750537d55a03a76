// lyra report FILE -o OUT
#include <memory>

#include "lyra/ClashResultFile.h"
#include "lyra/DocumentText.h"
#include "lyra/Prologue.h"
#include "lyra/ReplacedFile.h"
#include "lyra/ReportWriter.h"
#include "lyra/Verbs.h"

namespace lyra {
namespace {

constexpr const char* kDocumentType = "clash-report.dtd";

struct ReportOptions {
  std::string file, output;
  Prologue prologue;
};

int Report(const ReportOptions& inOptions, Output& ioOutput) {
  inOptions.prologue.Check();
  ClashResultFile file(inOptions.file);
  file.Require({DocumentKind::kClash, DocumentKind::kInterference}, "interferences");

  ZORLyraXMLServices writer;
  const ZORUnicodeString styleSheet = inOptions.prologue.styleSheet.empty()
                                          ? AttributeValue(writer.getStyleSheetFromSetting())
                                          : inOptions.prologue.StyleSheet();
  const ZORUnicodeString dtd =
      inOptions.prologue.dtd.empty() ? kDocumentType : inOptions.prologue.Dtd();
  writer.WriteXMLHeaderTag(RootName(file.Kind()), dtd, styleSheet);
  WriteReportElement(file.Root(), writer);

  ReplacedFile output(inOptions.output);
  output.Check(writer.DumpDocument(FromUtf8(output.TemporaryPath())));
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
