// What a verb can be given on the command line.
#ifndef ZOR_TOOLS_LYRA_ARGUMENTS_H
#define ZOR_TOOLS_LYRA_ARGUMENTS_H

#include <optional>
#include <string>
#include <vector>

namespace CLI {
class App;
}

namespace lyra {

/// Declares the arguments of one verb. The variables are filled when the command line is read and
/// must live until then; what is not given leaves its variable as it is.
class Arguments {
 public:
  explicit Arguments(CLI::App& ioApp) : app_(ioApp) {}

  // Required, by position
  void Positional(const char* inName, std::string& outText, const char* inHelp);
  void Positionals(const char* inName, std::vector<std::string>& outTexts, const char* inHelp,
                   int inFewest = 1);
  void PositionalNumber(const char* inName, long long& outNumber, const char* inHelp);

  // Optional, by name such as "--type" or "-o,--output"
  void Flag(const char* inNames, bool& outGiven, const char* inHelp);
  void Text(const char* inNames, const char* inValue, std::string& outText, const char* inHelp);
  /// May be given several times.
  void Texts(const char* inNames, const char* inValue, std::vector<std::string>& outTexts,
             const char* inHelp);
  void RequiredText(const char* inNames, const char* inValue, std::string& outText,
                    const char* inHelp);
  void Number(const char* inNames, const char* inValue, std::optional<long long>& outNumber,
              const char* inHelp);
  /// The language of the message catalogues, for verbs that translate words of documents.
  void Language(std::string& outLanguage);

 private:
  CLI::App& app_;
};

}  // namespace lyra

#endif
