#include "lyra/manual/Papers.h"

namespace lyra {
namespace {

std::string Quoted(const std::string& inText) { return "'" + Replaced(inText, "'", "'\\''") + "'"; }

std::string Action(ValueKind inKind, const std::vector<std::string>& inWords) {
  if (!inWords.empty()) return "(" + Joined(inWords, " ") + ")";
  if (inKind == ValueKind::kFolder) return "_files -/";
  return inKind == ValueKind::kFile ? "_files" : " ";
}

/// One option in the notation of _arguments: which others it shuts out, its names, what it means,
/// what its value is.
std::string OptionSpec(const OptionRow& inOption) {
  const std::string before = inOption.isRepeatable ? "*" : "(" + Joined(inOption.names, " ") + ")";
  std::string meaning = "[" + Escaped(inOption.help, "[]:\\") + "]";
  if (inOption.TakesValue())
    meaning += ":" + inOption.value + ":" + Action(inOption.kind, inOption.words);
  std::vector<std::string> specs;
  for (const std::string& name : inOption.names) {
    const std::string joint = !inOption.TakesValue() ? "" : name.starts_with("--") ? "=" : "+";
    specs.push_back(Quoted(before + name + joint + meaning));
  }
  return Joined(specs, " ");
}

std::string PositionalSpec(const PositionalRow& inPositional) {
  const std::string place = inPositional.isRepeatable ? "*:" : ":";
  return Quoted(place + inPositional.name + ":" + Action(inPositional.kind, {}));
}

std::string VerbCase(const VerbRow& inVerb) {
  std::string text = "        " + inVerb.name + ")\n          _arguments";
  for (const OptionRow& option : inVerb.options) text += " \\\n            " + OptionSpec(option);
  for (const PositionalRow& positional : inVerb.positionals)
    text += " \\\n            " + PositionalSpec(positional);
  return text + "\n          ;;\n";
}

}  // namespace

std::string ZshCompletion(const CommandTable& inTable) {
  std::string text =
      "#compdef lyra\n# Completion of lyra for zsh.\n_lyra() {\n"
      "  local curcontext=$curcontext state line\n  typeset -A opt_args\n"
      "  local -a verbs=(\n";
  for (const VerbRow& verb : inTable.verbs)
    text += "    " + Quoted(verb.name + ":" + Escaped(verb.summary, ":\\")) + "\n";
  text += "  )\n  _arguments -C";
  for (const OptionRow& option : inTable.options) text += " \\\n    " + OptionSpec(option);
  text +=
      " \\\n    ':verb:->verb' \\\n    '*::argument:->arguments' && return\n"
      "  case $state in\n    verb) _describe verb verbs ;;\n    arguments)\n"
      "      case $words[1] in\n";
  for (const VerbRow& verb : inTable.verbs) text += VerbCase(verb);
  return text + "      esac\n      ;;\n  esac\n}\n_lyra \"$@\"\n";
}

}  // namespace lyra
