// A simple stand-in for libFuzzer, which needs Clang: runs all files of a corpus, then seeded mutations
// of them, within a time. What ends the program is kept as a file.
//   NAME_fuzz [-max_total_time=SECONDS] [-seed=N] [-artifact_prefix=PATH] FILE|FOLDER…
#include <signal.h>
#include <unistd.h>
#ifdef __SANITIZE_ADDRESS__
#include <sanitizer/common_interface_defs.h>
#endif

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <random>
#include <string_view>
#include <vector>

#include "fuzz/Fuzz.h"

namespace fs = std::filesystem;

namespace {

constexpr std::size_t kMaxSize = 8192;

struct Options {
  double seconds = 10;
  unsigned int seed = 1;
  std::string artifactPrefix = "./";
  std::vector<std::string> corpus;
};

Options Parse(int inCount, char** inArguments) {
  Options options;
  for (int i = 1; i < inCount; ++i) {
    const std::string_view word = inArguments[i];
    const std::string value(word.substr(std::min(word.find('=') + 1, word.size())));
    if (word.starts_with("-max_total_time="))
      options.seconds = std::stod(value);
    else if (word.starts_with("-seed="))
      options.seed = static_cast<unsigned int>(std::stoul(value));
    else if (word.starts_with("-artifact_prefix="))
      options.artifactPrefix = value;
    else if (!word.starts_with('-'))
      options.corpus.emplace_back(word);
  }
  return options;
}

std::string ReadFile(const fs::path& inPath) {
  std::ifstream file(inPath, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

std::vector<std::string> ReadCorpus(const std::vector<std::string>& inPaths) {
  std::vector<fs::path> files;
  for (const std::string& path : inPaths)
    if (fs::is_directory(path)) {
      for (const auto& entry : fs::directory_iterator(path))
        if (entry.is_regular_file()) files.push_back(entry.path());
    } else {
      files.emplace_back(path);
    }
  std::ranges::sort(files);
  std::vector<std::string> inputs;
  for (const fs::path& file : files) inputs.push_back(ReadFile(file));
  return inputs;
}

// ---- what is running, kept when it ends the program

std::string current;
std::string artifactPath;

void KeepCurrent() {
  std::ofstream(artifactPath, std::ios::binary) << current;
  std::fprintf(stderr, "the input is in %s\n", artifactPath.c_str());
}

void KeepAtSignal(int inSignal) {
  KeepCurrent();
  signal(inSignal, SIG_DFL);
  raise(inSignal);
}

// ---- mutations

class Mutator {
 public:
  Mutator(std::vector<std::string> inCorpus, unsigned int inSeed)
      : corpus_(std::move(inCorpus)), random_(inSeed) {
    if (corpus_.empty()) corpus_.emplace_back("a");
  }

  std::string Next() {
    std::string input = Any();
    for (std::size_t changes = 1 + Below(4); changes > 0; --changes) Change(input);
    if (input.size() > kMaxSize) input.resize(kMaxSize);
    return input;
  }

 private:
  std::size_t Below(std::size_t inLimit) { return random_() % std::max<std::size_t>(inLimit, 1); }
  const std::string& Any() { return corpus_[Below(corpus_.size())]; }
  /// A piece of any input of the corpus.
  std::string Piece() {
    const std::string& from = Any();
    return from.substr(Below(from.size()), 1 + Below(40));
  }

  void Change(std::string& ioInput) {
    static constexpr const char* kTokens[] = {"<",
                                              ">",
                                              "&",
                                              "\"",
                                              "'",
                                              "&#0;",
                                              "&lt;",
                                              "]]>",
                                              "<!--",
                                              "-->",
                                              "<![CDATA[",
                                              "<?x ?>",
                                              "\xEF\xBF\xBE",
                                              "\xF0\x9F\x98\x80",
                                              "\xF5\x80\x80\x80",
                                              "\r\n",
                                              "%s",
                                              "-1",
                                              "2147483648",
                                              "1e999",
                                              "nan",
                                              "[",
                                              "]",
                                              "{",
                                              "}",
                                              ".",
                                              "=",
                                              "\\u0000",
                                              "\"\"\"",
                                              "/p1",
                                              "//",
                                              "\xFF"};
    const std::size_t at = Below(ioInput.size() + 1), length = Below(ioInput.size() - at + 1);
    switch (Below(8)) {
      case 0:
        if (at < ioInput.size()) ioInput[at] = static_cast<char>(random_());
        break;
      case 1:
        if (at < ioInput.size()) ioInput[at] = static_cast<char>(ioInput[at] ^ (1 << Below(8)));
        break;
      case 2:
        ioInput.erase(at, std::min<std::size_t>(length, 1 + Below(64)));
        break;
      case 3:
        ioInput.insert(at, Piece());
        break;
      case 4:
        ioInput.insert(at, kTokens[Below(std::size(kTokens))]);
        break;
      case 5:
        ioInput.insert(at, ioInput.substr(at, std::min<std::size_t>(length, 200)));
        break;
      case 6:
        ioInput.replace(at, std::min<std::size_t>(length, 40), Piece());
        break;
      default:
        ioInput.resize(at);
    }
  }

  std::vector<std::string> corpus_;
  std::mt19937 random_;
};

void RunOne(const std::string& inInput) {
  current = inInput;
  LLVMFuzzerTestOneInput(reinterpret_cast<const std::uint8_t*>(current.data()), current.size());
}

}  // namespace

int main(int inCount, char** inArguments) {
  const Options options = Parse(inCount, inArguments);
  artifactPath = options.artifactPrefix + "finding-" + std::to_string(getpid());
#ifdef __SANITIZE_ADDRESS__  // which reports all other ends itself
  __sanitizer_set_death_callback(KeepCurrent);
  signal(SIGABRT, KeepAtSignal);
#else
  for (const int deadly : {SIGABRT, SIGSEGV, SIGBUS, SIGFPE, SIGILL}) signal(deadly, KeepAtSignal);
#endif
  const std::vector<std::string> corpus = ReadCorpus(options.corpus);
  const auto end =
      std::chrono::steady_clock::now() + std::chrono::duration<double>(options.seconds);
  std::size_t executions = 0;
  for (const std::string& input : corpus) RunOne(input), ++executions;
  Mutator mutator(corpus, options.seed);
  while (std::chrono::steady_clock::now() < end) {
    RunOne(mutator.Next());
    ++executions;
  }
  std::printf("Done %zu runs, %zu inputs in the corpus\n", executions, corpus.size());
  return corpus.empty() && !options.corpus.empty() ? 1 : 0;
}
