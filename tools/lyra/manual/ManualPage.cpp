#include "lyra/manual/CommandTable.h"

namespace lyra {
namespace {

/// A line of text that is no request and shows every character as it is.
std::string Roff(std::string inText) {
  inText = Replaced(std::move(inText), "\\", "\\e");
  for (const auto& [plain, roff] :
       {std::pair{"-", "\\-"}, {"'", "\\(aq"}, {"`", "\\(ga"}, {"^", "\\(ha"}, {"~", "\\(ti"}})
    inText = Replaced(std::move(inText), plain, roff);
  return inText.starts_with('.') ? "\\&" + inText : inText;
}

std::string Bold(const std::string& inText) { return "\\fB" + Roff(inText) + "\\fR"; }
std::string Italic(const std::string& inText) { return "\\fI" + Roff(inText) + "\\fR"; }

std::string Entry(const std::string& inTag, const std::string& inText) {
  return ".TP\n" + inTag + "\n" + Roff(inText) + "\n";
}

std::string OptionEntry(const OptionRow& inOption) {
  std::vector<std::string> names;
  for (const std::string& name : inOption.names) names.push_back(Bold(name));
  const std::string value = inOption.TakesValue() ? " " + Italic(inOption.value) : "";
  std::string text = inOption.help;
  if (inOption.isRequired) text += " (required)";
  return Entry(Joined(names, ", ") + value, text);
}

std::string VerbSynopsis(const VerbRow& inVerb) {
  std::string synopsis = Bold("lyra " + inVerb.name);
  for (const OptionRow& option : inVerb.options)
    if (option.isRequired)
      synopsis += " " + Bold(option.names.front()) + " " + Italic(option.value);
  synopsis += " [" + Italic("OPTION") + "]...";
  for (const PositionalRow& positional : inVerb.positionals)
    synopsis += " " + Italic(positional.name) + (positional.isRepeatable ? "..." : "");
  return synopsis + "\n";
}

std::string VerbPart(const VerbRow& inVerb) {
  std::string part =
      ".SS " + Roff(inVerb.name) + "\n" + Roff(inVerb.summary) + ".\n.PP\n" + VerbSynopsis(inVerb);
  for (const PositionalRow& positional : inVerb.positionals)
    part += Entry(Italic(positional.name), positional.help);
  for (const OptionRow& option : inVerb.options) part += OptionEntry(option);
  return part;
}

std::string Synopsis() {
  return ".SH SYNOPSIS\n" + Bold("lyra") + " [" + Italic("OPTION") + "]... " + Italic("VERB") +
         " [" + Italic("ARGUMENT") + "]...\n";
}

std::string Description(const CommandTable& inTable) {
  return ".SH DESCRIPTION\n" + Roff(inTable.description) + "\n" +
         Roff("A file named \"-\" is standard input, or standard output where one is written.\n") +
         Roff("Results go to standard output, everything else to standard error.\n") +
         Roff(
             "An output takes the place of an older file once it is whole. Where standard output "
             "fails after that, the exit status is 1 and the new file stays.\n");
}

std::string ExitStatus() {
  return ".SH EXIT STATUS\n" + Entry(Bold("0"), "Done, or passed.") +
         Entry(Bold("1"),
               "The input or the output cannot be used; of gate also: nothing could be judged.") +
         Entry(Bold("2"), "Wrong usage.") +
         Entry(Bold("3"),
               "The answer is no: the gate failed, diff was given --exit-code and there are "
               "differences, or a merge of reviews has conflicts.");
}

std::string Environment() {
  return ".SH ENVIRONMENT\n" +
         Entry(Bold("ZOR_LANG"), "Language of the documents' words, unless --lang gives one.") +
         Entry(Bold("ZOR_SETTINGS_PATH"), "Folders of settings, with colons between them.") +
         Entry(Bold("ZOR_CATALOGUE_PATH"), "Folders of message catalogues, likewise.") +
         Entry(Bold("COLUMNS"), "Width to which tables are cut on a terminal.") +
         Entry(Bold("NO_COLOR"), "When set, headers on a terminal are not bold.");
}

std::string Examples() {
  std::string examples = ".SH EXAMPLES\n";
  for (const auto& [line, text] :
       {std::pair{"lyra list result.xml --type clash --status relevant",
                  "The clashes of a result that matter."},
        {"lyra show result.xml 3 --json | jq .products", "The two products of interference 3."},
        {"lyra diff last-week.xml today.xml --exit-code",
         "What became of the interferences; fails when anything differs."},
        {"lyra gate today.xml --policy policy.toml --baseline last-week.xml --report "
         "junit=gate.xml",
         "Fails when today\'s result may not pass, with a report for the build server."},
        {"lyra publish result.xml --model assembly.stp -o page",
         "A page with pictures, page/index.html."}})
    examples += Entry(Bold(line), text);
  return examples;
}

}  // namespace

std::string ManualPage(const CommandTable& inTable) {
  std::string page = ".TH LYRA 1 \"\" \"" + Roff(inTable.version) + "\" \"User Commands\"\n" +
                     ".SH NAME\nlyra \\- read and show the XML results of clash analyses\n" +
                     Synopsis() + Description(inTable) + ".SH OPTIONS\n";
  for (const OptionRow& option : inTable.options) page += OptionEntry(option);
  page += ".SH VERBS\n";
  for (const VerbRow& verb : inTable.verbs) page += VerbPart(verb);
  return page + ExitStatus() + Environment() + Examples();
}

std::string Joined(const std::vector<std::string>& inTexts, std::string_view inBetween) {
  std::string joined;
  for (const std::string& text : inTexts) {
    if (!joined.empty()) joined += inBetween;
    joined += text;
  }
  return joined;
}

std::string Replaced(std::string inText, std::string_view inOld, std::string_view inNew) {
  for (std::size_t at = inText.find(inOld); at != std::string::npos;
       at = inText.find(inOld, at + inNew.size()))
    inText.replace(at, inOld.size(), inNew);
  return inText;
}

std::string Escaped(std::string_view inText, std::string_view inCharacters) {
  std::string escaped;
  for (const char character : inText) {
    if (inCharacters.find(character) != std::string_view::npos) escaped += '\\';
    escaped += character;
  }
  return escaped;
}

}  // namespace lyra
