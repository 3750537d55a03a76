#include "lyra/manual/Papers.h"

namespace lyra {
namespace {

constexpr const char* kHead = R"(# Completion of lyra for fish.
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

std::string Quoted(const std::string& inText) { return "'" + Escaped(inText, "'\\") + "'"; }

std::string ValueOptions(const CommandTable& inTable) {
  std::vector<std::string> names;
  for (const OptionRow& option : inTable.options)
    if (option.TakesValue()) names.insert(names.end(), option.names.begin(), option.names.end());
  return Joined(names, " ");
}

std::string LineFor(const std::string& inVerb, const std::string& inRest) {
  return "complete -c lyra -n " + Quoted("__lyra_verb_is " + (inVerb.empty() ? "''" : inVerb)) +
         " " + inRest + "\n";
}

std::string ValueArguments(const OptionRow& inOption) {
  if (!inOption.TakesValue()) return "";
  if (!inOption.words.empty()) return " -x -a " + Quoted(Joined(inOption.words, " "));
  if (inOption.kind == ValueKind::kFolder) return " -x -a '(__fish_complete_directories)'";
  return inOption.kind == ValueKind::kFile ? " -r -F" : " -x";
}

std::string OptionLine(const std::string& inVerb, const OptionRow& inOption) {
  std::string names;
  for (const std::string& name : inOption.names)
    names += name.starts_with("--") ? " -l " + name.substr(2) : " -s " + name.substr(1);
  return LineFor(inVerb,
                 names.substr(1) + ValueArguments(inOption) + " -d " + Quoted(inOption.help));
}

}  // namespace

std::string FishCompletion(const CommandTable& inTable) {
  std::string text = Replaced(kHead, "@VALUE_OPTIONS@", ValueOptions(inTable));
  for (const OptionRow& option : inTable.options) text += OptionLine("", option);
  for (const VerbRow& verb : inTable.verbs)
    text += LineFor("", "-a " + verb.name + " -d " + Quoted(verb.summary));
  for (const VerbRow& verb : inTable.verbs) {
    for (const OptionRow& option : verb.options) text += OptionLine(verb.name, option);
    if (verb.TakesFiles()) text += LineFor(verb.name, "-F");
  }
  return text;
}

}  // namespace lyra
