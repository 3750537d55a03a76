// lyra carry OLD NEW -o OUT, lyra review set|apply|merge|import … -o OUT
#include <algorithm>
#include <cstdio>
#include <memory>
#include <unordered_set>

#include "foundation/ReadWholeFile.h"
#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/GroupOptions.h"
#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/ReviewImport.h"
#include "lyra/commands/ReviewInput.h"
#include "lyra/terminal/Table.h"
#include "lyra/terminal/Terminal.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr int kConflicts = 3;
constexpr const char* kSettableStatuses[] = {"relevant", "irrelevant", "not-inspected"};
constexpr const char* kPreferences[] = {"mine", "theirs"};

// carry

struct CarryOptions {
  std::string oldFile, newFile, output;
  CompareOptions compare;
  bool keepChanged = false, verbose = false;
};

int Carry(const CarryOptions& inOptions, Output& ioOutput) {
  const DiffOptions options = inOptions.compare.Get();
  ChooseLanguage(inOptions.compare.language);
  const ReviewReading reading{.geometries = true};
  const ReviewInput was(inOptions.oldFile, reading);
  ReviewInput is(inOptions.newFile, reading);
  const CarryPlan plan = CarryInto(is, was, options, inOptions.keepChanged);
  WriteReviewed(is, inOptions.output, ioOutput);
  if (inOptions.verbose && was.bytes != is.bytes)  // else it was not computed again
    std::fprintf(stderr,
                 "%d decisions carried over, %d reopened, %d others replaced, %d left behind with "
                 "what is resolved or not comparable\n",
                 plan.carried, plan.reopened, plan.replaced, plan.left);
  return 0;
}

// review

struct ReviewOptions {
  std::string action, status, group, output, prefer, language;
  std::vector<std::string> files, only, comments;
  GroupVerbOptions grouping;
  bool json = false;
};

void RequireFiles(const ReviewOptions& inOptions, std::size_t inCount, const char* inFiles) {
  if (inOptions.files.size() != inCount)
    throw UsageError("review " + inOptions.action + ": takes " + inFiles);
}

/// Where a list goes when the document itself goes to standard output.
void PrintList(const std::string& inText, const ReviewOptions& inOptions, Output& ioOutput) {
  if (inOptions.output != "-") return ioOutput.Write(inText);
  WriteError(inText);
}

Preference PreferenceOf(const ReviewOptions& inOptions) {
  if (inOptions.prefer.empty()) return Preference::kNone;
  return ChosenWord("--prefer", inOptions.prefer, kPreferences) == 0 ? Preference::kMine
                                                                     : Preference::kTheirs;
}

/// Which decision stands now.
void NoteConflicts(std::size_t inCount, const ReviewOptions& inOptions) {
  const bool isOpen = inOptions.prefer.empty();
  const bool isTheirs = PreferenceOf(inOptions) == Preference::kTheirs;
  std::string text("note: conflicts: ");
  text.append(std::to_string(inCount)).append(isOpen ? ", left" : ", settled");
  text.append(isTheirs ? " as in theirs" : " as in mine");
  if (isOpen) text += "; settle by --prefer mine or theirs";
  WriteError(text.append(1, '\n'));
}

void PrintConflicts(const std::vector<ReviewConflict>& inConflicts, const ReviewOptions& inOptions,
                    Output& ioOutput) {
  if (!inConflicts.empty()) NoteConflicts(inConflicts.size(), inOptions);
  std::string text;
  if (inOptions.json) {
    std::vector<OrderedJson> rows;
    for (const ReviewConflict& conflict : inConflicts)
      rows.push_back({{"id", conflict.id},
                      {"index", conflict.position + 1},
                      {"what", conflict.what},
                      {"base", conflict.base},
                      {"mine", conflict.mine},
                      {"theirs", conflict.theirs}});
    return PrintList(JsonRows(rows) + "\n", inOptions, ioOutput);
  }
  for (const ReviewConflict& conflict : inConflicts)
    text += Printable("conflict: interference " + std::to_string(conflict.position + 1) + ", " +
                      conflict.what + ": \"" + conflict.base + "\" became \"" + conflict.mine +
                      "\" here and \"" + conflict.theirs + "\" there") +
            "\n";
  PrintList(text, inOptions, ioOutput);
}

