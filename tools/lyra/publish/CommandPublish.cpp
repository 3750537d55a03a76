// lyra publish RESULT --model MODEL -o DIR
#include <algorithm>
#include <memory>
#include <thread>

#include "ZORLyraXMLServices.h"
#include "foundation/AtomicFile.h"
#include "foundation/ReadWholeFile.h"
#include "lyra/CommandErrors.h"
#include "lyra/Language.h"
#include "lyra/ModelFile.h"
#include "lyra/OptionWord.h"
#include "lyra/Verbs.h"
#include "lyra/publish/OnlyFilter.h"
#include "lyra/publish/PageLibrary.h"
#include "lyra/publish/Publication.h"
#include "platform/system/ZORSettingRepository.h"
#include "platform/system/ZORSysSettingRepository.h"
#include "toolkit/publishing/ReportWriter.h"
#include "toolkit/records/DocumentText.h"

namespace fs = std::filesystem;

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr char kReport[] = "report.xml";
constexpr char kPage[] = "index.html";
constexpr char kReportStyleSheet[] = "clash-report.xsl";
constexpr char kReportType[] = "clash-report.dtd";
constexpr long long kMostProcesses = 256;
constexpr const char* kFormats[] = {"jpeg", "png"};
constexpr const char* kZooms[] = {"interference", "products"};  // by the setting's value
constexpr const char* kPositions[] = {"result", "model"};

struct PublishOptions {
  std::string file, model, directory, styleSheet, size, format = "jpeg", zoom, positions = "result",
                                                        language;
  std::vector<std::string> only;
  std::optional<long long> jobs;
  bool resume = false;
};

/// A style sheet that is applied in the place of the page's own.
struct OtherStyleSheet {
  std::string path;  // empty: none
  std::string text;

  std::string Name() const {
    return path.empty() ? kReportStyleSheet : fs::path(path).filename().string();
  }
};

std::string ReadWhole(const std::string& inPath) {
  auto file = ZORFoundation::TryReadWholeFile(inPath);
  if (!file) throw InputError(inPath + ": cannot be read");
  return std::move(file->bytes);
}

/// A reference may be written with backslashes, as on other systems.
std::string StyleSheetOfSetting() {
  ZORSettingRepository* const settings = ZORSettingRepository::GetRepository("ClashPublish");
  ZORUnicodeString ignored;
  if (settings == nullptr || FAILED(settings->ReadSetting("XslTemplate", &ignored))) return {};
  std::string path = Utf8(ZORLyraXMLServices().getStyleSheetFromSetting());
  if (!fs::exists(path)) std::replace(path.begin(), path.end(), '\\', '/');
  return path;
}

OtherStyleSheet ChosenStyleSheet(const PublishOptions& inOptions) {
  OtherStyleSheet sheet;
  sheet.path = inOptions.styleSheet.empty() ? StyleSheetOfSetting() : inOptions.styleSheet;
  if (sheet.path.empty()) return sheet;
  sheet.text = ReadWhole(sheet.path);
  const std::string name = sheet.Name();
  if (name == kReport || name == kPage || name == kReportType)
    throw InputError(sheet.path + ": a style sheet of this name would take the place of another");
  PageRequest reading;  // says what is wrong before drawing
  reading.styleSheet = sheet.text;
  reading.styleSheetName = sheet.path;
  PageLibrary().MakePage(reading);
  return sheet;
}

PictureStyle StyleOf(const PublishOptions& inOptions) {
  PictureStyle style;
  const bool isPng = ChosenWord("--format", inOptions.format, kFormats) == 1;
  style.format = isPng ? PictureFormat::kPng : PictureFormat::kJpeg;
  if (!inOptions.size.empty()) style.size = SizeOf(inOptions.size);
  if (!inOptions.zoom.empty())
    style.zoom = static_cast<int>(ChosenWord("--zoom", inOptions.zoom, kZooms));
  return style;
}

