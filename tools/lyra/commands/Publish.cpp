// lyra publish RESULT --model MODEL -o DIR|PAGE.html, lyra extract PAGE.html -o RESULT
#include <algorithm>
#include <filesystem>
#include <fstream>
#include <memory>
#include <optional>
#include <thread>

#include "foundation/NativePath.h"
#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/Model.h"
#include "lyra/commands/Picture.h"
#include "lyra/commands/PublishRun.h"
#include "lyra/commands/ReviewInput.h"
#include "lyra/commands/Shares.h"
#include "lyra/terminal/Progress.h"
#include "lyra/terminal/SafeText.h"
#include "lyra/terminal/Terminal.h"
#include "toolkit/publishing/OneFile.h"
#include "toolkit/publishing/Publication.h"
#include "toolkit/sharding/PublicationShare.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr long long kMaxProcesses = 256;
constexpr const char* kFormats[] = {"jpeg", "png"};
constexpr const char* kZooms[] = {"interference", "products"};  // by the setting's value
constexpr const char* kPositions[] = {"result", "model"};

struct PublishOptions {
  std::string file, model, directory, styleSheet, size, format, zoom, baseline, baselineModel,
      positions = "result", language;
  std::vector<std::string> only;
  std::optional<long long> jobs;
  bool resume = false, verify = false, flat = false;
  ModelReading reading;
  ShareOptions sharing;
};

using Opening = std::function<ZORIProduct_var()>;
/// What is made of a result once everything is read: a page, a share of one, or a plan.
using Making = std::function<int(ClashDocument&, const PublicationOptions&, const Opening&)>;

int ProcessCount(const PublishOptions& inOptions) {
  if (!inOptions.jobs) return static_cast<int>(std::max(1U, std::thread::hardware_concurrency()));
  if (*inOptions.jobs < 1 || *inOptions.jobs > kMaxProcesses)
    throw UsageError("--jobs: 1 to " + std::to_string(kMaxProcesses));
  return static_cast<int>(*inOptions.jobs);
}

PublicationOptions ToolkitOptions(const PublishOptions& inOptions) {
  PublicationOptions options;
  options.filter = FilterOfConditions(inOptions.only);
  SetTarget(options, inOptions.directory);
  // A share is a folder whatever its name, which says what it is a share of.
  if (!inOptions.sharing.shard.empty() &&
      ZORFoundation::NativePath(inOptions.directory).extension() == ".html")
    options.isOneFile = true;
  options.isCompact = inOptions.format.empty() && options.isOneFile;
  const bool isPng = options.isCompact || (!inOptions.format.empty() &&
                                           ChosenWord("--format", inOptions.format, kFormats) == 1);
  options.format = isPng ? PictureFormat::kPng : PictureFormat::kJpeg;
  if (!inOptions.size.empty()) options.size = SizeOf(inOptions.size);
  if (!inOptions.zoom.empty())
    options.zoom = static_cast<PictureZoom>(ChosenWord("--zoom", inOptions.zoom, kZooms));
  const bool areModels = ChosenWord("--positions", inOptions.positions, kPositions) == 1;
  options.places = areModels ? ProductPlaces::kModel : ProductPlaces::kResult;
  options.processes = ProcessCount(inOptions);
  options.language = inOptions.language;
  for (const std::string& only : inOptions.only)
    options.filterText += (options.filterText.empty() ? "" : ",") + only;
  options.styleSheet = inOptions.styleSheet;
  options.model = inOptions.model;
  options.resume = inOptions.resume;
  options.hasGeometry = !inOptions.flat;
  return options;
}

/// @return 0 when nothing has changed.
int Verify(const PublicationOptions& inOptions, Output& ioOutput) {
  constexpr int kChanged = 3;
  const std::vector<std::string> lines = VerifyPublication(inOptions);
  for (const std::string& line : lines) ioOutput.Write(Printable(line) + "\n");
  if (lines.empty()) ioOutput.Write(Printable(inOptions.folder) + ": nothing has changed\n");
  return lines.empty() ? 0 : kChanged;
}

