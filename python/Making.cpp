// Computing and publishing results.
#include <algorithm>
#include <exception>
#include <thread>
#include <utility>

#include "Binding.h"
#include "default_platform/OpenModel.h"
#include "foundation/AtomicFile.h"
#include "toolkit/detection/Detect.h"
#include "toolkit/publishing/Publication.h"
#include "toolkit/records/RecordFilter.h"
#include "toolkit/records/WrittenFile.h"
#include "toolkit/review/LanguageWords.h"
#include "toolkit/review/ReviewedFile.h"
#include "toolkit/scenes/ModelLimits.h"

namespace ZORPython {
using namespace ZORToolkit;
namespace {

/// Work is given up because a function of the caller raised an error.
struct GivenUp {};

/// Tells functions of the caller how far a long work has come. What one raises, or Ctrl-C, stops the
/// work and is raised again after it.
class Listener {
 public:
  Listener(py::object inProgress, py::object inWarn)
      : progress_(std::move(inProgress)), warn_(std::move(inWarn)) {}

  /// @return false when the work is to stop.
  bool Progress(const char* inWork, double inDone, double inAll) {
    return Call([&] {
      if (!progress_.is_none()) progress_(inWork, inDone, inAll);
    });
  }
  bool Warn(const std::string& inText) {
    return Call([&] {
      if (warn_.is_none())
        PyErr_WarnEx(PyExc_UserWarning, inText.c_str(), 1);
      else
        warn_(TextFrom(inText));
      if (PyErr_Occurred() != nullptr) throw py::error_already_set();
    });
  }
  void ProgressOrStop(const char* inWork, double inDone, double inAll) {
    if (!Progress(inWork, inDone, inAll)) throw GivenUp();
  }
  void WarnOrStop(const std::string& inText) {
    if (!Warn(inText)) throw GivenUp();
  }
  bool HasFailed() const { return error_ != nullptr; }
  void Rethrow() const {
    if (error_) std::rethrow_exception(error_);
  }

 private:
  template <class Do>
  bool Call(const Do& inDo) {
    if (error_) return false;
    const py::gil_scoped_acquire interpreter;
    try {
      if (PyErr_CheckSignals() != 0) throw py::error_already_set();
      inDo();
    } catch (const py::error_already_set&) {
      error_ = std::current_exception();
      return false;
    }
    return true;
  }

