#include "lyra/CommandLine.h"

namespace lyra {
namespace {

DeclaredVerb Declare(const Verb& inVerb, CLI::App& ioApp, OptionWords& ioWords) {
  CLI::App* app = ioApp.add_subcommand(inVerb.name, inVerb.summary);
  app->set_help_flag("-h,--help", "Print this help");
  app->group("Verbs");
  Arguments arguments(*app, ioWords);
  return {app, inVerb.declare(arguments)};
}

void ShapeHelp(CLI::App& ioApp) {
  ioApp.get_formatter()->label("SUBCOMMAND", "VERB");
  ioApp.get_formatter()->label("REQUIRED", "");
  ioApp.get_formatter()->column_width(20);
  ioApp.footer(
      "A FILE named \"-\" is standard input. \"lyra VERB --help\" explains a verb.\n"
      "Exit code: 0 done, 1 the input or output cannot be used, 2 wrong usage.");
}

}  // namespace

CommandLine::CommandLine() : app("Reads and shows the XML results of clash analyses.", "lyra") {
  app.set_help_flag("-h,--help", "Print this help");
  app.set_version_flag("--version", "lyra " LYRA_VERSION, "Print the version");
  app.add_option("--lang", language, "Language of the documents' words, before or after the verb")
      ->type_name("LANG");
  Arguments(app, words).Words("--lang", kLanguages);
  app.fallthrough();
  app.require_subcommand(1);
  ShapeHelp(app);
  for (const Verb& verb : Verbs()) verbs.push_back(Declare(verb, app, words));
}

}  // namespace lyra
