// The fields of differences and groups; see toolkit/records/RecordFields.h.
#ifndef ZOR_TOOLKIT_REVIEW_REVIEW_FIELDS_H
#define ZOR_TOOLKIT_REVIEW_REVIEW_FIELDS_H

#include <string>

#include "toolkit/records/RecordFields.h"
#include "toolkit/review/Diff.h"
#include "toolkit/review/Group.h"

namespace ZORToolkit {

/// An interference that a difference is about, with its stable identifier.
struct IdentifiedEntry {
  const DiffEntry& entry;
  const std::string& id;
};

template <class Maker>
auto ValueOf(Maker& m, const Change& inChange) {
  return m.Object("what", m.Text(inChange.what), "from", m.Text(inChange.from), "to",
                  m.Text(inChange.to));
}

template <class Maker>
auto ValueOf(Maker& m, const IdentifiedEntry& inIdentified) {
  const auto number = [&](int inPosition) {
    return inPosition < 0 ? m.Null() : m.Integer(inPosition + 1);
  };
  const DiffEntry& entry = inIdentified.entry;
  return m.Object("id", m.Text(inIdentified.id), "old", number(entry.oldPosition), "new",
                  number(entry.newPosition), "reason", m.Text(entry.reason), "changes",
                  m.Records(entry.changes));
}

template <class Maker>
typename Maker::Value ValueOf(Maker& m, const InterferenceGroup& inGroup) {
  return m.Object(
      "id", m.Text(inGroup.Id()), "by", m.Text(Name(inGroup.By())), "label",
      m.Text(inGroup.Label()), "size", m.Integer(static_cast<long long>(inGroup.Members().size())),
      "members",
      m.Array(inGroup.Members(), [&](int inPosition) { return m.Integer(inPosition + 1); }),
      "representative", m.Integer(inGroup.Representative() + 1), "worst",
      inGroup.Worst() ? m.Real(*inGroup.Worst()) : m.Null(), "groups", m.Records(inGroup.Groups()));
}

}  // namespace ZORToolkit

#endif