ProductPlaces PlacesOf(const PublishOptions& inOptions) {
  const bool areModels = ChosenWord("--positions", inOptions.positions, kPositions) == 1;
  return areModels ? ProductPlaces::kModel : ProductPlaces::kResult;
}

int ProcessCount(const PublishOptions& inOptions) {
  if (!inOptions.jobs) return static_cast<int>(std::max(1U, std::thread::hardware_concurrency()));
  if (*inOptions.jobs < 1 || *inOptions.jobs > kMostProcesses)
    throw UsageError("--jobs: 1 to " + std::to_string(kMostProcesses));
  return static_cast<int>(*inOptions.jobs);
}

/// The settings by which pictures differ.
std::string PictureSettings(const PictureStyle& inStyle) {
  int zoom = inStyle.zoom.value_or(0), subInterferences = 0;
  if (auto* const settings = ZORSettingRepository::GetRepository("ClashPublish");
      settings != nullptr && !inStyle.zoom)
    settings->ReadSetting("PictureZoom", &zoom, 1);
  if (auto* const settings = ZORSysSettingRepository::GetRepository("Clash"))
    settings->ReadAttr("ModeOfSubInterf", &subInterferences);
  const char* const switchedOn = std::getenv("TRX_VELD_SUBINTERF");
  return std::to_string(zoom) + " " + std::to_string(subInterferences) + " " +
         (switchedOn != nullptr ? switchedOn : "");
}

/// What the pictures are made from.
std::string StampOf(const PublishOptions& inOptions, const Publication& inPublication,
                    const PictureStyle& inStyle) {
  const auto time = fs::last_write_time(inOptions.model).time_since_epoch().count();
  return "result " + inPublication.Fingerprint() + "\nmodel " +
         fs::canonical(inOptions.model).string() + " " +
         std::to_string(fs::file_size(inOptions.model)) + " " + std::to_string(time) +
         "\npictures " + inOptions.format + " " + std::to_string(inStyle.size.width) + "x" +
         std::to_string(inStyle.size.height) + " " + inOptions.positions + " " +
         PictureSettings(inStyle) + "\n";
}

struct Drawn {
  std::size_t pictures = 0, failures = 0;
};

Drawn DrawPictures(const PublishOptions& inOptions, const PictureStyle& inStyle,
                   Publication& ioPublication) {
  const int processes = ProcessCount(inOptions);
  const ZORIProduct_var root = OpenModelFile(inOptions.model).root;
  const PictureStore store(inOptions.directory,
                           inStyle.format == PictureFormat::kPng ? ".png" : ".jpg");
  ioPublication.LookUp(root, PlacesOf(inOptions));
  if (!store.Prepare(StampOf(inOptions, ioPublication, inStyle), inOptions.resume))
    std::fputs("lyra: warning: the pictures that are there show something else: all are drawn\n",
               stderr);
  Drawn drawn;
  drawn.failures = ioPublication.Draw(store, inStyle, processes);
  for (const Entry& entry : ioPublication.Entries()) drawn.pictures += !entry.facts.picture.empty();
  return drawn;
}

/// @return the report's bytes.
std::string WriteReport(ClashDocument& ioResult, const std::string& inStyleSheet,
                        const std::string& inPath, Output& ioOutput) {
  OutputFile file(inPath);
  Prologue prologue;
  prologue.styleSheet = inStyleSheet;
  file.Check(WriteReport(ioResult, prologue, file.Path()));
  std::string bytes = ReadWhole(file.Path());
  file.Finish(ioOutput);
  return bytes;
}

PageRequest RequestOf(const PublishOptions& inOptions, const OtherStyleSheet& inSheet,
                      const Publication& inPublication) {
  PageRequest request;
  request.styleSheet = inSheet.text;
  request.styleSheetName = inSheet.path.empty() ? "clash-page.xsl" : inSheet.path;
  request.model = Utf8(FromUtf8(fs::path(inOptions.model).filename().string()));
  request.isAsInModel = !inOptions.model.empty() && PlacesOf(inOptions) == ProductPlaces::kModel;
  for (const Entry& entry : inPublication.Entries()) request.interferences.push_back(entry.facts);
  return request;
}

