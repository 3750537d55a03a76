#include "lyra/manual/CommandTable.h"

namespace lyra {
namespace {

constexpr const char* kBashHead = R"(# Completion of lyra for bash.
_lyra() {
  local word=${COMP_WORDS[COMP_CWORD]} before= verb= words= kind= at=1 separator=
  ((COMP_CWORD > 0)) && before=${COMP_WORDS[COMP_CWORD - 1]}
  # bash makes three words of --option=value.
  if [[ $word == = ]]; then
    word=
  elif [[ $before == = ]] && ((COMP_CWORD > 1)); then
    before=${COMP_WORDS[COMP_CWORD - 2]}
  fi
  COMPREPLY=()
  while ((at < COMP_CWORD)); do
    case ${COMP_WORDS[at]} in
      --) separator=1 ;;
      @VALUE_OPTIONS@)
        ((++at))
        [[ ${COMP_WORDS[at]} != = ]] || ((++at))
        ;;
      -* | =) ;;
      *) [[ $verb ]] || verb=${COMP_WORDS[at]} ;;
    esac
    ((++at))
  done
)";

constexpr const char* kTail = R"(  if [[ $kind == file ]]; then
    compopt -o default
  elif [[ $kind == folder ]]; then
    compopt -o dirnames
  elif [[ $words ]]; then
    mapfile -t COMPREPLY < <(compgen -W "$words" -- "$word")
  fi
}
complete -F _lyra lyra
)";

const char* KindWord(ValueKind inKind) {
  if (inKind == ValueKind::kFile) return "file";
  return inKind == ValueKind::kFolder ? "folder" : "text";
}

std::string OptionNames(const std::vector<OptionRow>& inOptions) {
  std::vector<std::string> names;
  for (const OptionRow& option : inOptions)
    names.insert(names.end(), option.names.begin(), option.names.end());
  return Joined(names, " ");
}

/// The case of a value that follows the name of an option.
std::string ValueCase(const std::string& inVerb, const OptionRow& inOption) {
  std::vector<std::string> patterns;
  for (const std::string& name : inOption.names) patterns.push_back(inVerb + ":" + name);
  const std::string answer = inOption.words.empty() ? std::string("kind=") + KindWord(inOption.kind)
                                                    : "words='" + Joined(inOption.words, " ") + "'";
  return "    " + Joined(patterns, " | ") + ") " + answer + " ;;\n";
}

std::string ValueCases(const CommandTable& inTable) {
  std::string cases;
  for (const OptionRow& option : inTable.options)
    if (option.TakesValue()) cases += ValueCase("", option);
  for (const VerbRow& verb : inTable.verbs)
    for (const OptionRow& option : verb.options)
      if (option.TakesValue()) cases += ValueCase(verb.name, option);
  return cases;
}

std::string ValueOptions(const CommandTable& inTable, std::string_view inBetween) {
  std::vector<std::string> names;
  for (const OptionRow& option : inTable.options)
    if (option.TakesValue()) names.insert(names.end(), option.names.begin(), option.names.end());
  return Joined(names, inBetween);
}

std::string VerbNames(const CommandTable& inTable) {
  std::vector<std::string> names;
  for (const VerbRow& verb : inTable.verbs) names.push_back(verb.name);
  return Joined(names, " ");
}

/// What stands where no option awaits its value: verbs or options first, then options or files.
std::string WordCases(const CommandTable& inTable) {
  std::string cases = "      :-*) words='" + OptionNames(inTable.options) +
                      "' ;;\n      :*) words='" + VerbNames(inTable) + "' ;;\n";
  for (const VerbRow& verb : inTable.verbs) {
    cases += "      " + verb.name + ":-*) words='" + OptionNames(verb.options) + "' ;;\n";
    if (verb.TakesFiles()) cases += "      " + verb.name + ":*) kind=file ;;\n";
  }
  return cases;
}

std::string ZshQuoted(const std::string& inText) {
  return "'" + Replaced(inText, "'", "'\\''") + "'";
}

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
    specs.push_back(ZshQuoted(before + name + joint + meaning));
  }
  return Joined(specs, " ");
}

std::string PositionalSpec(const PositionalRow& inPositional) {
  const std::string place = inPositional.isRepeatable ? "*:" : ":";
  return ZshQuoted(place + inPositional.name + ":" + Action(inPositional.kind, {}));
}