/// Reads what the options name, and lets it be made.
int ReadAndMake(const PublishOptions& inOptions, PublicationOptions inPublication,
                const Making& inMake) {
  if (!inOptions.baseline.empty()) {
    inPublication.baselineSource = BytesOfInput(inOptions.baseline);
    inPublication.baselineName = FileNameOf(inOptions.baseline);
  }
  std::optional<ClashDocument> baseline;
  if (!inOptions.baseline.empty())
    inPublication.baseline = &baseline.emplace(inOptions.baseline, inPublication.baselineSource);
  if (!inOptions.baselineModel.empty())
    inPublication.openBaselineModel = [&] {
      return OpenModelFile(inOptions.baselineModel, inOptions.reading).root;
    };
  ClashDocument document(inOptions.file, inPublication.source);
  std::optional<DrawingProgress> progress;
  SayOnStandardError(progress, inPublication);
  return inMake(document, inPublication, [&] {
    const ZORIProduct_var root = OpenModelFile(inOptions.model, inOptions.reading).root;
    progress.emplace();
    return root;
  });
}

/// The share that the options describe, with the files that it is made of.
ShareManifest ShareOf(const PublishOptions& inOptions, const Shard& inShard) {
  ShareManifest share = NewShare("publish", inOptions.directory, inShard);
  for (const auto& [role, path] : {std::pair{"result", &inOptions.file},
                                   {"model", &inOptions.model},
                                   {"baseline", &inOptions.baseline},
                                   {"baseline model", &inOptions.baselineModel},
                                   {"style sheet", &inOptions.styleSheet}}) {
    if (*path == "-") throw InputError("-: what is shared must be a file");
    if (!path->empty()) share.inputs.push_back(ShareInputOf(role, *path));
  }
  share.options = {{"size", inOptions.size},
                   {"format", inOptions.format},
                   {"zoom", inOptions.zoom},
                   {"positions", inOptions.positions},
                   {"language", inOptions.language},
                   {"only", ListText(inOptions.only)},
                   {"flat", inOptions.flat ? "yes" : ""}};
  return share;
}

int Publish(const PublishOptions& inOptions, Output& ioOutput) {
  const std::optional<Shard> shard = inOptions.sharing.Get();
  if (inOptions.directory.empty() && !inOptions.verify && !inOptions.sharing.plan)
    throw UsageError("publish: -o is required");
  PublicationOptions options = ToolkitOptions(inOptions);
  inOptions.reading.Check();
  ChooseLanguage(inOptions.language);
  if (inOptions.verify && inOptions.directory.empty()) {  // what is there, by itself
    options.folder = inOptions.file;
    return Verify(options, ioOutput);
  }
  options.source = BytesOfInput(inOptions.file);
  options.sourceName = FileNameOf(inOptions.file);
  if (inOptions.verify) {
    if (!inOptions.baseline.empty()) options.baselineSource = BytesOfInput(inOptions.baseline);
    return Verify(options, ioOutput);
  }
  return ReadAndMake(
      inOptions, options,
      [&](ClashDocument& ioDocument, const PublicationOptions& inPublication,
          const Opening& inOpen) {
        if (inOptions.sharing.plan)
          return PrintPlan("publish", SamplePublication(ioDocument, inPublication, inOpen),
                           inOptions.sharing, ioOutput);
        if (!shard)
          return ReportPage(ZORToolkit::Publish(ioDocument, inPublication, inOpen), ioOutput);
        const ShareManifest share = ShareOf(inOptions, *shard);
        ioOutput.Write(ShareLine(share, PublishShare(ioDocument, inPublication, share, inOpen)));
        return 0;
      });
}

struct ExtractOptions {
  std::string file, output;
  bool manifest = false;
};

int Extract(const ExtractOptions& inOptions, Output& ioOutput) {
  const PublishedPage page(inOptions.file, BytesOfInput(inOptions.file));
  const std::string bytes = inOptions.manifest ? page.ManifestText() : page.Result();
  OutputFile output(inOptions.output);
  std::ofstream file(ZORFoundation::NativePath(output.Path()), std::ios::binary);
  file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
  file.close();  // Windows renames no file that is open
  output.Check(file ? S_OK : E_FAIL);
  output.Finish(ioOutput);
  return 0;
}

}  // namespace

void SayOnStandardError(std::optional<DrawingProgress>& ioProgress, PublicationOptions& ioOptions) {
  ioOptions.warn = [](const std::string& inWarning) {
    WriteError("lyra: warning: " + Printable(inWarning) + "\n");
  };
  ioOptions.drawn = [&](std::size_t inDone, std::size_t inAll) { ioProgress->Show(inDone, inAll); };
}

void RequireAllPictures(const Published& inMade) {
  if (inMade.failures > 0)
    throw InputError(std::to_string(inMade.failures) +
                     " interferences have no picture: it cannot be drawn or written");
}