/// @return the interferences that the options choose, by position.
std::vector<int> ChosenPositions(const ReviewOptions& inOptions, ReviewInput& ioInput) {
  std::unordered_set<int> ofGroup;
  if (!inOptions.group.empty()) {
    const GroupOptions options = inOptions.grouping.Get();
    const InterferenceGroups groups = GroupInterferences(ioInput.result, options);
    const auto group = groups.Find(inOptions.group);
    if (!group)
      throw InputError(ioInput.document.Name() + ": there is no group " + inOptions.group);
    ofGroup.insert(group->Members().begin(), group->Members().end());
  }
  const RecordFilter filter = FilterOfConditions(inOptions.only);
  std::vector<int> positions;
  ForEachInterference(ioInput.document, filter.NeedsLabels() ? RecordPart::kAll : RecordPart::kRow,
                      [&](const InterferenceRecord& inRecord) {
                        const int position = inRecord.index - 1;
                        if (!inOptions.group.empty() && !ofGroup.contains(position)) return;
                        if (filter.Accepts(inRecord)) positions.push_back(position);
                      });
  return positions;
}

int Set(const ReviewOptions& inOptions, Output& ioOutput) {
  RequireFiles(inOptions, 1, "one RESULT");
  if (inOptions.only.empty() && inOptions.group.empty())
    throw UsageError("review set: --only or --group must choose interferences");
  if (inOptions.status.empty() && inOptions.comments.empty())
    throw UsageError("review set: --status or --comment must say what to set");
  constexpr const char* kStatuses[] = {"Relevant", "Irrelevant", "Not inspected"};
  ReviewEdit edit;
  if (!inOptions.status.empty())
    edit.status = kStatuses[ChosenWord("--status", inOptions.status, kSettableStatuses)];
  if (!inOptions.comments.empty()) edit.comment = inOptions.comments.back();
  ReviewInput input(inOptions.files[0]);
  std::vector<ReviewEdit> edits;
  for (const int position : ChosenPositions(inOptions, input)) {
    edit.position = position;
    edits.push_back(edit);
  }
  const int changed = input.Apply(edits);
  WriteReviewed(input, inOptions.output, ioOutput);
  PrintList(std::to_string(edits.size()) + " chosen, " + std::to_string(changed) + " changed\n",
            inOptions, ioOutput);
  return 0;
}

int Apply(const ReviewOptions& inOptions, Output& ioOutput) {
  RequireFiles(inOptions, 2, "a RESULT and a REVIEW.json");
  ReviewInput input(inOptions.files[0]);
  const std::string& path = inOptions.files[1];
  const ReviewFile review = ReadReviewFile(path, BytesOfInput(path));
  if (!review.hash.empty() && review.hash != DocumentHash(input.bytes))
    std::fputs("note: the review was made of another state of the result\n", stderr);
  const ApplyPlan plan = PlanApply(input.result, review, PreferenceOf(inOptions));
  input.Apply(plan.edits);
  WriteReviewed(input, inOptions.output, ioOutput);
  for (const ReviewEntry& entry : plan.unknown)
    WriteError("note: the result has no interference " + Printable(entry.id) + " (" +
               std::to_string(entry.index) + " in the review)\n");
  if (inOptions.json || !plan.conflicts.empty())
    PrintConflicts(plan.conflicts, inOptions, ioOutput);
  return plan.conflicts.empty() || !inOptions.prefer.empty() ? 0 : kConflicts;
}

