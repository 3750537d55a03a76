// Comparing, grouping, judging and settling results.
#include <algorithm>
#include <array>
#include <utility>

#include "Binding.h"
#include "toolkit/records/ClashDocumentEdit.h"
#include "toolkit/records/RecordFilter.h"
#include "toolkit/records/WrittenFile.h"
#include "toolkit/review/Gate.h"
#include "toolkit/review/ReviewFields.h"
#include "toolkit/review/ReviewedFile.h"

namespace ZORPython {
using namespace ZORToolkit;
namespace {

// diff

struct PyDiff {
  LoadedPointer older, newer;  // their texts are the entries'
  ResultDiff diff;
  std::vector<std::string> ids;
};
using DiffPointer = std::shared_ptr<const PyDiff>;

struct PyDiffEntry {
  DiffPointer of;
  std::size_t place = 0;

  const DiffEntry& Entry() const { return of->diff.entries[place]; }
  IdentifiedEntry Identified() const { return {Entry(), of->ids[place]}; }
};

constexpr DiffClass kClasses[] = {DiffClass::kNew, DiffClass::kPersisting, DiffClass::kChanged,
                                  DiffClass::kResolved, DiffClass::kNotComparable};
static_assert(std::size(kClasses) == kDiffClassCount);

DiffOptions Comparison(double inTolerance, double inPlace) {
  DiffOptions options;
  options.tolerance = Length("tolerance", inTolerance);
  options.samePlace = Length("place", inPlace);
  return options;
}

std::shared_ptr<PyDiff> Compare(const py::object& inOld, const py::object& inNew,
                                double inTolerance, double inPlace) {
  const DiffOptions options = Comparison(inTolerance, inPlace);
  auto compared = std::make_shared<PyDiff>();
  compared->older = LoadedFrom(inOld);
  compared->newer = LoadedFrom(inNew);
  const LibraryScope library;
  const ReviewedResult &older = compared->older->Review(), &newer = compared->newer->Review();
  compared->diff = Diff(older, newer, options);
  compared->ids = EntryIds(compared->diff, older, newer);
  return compared;
}

std::vector<PyDiffEntry> EntriesOf(const std::shared_ptr<PyDiff>& inDiff,
                                   std::optional<DiffClass> inClass) {
  std::vector<PyDiffEntry> entries;
  for (std::size_t i = 0; i < inDiff->ids.size(); ++i)
    if (!inClass || inDiff->diff.entries[i].itsClass == *inClass) entries.push_back({inDiff, i});
  return entries;
}

py::dict ByClass(const std::shared_ptr<PyDiff>& inDiff) {
  py::dict classes;
  for (const DiffClass itsClass : kClasses) {
    py::list rows;
    for (const PyDiffEntry& entry : EntriesOf(inDiff, itsClass))
      rows.append(RecordFrom(entry.Identified()));
    classes[Name(itsClass)] = rows;
  }
  return classes;
}

py::list DiffRecords(const std::shared_ptr<PyDiff>& inDiff) {
  py::list rows;
  for (const PyDiffEntry& entry : EntriesOf(inDiff, std::nullopt)) {
    py::dict row;
    row["class"] = Name(entry.Entry().itsClass);
    row.attr("update")(RecordFrom(entry.Identified()));
    rows.append(row);
  }
  return rows;
}

struct PyChange {
  std::string what, before, after;
  bool isSubstantial;
};

std::vector<PyChange> ChangesOf(const PyDiffEntry& inEntry) {
  std::vector<PyChange> changes;
  for (const Change& change : inEntry.Entry().changes)
    changes.push_back(
        {change.what, std::string(change.from), std::string(change.to), change.isSubstantial});
  return changes;
}

std::optional<int> NumberAt(int inPosition) {
  return inPosition < 0 ? std::nullopt : std::optional(inPosition + 1);
}

void DefineDiff(py::module_& ioModule) {
  py::class_<PyChange>(ioModule, "Change", "What changed about an interference.")
      .def_readonly("what", &PyChange::what)
      .def_readonly("before", &PyChange::before)
      .def_readonly("after", &PyChange::after)
      .def_readonly("is_substantial", &PyChange::isSubstantial,
                    "Whether it is another interference to decide on.");
  py::class_<PyDiffEntry>(ioModule, "DiffEntry", "What became of one interference.")
      .def_property_readonly(
          "kind", [](const PyDiffEntry& inEntry) { return Name(inEntry.Entry().itsClass); },
          "'new', 'persisting', 'changed', 'resolved' or 'notComparable'.")
      .def_property_readonly("id",
                             [](const PyDiffEntry& inEntry) { return inEntry.Identified().id; })
      .def_property_readonly(
          "old", [](const PyDiffEntry& inEntry) { return NumberAt(inEntry.Entry().oldPosition); },
          "Its number in the old result, or None.")
      .def_property_readonly(
          "new", [](const PyDiffEntry& inEntry) { return NumberAt(inEntry.Entry().newPosition); },
          "Its number in the new result, or None.")
      .def_property_readonly(
          "reason", [](const PyDiffEntry& inEntry) { return TextFrom(inEntry.Entry().reason); })
      .def_property_readonly("changes", &ChangesOf)
      .def(
          "to_dict", [](const PyDiffEntry& inEntry) { return RecordFrom(inEntry.Identified()); },
          "As `lyra diff --json` has it.");
  py::class_<PyDiff, std::shared_ptr<PyDiff>> diff(
      ioModule, "Diff", "What became of the interferences of a result; see diff().");
  constexpr const char* kNames[] = {"new", "persisting", "changed", "resolved", "not_comparable"};
  for (std::size_t i = 0; i < kDiffClassCount; ++i)
    diff.def_property_readonly(kNames[i],
                               [itsClass = kClasses[i]](const std::shared_ptr<PyDiff>& inDiff) {
                                 return EntriesOf(inDiff, itsClass);
                               });
  diff.def_property_readonly(
          "entries",
          [](const std::shared_ptr<PyDiff>& inDiff) { return EntriesOf(inDiff, std::nullopt); },
          "All: those with a new interference by its number, then the others.")
      .def_property_readonly(
          "has_differences", [](const PyDiff& inDiff) { return inDiff.diff.HasDifferences(); },
          "Whether there is anything but persisting interferences.")
      .def("__len__", [](const PyDiff& inDiff) { return inDiff.ids.size(); })
      .def("to_dict", &ByClass, "Lists by class, as `lyra diff --json` has them.")
      .def("to_records", &DiffRecords, "The entries as dictionaries, with their class.");
  ioModule.def("diff", &Compare, py::arg("old"), py::arg("new"), py::kw_only(),
               py::arg("tolerance") = MatchOptions().tolerance,
               py::arg("place") = MatchOptions().samePlace,
               "Say what is new, persisting, changed, resolved or not comparable since an older "
               "result.\n\nold, new: documents or paths. tolerance: a value or a placement that "
               "differs by no more millimetres is the same. place: farther apart on its products "
               "it is another interference.");
}

// group

struct PyGroup {
  LoadedPointer loaded;
  InterferenceGroups all;
  InterferenceGroup group;
};

GroupBy Criterion(const std::string& inWord) {
  for (const GroupBy by :
       {GroupBy::kParts, GroupBy::kAssemblies, GroupBy::kPlace, GroupBy::kProduct})
    if (inWord == Name(by)) return by;
  constexpr const char* kKnown[] = {"parts", "assemblies", "place", "product"};
  throw UnknownWord("by", inWord, kKnown);
}

std::vector<PyGroup> GroupsOf(const LoadedPointer& inLoaded, const InterferenceGroups& inAll,
                              const GroupList& inGroups) {
  std::vector<PyGroup> groups;
  for (const InterferenceGroup group : inGroups) groups.push_back({inLoaded, inAll, group});
  return groups;
}

std::vector<PyGroup> Group(const py::object& inResult,
                           const std::optional<std::vector<std::string>>& inBy, double inDistance) {
  GroupOptions options;
  options.distance = Length("distance", inDistance);
  if (inBy) {
    options.by.clear();
    for (const std::string& word : *inBy) options.by.push_back(Criterion(word));
  }
  const LoadedPointer loaded = LoadedFrom(inResult);
  std::optional<InterferenceGroups> all;
  {
    const LibraryScope library;
    all = GroupInterferences(loaded->Review(), options);
  }
  return GroupsOf(loaded, *all, *all);
}

void DefineGroup(py::module_& ioModule) {
  py::class_<PyGroup>(ioModule, "Group", "Interferences that belong together; see group().")
      .def_property_readonly("id", [](const PyGroup& inGroup) { return inGroup.group.Id(); })
      .def_property_readonly("by", [](const PyGroup& inGroup) { return Name(inGroup.group.By()); })
      .def_property_readonly("label",
                             [](const PyGroup& inGroup) { return TextFrom(inGroup.group.Label()); })
      .def_property_readonly(
          "members",
          [](const PyGroup& inGroup) {
            std::vector<int> numbers(inGroup.group.Members().begin(),
                                     inGroup.group.Members().end());
            for (int& number : numbers) ++number;
            return numbers;
          },
          "The numbers of its interferences.")
      .def_property_readonly(
          "representative",
          [](const PyGroup& inGroup) { return inGroup.group.Representative() + 1; },
          "The number of the member of the worst value.")
      .def_property_readonly("worst", [](const PyGroup& inGroup) { return inGroup.group.Worst(); })
      .def_property_readonly("groups",
                             [](const PyGroup& inGroup) {
                               return GroupsOf(inGroup.loaded, inGroup.all, inGroup.group.Groups());
                             })
      .def("__len__", [](const PyGroup& inGroup) { return inGroup.group.Members().size(); })
      .def(
          "to_dict", [](const PyGroup& inGroup) { return RecordFrom(inGroup.group); },
          "As `lyra group --json` has it.");
  ioModule.def("group", &Group, py::arg("result"), py::kw_only(), py::arg("by") = py::none(),
               py::arg("distance") = GroupOptions().distance,
               "Show which interferences belong together, the largest group first.\n\nresult: a "
               "document or a path. by: some of 'parts', 'assemblies', 'place', 'product', each "
               "inside the one before; the first three when None. distance: interferences of one "
               "place are no farther from the next, millimetres.");
}

// gate

struct PyGate {
  LoadedPointer result, baseline;
  GatePolicy policy;
  std::optional<ResultDiff> diff;
  GateOutcome outcome;
};

template <std::string (*Make)(const GateReport&)>
py::object ReportOf(const PyGate& inGate) {
  std::string text;
  {
    const LibraryScope library;
    text = Make({inGate.policy, inGate.result->Review(), inGate.outcome,
                 inGate.diff ? &*inGate.diff : nullptr, ZOR_VERSION});
  }
  return TextFrom(text);
}

std::shared_ptr<PyGate> Gate(const py::object& inResult, const py::object& inPolicy,
                             const std::optional<py::object>& inBaseline, double inTolerance,
                             double inPlace) {
  const DiffOptions options = Comparison(inTolerance, inPlace);
  const std::string path = PathFrom(inPolicy);
  auto gate = std::make_shared<PyGate>();
  gate->policy = ReadPolicy(path, BytesOfInput(path));
  if (gate->policy.NeedsBaseline() && !inBaseline)
    throw UsageError("the policy compares with an older result: baseline is missing");
  gate->result = LoadedFrom(inResult);
  if (inBaseline) gate->baseline = LoadedFrom(*inBaseline);
  const LibraryScope library;
  if (gate->baseline) gate->diff = Diff(gate->baseline->Review(), gate->result->Review(), options);
  gate->outcome = Judge(gate->policy, gate->result->Review(), gate->diff ? &*gate->diff : nullptr);
  return gate;
}

std::vector<int> Numbers(const std::vector<int>& inPositions) {
  std::vector<int> numbers = inPositions;
  for (int& number : numbers) ++number;
  return numbers;
}

py::list LimitsOf(const PyGate& inGate) {
  py::list limits;
  for (std::size_t i = 0; i < inGate.outcome.limits.size(); ++i) {
    const GateLimit& limit = inGate.policy.limits[i];
    const LimitOutcome& outcome = inGate.outcome.limits[i];
    py::dict row;
    row["name"] = TextFrom(limit.name);
    row["max"] = limit.max;
    row["warning"] = limit.isWarning;
    row["exceeded"] = outcome.isExceeded;
    row["counted"] = Numbers(outcome.counted);
    row["suppressed"] = Numbers(outcome.suppressed);
    limits.append(row);
  }
  return limits;
}

void DefineGate(py::module_& ioModule) {
  py::class_<PyGate, std::shared_ptr<PyGate>>(ioModule, "Gate",
                                              "Whether a result may pass; see gate().")
      .def_property_readonly(
          "passed", [](const PyGate& inGate) { return inGate.outcome.verdict == Verdict::kPassed; })
      .def_property_readonly(
          "verdict",
          [](const PyGate& inGate) {
            constexpr const char* kVerdicts[] = {"passed", "failed", "nothing judged"};
            return kVerdicts[static_cast<std::size_t>(inGate.outcome.verdict)];
          },
          "'passed', 'failed' or 'nothing judged'.")
      .def_property_readonly(
          "reason", [](const PyGate& inGate) { return inGate.outcome.reason; },
          "Why nothing could be judged.")
      .def_property_readonly("limits", &LimitsOf,
                             "A dictionary for each limit of the policy, with the numbers of the "
                             "interferences that are counted.")
      .def_property_readonly("not_comparable",
                             [](const PyGate& inGate) { return inGate.outcome.notComparable; })
      .def("text", &ReportOf<GateText>, "The report of `lyra gate`.")
      .def("junit", &ReportOf<GateJUnit>, "The report as JUnit XML.")
      .def("sarif", &ReportOf<GateSarif>, "The report as SARIF 2.1.0.");
  ioModule.def("gate", &Gate, py::arg("result"), py::arg("policy"),
               py::arg("baseline") = py::none(), py::kw_only(),
               py::arg("tolerance") = MatchOptions().tolerance,
               py::arg("place") = MatchOptions().samePlace,
               "Judge a result by the limits of a policy.\n\nresult, baseline: documents or paths. "
               "policy: the path of a policy in TOML. Raises ValueError when the policy compares "
               "with an older result and there is no baseline.");
}

// carry and merge

CarryPlan CarryToFile(const py::object& inOld, const py::object& inNew, const py::object& inOutput,
                      bool inKeepChanged, double inTolerance, double inPlace) {
  const DiffOptions options = Comparison(inTolerance, inPlace);
  const std::string older = PathFrom(inOld), newer = PathFrom(inNew), path = PathFrom(inOutput);
  const LibraryScope library;
  const ReviewedFile was(older);
  ReviewedFile is(newer);
  CarryPlan plan = CarryInto(is, was, options, inKeepChanged);
  ReplaceFile(path, [&](const std::string& inPath) { return is.Write(inPath); });
  return plan;
}

py::object MergeToFile(const std::vector<py::object>& inFiles, const py::object& inOutput,
                       bool inSumCounts) {
  std::vector<std::string> paths;
  for (const py::object& file : inFiles) paths.push_back(PathFrom(file));
  if (paths.size() < 2) throw UsageError("merge takes two or more clash documents");
  const std::string output = PathFrom(inOutput);
  std::string trace;
  {
    const LibraryScope library;
    const std::unique_ptr<ClashDocument> merged = MergeClashes(paths, inSumCounts, trace);
    ReplaceFile(output, [&](const std::string& inPath) {
      return ClashDocumentEdit(*merged).Dump({}, inPath);
    });
  }
  return TextFrom(trace);
}

void DefineCarryAndMerge(py::module_& ioModule) {
  py::class_<CarryPlan>(ioModule, "Carried", "What became of decisions; see carry().")
      .def_readonly("carried", &CarryPlan::carried, "Decisions that hold.")
      .def_readonly("reopened", &CarryPlan::reopened, "Decisions that have to be made again.")
      .def_readonly("replaced", &CarryPlan::replaced, "Others that gave way to old ones.")
      .def_readonly("left", &CarryPlan::left, "Decisions on what the new result has not.");
  ioModule.def("carry", &CarryToFile, py::arg("old"), py::arg("new"), py::arg("output"),
               py::kw_only(), py::arg("keep_changed") = false,
               py::arg("tolerance") = MatchOptions().tolerance,
               py::arg("place") = MatchOptions().samePlace,
               "Write a newer result with the decisions of an older one.\n\nold, new, output: "
               "paths. keep_changed leaves settled what changed, instead of reopening it.");
  ioModule.def(
      "merge", &MergeToFile, py::arg("files"), py::arg("output"), py::kw_only(),
      py::arg("sum_counts") = false,
      "Fold two or more clash documents into one: the first takes in the others.\n\nfiles, "
      "output: paths. sum_counts declares the interferences that are there, not the sum of "
      "what was declared. Returns a line for each step.");
}

}  // namespace

void DefineReview(py::module_& ioModule) {
  DefineDiff(ioModule);
  DefineGroup(ioModule);
  DefineGate(ioModule);
  DefineCarryAndMerge(ioModule);
}

}  // namespace ZORPython
