#include "lyra/RunLyra.h"

#include <CLI/CLI.hpp>
#include <csignal>
#include <cstdio>
#include <exception>
#include <new>
#include <string>
#include <utility>
#include <vector>

#include "lyra/CommandErrors.h"
#include "lyra/Language.h"
#include "lyra/SafeText.h"
#include "lyra/Verbs.h"

namespace lyra {
namespace {

constexpr int kUnusable = 1;
constexpr int kWrongUsage = 2;

/// Writes one line on stderr; a document's or a path's line feeds do not make it two.
void Complain(const std::string& inReason) {
  std::fprintf(stderr, "lyra: %s\n", Printable(inReason).c_str());
}

int ComplainOfUsage(const std::string& inReason) {
  Complain(inReason);
  std::fputs("see lyra --help\n", stderr);
  return kWrongUsage;
}

/// A verb's arguments as they are read, and what is then done with them.
struct DeclaredVerb {
  CLI::App* app;
  VerbAction act;
};

std::vector<DeclaredVerb> DeclareVerbs(CLI::App& ioApp) {
  std::vector<DeclaredVerb> declared;
  for (const Verb& verb : Verbs()) {
    CLI::App* app = ioApp.add_subcommand(verb.name, verb.summary);
    app->set_help_flag("-h,--help", "Print this help");
    app->group("Verbs");
    Arguments arguments(*app);
    declared.push_back({app, verb.declare(arguments)});
  }
  return declared;
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

int Act(const std::vector<DeclaredVerb>& inVerbs, Output& ioOutput) {
  for (const DeclaredVerb& verb : inVerbs)
    if (verb.app->parsed()) return verb.act(ioOutput);
  return kWrongUsage;
}

int ParseAndAct(int inCount, char** inArguments, Output& ioOutput) {
  CLI::App app("Reads and shows the XML results of clash analyses.", "lyra");
  app.set_help_flag("-h,--help", "Print this help");
  app.set_version_flag("--version", "lyra " LYRA_VERSION, "Print the version");
  std::string language;
  app.add_option("--lang", language, "Language of the documents' words, before or after the verb")
      ->type_name("LANG");
  app.fallthrough();
  app.require_subcommand(1);
  app.get_formatter()->label("SUBCOMMAND", "VERB");
  app.get_formatter()->label("REQUIRED", "");
  app.get_formatter()->column_width(20);
  app.footer(
      "A FILE named \"-\" is standard input. \"lyra VERB --help\" explains a verb.\n"
      "Exit code: 0 done, 1 the input or output cannot be used, 2 wrong usage.");
  const std::vector<DeclaredVerb> verbs = DeclareVerbs(app);
  try {
    app.parse(inCount, inArguments);
  } catch (const CLI::CallForHelp&) {
    ioOutput.Write(app.help());
    return 0;
  } catch (const CLI::CallForVersion& version) {
    ioOutput.Write(std::string(version.what()) + "\n");
    return 0;
  } catch (const CLI::ParseError& error) {
    return ComplainOfUsage(UsageReason(app, error));
  }
  ChooseLanguage(language);
  return Act(verbs, ioOutput);
}

}  // namespace

int RunLyra(int inCount, char** inArguments) {
  // A reader that goes away shows as a failed write, so that work can stop in good order.
  std::signal(SIGPIPE, SIG_IGN);
  std::signal(SIGXFSZ, SIG_IGN);  // likewise a file that may not grow any further
  try {
    Output output(stdout);
    const int code = ParseAndAct(inCount, inArguments, output);
    output.Finish();
    return code;
  } catch (const ReaderGone&) {
    return 0;
  } catch (const UsageError& error) {
    return ComplainOfUsage(error.what());
  } catch (const std::bad_alloc&) {
    Complain("there is not enough memory");
  } catch (const std::exception& error) {
    Complain(error.what());
  }
  return kUnusable;
}

}  // namespace lyra