int ReportPage(const Published& inMade, Output& ioOutput) {
  ioOutput.Write(inMade.page + ": " + std::to_string(inMade.interferences) + " interferences, " +
                 std::to_string(inMade.pictures) + " with a picture\n");
  RequireAllPictures(inMade);
  return 0;
}

int GatherPublish(const std::vector<ShareManifest>& inShares, const GatherOptions& inOptions,
                  Output& ioOutput) {
  const ShareManifest& share = inShares.front();
  PublishOptions options;
  options.file = InputOfShares(share, "result", inOptions.result);
  options.model = InputOfShares(share, "model", inOptions.model);
  options.baseline = InputOfShares(share, "baseline");
  options.baselineModel = InputOfShares(share, "baseline model");
  options.styleSheet = InputOfShares(share, "style sheet");
  options.directory = inOptions.output;
  options.size = share.Option("size");
  options.format = share.Option("format");
  options.zoom = share.Option("zoom");
  options.positions = share.Option("positions");
  options.language = share.Option("language");
  options.only = ListFrom(share.Option("only"));
  options.flat = !share.Option("flat").empty();
  options.jobs = inOptions.jobs;
  options.resume = inOptions.resume;
  options.reading = inOptions.reading;
  PublicationOptions publication = ToolkitOptions(options);
  ChooseLanguage(options.language);
  publication.source = BytesOfInput(options.file);
  publication.sourceName = FileNameOf(options.file);
  return ReadAndMake(
      options, publication,
      [&](ClashDocument& ioDocument, const PublicationOptions& inPublication,
          const Opening& inOpen) {
        return ReportPage(GatherPublication(ioDocument, inPublication, inShares, inOpen), ioOutput);
      });
}

VerbAction DeclareExtract(Arguments& ioArguments) {
  const auto options = std::make_shared<ExtractOptions>();
  ioArguments.Positional("PAGE", options->file, "A page in one file, as lyra publish makes it");
  ioArguments.RequiredText("-o,--output", "OUT", options->output, "Where the result is written");
  ioArguments.Flag("--manifest", options->manifest,
                   "Write what the page was made from instead, as JSON");
  return [options](Output& ioOutput) { return Extract(*options, ioOutput); };
}

VerbAction DeclarePublish(Arguments& ioArguments) {
  const auto options = std::make_shared<PublishOptions>();
  ioArguments.Positional("RESULT", options->file, "A clash result, or - for standard input");
  ioArguments.NonEmptyText("-o,--output", "DIR", options->directory,
                           "The folder that gets the page, the report and the pictures, or a name "
                           "that ends in .html: everything in one file");
  ioArguments.NonEmptyText("--model", "MODEL", options->model,
                           "The model that the pictures show: a STEP, IGES, glTF, OBJ or STL file");
  ioArguments.NonEmptyText("--baseline", "OLD", options->baseline,
                           "An older result: each interference says what became of it since");
  ioArguments.NonEmptyText("--baseline-model", "MODEL", options->baselineModel,
                           "The model of its pictures (default: that of --model)");
  ioArguments.Texts("--only", "CONDITIONS", options->only,
                    "Only some, such as type=clash,status=relevant; also result= and product=");
  ioArguments.Text("--size", "WxH", options->size,
                   "Width and height of a picture in pixels (default: 756x506)");
  ioArguments.Text("--format", "FORMAT", options->format,
                   "jpeg or png (default: jpeg; in one file WebP, which is smaller)");
  ioArguments.Words("--format", kFormats);
  ioArguments.Text("--zoom", "WHAT", options->zoom,
                   "What pictures are framed on: interference or products (default: the setting "
                   "PictureZoom)");
  ioArguments.Words("--zoom", kZooms);
  ioArguments.Text("--positions", "WHOSE", options->positions,
                   "Where products stand in pictures: as the result (default) or the model says");
  ioArguments.Words("--positions", kPositions);
  ioArguments.NonEmptyText(
      "--xsl", "FILE", options->styleSheet,
      "A style sheet of your own for the page (default: the setting XslTemplate)");
  ioArguments.Number("--jobs", "N", options->jobs,
                     "Processes that draw (default: as many as processors)");
  ioArguments.Flag("--resume", options->resume, "Keep the pictures of a run that was ended early");
  ioArguments.Flag("--flat", options->flat,
                   "Leave the geometry of the model out: pictures cannot be turned");
  ioArguments.Flag("--verify", options->verify,
                   "Make nothing; say what has changed since DIR was made (exit code 3)");
  options->sharing.Declare(ioArguments);
  options->reading.Declare(ioArguments);
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Publish(*options, ioOutput); };
}

}  // namespace lyra
