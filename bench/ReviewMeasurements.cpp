// Reviewing: what became of a result when it was computed again, and what is decided about it.
#include "Measurement.h"
#include "ResultHash.h"
#include "toolkit/review/Gate.h"
#include "toolkit/review/Group.h"

namespace {
using namespace ZORToolkit;

void HashGroups(const GroupList& inGroups, ResultHash& ioHash) {
  for (const InterferenceGroup group : inGroups) {
    ioHash.Add(group.Id());
    ioHash.Add(group.Label());
    ioHash.Add(std::uint64_t{group.Members().size()});
    HashGroups(group.Groups(), ioHash);
  }
}

/// @return how long all labels are, so that they are made.
std::size_t Name(const GroupList& inGroups) {
  std::size_t length = 0;
  for (const InterferenceGroup group : inGroups)
    length += group.Id().size() + group.Label().size() + Name(group.Groups());
  return length;
}

GatePolicy Policy() {
  return ReadPolicy("policy.toml", R"(
[[limit]]
name = "no deep penetration left"
type = "clash"
max-value = -1.0
status = ["relevant", "not-inspected"]
[[limit]]
name = "few open contacts"
level = "warning"
type = "contact"
max = 50
)");
}
}  // namespace

Steps DiffWithZORLyra(const Arguments& inArguments) {
  Steps steps;
  std::optional<ClashDocument> oldDocument, newDocument;
  TimeStep("load", steps, [&] {
    oldDocument.emplace(inArguments.at(0));
    newDocument.emplace(inArguments.at(1));
  });
  ReviewedResult was, is;
  TimeStep("read", steps, [&] {
    was = ReadForReview(*oldDocument, {.geometries = true});
    is = ReadForReview(*newDocument, {.geometries = true, .identities = true});
  });
  ResultDiff diff;
  TimeStep("diff", steps, [&] { diff = Diff(was, is); });
  std::vector<std::string> ids;
  TimeStep("identifiers", steps, [&] { ids = EntryIds(diff, was, is); });
  ResultHash hash;
  for (std::size_t i = 0; i < ids.size(); ++i) {
    const DiffEntry& entry = diff.entries[i];
    hash.Add(Name(entry.itsClass));
    hash.Add(entry.reason);
    for (const Change& change : entry.changes) hash.Add(std::string(change.from).append(change.to));
    hash.Add(ids[i]);
  }
  steps.back().hash = hash.Value();
  return steps;
}

Steps CarryWithZORLyra(const Arguments& inArguments) {
  Steps steps;
  std::optional<ClashDocument> oldDocument, newDocument;
  TimeStep("load", steps, [&] {
    oldDocument.emplace(inArguments.at(0));
    newDocument.emplace(inArguments.at(1));
  });
  int changed = 0;
  TimeStep("carry", steps, [&] {
    const ReviewedResult was = ReadForReview(*oldDocument, {.geometries = true});
    const ReviewedResult is = ReadForReview(*newDocument, {.geometries = true});
    const CarryPlan plan = PlanCarry(was, is, Diff(was, is));
    changed = ApplyReviewEdits(*newDocument, is, plan.edits);
  });
  ResultHash hash;
  hash.Add(static_cast<std::uint64_t>(changed));
  for (const ReviewRecord& record : ReadForReview(*newDocument).interferences) {
    hash.Add(record.status);
    hash.Add(record.comment);
    hash.Add(record.retrieve);
  }
  steps.back().hash = hash.Value();
  return steps;
}

Steps GroupWithZORLyra(const Arguments& inArguments) {
  Steps steps;
  std::optional<ClashDocument> document;
  TimeStep("load", steps, [&] { document.emplace(inArguments.at(0)); });
  ReviewedResult result;
  std::optional<InterferenceGroups> groups;
  TimeStep("group", steps, [&] {
    result = ReadForReview(*document, ReadingForGroups({}));
    groups = GroupInterferences(result);
  });
  TimeStep("identifiers", steps, [&] { Name(*groups); });
  ResultHash hash;
  HashGroups(*groups, hash);
  steps.back().hash = hash.Value();
  return steps;
}

Steps GateWithZORLyra(const Arguments& inArguments) {
  Steps steps;
  std::optional<ClashDocument> document;
  TimeStep("load", steps, [&] { document.emplace(inArguments.at(0)); });
  const GatePolicy policy = Policy();
  GateOutcome outcome;
  TimeStep("gate", steps, [&] { outcome = Judge(policy, ReadForReview(*document), nullptr); });
  ResultHash hash;
  for (const LimitOutcome& limit : outcome.limits) {
    hash.Add(std::uint64_t{limit.counted.size()});
    hash.Add(std::uint64_t{limit.suppressed.size()});
  }
  steps.back().hash = hash.Value();
  return steps;
}
