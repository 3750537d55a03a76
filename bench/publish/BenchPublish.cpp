// zor_bench_publish: a result of many interferences is published with pictures of its model.
//
// Exit code 1 when a picture is missing, when one interference has different pictures, or when all
// of them together are not those that --expect names; however slow it was, 0 otherwise.
#include <sys/resource.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>
#include <string>
#include <vector>

#include "ChildProcess.h"
#include "ResultHash.h"
#include "foundation/TemporaryFile.h"
#include "publish/PhaseTimes.h"
#include "publish/RepeatedResult.h"
#include "support/ResultOnModel.h"

namespace fs = std::filesystem;

namespace {

constexpr int kWidth = 756, kHeight = 506;
constexpr int kEnoughPixels = 200;

struct Options {
  std::string result = ZOR_SOURCE_DIR "/samples/dissonance.clash.xml";
  std::string model = ZOR_SOURCE_DIR "/samples/dissonance_assembly.step";
  std::string expect;
  std::size_t interferences = 1000;
  int jobs = 2;
};

/// Milliseconds of processor time of all processes that were started here and have ended.
double ProcessorTimeOfChildren() {
  rusage usage{};
  getrusage(RUSAGE_CHILDREN, &usage);
  const auto milliseconds = [](const timeval& inTime) {
    return 1e3 * static_cast<double>(inTime.tv_sec) + 1e-3 * static_cast<double>(inTime.tv_usec);
  };
  return milliseconds(usage.ru_utime) + milliseconds(usage.ru_stime);
}

std::string BytesOf(const fs::path& inPath) {
  std::ifstream file(inPath, std::ios::binary);
  if (!file) throw std::runtime_error(inPath.filename().string() + " is missing");
  return {std::istreambuf_iterator<char>(file), {}};
}

struct Run {
  double wall = 0, processor = 0;  // milliseconds
  std::array<double, kPhaseCount> phases{};
  std::array<std::uint64_t, kPhaseCount> calls{};
};

/// Every path that the command takes depends on its arguments alone.
void PrepareEnvironment(const fs::path& inFolder) {
  for (const char* const name : {"ZOR_PICTURE_THREADS", "TRX_VELD_SUBINTERF"}) unsetenv(name);
  setenv("XDG_CACHE_HOME", (inFolder / "cache").c_str(), 1);
}

Run Publish(const Options& inOptions, const fs::path& inFolder) {
  const fs::path times = inFolder / "times";
  std::ofstream(times, std::ios::binary) << std::string(sizeof(PhaseTimes), '\0');
  setenv(kPhaseTimesVariable, times.c_str(), 1);
  // The linker splits the list of these libraries at blanks, which the path of the build may hold.
  const fs::path library = inFolder / "phase-times.so";
  fs::create_symlink(ZOR_BENCH_PHASE_TIMES_LIBRARY, library);
  setenv("LD_PRELOAD", library.c_str(), 1);
  const std::string lyra = (fs::read_symlink("/proc/self/exe").parent_path() / "lyra").string();
  const double before = ProcessorTimeOfChildren();
  const ChildOutcome outcome =
      RunChild({lyra, "publish", (inFolder / "result.xml").string(), "--model", inOptions.model,
                "--zoom", "interference", "--jobs", std::to_string(inOptions.jobs), "-o",
                (inFolder / "page").string()});
  unsetenv("LD_PRELOAD");
  if (outcome.exitCode != 0) throw std::runtime_error("the command failed");
  Run run;
  run.wall = outcome.milliseconds;
  run.processor = ProcessorTimeOfChildren() - before;
  std::ifstream stream(times, std::ios::binary);
  for (std::size_t i = 0; i < kPhaseCount; ++i) {
    std::uint64_t nanoseconds = 0;
    stream.read(reinterpret_cast<char*>(&run.calls[i]), sizeof run.calls[i]);
    stream.read(reinterpret_cast<char*>(&nanoseconds), sizeof nanoseconds);
    run.phases[i] = 1e-6 * static_cast<double>(nanoseconds);
  }
  if (!stream || run.calls[kDraw] == 0) throw std::runtime_error("the phases were not timed");
  return run;
}

/// Of all pictures in order. Those of one interference are the same however often it occurs.
std::uint64_t HashOfPictures(const fs::path& inPictures, std::size_t inCount,
                             std::size_t inDifferent) {
  ResultHash all;
  std::vector<std::uint64_t> firsts;
  for (std::size_t i = 0; i < inCount; ++i) {
    ResultHash one;
    for (const char* const ending : {".jpg", "_product_1.jpg", "_product_2.jpg"}) {
      const std::string name = "interference_" + std::to_string(i + 1) + ending;
      one.Add(std::string_view(BytesOf(inPictures / name)));
    }
    if (firsts.size() < inDifferent) firsts.push_back(one.Value());
    if (firsts[i % inDifferent] != one.Value())
      throw std::runtime_error("interference " + std::to_string(i + 1) + " is drawn differently");
    all.Add(one.Value());
  }
  return all.Value();
}

void PrintTimes(const Options& inOptions, const Run& inRun) {
  const double pictures = static_cast<double>(inOptions.interferences);
  std::printf("%zu interferences, %d processes: %.1f s on the wall, %.1f s of processor time\n",
              inOptions.interferences, inOptions.jobs, inRun.wall / 1e3, inRun.processor / 1e3);
  std::printf(
      "%.1f pictures a second (%.1f with both products' previews), %.1f a processor second\n",
      1e3 * pictures / inRun.wall, 3e3 * pictures / inRun.wall, 1e3 * pictures / inRun.processor);
  const char* const names[kPhaseCount] = {"opening the model", "drawing", "encoding",
                                          "trying directions"};
  double rest = inRun.processor;
  const auto print = [&](const char* inName, double inTime, std::uint64_t inCalls) {
    std::printf("  %-18s %10.1f ms %6.1f %%  %8llu calls\n", inName, inTime,
                100 * inTime / inRun.processor, static_cast<unsigned long long>(inCalls));
  };
  for (std::size_t i = 0; i < kPhaseCount; ++i) {
    rest -= inRun.phases[i];
    print(names[i], inRun.phases[i], inRun.calls[i]);
  }
  print("all else", rest, 1);
  const double outside =
      100 * (inRun.processor - inRun.phases[kDraw] - inRun.phases[kEncode]) / inRun.processor;
  std::printf(
      "outside drawing and encoding: %.1f %% (at most 15: %s); %.1f %% without the trials\n",
      outside, outside <= 15 ? "kept" : "NOT KEPT",
      outside - 100 * inRun.phases[kTryViews] / inRun.processor);
}

/// Of the interferences that differ.
void PrintVisibility(const Options& inOptions) {
  const support::ResultOnModel sample(inOptions.model, inOptions.result);
  std::size_t framed = 0, seen = 0;
  for (std::size_t i = 0; i < std::min(sample.Count(), inOptions.interferences); ++i) {
    const auto pixels = support::SeenWhereFramed(sample.Scene(i), kWidth, kHeight);
    if (!pixels) continue;
    ++framed;
    if ((*pixels)[0] >= kEnoughPixels && (*pixels)[1] >= kEnoughPixels)
      ++seen;
    else
      std::printf("  interference %zu: %d and %d pixels\n", i + 1, (*pixels)[0], (*pixels)[1]);
  }
  const double share =
      framed == 0 ? 0 : 100.0 * static_cast<double>(seen) / static_cast<double>(framed);
  std::printf(
      "both products visible, %d pixels each: %zu of %zu pictures without a stored "
      "viewpoint, %.1f %% (at least 95: %s)\n",
      kEnoughPixels, seen, framed, share,
      framed == 0   ? "nothing to see"
      : share >= 95 ? "kept"
                    : "NOT KEPT");
}

int Measure(const Options& inOptions) {
  const ZORFoundation::ScratchFolder scratch;
  const fs::path folder = scratch.Path();
  PrepareEnvironment(folder);
  const std::size_t different = WriteRepeatedResult(inOptions.result, inOptions.interferences,
                                                    (folder / "result.xml").string());
  const Run run = Publish(inOptions, folder);
  PrintTimes(inOptions, run);
  char hash[17];
  std::snprintf(hash, sizeof hash, "%016llx",
                static_cast<unsigned long long>(
                    HashOfPictures(folder / "page/pictures", inOptions.interferences, different)));
  std::printf("hash of the pictures: %s\n", hash);
  PrintVisibility(inOptions);
  if (inOptions.expect.empty() || inOptions.expect == hash) return 0;
  std::fprintf(stderr, "zor_bench_publish: other pictures than expected\n");
  return 1;
}

}  // namespace

int main(int inCount, char** inArguments) try {
  Options options;
  CLI::App arguments("Publishes a result of many interferences with pictures");
  arguments.add_option("--result", options.result, "Whose interferences are repeated");
  arguments.add_option("--model", options.model, "What the pictures show");
  arguments.add_option("--interferences", options.interferences)->check(CLI::Range(1, 1'000'000));
  arguments.add_option("--jobs", options.jobs, "Processes that draw")->check(CLI::Range(1, 256));
  arguments.add_option("--expect", options.expect, "The hash that the pictures must have");
  CLI11_PARSE(arguments, inCount, inArguments);
  return Measure(options);
} catch (const std::exception& error) {
  std::fprintf(stderr, "zor_bench_publish: %s\n", error.what());
  return 1;
}