  py::object progress_, warn_;
  std::exception_ptr error_;
};

/// Runs long work without the interpreter; an error of the caller's function is raised in its place.
template <class Work>
void Attended(Listener& ioListener, const Work& inWork) {
  try {
    const LibraryScope library;
    inWork();
  } catch (const GivenUp&) {
    ioListener.Rethrow();
    throw;
  } catch (...) {
    ioListener.Rethrow();
    throw;
  }
  ioListener.Rethrow();
}

// detect

struct PyDetection {
  std::string output;
  std::size_t clashes = 0, contacts = 0, clearances = 0, productsChecked = 0;
  std::vector<std::string> unjudged;
};

PyDetection SummaryOf(const DetectionResult& inResult, std::string inOutput) {
  PyDetection summary;
  summary.output = std::move(inOutput);
  summary.productsChecked = inResult.productsChecked;
  summary.unjudged = inResult.unjudged;
  for (const DetectedInterference& found : inResult.interferences) {
    using Kind = DetectedInterference::Kind;
    ++(found.kind == Kind::kClash     ? summary.clashes
       : found.kind == Kind::kContact ? summary.contacts
                                      : summary.clearances);
  }
  return summary;
}

using Patterns = std::vector<std::string>;
using Limit = std::optional<long long>;

/// How a model is read, from the arguments that several functions have.
ZORDefault::ModelOptions ReadingFrom(const Limit& inTime, const Limit& inMemory, bool inStrict) {
  ZORDefault::ModelOptions reading;
  reading.maxSeconds = static_cast<double>(ModelLimit("limit_time", inTime, "LimitTime"));
  reading.maxMemory =
      static_cast<std::uint64_t>(ModelLimit("limit_memory", inMemory, "LimitMemory")) << 20;
  reading.isStrict = inStrict;
  return reading;
}

DetectionOptions DetectionOptionsFrom(
    double inTolerance, double inContactGap, double inClearance, std::optional<int> inLevel,
    const Patterns& inOnly, const Patterns& inIgnore,
    const std::optional<std::pair<std::string, std::string>>& inBetween,
    const std::string& inSheets, bool inViewpoints, unsigned inJobs,
    const ZORDefault::ModelOptions& inReading) {
  constexpr const char* kSheets[] = {"clash", "contact", "ignore"};
  constexpr unsigned kMaxThreads = 1024;
  DetectionOptions options;
  options.tolerance = inTolerance;
  options.contactGap = inContactGap;
  options.clearance = inClearance;
  options.level = inLevel;
  options.only = inOnly;
  options.ignore = inIgnore;
  options.between = inBetween;
  const auto word = std::find(std::begin(kSheets), std::end(kSheets), inSheets);
  if (word == std::end(kSheets)) throw UnknownWord("sheets", inSheets, kSheets);
  options.sheets = static_cast<SheetsMean>(word - std::begin(kSheets));
  if (inJobs > kMaxThreads) throw UsageError("jobs: at most " + std::to_string(kMaxThreads));
  options.hasViewpoints = inViewpoints;
  options.threads = inJobs;
  options.maxSeconds = inReading.maxSeconds;
  options.maxMemory = inReading.maxMemory;
  options.isStrict = inReading.isStrict;
  if (const std::string fault = FindFault(options); !fault.empty()) throw UsageError(fault);
  return options;
}

PyDetection DetectToFile(const py::object& inModel, const py::object& inOutput, double inTolerance,
                         double inContactGap, double inClearance, std::optional<int> inLevel,
                         const Patterns& inOnly, const Patterns& inIgnore,
                         const std::optional<std::pair<std::string, std::string>>& inBetween,
                         const std::string& inSheets, bool inViewpoints,
                         const std::optional<py::object>& inPrevious, unsigned inJobs,
                         const Limit& inTime, const Limit& inMemory, bool inStrict,
                         const py::object& inProgress, const py::object& inWarn) {
  DetectionOptions options = DetectionOptionsFrom(
      inTolerance, inContactGap, inClearance, inLevel, inOnly, inIgnore, inBetween, inSheets,
      inViewpoints, inJobs, ReadingFrom(inTime, inMemory, inStrict));
  const std::string model = PathFrom(inModel), output = PathFrom(inOutput);
  const std::string previousPath = inPrevious ? PathFrom(*inPrevious) : std::string();
  Listener listener(inProgress, inWarn);
  options.readingProgress = [&](double done) { listener.ProgressOrStop("reading", done, 1); };
  options.warn = [&](const std::string& warning) { listener.WarnOrStop(warning); };
  options.progress = [&](std::size_t done, std::size_t all) {
    return listener.Progress("checking", static_cast<double>(done), static_cast<double>(all));
  };
  PyDetection summary;
  Attended(listener, [&] {
    std::optional<ReviewedFile> previous;
    if (inPrevious) previous.emplace(previousPath);
    {
      const ZORFoundation::AtomicFile probe(output);
    }  // fails at once where nothing can be written
    const DetectionResult result = Detect(model, options);
    if (listener.HasFailed()) throw GivenUp();
    ReplaceFile(output, [&](const std::string& inPath) {
      WriteClashResult(result, DateOfWriting(), inPath);
      return previous ? SettleAsBefore(*previous, inPath) : S_OK;
    });
    summary = SummaryOf(result, output);
  });
  return summary;
}

void DefineDetect(py::module_& ioModule) {
  const DetectionOptions options;
  py::class_<PyDetection>(ioModule, "Detection", "What was found in a model; see detect().")
      .def_property_readonly("output",
                             [](const PyDetection& inFound) { return TextFrom(inFound.output); })
      .def_readonly("clashes", &PyDetection::clashes)
      .def_readonly("contacts", &PyDetection::contacts)
      .def_readonly("clearances", &PyDetection::clearances)
      .def_readonly("products_checked", &PyDetection::productsChecked)
      .def_readonly("unjudged", &PyDetection::unjudged, "What could not be judged.");
  ioModule.def(
      "detect", &DetectToFile, py::arg("model"), py::arg("output"), py::kw_only(),
      py::arg("tolerance") = options.tolerance, py::arg("contact_gap") = options.contactGap,
      py::arg("clearance") = options.clearance, py::arg("level") = py::none(),
      py::arg("only") = Patterns(), py::arg("ignore") = Patterns(), py::arg("between") = py::none(),
      py::arg("sheets") = "clash", py::arg("viewpoints") = false, py::arg("previous") = py::none(),
      py::arg("jobs") = 0, py::arg("limit_time") = py::none(), py::arg("limit_memory") = py::none(),
      py::arg("strict") = false, py::arg("progress") = py::none(), py::arg("warn") = py::none(),
      "Compute a clash result from a CAD model and write it.\n\nThe options are those of `lyra "
      "detect`; jobs: threads, 0 for one for each processor; limit_time, limit_memory: seconds "
      "of processor time and megabytes that reading the model may take, by default those of the "
      "settings, else by its size; strict refuses a model of which something cannot be read. "
      "progress(work, done, all) is called "
      "with work 'reading' or 'checking'; warn(text) for each warning, by default "
      "warnings.warn. What one of them raises stops the work; no file is written then.");
}

// publish

std::size_t WordPlace(const char* inName, const std::string& inWord,
                      std::span<const char* const> inKnown) {
  const auto found = std::find(inKnown.begin(), inKnown.end(), inWord);
  if (found == inKnown.end()) throw UnknownWord(inName, inWord, inKnown);
  return static_cast<std::size_t>(found - inKnown.begin());
}

Published PublishToFolder(const py::object& inResult, const py::object& inOutput,
                          const std::optional<py::object>& inModel,
                          const std::optional<py::object>& inBaseline, const Patterns& inOnly,
                          const std::optional<std::string>& inFormat, std::pair<int, int> inSize,
                          const std::optional<std::string>& inZoom, const std::string& inPositions,
                          const std::optional<py::object>& inBaselineModel,
                          const std::optional<py::object>& inStyleSheet,
                          const std::optional<std::string>& inLanguage, unsigned inJobs,
                          bool inResume, bool inFlat, const Limit& inTime, const Limit& inMemory,
                          bool inStrict, const py::object& inProgress, const py::object& inWarn) {
  constexpr const char* kFormats[] = {"jpeg", "png"};
  constexpr const char* kZooms[] = {"interference", "products"};
  constexpr const char* kPositions[] = {"result", "model"};
  const std::string result = PathFrom(inResult), output = PathFrom(inOutput);
  const std::string baselinePath = inBaseline ? PathFrom(*inBaseline) : std::string();
  PublicationOptions options;
  SetTarget(options, output);
  options.filter = FilterOfConditions(inOnly);
  for (const std::string& only : inOnly)
    options.filterText += (options.filterText.empty() ? "" : ",") + only;
  options.isCompact = !inFormat && options.isOneFile;
  if (options.isCompact || (inFormat && WordPlace("format", *inFormat, kFormats) == 1))
    options.format = PictureFormat::kPng;
  const auto isSide = [](int inPixels) { return inPixels >= 1 && inPixels <= kMaxPictureSize; };
  if (!isSide(inSize.first) || !isSide(inSize.second))
    throw UsageError("size: 1 to " + std::to_string(kMaxPictureSize) + " pixels");
  options.size = {inSize.first, inSize.second};
  if (inZoom) options.zoom = static_cast<PictureZoom>(WordPlace("zoom", *inZoom, kZooms));
  options.places = static_cast<ProductPlaces>(WordPlace("positions", inPositions, kPositions));
  constexpr unsigned kMaxProcesses = 256;
  if (inJobs > kMaxProcesses) throw UsageError("jobs: at most " + std::to_string(kMaxProcesses));
  options.processes =
      static_cast<int>(inJobs != 0 ? inJobs : std::max(1U, std::thread::hardware_concurrency()));
  options.resume = inResume;
  options.hasGeometry = !inFlat;
  if (inModel) options.model = PathFrom(*inModel);
  if (inStyleSheet) options.styleSheet = PathFrom(*inStyleSheet);
  const char* const language =
      inLanguage ? kLanguages[WordPlace("lang", *inLanguage, kLanguages)] : nullptr;
  if (language != nullptr) options.language = language;
  Listener listener(inProgress, inWarn);
  options.warn = [&](const std::string& warning) { listener.WarnOrStop(warning); };
  options.drawn = [&](std::size_t done, std::size_t all) {
    listener.ProgressOrStop("drawing", static_cast<double>(done), static_cast<double>(all));
  };
  ZORDefault::ModelOptions reading = ReadingFrom(inTime, inMemory, inStrict);
  reading.progress = [&](double done) { listener.ProgressOrStop("reading", done, 1); };
  reading.warn = options.warn;
  if (inBaselineModel)
    options.openBaselineModel = [&, path = PathFrom(*inBaselineModel)] {
      return ZORDefault::OpenModel(path, reading).root;
    };
  Published made;
  Attended(listener, [&] {
    std::optional<OtherLanguage> spoken;
    if (language != nullptr) spoken.emplace(language);
    options.source = BytesOfInput(result);
    options.sourceName = FileNameOf(result);
    std::optional<ClashDocument> baseline;
    if (inBaseline) {
      options.baselineSource = BytesOfInput(baselinePath);
      options.baselineName = FileNameOf(baselinePath);
      options.baseline = &baseline.emplace(baselinePath, options.baselineSource);
    }
    ClashDocument document(result, options.source);
    made = Publish(document, options,
                   [&] { return ZORDefault::OpenModel(options.model, reading).root; });
  });
  return made;
}

void DefinePublish(py::module_& ioModule) {
  const PublicationOptions options;
  py::class_<Published>(ioModule, "Published", "What was published; see publish().")
      .def_property_readonly("page", [](const Published& inMade) { return TextFrom(inMade.page); })
      .def_readonly("interferences", &Published::interferences)
      .def_readonly("pictures", &Published::pictures, "Interferences with a picture.")
      .def_readonly("failures", &Published::failures,
                    "Interferences without one although the model has one of their products.");
  ioModule.def(
      "publish", &PublishToFolder, py::arg("result"), py::arg("output"), py::kw_only(),
      py::arg("model") = py::none(), py::arg("baseline") = py::none(), py::arg("only") = Patterns(),
      py::arg("format") = py::none(),
      py::arg("size") = std::pair(options.size.width, options.size.height),
      py::arg("zoom") = py::none(), py::arg("positions") = "result",
      py::arg("baseline_model") = py::none(), py::arg("xsl") = py::none(),
      py::arg("lang") = py::none(), py::arg("jobs") = 0, py::arg("resume") = false,
      py::arg("flat") = false, py::arg("limit_time") = py::none(),
      py::arg("limit_memory") = py::none(), py::arg("strict") = false,
      py::arg("progress") = py::none(), py::arg("warn") = py::none(),
      "Publish a result as a page: a folder, or one file when output ends in '.html'.\n\nresult, "
      "output, model, baseline, baseline_model, xsl: paths; without a model there are no "
      "pictures. only: conditions such as 'type=clash,status=relevant'. lang: the language of the "
      "words, such as 'de'. limit_time, limit_memory, strict: as for detect(). The other options "
      "are those of `lyra publish`; "
      "pictures are drawn in jobs processes that start as copies of this one, 0 for one for each "
      "processor. progress(work, done, all) is called with work 'reading' or 'drawing'; "
      "warn(text) for each warning, by default warnings.warn. What one of them raises stops the "
      "work; pictures that are whole stay.");
}

}  // namespace

void DefineMaking(py::module_& ioModule) {
  DefineDetect(ioModule);
  DefinePublish(ioModule);
}

}  // namespace ZORPython
