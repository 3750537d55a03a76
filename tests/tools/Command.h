// Running the command as a program.
#ifndef ZOR_TESTS_TOOLS_COMMAND_H
#define ZOR_TESTS_TOOLS_COMMAND_H

#include <string>
#include <vector>

/// What a run of the program left behind.
struct CommandResult {
  int code;  ///< exit code, or minus the signal that ended it
  std::string out, error;
};

/// The built command.
extern const std::string kLyraProgram;

/// Runs the built command in the source directory, with the tests' environment.
CommandResult RunCommand(const std::vector<std::string>& inArguments,
                         const std::string& inStandardInput = {});
CommandResult RunCommandIn(const std::string& inFolder,
                           const std::vector<std::string>& inArguments);
/// Runs a shell command line there; "lyra" is the command.
CommandResult RunShell(const std::string& inLine);

/// A directory of the test's own that goes with this object.
class TemporaryDirectory {
 public:
  TemporaryDirectory();
  ~TemporaryDirectory();
  TemporaryDirectory(const TemporaryDirectory&) = delete;
  TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

  std::string Path(const std::string& inName) const { return path_ + "/" + inName; }
  /// @return the path of the new file.
  std::string Write(const std::string& inName, const std::string& inBytes) const;

 private:
  std::string path_;
};

std::string ReadFile(const std::string& inPath);
/// The clash results among the samples, relative to the source directory.
std::vector<std::string> Samples();

#endif
