// What a reader of published pages waits for, in Chromium whose WebGL the processor draws: how fast a
// pair turns, and when the table is there.
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <exception>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "browser/Browser.h"

namespace {

namespace fs = std::filesystem;

/// Each frame is asked for by a key, as a reader does who holds it down, and read back, so that it
/// was drawn to the end before it counts.
constexpr const char* kTurn = R"((async () => {
  const canvas = document.querySelector('canvas'), gl = canvas.getContext('webgl2');
  const pixel = new Uint8Array(4);
  const frames = async seconds => {
    const start = performance.now();
    let count = 0;
    for (; performance.now() - start < 1000 * seconds; ++count) {
      canvas.dispatchEvent(new KeyboardEvent('keydown', { key: 'ArrowLeft', bubbles: true }));
      await new Promise(requestAnimationFrame);
      gl.readPixels(0, 0, 1, 1, gl.RGBA, gl.UNSIGNED_BYTE, pixel);
    }
    return 1000 * count / (performance.now() - start);
  };
  return [await frames(SECONDS), canvas.width, canvas.height];
})())";

struct Turning {
  double frames = 0,
         processor = 0;  ///< a second; milliseconds a frame of all the browser's processes
  int width = 0, height = 0;
};

/// Of all processes below this one, in seconds.
double ProcessorTimeOfDescendants() {
  struct Process {
    int parent = 0;
    double ticks = 0;
  };
  std::map<int, Process> processes;
  for (const fs::directory_entry& entry : fs::directory_iterator("/proc")) {
    const int number = std::atoi(entry.path().filename().c_str());
    if (number == 0) continue;
    std::ifstream file(entry.path() / "stat");
    std::string text((std::istreambuf_iterator<char>(file)), {});
    const std::size_t end = text.rfind(')');
    if (end == std::string::npos) continue;
    std::istringstream fields(text.substr(end + 2));
    std::string skipped;
    Process process;
    fields >> skipped >> process.parent;
    for (int i = 0; i < 9; ++i) fields >> skipped;
    for (int i = 0; i < 2; ++i) {
      double ticks = 0;
      fields >> ticks;
      process.ticks += ticks;
    }
    processes[number] = process;
  }
  const auto isOurs = [&](int inProcess) {
    for (int up = inProcess; up > 1; up = processes[up].parent)
      if (up == getpid()) return inProcess != getpid();
    return false;
  };
  double ticks = 0;
  for (const auto& [number, process] : std::map(processes))
    if (isOurs(number)) ticks += process.ticks;
  return ticks / static_cast<double>(sysconf(_SC_CLK_TCK));
}

Turning Turn(Browser& ioBrowser, double inSeconds) {
  const auto frames = [&](double inDuration) {
    std::string text = kTurn;
    return ioBrowser.Value(text.replace(text.find("SECONDS"), 7, std::to_string(inDuration)));
  };
  frames(1.5);  // by which it is found out how coarse they must be
  const double before = ProcessorTimeOfDescendants();
  const nlohmann::json figures = frames(inSeconds);
  const double spent = ProcessorTimeOfDescendants() - before, rate = figures[0];
  return {rate, 1e3 * spent / (rate * inSeconds), figures[1], figures[2]};
}

bool IsPressed(Browser& ioBrowser) {
  return ioBrowser.Wait(
      "document.querySelector('.tools button:nth-child(4)').getAttribute('aria-pressed') === "
      "'true' && document.querySelector('canvas').dataset.still === '1'");
}

/// Of some interferences of a page: frames a second of the pair alone, and with the assembly.
void MeasureTurning(Browser& ioBrowser, int inPairs, double inSeconds) {
  const nlohmann::json numbers =
      ioBrowser.Value("[...document.querySelectorAll('tr[data-n]')].map(row => row.dataset.n)");
  const int all = static_cast<int>(numbers.size()), pairs = std::min(inPairs, all);
  std::printf("%8s  %-28s  %s\n", "pair", "alone: frames, processor time", "with the assembly");
  for (int i = 0; i < pairs; ++i) {
    const std::string number = numbers[(all - 1) * i / std::max(1, pairs - 1)];
    const std::string section = "#i" + number;
    ioBrowser.Value("document.querySelector('" + section + "').scrollIntoView()");
    if (!ioBrowser.Wait("!!document.querySelector('" + section + " .turn button')"))
      throw std::runtime_error("interference " + number + " has no picture to turn");
    ioBrowser.Click(section + " .turn button");
    if (!ioBrowser.Wait("!!document.querySelector('" + section + " canvas')"))
      throw std::runtime_error("the pair does not open");
    const Turning alone = Turn(ioBrowser, inSeconds);
    ioBrowser.Value("document.querySelector('canvas').focus()");
    ioBrowser.Key("t");
    if (!IsPressed(ioBrowser)) throw std::runtime_error("the assembly is not shown");
    const Turning ghosted = Turn(ioBrowser, inSeconds);
    std::printf("%8s", number.c_str());
    for (const Turning& turning : {alone, ghosted})
      std::printf("  %5.1f/s %5.1f ms %4d x %3d", turning.frames, turning.processor, turning.width,
                  turning.height);
    std::printf("\n");
    std::fflush(stdout);
    ioBrowser.Key("t");
    ioBrowser.Key("Escape");
  }
}

void MeasurePage(Browser& ioBrowser, const std::string& inPath, int inPairs, double inSeconds) {
  ioBrowser.Open(fs::absolute(inPath).string());
  const nlohmann::json opened = ioBrowser.Value(
      "(t => [t.domInteractive, t.loadEventEnd, "
      "document.querySelectorAll('tr[data-n]').length])"
      "(performance.getEntriesByType('navigation')[0])");
  std::printf(
      "%s: %.2f MB, %d interferences; its scripts run after %.0f ms, loaded after %.0f ms\n",
      fs::path(inPath).filename().c_str(), 1e-6 * static_cast<double>(fs::file_size(inPath)),
      opened[2].get<int>(), opened[0].get<double>(), opened[1].get<double>());
  if (ioBrowser.Value("!!document.getElementById('zor-block-scene')") == true)
    MeasureTurning(ioBrowser, inPairs, inSeconds);
}

}  // namespace

int main(int inCount, char** inArguments) try {
  int pairs = 4;
  double seconds = 3;
  std::vector<std::string> pages;
  for (int i = 1; i < inCount; ++i) {
    const std::string word = inArguments[i];
    if (word == "--pairs" && i + 1 < inCount)
      pairs = std::stoi(inArguments[++i]);
    else if (word == "--seconds" && i + 1 < inCount)
      seconds = std::stod(inArguments[++i]);
    else
      pages.push_back(word);
  }
  if (pages.empty()) {
    std::fprintf(stderr, "zor_bench_page [--pairs N] [--seconds N] PAGE.html...\n");
    return 2;
  }
  Browser browser;
  for (const std::string& page : pages) MeasurePage(browser, page, pairs, seconds);
  return 0;
} catch (const std::exception& error) {
  std::fprintf(stderr, "zor_bench_page: %s\n", error.what());
  return 1;
}