std::string VerbCase(const VerbRow& inVerb) {
  std::string text = "        " + inVerb.name + ")\n          _arguments";
  for (const OptionRow& option : inVerb.options) text += " \\\n            " + OptionSpec(option);
  for (const PositionalRow& positional : inVerb.positionals)
    text += " \\\n            " + PositionalSpec(positional);
  return text + "\n          ;;\n";
}

constexpr const char* kFishHead = R"(# Completion of lyra for fish.
function __lyra_verb_is --description 'Whether this is the verb; the empty word: there is none yet'
    set -l verb ''
    set -l is_value 0
    for word in (commandline -opc)[2..-1]
        if test $is_value = 1
            set is_value 0
            continue
        end
        switch $word
            case @VALUE_OPTIONS@
                set is_value 1
            case '-*'
            case '*'
                set verb $word
                break
        end
    end
    test "$verb" = "$argv[1]"
end
complete -c lyra -f
)";

std::string FishQuoted(const std::string& inText) { return "'" + Escaped(inText, "'\\") + "'"; }

std::string LineFor(const std::string& inVerb, const std::string& inRest) {
  return "complete -c lyra -n " + FishQuoted("__lyra_verb_is " + (inVerb.empty() ? "''" : inVerb)) +
         " " + inRest + "\n";
}

std::string ValueArguments(const OptionRow& inOption) {
  if (!inOption.TakesValue()) return "";
  if (!inOption.words.empty()) return " -x -a " + FishQuoted(Joined(inOption.words, " "));
  if (inOption.kind == ValueKind::kFolder) return " -x -a '(__fish_complete_directories)'";
  return inOption.kind == ValueKind::kFile ? " -r -F" : " -x";
}

std::string OptionLine(const std::string& inVerb, const OptionRow& inOption) {
  std::string names;
  for (const std::string& name : inOption.names)
    names += name.starts_with("--") ? " -l " + name.substr(2) : " -s " + name.substr(1);
  return LineFor(inVerb,
                 names.substr(1) + ValueArguments(inOption) + " -d " + FishQuoted(inOption.help));
}

}  // namespace

std::string BashCompletion(const CommandTable& inTable) {
  return Replaced(kBashHead, "@VALUE_OPTIONS@", ValueOptions(inTable, " | ")) +
         "  [[ $separator ]] && before=\n  case $verb:$before in\n" + ValueCases(inTable) +
         "    *)\n      [[ $separator ]] && word=/\n      case $verb:$word in\n" +
         Replaced(WordCases(inTable), "\n      ", "\n        ").insert(0, "  ") +
         "      esac\n      ;;\n  esac\n" + kTail;
}

std::string ZshCompletion(const CommandTable& inTable) {
  std::string text =
      "#compdef lyra\n# Completion of lyra for zsh.\n_lyra() {\n"
      "  local curcontext=$curcontext state line\n  typeset -A opt_args\n"
      "  local -a verbs=(\n";
  for (const VerbRow& verb : inTable.verbs)
    text += "    " + ZshQuoted(verb.name + ":" + Escaped(verb.summary, ":\\")) + "\n";
  text += "  )\n  _arguments -C";
  for (const OptionRow& option : inTable.options) text += " \\\n    " + OptionSpec(option);
  text +=
      " \\\n    ':verb:->verb' \\\n    '*::argument:->arguments' && return\n"
      "  case $state in\n    verb) _describe verb verbs ;;\n    arguments)\n"
      "      case $words[1] in\n";
  for (const VerbRow& verb : inTable.verbs) text += VerbCase(verb);
  return text + "      esac\n      ;;\n  esac\n}\n_lyra \"$@\"\n";
}

std::string FishCompletion(const CommandTable& inTable) {
  std::string text = Replaced(kFishHead, "@VALUE_OPTIONS@", ValueOptions(inTable, " "));
  for (const OptionRow& option : inTable.options) text += OptionLine("", option);
  for (const VerbRow& verb : inTable.verbs)
    text += LineFor("", "-a " + verb.name + " -d " + FishQuoted(verb.summary));
  for (const VerbRow& verb : inTable.verbs) {
    for (const OptionRow& option : verb.options) text += OptionLine(verb.name, option);
    if (verb.TakesFiles()) text += LineFor(verb.name, "-F");
  }
  return text;
}

}  // namespace lyra
