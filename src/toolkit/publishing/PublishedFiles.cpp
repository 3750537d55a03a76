#include "toolkit/publishing/PublishedFiles.h"

#include <algorithm>
#include <filesystem>

#include "ZORLyraXMLServices.h"
#include "foundation/AtomicFile.h"
#include "foundation/PluginLoader.h"
#include "foundation/ReadWholeFile.h"
#include "platform/system/ZORSettingRepository.h"
#include "toolkit/publishing/PageMaker.h"
#include "toolkit/records/DocumentText.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

constexpr char kReportFile[] = "report.xml";
constexpr char kReportStyleSheet[] = "clash-report.xsl";
constexpr char kReportType[] = "clash-report.dtd";
constexpr std::uint64_t kMaxStyleSheetSize = std::uint64_t{64} << 20;

/// Of the library that applies style sheets, loaded when the first one is.
template <typename Function>
Function* PageFunction(const char* inName) {
  std::string reason;
  void* const function = ZORFoundation::FindPluginFunction("libZORPage.so", inName, reason);
  if (function == nullptr) throw Error("the library that makes pages cannot be loaded: " + reason);
  return reinterpret_cast<Function*>(function);
}

Page MakePage(const PageRequest& inRequest) {
  Page page;
  if (!PageFunction<MakePageFunction>(kMakePageName)(inRequest, page))
    throw Error(inRequest.styleSheetName + ": " + page.reason);
  return page;
}

/// A reference may be written with backslashes, as on other systems.
std::string StyleSheetOfSetting() {
  ZORSettingRepository* const settings = ZORSettingRepository::GetRepository("ClashPublish");
  ZORUnicodeString ignored;
  if (settings == nullptr || FAILED(settings->ReadSetting("XslTemplate", &ignored))) return {};
  std::string path = Utf8(ZORLyraXMLServices().getStyleSheetFromSetting());
  if (!fs::exists(path)) std::ranges::replace(path, '\\', '/');
  return path;
}

std::string FileNameOf(const PageStyleSheet& inSheet) {
  return inSheet.path.empty() ? kReportStyleSheet : fs::path(inSheet.path).filename().string();
}

void WriteReportFile(const ClashDocument& inDocument, const std::string& inStyleSheet,
                     const std::string& inPath, const ZORFoundation::AtomicFileOptions& inOptions) {
  Prologue prologue;
  prologue.styleSheet = inStyleSheet;
  ZORFoundation::AtomicFile file(inPath, inOptions);
  if (FAILED(WriteReport(inDocument, prologue, file.Temporary().Utf8Path())))
    throw Error(inPath + ": the file could not be written");
  file.Commit();
}

}  // namespace

PageStyleSheet::PageStyleSheet(const std::string& inPath)
    : path(inPath.empty() ? StyleSheetOfSetting() : inPath) {
  if (path.empty()) return;
  ZORFoundation::ReadOptions limit;
  limit.maxSize = kMaxStyleSheetSize;
  text = ZORFoundation::ReadWholeFile(path, limit).bytes;
  if (text.empty()) throw Error(path + ": the style sheet is empty");
  const std::string name = FileNameOf(*this);
  if (name == kReportFile || name == kPageFile || name == kReportType)
    throw Error(path + ": a style sheet of this name would take the place of another");
  MakePage({"", text, path});
}

void WritePublishedFiles(const PublicationOptions& inOptions, const PageStyleSheet& inSheet,
                         const ClashDocument& inDocument, const PublishedResult& inPublished,
                         const std::string& inWorkFolder) {
  // First, since it may fail: the old publication stays as it was then.
  const std::string name = inSheet.path.empty() ? "clash-page.xsl" : inSheet.path;
  const Page page = MakePage({AnnotatedReport(inDocument, inPublished), inSheet.text, name});
  if (!page.messages.empty() && inOptions.warn)
    inOptions.warn(name + ": " + page.messages.substr(0, page.messages.find('\n')));
  ZORFoundation::AtomicFileOptions written;
  written.temporaryFolder = inWorkFolder;
  const std::string folder = inOptions.folder + "/", styleSheet = FileNameOf(inSheet);
  WriteReportFile(inDocument, styleSheet, folder + kReportFile, written);
  ZORFoundation::WriteWholeFile(folder + kReportType,
                                PageFunction<ShippedTextFunction>(kReportTypeName)(), written);
  ZORFoundation::WriteWholeFile(folder + styleSheet,
                                inSheet.path.empty()
                                    ? PageFunction<ShippedTextFunction>(kReportStyleSheetName)()
                                    : inSheet.text,
                                written);
  ZORFoundation::WriteWholeFile(folder + kPageFile, page.bytes, written);
}

}  // namespace ZORToolkit