int Merge(const ReviewOptions& inOptions, Output& ioOutput) {
  RequireFiles(inOptions, 3, "BASE, MINE and THEIRS");
  const Preference preference = PreferenceOf(inOptions);
  const ReviewReading reading{.geometries = true};
  const ReviewInput base(inOptions.files[0], reading);
  ReviewInput mine(inOptions.files[1], reading);
  const ReviewInput theirs(inOptions.files[2], reading);
  const MergePlan plan = PlanMerge(base.result, mine.result, theirs.result, preference);
  mine.Apply(plan.edits);
  WriteReviewed(mine, inOptions.output, ioOutput);
  if (plan.missing > 0)
    WriteError("note: " + std::to_string(plan.missing) + " decisions of " +
               Printable(inOptions.files[2]) + " are on interferences that " +
               Printable(inOptions.files[1]) + " has not\n");
  if (inOptions.json || !plan.conflicts.empty())
    PrintConflicts(plan.conflicts, inOptions, ioOutput);
  return plan.conflicts.empty() || preference != Preference::kNone ? 0 : kConflicts;
}

int Import(const ReviewOptions& inOptions, Output& ioOutput) {
  RequireFiles(inOptions, 2, "a RESULT and what was made of it, such as FILE.bcf");
  return ImportReview({inOptions.files[0], inOptions.files[1], inOptions.output,
                       inOptions.grouping.Get(), inOptions.json},
                      ioOutput);
}

int Review(const ReviewOptions& inOptions, Output& ioOutput) {
  constexpr const char* kActions[] = {"set", "apply", "merge", "import"};
  constexpr int (*kDo[])(const ReviewOptions&, Output&) = {Set, Apply, Merge, Import};
  const std::size_t action = ChosenWord("review", inOptions.action, kActions);
  ChooseLanguage(inOptions.language);
  return kDo[action](inOptions, ioOutput);
}

}  // namespace

VerbAction DeclareCarry(Arguments& ioArguments) {
  const auto options = std::make_shared<CarryOptions>();
  ioArguments.Positional("OLD", options->oldFile, "The reviewed result, or - for standard input");
  ioArguments.Positional("NEW", options->newFile, "The result of a later computation");
  ioArguments.RequiredText("-o,--output", "OUT", options->output,
                           "Where NEW is written with the decisions of OLD");
  ioArguments.Flag("--keep-changed", options->keepChanged,
                   "Leave settled what changed, instead of reopening it");
  ioArguments.Flag("-v,--verbose", options->verbose,
                   "Say on standard error what became of the decisions");
  options->compare.Declare(ioArguments);
  return [options](Output& ioOutput) { return Carry(*options, ioOutput); };
}

VerbAction DeclareReview(Arguments& ioArguments) {
  const auto options = std::make_shared<ReviewOptions>();
  ioArguments.Positional("ACTION", options->action,
                         "set: decide in bulk; apply: take in a review file; merge: three ways; "
                         "import: make a review file of what was done in other tools");
  ioArguments.Positionals(
      "FILE", options->files,
      "set: RESULT; apply: RESULT REVIEW.json; merge: BASE MINE THEIRS; import: "
      "RESULT and FILE.bcf, .xlsx or .csv");
  ioArguments.RequiredText("-o,--output", "OUT", options->output,
                           "Where the result, or the review file of import, is written");
  ioArguments.Texts("--only", "CONDITIONS", options->only,
                    "set: those such as type=clash,product=bolt; several words are alternatives");
  ioArguments.Text("--group", "ID", options->group,
                   "set: those of a group that lyra group shows with the same options");
  options->grouping.Declare(ioArguments);
  ioArguments.Text("--status", "STATUS", options->status,
                   "set: relevant, irrelevant or not-inspected");
  ioArguments.Words("--status", kSettableStatuses);
  ioArguments.Texts("--comment", "TEXT", options->comments,
                    "set: the comment; an empty one takes it out");
  ioArguments.Text("--prefer", "SIDE", options->prefer,
                   "apply, merge: whose decision counts where both differ, mine or theirs");
  ioArguments.Words("--prefer", kPreferences);
  ioArguments.Flag("--json", options->json,
                   "apply, merge: print the conflicts as JSON; import: what became of it");
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Review(*options, ioOutput); };
}

}  // namespace lyra
