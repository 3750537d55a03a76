#include "ChildProcess.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <stdexcept>

namespace {
std::string ReadToEnd(int inDescriptor) {
  std::string text;
  char buffer[4096];
  for (ssize_t count = 0; (count = read(inDescriptor, buffer, sizeof buffer)) > 0;)
    text.append(buffer, static_cast<std::size_t>(count));
  return text;
}

double Milliseconds(const timeval& inTime) {
  return 1e3 * static_cast<double>(inTime.tv_sec) + 1e-3 * static_cast<double>(inTime.tv_usec);
}

pid_t Start(const std::vector<std::string>& inCommand, int inOutput) {
  std::vector<std::string> words = inCommand;
  std::vector<char*> arguments;
  for (std::string& word : words) arguments.push_back(word.data());
  arguments.push_back(nullptr);

  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, STDIN_FILENO, "/dev/null", O_RDONLY, 0);
  posix_spawn_file_actions_adddup2(&actions, inOutput, STDOUT_FILENO);
  pid_t child = 0;
  const int error =
      posix_spawnp(&child, arguments[0], &actions, nullptr, arguments.data(), environ);
  posix_spawn_file_actions_destroy(&actions);
  if (error != 0) throw std::runtime_error("cannot start " + inCommand[0]);
  return child;
}
}  // namespace

ChildOutcome RunChild(const std::vector<std::string>& inCommand) {
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) throw std::runtime_error("no pipe");
  const auto start = std::chrono::steady_clock::now();
  const pid_t child = Start(inCommand, ends[1]);
  close(ends[1]);
  ChildOutcome outcome{};
  outcome.output = ReadToEnd(ends[0]);
  close(ends[0]);
  int status = 0;
  rusage usage{};
  wait4(child, &status, 0, &usage);
  outcome.milliseconds =
      std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
  outcome.processorMilliseconds = Milliseconds(usage.ru_utime) + Milliseconds(usage.ru_stime);
  outcome.peakMegabytes = static_cast<double>(usage.ru_maxrss) / 1024;
  outcome.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
  return outcome;
}
