#include "lyra/manual/Papers.h"

namespace lyra {
namespace {

constexpr const char* kHead = R"(# Completion of lyra for bash.
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

std::string ValueOptions(const CommandTable& inTable) {
  std::vector<std::string> names;
  for (const OptionRow& option : inTable.options)
    if (option.TakesValue()) names.insert(names.end(), option.names.begin(), option.names.end());
  return Joined(names, " | ");
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

}  // namespace

std::string BashCompletion(const CommandTable& inTable) {
  return Replaced(kHead, "@VALUE_OPTIONS@", ValueOptions(inTable)) +
         "  [[ $separator ]] && before=\n  case $verb:$before in\n" + ValueCases(inTable) +
         "    *)\n      [[ $separator ]] && word=/\n      case $verb:$word in\n" +
         Replaced(WordCases(inTable), "\n      ", "\n        ").insert(0, "  ") +
         "      esac\n      ;;\n  esac\n" + kTail;
}

}  // namespace lyra
