// What a document says besides its interferences, and the files that it links.
#ifndef ZOR_TOOLKIT_RECORDS_DOCUMENT_RECORDS_H
#define ZOR_TOOLKIT_RECORDS_DOCUMENT_RECORDS_H

#include <array>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "toolkit/records/InterferenceRecord.h"

namespace ZORToolkit {

struct ResultSetRecord {
  std::string name, computationCase;
  int declared = 0;  // "NbInterf", 0 when it is no number
  int found = 0;
};

struct ErrorRecord {
  int id = -1;
  std::string message;
};

/// Names and values.
typedef std::vector<std::pair<std::string, std::string>> AttributeTexts;

/// What a document says of itself as a whole.
struct DocumentRecord {
  std::string file;
  DocumentKind kind = DocumentKind::kClash;
  std::string version, reference, responsible;
  AttributeTexts date, specification;  // of the last "Date" and "ClashSpec"
  std::vector<ResultSetRecord> results;
  int interferences = 0, specifications = 0;
  int components = 0;  // of a component list
  int links = 0;       // of a federator document
  std::string serverMarker, transaction, prcName;
  std::optional<ErrorRecord> error;  // of an error report
};

struct ComponentAttributeRecord {
  std::string name, type, value;
};

struct ShapeRecord {
  std::string type, id, name, onDisk;
};

struct ComponentRecord {
  int position = 0;  // among all child nodes of the root, from 0
  std::string id, type, partNumber, uuid, documentVersion, alien;
  std::vector<ComponentAttributeRecord> attributes, features;
  std::vector<ShapeRecord> shapes;
  std::optional<Placement> placement;  // absent unless all four of its elements are there
};

struct SpecifiedProducts {
  std::string alias, id, version, alien, shape;
};

struct SpecificationRecord {
  int index = 0;  // from 1
  std::array<SpecifiedProducts, 2> products;
};

struct LinkedProduct {
  std::string name, id, url;
};

struct LinkRecord {
  std::string link;
  std::array<LinkedProduct, 2> products;
  std::optional<std::string> check = std::nullopt;  // what a check of the linked file said
};

ZOR_TOOLKIT_EXPORT DocumentRecord ReadDocument(ClashDocument& ioDocument);
/// Empty for a document that is no component list.
ZOR_TOOLKIT_EXPORT std::vector<ComponentRecord> ReadComponents(ClashDocument& ioDocument);
ZOR_TOOLKIT_EXPORT std::vector<SpecificationRecord> ReadSpecifications(ClashDocument& ioDocument);
/// Empty for a document that is no federator document.
ZOR_TOOLKIT_EXPORT std::vector<LinkRecord> ReadLinks(ClashDocument& ioDocument);

/// The reference by which a federator document links a file: relative to the federator document
/// where the file's path is relative. @param inFederator "-" stands in the current directory.
ZOR_TOOLKIT_EXPORT std::string LinkTo(const std::string& inFile, const std::string& inFederator);
/// The path of a linked file: logical names are resolved, and what is relative is so to the
/// federator document. Empty when there is no such path.
ZOR_TOOLKIT_EXPORT std::string LinkedPath(const std::string& inLink,
                                          const std::string& inFederator);

/// For each link what is wrong with it: missing, unreadable, of the wrong kind or listed twice;
/// empty when nothing is.
ZOR_TOOLKIT_EXPORT std::vector<std::string> CheckLinks(const std::vector<LinkRecord>& inLinks,
                                                       const std::string& inFederator);

}  // namespace ZORToolkit

#endif
