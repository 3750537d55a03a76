#include "tools/Command.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>

namespace fs = std::filesystem;

namespace {
const std::string kProgram = ZOR_BINARY_DIR "/bin/lyra";

int RunProgram(std::vector<std::string> inWords, const TemporaryDirectory& inStreams) {
  std::vector<char*> words;
  for (std::string& word : inWords) words.push_back(word.data());
  words.push_back(nullptr);
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  const std::string in = inStreams.Path("in"), out = inStreams.Path("out"),
                    error = inStreams.Path("error");
  posix_spawn_file_actions_addopen(&actions, 0, in.c_str(), O_RDONLY, 0);
  posix_spawn_file_actions_addopen(&actions, 1, out.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
  posix_spawn_file_actions_addopen(&actions, 2, error.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
  posix_spawn_file_actions_addchdir_np(&actions, ZOR_SOURCE_DIR);
  pid_t process = 0;
  const int failure = posix_spawn(&process, words[0], &actions, nullptr, words.data(), environ);
  posix_spawn_file_actions_destroy(&actions);
  if (failure != 0) throw std::runtime_error("cannot run " + inWords[0]);
  int status = 0;
  waitpid(process, &status, 0);
  return WIFSIGNALED(status) ? -WTERMSIG(status) : WEXITSTATUS(status);
}

CommandResult Run(const std::vector<std::string>& inWords, const std::string& inStandardInput) {
  const TemporaryDirectory streams;
  streams.Write("in", inStandardInput);
  const int code = RunProgram(inWords, streams);
  return {code, ReadFile(streams.Path("out")), ReadFile(streams.Path("error"))};
}
}  // namespace

CommandResult RunCommand(const std::vector<std::string>& inArguments,
                         const std::string& inStandardInput) {
  std::vector<std::string> words = {kProgram};
  words.insert(words.end(), inArguments.begin(), inArguments.end());
  return Run(words, inStandardInput);
}

CommandResult RunShell(const std::string& inLine) {
  return Run({"/bin/bash", "-c", "PATH='" ZOR_BINARY_DIR "/bin':$PATH; " + inLine}, {});
}

TemporaryDirectory::TemporaryDirectory() {
  std::string pattern = (fs::temp_directory_path() / "lyra_test_XXXXXX").string();
  if (mkdtemp(pattern.data()) == nullptr) throw std::runtime_error("no temporary directory");
  path_ = pattern;
}

TemporaryDirectory::~TemporaryDirectory() {
  std::error_code ignored;
  fs::remove_all(path_, ignored);
}

std::string TemporaryDirectory::Write(const std::string& inName, const std::string& inBytes) const {
  std::ofstream stream(Path(inName), std::ios::binary);
  stream << inBytes;
  if (!stream.flush()) throw std::runtime_error("cannot write " + Path(inName));
  return Path(inName);
}

std::string ReadFile(const std::string& inPath) {
  std::ifstream stream(inPath, std::ios::binary);
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
