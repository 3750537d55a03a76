#include "tools/RunProgram.h"

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <stdexcept>

int RunProgram(std::vector<std::string> inWords, const std::string& inFolder,
               const ProgramStreams& inStreams) {
  std::vector<char*> words;
  for (std::string& word : inWords) words.push_back(word.data());
  words.push_back(nullptr);
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, 0, inStreams.in.c_str(), O_RDONLY, 0);
  int stream = 0;
  for (const std::string& path : {inStreams.out, inStreams.error})
    posix_spawn_file_actions_addopen(&actions, ++stream, path.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                     0600);
  posix_spawn_file_actions_addchdir_np(&actions, inFolder.c_str());
  pid_t process = 0;
  const int failure = posix_spawn(&process, words[0], &actions, nullptr, words.data(), environ);
  posix_spawn_file_actions_destroy(&actions);
  if (failure != 0) throw std::runtime_error("cannot run " + inWords[0]);
  int status = 0;
  waitpid(process, &status, 0);
  return WIFSIGNALED(status) ? -WTERMSIG(status) : WEXITSTATUS(status);
}
