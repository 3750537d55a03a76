// A clash document: loaded, asked everything, written, read again and merged.
#include "fuzz/Fuzz.h"
#include "support/TreeEquality.h"
#include "toolkit/publishing/ReportWriter.h"
#include "toolkit/records/ClashDocumentEdit.h"
#include "toolkit/records/DocumentRecords.h"
#include "toolkit/records/InterferenceRecord.h"

namespace {

using ZORToolkit::ClashDocument;

void AskEverything(ClashDocument& ioDocument) {
  ReadDocument(ioDocument);
  using enum ZORToolkit::DocumentKind;
  if (ioDocument.Kind() == kComponents) ReadComponents(ioDocument);
  if (ioDocument.Kind() == kClash) ReadSpecifications(ioDocument);
  if (ioDocument.Kind() == kFederator) ReadLinks(ioDocument);
  if (!ioDocument.HasInterferences()) return;
  ForEachInterference(ioDocument, ZORToolkit::RecordPart::kAll,
                      [](const ZORToolkit::InterferenceRecord&) {});
  AnnotatedReport(ioDocument, {});
}

/// What is written is read as it was.
void WriteAndReadAgain(ClashDocument& ioDocument) {
  const std::string written = support::WrittenText(ioDocument.Document());
  if (written == "E_FAIL" || written == "E_INVALIDARG") return;
  const DOM_Document again = support::ParseText(written);
  fuzz::Require(support::WrittenText(again) == written, "written otherwise the second time");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  const std::string text = fuzz::Text(inBytes, inSize);
  try {
    ClashDocument document("text", text), same("same", text);
    AskEverything(document);
    WriteAndReadAgain(document);
    std::string trace;
    if (document.Kind() == ZORToolkit::DocumentKind::kClash)
      ZORToolkit::ClashDocumentEdit(document).TakeIn(same, trace);
    WriteAndReadAgain(document);
  } catch (const ZORToolkit::Error&) {
    return 0;  // refused
  }
  return 0;
}
