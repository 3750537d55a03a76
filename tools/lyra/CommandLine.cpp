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
      "Exit code: 0 done, 1 the input or output cannot be used, 2 wrong usage, 3 the answer is "
      "no.");
}

}  // namespace

std::span<const Verb> Verbs() {
  static constexpr Verb kVerbs[] = {
      {"info", "Say what documents are and what they hold", DeclareInfo},
      {"list", "List the interferences of a result, a row each", DeclareList},
      {"show", "Show everything about one interference", DeclareShow},
      {"components", "List the components of a component list", DeclareComponents},
      {"specs", "List the pairs of products that a computation was asked to check", DeclareSpecs},
      {"links", "List the clash documents that a federator document links", DeclareLinks},
      {"convert", "Write a whole document in another format", DeclareConvert},
      {"diff", "Say what is new, changed or resolved since an older result", DeclareDiff},
      {"carry", "Take the decisions of an older result over to a newer one", DeclareCarry},
      {"group", "Show which interferences belong together", DeclareGroup},
      {"review", "Decide in bulk, take in a review file, merge reviews", DeclareReview},
      {"rules", "Settle what is accepted by design", DeclareRules},
      {"gate", "Say whether a result may pass, with reports for build servers", DeclareGate},
      {"merge", "Merge clash documents into one", DeclareMerge},
      {"federate", "Write a federator document that links clash documents", DeclareFederate},
      {"report", "Write a result as an XML report with a style sheet", DeclareReport},
      {"publish", "Write a page of a result, with pictures of a CAD model", DeclarePublish},
      {"extract", "Give back the result from which a page was made", DeclareExtract},
      {"detect", "Find the interferences of a CAD model", DeclareDetect},
      {"gather", "Put the shares of publish or detect together", DeclareGather},
      {"tree", "List the products of a CAD model", DeclareTree},
      {"render", "Draw a picture of a CAD model", DeclareRender},
      {"path", "Say which path a logical name stands for", DeclarePath},
      {"escape", "Escape a text for XML", DeclareEscape},
      {"filename", "Make a text fit for the name of a file", DeclareFilename},
  };
  return kVerbs;
}

CommandLine::CommandLine() : app("Reads and shows the XML results of clash analyses.", "lyra") {
  app.allow_windows_style_options(false);  // a path there may begin with a slash too
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
