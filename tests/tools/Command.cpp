#include "tools/Command.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <random>
#include <sstream>
#include <stdexcept>

#include "foundation/NativePath.h"
#include "tools/RunProgram.h"

namespace fs = std::filesystem;

const std::string kLyraProgram = LYRA_PROGRAM;

namespace {
CommandResult Run(const std::vector<std::string>& inWords, const std::string& inStandardInput,
                  const std::string& inFolder = ZOR_SOURCE_DIR) {
  const TemporaryDirectory streams;
  const ProgramStreams files = {streams.Write("in", inStandardInput), streams.Path("out"),
                                streams.Path("error")};
  const int code = RunProgram(inWords, inFolder, files);
  return {code, ReadFile(files.out), ReadFile(files.error)};
}

std::vector<std::string> WordsWith(const std::vector<std::string>& inArguments) {
  std::vector<std::string> words = {kLyraProgram};
  words.insert(words.end(), inArguments.begin(), inArguments.end());
  return words;
}
}  // namespace

CommandResult RunCommand(const std::vector<std::string>& inArguments,
                         const std::string& inStandardInput) {
  return Run(WordsWith(inArguments), inStandardInput);
}

CommandResult RunCommandIn(const std::string& inFolder,
                           const std::vector<std::string>& inArguments) {
  return Run(WordsWith(inArguments), {}, inFolder);
}

CommandResult RunShell(const std::string& inLine) {
  return Run({"/bin/bash", "-c", "PATH='" ZOR_BINARY_DIR "/bin':$PATH; " + inLine}, {});
}

TemporaryDirectory::TemporaryDirectory() {
  do
    path_ = (fs::temp_directory_path() / ("lyra_test_" + std::to_string(std::random_device()())))
                .generic_string();
  while (!fs::create_directory(path_));
}

TemporaryDirectory::~TemporaryDirectory() {
  std::error_code ignored;
  fs::remove_all(path_, ignored);
}

std::string TemporaryDirectory::Write(const std::string& inName, const std::string& inBytes) const {
  std::ofstream stream(ZORFoundation::NativePath(Path(inName)), std::ios::binary);
  stream << inBytes;
  if (!stream.flush()) throw std::runtime_error("cannot write " + Path(inName));
  return Path(inName);
}

std::string ReadFile(const std::string& inPath) {
  std::ifstream stream(ZORFoundation::NativePath(inPath), std::ios::binary);
  if (!stream) throw std::runtime_error("cannot read " + inPath);
  std::ostringstream bytes;
  bytes << stream.rdbuf();
  return bytes.str();
}

std::vector<std::string> Samples() {
  std::vector<std::string> samples;
  for (const auto& entry : fs::directory_iterator(ZOR_SOURCE_DIR "/samples"))
    if (entry.path().string().ends_with(".clash.xml"))
      samples.push_back("samples/" + entry.path().filename().string());
  std::sort(samples.begin(), samples.end());
  return samples;
}
