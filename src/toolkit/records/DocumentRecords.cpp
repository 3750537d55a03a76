#include "toolkit/records/DocumentRecords.h"

#include <algorithm>
#include <climits>
#include <filesystem>
#include <memory>
#include <set>

#include "BuildPath.h"
#include "foundation/NativePath.h"
#include "toolkit/records/DocumentText.h"
#include "toolkit/records/ElementWalk.h"

namespace ZORToolkit {
namespace {

AttributeTexts AllAttributes(const DOM_Node& inElement) {
  AttributeTexts texts;
  const DOM_NamedNodeMap attributes = inElement.getAttributes();
  for (unsigned int i = 0; i < attributes.getLength(); ++i) {
    const DOM_Node attribute = attributes.item(i);
    texts.emplace_back(Utf8(attribute.getNodeName().DOMStringToZORUnicodeString()),
                       Utf8(attribute.getNodeValue().DOMStringToZORUnicodeString()));
  }
  return texts;
}

int DeclaredCount(const DOM_Node& inResultSet) {
  double declared = 0;
  FromUtf8(AttributeText(inResultSet, "NbInterf")).ConvertToNum(&declared, "%le");
  if (!(declared > INT_MIN)) return declared < 0 ? INT_MIN : 0;  // 0 for what is not a number
  return declared < INT_MAX ? static_cast<int>(declared) : INT_MAX;
}

std::vector<ResultSetRecord> ReadResultSets(const ClashDocument& inDocument) {
  std::vector<ResultSetRecord> sets;
  if (inDocument.Kind() != DocumentKind::kClash) return sets;
  ForEachElement(inDocument.Root(), "ClashResult", [&](const DOM_Node& inSet) {
    sets.push_back({AttributeText(inSet, "Name"), AttributeText(inSet, "ComputationCase"),
                    DeclaredCount(inSet), CountElements(inSet, "Interference")});
  });
  return sets;
}

bool IsFeature(const DOM_Node& inAttribute) {
  return AttributeText(inAttribute, "AttrType") == "Feature";
}

void ReadAttributes(const DOM_Node& inComponent, ComponentRecord& outRecord) {
  ForEachElement(inComponent, "ComponentAttributes", [&](const DOM_Node& inGroup) {
    ForEachElement(inGroup, "ComponentAttribute", [&](const DOM_Node& inAttribute) {
      (IsFeature(inAttribute) ? outRecord.features : outRecord.attributes)
          .push_back({AttributeText(inAttribute, "Name"), AttributeText(inAttribute, "AttrType"),
                      AttributeText(inAttribute, "AttrValue")});
    });
  });
}

std::vector<ShapeRecord> ReadShapes(ZORClashParsing& ioReader, int inPosition) {
  std::vector<ShapeRecord> shapes;
  const int count = ioReader.GetNbShapes(inPosition);
  if (count > 0) shapes.reserve(static_cast<std::size_t>(count));
  const auto text = [&](int inShape, const char* inName) {
    return Utf8(ioReader.GetShapeAttrValue(inPosition, inShape, inName));
  };
  for (int i = 0; i < count; ++i)
    shapes.push_back(
        {text(i, "ShapeType"), text(i, "ShapeId"), text(i, "ShapeName"), text(i, "ShapeOnDisk")});
  return shapes;
}

/// Whether the reader finds all twelve numbers; it leaves the others unset.
bool HasWholePlacement(const DOM_Node& inComponent) {
  bool found[4] = {};
  constexpr const char* kNames[] = {"Rx", "Ry", "Rz", "T"};
  ForEachElement(inComponent, "ShapePosition", [&](const DOM_Node& inPosition) {
    for (int i = 0; i < 4; ++i)
      found[i] = found[i] || !FirstElement(inPosition, kNames[i]).isNull();
  });
  return std::all_of(std::begin(found), std::end(found), [](bool inFound) { return inFound; });
}

std::optional<Placement> ReadPlacement(ZORClashParsing& ioReader, int inPosition,
                                       const DOM_Node& inComponent) {
  if (!HasWholePlacement(inComponent)) return std::nullopt;
  double* numbers = nullptr;
  ioReader.GetPosition(inPosition, numbers);
  const std::unique_ptr<double[]> owned(numbers);
  Placement placement;
  std::copy_n(numbers, placement.size(), placement.begin());
  return placement;
}

}  // namespace

DocumentRecord ReadDocument(ClashDocument& ioDocument) {
  DocumentRecord record;
  record.file = ioDocument.Name();
  record.kind = ioDocument.Kind();
  record.version = ioDocument.Version();
  ZORClashParsing& reader = ioDocument.Reader();

  ZORUnicodeString version, reference, responsible;
  DOM_Node date, specification;
  int declared = 0;
  reader.GetClashGeneralInfos(version, reference, date, specification, declared, responsible);
  record.reference = Utf8(reference);
  record.responsible = Utf8(responsible);
  record.date = AllAttributes(date);
  record.specification = AllAttributes(specification);
  record.results = ReadResultSets(ioDocument);
  record.interferences = ioDocument.HasInterferences() ? CountInterferences(ioDocument) : 0;
  reader.GetSpecInfos(record.specifications);
  if (record.kind == DocumentKind::kComponents)
    record.components = CountElements(ioDocument.Root(), nullptr);
  record.links = CountElements(reader.GetElementsNode(), nullptr);
  record.serverMarker = Utf8(reader.GetServerMarker());
  record.transaction = Utf8(reader.GetTransaction());
  record.prcName = Utf8(reader.GetPRCName());
  if (record.kind == DocumentKind::kErrors) {
    ZORUnicodeString message;
    ErrorRecord error;
    reader.GetErrorId(message, error.id);
    error.message = Utf8(message);
    record.error = error;
  }
  return record;
}

std::vector<ComponentRecord> ReadComponents(ClashDocument& ioDocument) {
  std::vector<ComponentRecord> components;
  if (ioDocument.Kind() != DocumentKind::kComponents) return components;
  ZORClashParsing& reader = ioDocument.Reader();
  int position = 0;
  for (DOM_Node node = ioDocument.Root().getFirstChild(); !node.isNull();
       node = node.getNextSibling(), ++position) {
    if (node.getNodeType() != DOM_Node::ELEMENT_NODE) continue;
    ComponentRecord record;
    record.position = position;
    record.id = Utf8(reader.GetPrdId(position));
    record.type = Utf8(reader.GetPrdType(position));
    record.partNumber = Utf8(reader.GetCompoAttr(position, "PartNumber"));
    record.uuid = Utf8(reader.GetCompoAttr(position, "ComponentUuid"));
    record.documentVersion = Utf8(reader.GetCompoAttr(position, "DocumentVersionUUID"));
    record.alien = Utf8(reader.GetCompoAttr(position, "Alien"));
    ReadAttributes(node, record);
    record.shapes = ReadShapes(reader, position);
    record.placement = ReadPlacement(reader, position, node);
    components.push_back(std::move(record));
  }
  return components;
}

std::vector<SpecificationRecord> ReadSpecifications(ClashDocument& ioDocument) {
  std::vector<SpecificationRecord> specifications;
  int count = 0;
  ioDocument.Reader().GetSpecInfos(count);
  for (int i = 1; i <= count; ++i) {
    ZORUnicodeString alias[2], id[2], version[2], alien[2], shape[2];
    ioDocument.Reader().GetProductsInSpec(i, alias[0], alias[1], id[0], id[1], version[0],
                                          version[1], alien[0], alien[1], shape[0], shape[1]);
    SpecificationRecord record;
    record.index = i;
    for (std::size_t set = 0; set < 2; ++set)
      record.products[set] = {Utf8(alias[set]), Utf8(id[set]), Utf8(version[set]), Utf8(alien[set]),
                              Utf8(shape[set])};
    specifications.push_back(std::move(record));
  }
  return specifications;
}

std::vector<LinkRecord> ReadLinks(ClashDocument& ioDocument) {
  std::vector<LinkRecord> links;
  ZORClashParsing& reader = ioDocument.Reader();
  ForEachElement(reader.GetElementsNode(), nullptr, [&](const DOM_Node& inElement) {
    ZORUnicodeString link, name[2], id[2], url[2];
    reader.GetAttOfLinkedElement(inElement, link, name[0], name[1], id[0], id[1], url[0], url[1]);
    LinkRecord record;
    record.link = Utf8(link);
    for (std::size_t i = 0; i < 2; ++i)
      record.products[i] = {Utf8(name[i]), Utf8(id[i]), Utf8(url[i])};
    links.push_back(std::move(record));
  });
  return links;
}

}  // namespace ZORToolkit

