#include "lyra/RunLyra.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <new>
#include <string>
#include <vector>

#include "foundation/Process.h"
#include "foundation/TerminationSignals.h"
#include "lyra/CommandErrors.h"
#include "lyra/CommandLine.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/terminal/SafeText.h"
#include "lyra/terminal/Terminal.h"

namespace lyra {
namespace {

constexpr int kUnusable = 1;
constexpr int kWrongUsage = 2;

/// Writes one line on stderr; a document's or a path's line feeds do not make it two.
void Complain(const std::string& inReason) { WriteError("lyra: " + Printable(inReason) + "\n"); }

int ComplainOfUsage(const std::string& inReason) {
  Complain(inReason);
  std::fputs("see lyra --help\n", stderr);
  return kWrongUsage;
}

// The parser calls a word that is no verb a missing subcommand.
std::string UsageReason(const CLI::App& inApp, const CLI::ParseError& inError) {
  const std::vector<CLI::App*> chosen = inApp.get_subcommands();
  if (!chosen.empty()) return chosen.front()->get_name() + ": " + inError.what();
  const std::vector<std::string> unread = inApp.remaining();
  if (unread.empty()) return "a verb is missing";
  const bool isOption = unread.front().starts_with('-');
  return (isOption ? "unknown option \"" : "unknown verb \"") + unread.front() + "\"";
}

/// Before a verb only options may stand, also where help is asked for. @return empty without one.
std::string WordInPlaceOfVerb(const CLI::App& inApp) {
  if (!inApp.get_subcommands().empty()) return {};
  for (const std::string& word : inApp.remaining())
    if (!word.starts_with('-')) return word;
  return {};
}

int Act(const std::vector<DeclaredVerb>& inVerbs, Output& ioOutput) {
  for (const DeclaredVerb& verb : inVerbs)
    if (verb.app->parsed()) return verb.act(ioOutput);
  return kWrongUsage;
}

/// What follows the command's name, the last word first, as the parser takes them.
std::vector<std::string> WordsForParser(int inCount, char** inArguments) {
  std::vector<std::string> words = ZORFoundation::WordsOfCommandLine(inCount, inArguments);
  std::ranges::reverse(words);
  if (!words.empty()) words.pop_back();
  return words;
}

int ParseAndAct(int inCount, char** inArguments, Output& ioOutput) {
  CommandLine line;
  CLI::App& app = line.app;
  try {
    app.parse(WordsForParser(inCount, inArguments));
  } catch (const CLI::CallForHelp&) {
    if (const std::string word = WordInPlaceOfVerb(app); !word.empty())
      return ComplainOfUsage("unknown verb \"" + word + "\"");
    ioOutput.Write(app.help());
    return 0;
  } catch (const CLI::CallForVersion& version) {
    ioOutput.Write(std::string(version.what()) + "\n");
    return 0;
  } catch (const CLI::ParseError& error) {
    return ComplainOfUsage(UsageReason(app, error));
  }
  ChooseLanguage(line.language);
  return Act(line.verbs, ioOutput);
}

std::terminate_handler usualTermination = std::abort;

void ComplainOfMemory() { std::fputs("lyra: there is not enough memory\n", stderr); }

volatile bool hasLackedMemory = false;

[[noreturn]] void NoteLackOfMemory() {
  hasLackedMemory = true;
  throw std::bad_alloc();
}

// The parser of the command line and the standard library allocate in functions that may raise
// nothing.
[[noreturn]] void ReportAndEnd() {
  if (!hasLackedMemory) usualTermination();  // a mistake of ours, which is to be seen
  ComplainOfMemory();
  ZORFoundation::RemoveUnfinishedFiles();
  std::_Exit(kUnusable);
}

int RunAndReport(int inCount, char** inArguments) {
  PrepareStreams();
  ZORFoundation::HandleTerminationSignals();
  try {
    Output output(stdout);
    const int code = ParseAndAct(inCount, inArguments, output);
    output.Finish();
    return code;
  } catch (const ReaderGone&) {
    return 0;
  } catch (const UsageError& error) {
    return ComplainOfUsage(error.what());
  } catch (const ZORFoundation::Interrupted& interrupted) {
    ZORFoundation::EndBySignal(interrupted.signal);
  } catch (const std::bad_alloc&) {
    throw;
  } catch (const std::exception& error) {
    Complain(error.what());
  }
  return kUnusable;
}

}  // namespace

// Reporting an error may also lack memory; these lines need none.
int RunLyra(int inCount, char** inArguments) {
  usualTermination = std::set_terminate(ReportAndEnd);
  std::set_new_handler(NoteLackOfMemory);
  try {
    return RunAndReport(inCount, inArguments);
  } catch (const std::bad_alloc&) {
    ComplainOfMemory();
    return kUnusable;
  }
}

}  // namespace lyra