void WriteAll(const PublishOptions& inOptions, const OtherStyleSheet& inSheet,
              const Publication& inPublication, ClashDocument& ioResult, Output& ioOutput) {
  const PageLibrary library;
  const std::string folder = inOptions.directory + "/";
  PageRequest request = RequestOf(inOptions, inSheet, inPublication);
  request.report = WriteReport(ioResult, inSheet.Name(), folder + kReport, ioOutput);
  ZORFoundation::WriteWholeFile(folder + kReportType, library.ReportType());
  ZORFoundation::WriteWholeFile(folder + inSheet.Name(),
                                inSheet.path.empty() ? library.ReportStyleSheet() : inSheet.text);
  ZORFoundation::WriteWholeFile(folder + kPage, library.MakePage(request));
}

int Publish(const PublishOptions& inOptions, Output& ioOutput) {
  const ListFilter filter = ParseOnly(inOptions.only);
  const PictureStyle style = StyleOf(inOptions);
  PlacesOf(inOptions);
  ProcessCount(inOptions);
  ChooseLanguage(inOptions.language);
  ClashDocument file(inOptions.file);
  file.RequireInterferences();
  const OtherStyleSheet sheet = ChosenStyleSheet(inOptions);
  Publication publication(file, filter);
  Drawn drawn;
  try {
    fs::create_directories(inOptions.directory);
    RemoveUnfinishedFiles(inOptions.directory);
    if (!inOptions.model.empty()) drawn = DrawPictures(inOptions, style, publication);
  } catch (const fs::filesystem_error& error) {
    throw InputError(error.path1().string() + ": " + error.code().message());
  }
  publication.Finish(file);
  WriteAll(inOptions, sheet, publication, file, ioOutput);
  ioOutput.Write(Utf8(FromUtf8((fs::path(inOptions.directory) / kPage).string())) + ": " +
                 std::to_string(publication.Entries().size()) + " interferences, " +
                 std::to_string(drawn.pictures) + " with a picture\n");
  if (drawn.failures > 0)
    throw InputError(std::to_string(drawn.failures) +
                     " interferences have no picture: it cannot be drawn or written");
  return 0;
}

}  // namespace

VerbAction DeclarePublish(Arguments& ioArguments) {
  const auto options = std::make_shared<PublishOptions>();
  ioArguments.Positional("RESULT", options->file, "A clash result, or - for standard input");
  ioArguments.RequiredText("-o,--output", "DIR", options->directory,
                           "The folder that gets the page, the report and the pictures");
  ioArguments.Text("--model", "MODEL", options->model,
                   "The model that the pictures show: a STEP, IGES, glTF, OBJ or STL file");
  ioArguments.Texts("--only", "CONDITIONS", options->only,
                    "Only some, such as type=clash,status=relevant; also result= and product=");
  ioArguments.Text("--size", "WxH", options->size,
                   "Width and height of a picture in pixels (default: 756x506)");
  ioArguments.Text("--format", "FORMAT", options->format, "jpeg (default) or png");
  ioArguments.Words("--format", kFormats);
  ioArguments.Text("--zoom", "WHAT", options->zoom,
                   "What pictures are framed on: interference or products (default: the setting "
                   "PictureZoom)");
  ioArguments.Words("--zoom", kZooms);
  ioArguments.Text("--positions", "WHOSE", options->positions,
                   "Where products stand in pictures: as the result (default) or the model says");
  ioArguments.Words("--positions", kPositions);
  ioArguments.Text("--xsl", "FILE", options->styleSheet,
                   "A style sheet of your own for the page (default: the setting XslTemplate)");
  ioArguments.Number("--jobs", "N", options->jobs,
                     "Processes that draw (default: as many as processors)");
  ioArguments.Flag("--resume", options->resume, "Keep the pictures of a run that was ended early");
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Publish(*options, ioOutput); };
}

}  // namespace lyra