namespace fs = std::filesystem;
using ZORFoundation::NativePath;

namespace ZORToolkit {
namespace {

constexpr const char* kLogicalScheme = "ZORDLN://";

fs::path DirectoryOf(const std::string& inFederator) {
  return inFederator == "-" ? fs::current_path()
                            : fs::absolute(NativePath(inFederator)).parent_path();
}

/// The path without links and dots as far as it exists.
fs::path Canonical(const fs::path& inPath) {
  std::error_code failure;
  const fs::path canonical = fs::weakly_canonical(inPath, failure);
  return failure ? inPath.lexically_normal() : canonical;
}

std::string WithSlashes(std::string inPath) {
  std::replace(inPath.begin(), inPath.end(), '\\', '/');
  return inPath;
}

std::string WhatIsWrongWith(const std::string& inPath) {
  if (inPath.empty()) return "missing: unknown logical name";
  std::error_code error;  // such as a loop of links, which opening the file names
  if (!fs::exists(NativePath(inPath), error) && !error) return "missing";
  try {
    const ClashDocument document(inPath);
    return document.HasInterferences() ? ""
                                       : std::string("wrong kind: ") + Description(document.Kind());
  } catch (const Error& failure) {
    std::string reason = failure.what();
    if (reason.starts_with(inPath + ":")) reason.erase(0, inPath.size() + 1);
    return "unreadable: " + reason.substr(std::min(reason.size(), reason.find_first_not_of(' ')));
  }
}

}  // namespace

std::string LinkTo(const std::string& inFile, const std::string& inFederator) {
  const fs::path file = NativePath(inFile);
  if (file.is_absolute()) return inFile;
  return Canonical(fs::absolute(file))
      .lexically_relative(Canonical(DirectoryOf(inFederator)))
      .generic_string();
}

std::string LinkedPath(const std::string& inLink, const std::string& inFederator) {
  std::string link = inLink;
  if (link.find(kLogicalScheme) != std::string::npos) {
    link = WithSlashes(Utf8(BuildPath::TransformPathnameFromDLName(FromUtf8(link))));
    if (link.empty() || link == "error") return {};
  }
  const fs::path path = DirectoryOf(inFederator) / NativePath(link);
  std::error_code ignored;
  // Documents from the library's home system separate folders by backslashes.
  if (!fs::exists(path, ignored) && link.find('\\') != std::string::npos)
    return (DirectoryOf(inFederator) / NativePath(WithSlashes(link))).string();
  return path.string();
}

std::vector<std::string> CheckLinks(const std::vector<LinkRecord>& inLinks,
                                    const std::string& inFederator) {
  std::vector<std::string> problems;
  std::set<fs::path> seen;
  for (const LinkRecord& link : inLinks) {
    const std::string path = LinkedPath(link.link, inFederator);
    std::string problem = link.link.empty() ? "missing: the link is empty" : WhatIsWrongWith(path);
    if (!path.empty() && !seen.insert(Canonical(NativePath(path))).second)
      problem += problem.empty() ? "listed twice" : ", listed twice";
    problems.push_back(problem);
  }
  return problems;
}

}  // namespace ZORToolkit
