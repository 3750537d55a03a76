// Everything about one interference of a clash result.
#ifndef ZOR_TOOLKIT_RECORDS_INTERFERENCE_RECORD_H
#define ZOR_TOOLKIT_RECORDS_INTERFERENCE_RECORD_H

#include <array>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "toolkit/records/ClashDocument.h"

namespace ZORToolkit {

/// A number as a document has it.
struct ZOR_TOOLKIT_EXPORT Number {
  std::string text;             ///< as the reader answers it; empty where it is missing
  std::optional<double> value;  ///< finite; nothing where the text is no number

  Number() = default;
  /// With a decimal point or a decimal comma.
  explicit Number(std::string inText);
  explicit Number(const ZORUnicodeString& inText);
  /// The shortest text that reads back as the same number.
  explicit Number(double inValue);
};
typedef std::array<Number, 3> NumberTriple;

/// The columns Rx, Ry, Rz of a rotation, then a translation in millimetres.
typedef std::array<double, 12> Placement;

/// Where a record was read from: what edits of its document go by. Empty in a record that was not
/// read.
class ElementHandle {
 public:
  ElementHandle() = default;
  explicit ElementHandle(const DOM_Node& inElement) : element_(inElement) {}
  bool IsEmpty() const { return element_.isNull(); }
  bool operator==(const ElementHandle& inOther) const { return element_ == inOther.element_; }

 private:
  friend class ClashDocumentEdit;
  DOM_Node element_;
};

struct RuleRecord {
  std::string name;
  Number clearance;
  std::string severity, penetrationCandidate;
};

struct ProductRecord {
  bool exists = false;  ///< whether the interference names such a product
  std::string id, alias, instance, label, alien, processMode, shape, shapeSource, preview;
  /// As a reader takes the numbers of its "Matrix": -1 for what is no number, 0 where a column, the
  /// translation or the matrix is missing.
  Placement placement{};
  /// Why these numbers are not those that were written; empty when they are.
  std::string whyMisread;
  ElementHandle element;
};

/// Perspective for a projection type that is none of those in English, French, German, Italian,
/// Spanish or Japanese.
enum class Projection { kPerspective, kOrthographic };
ZOR_TOOLKIT_EXPORT Projection ProjectionNamed(const std::string& inText);

struct ViewpointRecord {
  std::string projection;
  Number focusDistance, nearPlane, farPlane;
  NumberTriple point, sight;
};

/// Texts are those that the library's reader answers, in UTF-8; empty where the document has none.
/// Of several "Product" elements the first and the last count; of other elements the last, but of
/// several "Picture" elements the first.
struct InterferenceRecord {
  int index = 0;  ///< from 1, in document order over all result sets
  std::string result, name;
  Number value;
  std::string type;  ///< "Clash", "Contact", "Clearance", "error" or a language-neutral word
  std::string typeAsWritten;
  Number clearance;    ///< that of the rule where it has one
  std::string status;  ///< "Relevant", "Irrelevant", "Not inspected" or "error"
  std::string statusAsWritten;
  std::string computationCase, retrieve;
  RuleRecord rule;
  std::array<ProductRecord, 2> products;
  std::string comment, picture;
  Number curveLength, distance;
  std::vector<NumberTriple> points;
  std::optional<ViewpointRecord> viewpoint;
  ElementHandle element;
};

/// kRow: what a row of a list shows and is chosen by; words as written, labels, previews, placements,
/// geometry, viewpoint and picture stay empty, which saves a third of the reading.
enum class RecordPart { kAll, kRow };

/// Reads one interference after the other, in the order of their numbers. A single-interference
/// document has the first one directly under its root. Raises Error for a document of another kind.
ZOR_TOOLKIT_EXPORT void ForEachInterference(
    ClashDocument& ioDocument, RecordPart inPart,
    const std::function<void(const InterferenceRecord& inRecord)>& inVisit);

/// What a row shows of one "Interference" of the document; its number stays 0.
ZOR_TOOLKIT_EXPORT InterferenceRecord ReadRow(ClashDocument& ioDocument,
                                              const DOM_Node& inInterference);
/// The interference of a number. Raises Error, which says how many there are, when there is none of
/// that number.
ZOR_TOOLKIT_EXPORT InterferenceRecord ReadInterference(ClashDocument& ioDocument,
                                                       long long inNumber);
/// A number that differs when anything differs that the document says of the interference. The same
/// on every run and machine.
ZOR_TOOLKIT_EXPORT std::uint64_t HashOf(const InterferenceRecord& inRecord);
ZOR_TOOLKIT_EXPORT int CountInterferences(const ClashDocument& inDocument);

/// The interferences of a document by their numbers: found once, each read when it is asked for. It
/// does not see interferences that an edit adds or takes out.
class ZOR_TOOLKIT_EXPORT InterferenceIndex {
 public:
  /// @param ioDocument lives as long as this. Raises Error for a document of another kind.
  explicit InterferenceIndex(ClashDocument& ioDocument);

  int Count() const { return static_cast<int>(places_.size()); }
  /// @param inNumber 1 to Count().
  InterferenceRecord Read(int inNumber) const;

 private:
  struct Place {
    DOM_Node set, element;
  };
  ClashDocument& document_;
  std::vector<Place> places_;
};

}  // namespace ZORToolkit

#endif
