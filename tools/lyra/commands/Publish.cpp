// lyra publish RESULT --model MODEL -o DIR
#include <algorithm>
#include <memory>
#include <thread>

#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/Model.h"
#include "lyra/commands/Picture.h"
#include "lyra/terminal/Progress.h"
#include "lyra/terminal/SafeText.h"
#include "toolkit/publishing/Publication.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr long long kMaxProcesses = 256;
constexpr const char* kFormats[] = {"jpeg", "png"};
constexpr const char* kZooms[] = {"interference", "products"};  // by the setting's value
constexpr const char* kPositions[] = {"result", "model"};

struct PublishOptions {
  std::string file, model, directory, styleSheet, size, format = "jpeg", zoom, positions = "result",
                                                        language;
  std::vector<std::string> only;
  std::optional<long long> jobs;
  bool resume = false;
  ModelReading reading;
};

int ProcessCount(const PublishOptions& inOptions) {
  if (!inOptions.jobs) return static_cast<int>(std::max(1U, std::thread::hardware_concurrency()));
  if (*inOptions.jobs < 1 || *inOptions.jobs > kMaxProcesses)
    throw UsageError("--jobs: 1 to " + std::to_string(kMaxProcesses));
  return static_cast<int>(*inOptions.jobs);
}

PublicationOptions ToolkitOptions(const PublishOptions& inOptions) {
  PublicationOptions options;
  options.filter = FilterOfConditions(inOptions.only);
  const bool isPng = ChosenWord("--format", inOptions.format, kFormats) == 1;
  options.format = isPng ? PictureFormat::kPng : PictureFormat::kJpeg;
  if (!inOptions.size.empty()) options.size = SizeOf(inOptions.size);
  if (!inOptions.zoom.empty())
    options.zoom = static_cast<PictureZoom>(ChosenWord("--zoom", inOptions.zoom, kZooms));
  const bool areModels = ChosenWord("--positions", inOptions.positions, kPositions) == 1;
  options.places = areModels ? ProductPlaces::kModel : ProductPlaces::kResult;
  options.processes = ProcessCount(inOptions);
  options.folder = inOptions.directory;
  options.styleSheet = inOptions.styleSheet;
  options.model = inOptions.model;
  options.resume = inOptions.resume;
  return options;
}

int Publish(const PublishOptions& inOptions, Output& ioOutput) {
  PublicationOptions options = ToolkitOptions(inOptions);
  inOptions.reading.Check();
  ChooseLanguage(inOptions.language);
  ClashDocument document(inOptions.file);
  options.warn = [](const std::string& inWarning) {
    std::fprintf(stderr, "lyra: warning: %s\n", Printable(inWarning).c_str());
  };
  Published made;
  {
    std::optional<DrawingProgress> progress;
    options.drawn = [&](std::size_t inDone, std::size_t inAll) { progress->Show(inDone, inAll); };
    made = ZORToolkit::Publish(document, options, [&] {
      const ZORIProduct_var root = OpenModelFile(inOptions.model, inOptions.reading).root;
      progress.emplace();
      return root;
    });
  }
  ioOutput.Write(made.page + ": " + std::to_string(made.interferences) + " interferences, " +
                 std::to_string(made.pictures) + " with a picture\n");
  if (made.failures > 0)
    throw InputError(std::to_string(made.failures) +
                     " interferences have no picture: it cannot be drawn or written");
  return 0;
}

}  // namespace

VerbAction DeclarePublish(Arguments& ioArguments) {
  const auto options = std::make_shared<PublishOptions>();
  ioArguments.Positional("RESULT", options->file, "A clash result, or - for standard input");
  ioArguments.RequiredText("-o,--output", "DIR", options->directory,
                           "The folder that gets the page, the report and the pictures");
  ioArguments.NonEmptyText("--model", "MODEL", options->model,
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
  ioArguments.NonEmptyText(
      "--xsl", "FILE", options->styleSheet,
      "A style sheet of your own for the page (default: the setting XslTemplate)");
  ioArguments.Number("--jobs", "N", options->jobs,
                     "Processes that draw (default: as many as processors)");
  ioArguments.Flag("--resume", options->resume, "Keep the pictures of a run that was ended early");
  options->reading.Declare(ioArguments);
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Publish(*options, ioOutput); };
}

}  // namespace lyra
