#include "toolkit/exchange/bcf/BcfWriter.h"

#include <algorithm>
#include <set>
#include <tuple>

#include "foundation/Hash.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/exchange/DocumentTimes.h"
#include "toolkit/exchange/ExchangeLibrary.h"
#include "toolkit/exchange/XmlText.h"
#include "toolkit/exchange/bcf/BcfNames.h"
#include "toolkit/exchange/bcf/BcfPictures.h"
#include "toolkit/exchange/bcf/BcfTopics.h"
#include "toolkit/exchange/bcf/BcfWords.h"
#include "toolkit/review/Match.h"

namespace ZORToolkit {
namespace {

constexpr char kSystem[] = "ZORLyra";
constexpr double kMetresOfMillimetres = 0.001;
constexpr double kPi = 3.14159265358979323846;
constexpr std::size_t kManyComponents = 1000;
constexpr const char* kTopicStatuses[] = {"Not inspected", "Relevant", "Irrelevant"};
constexpr const char* kTopicTypes[] = {"Clash", "Contact", "Clearance", "Interference"};

std::string Quoted(const std::string& inText) { return "\"" + inText + "\""; }

// Files of a topic

void WriteTriple(const char* inName, const ZORFoundation::Vector3d& inVector, double inScale,
                 XmlText& ioXml) {
  ioXml.Open(inName);
  ioXml.Leaf("X", inScale * inVector.x);
  ioXml.Leaf("Y", inScale * inVector.y);
  ioXml.Leaf("Z", inScale * inVector.z);
  ioXml.Close();
}

struct ShownComponent {
  std::string guid, tool;
  std::size_t colour = 0;  // of the two of a snapshot
};

class BcfFileWriter {
 public:
  BcfFileWriter(ClashDocument& ioResult, const BcfOptions& inOptions)
      : options_(inOptions),
        is30_(inOptions.version == BcfVersion::k30),
        about_(ReadDocument(ioResult)),
        result_(ReadForReview(ioResult)),
        ids_(StableIds(result_)),
        time_(TimeOf(about_)),
        author_(about_.responsible.empty() ? kSystem : about_.responsible),
        documentGuid_(GuidNamed("document " + about_.reference + "\n" + about_.file)) {
    documentGuid_.replace(0, std::string_view(kAttachedGuidStart).size(), kAttachedGuidStart);
    ForEachInterference(ioResult, RecordPart::kAll,
                        [&](const InterferenceRecord& inRecord) { records_.push_back(inRecord); });
    topics_ = PlanTopics(result_, ids_, inOptions.grouping ? &*inOptions.grouping : nullptr);
    Filter();
  }

  BcfWritten Write(const std::function<ZORIProduct_var()>& inOpenModel, const std::string& inPath) {
    constexpr std::size_t kFilesOfTopic = 3, kOtherFiles = 5;
    if (topics_.size() > (kMaxArchiveEntries - kOtherFiles) / kFilesOfTopic)
      throw Error(about_.file,
                  std::string("makes ") + std::to_string(topics_.size()) +
                      " topics, more than a BCF file has room for; group them, or choose some");
    SnapshotMaker maker(options_, about_.file);
    std::vector<const InterferenceRecord*> shown;
    for (const PlannedTopic& topic : topics_) shown.push_back(&Record(topic.representative));
    snapshots_ = maker.Make(shown, inOpenModel);
    const std::vector<NewArchiveEntry> entries = Entries();
    std::string reason;
    if (!FindExchangeFunction<WriteArchiveFunction>(kWriteArchiveName)(inPath, entries, reason))
      throw Error(about_.file, std::string("the BCF file cannot be written: ") + reason);
    BcfWritten written = Report();
    if (entries.size() > kMaxPlainArchiveEntries)
      written.warnings.emplace_back("tools that do not know zip64 cannot read so many topics");
    return written;
  }

 private:
  const InterferenceRecord& Record(int inPosition) const {
    return records_[static_cast<std::size_t>(inPosition)];
  }

  void Filter() {
    for (PlannedTopic& topic : topics_)
      std::erase_if(topic.members,
                    [&](int inMember) { return !options_.filter.Accepts(Record(inMember)); });
    std::erase_if(topics_, [](const PlannedTopic& inTopic) { return inTopic.members.empty(); });
    for (PlannedTopic& topic : topics_)
      if (std::ranges::find(topic.members, topic.representative) == topic.members.end())
        topic.representative = topic.members.front();
  }

  BcfWritten Report() const {
    BcfWritten written;
    written.topics = topics_.size();
    NotCarriedCounter counter;
    int mixed = 0;
    for (std::size_t i = 0; i < topics_.size(); ++i) {
      for (const int member : topics_[i].members) counter.Add(Record(member));
      written.interferences += topics_[i].members.size();
      written.pictures += snapshots_[i].showsProducts ? 1 : 0;
      mixed += topics_[i].hasOneStatus ? 0 : static_cast<int>(topics_[i].members.size());
      const std::size_t components = ComponentsOf(topics_[i]).size();
      if (components > kManyComponents)
        written.warnings.push_back("the topic " + Quoted(TitleOf(topics_[i])) + " has " +
                                   std::to_string(components) +
                                   " components, which many tools cannot show");
    }
    written.notCarried = counter.List();
    if (mixed > 0)
      written.notCarried.push_back(
          {"status, where those of a group differ", mixed, "in the attached result"});
    if (written.pictures < written.topics)
      written.warnings.push_back(std::to_string(written.topics - written.pictures) +
                                 " topics have a picture without products");
    return written;
  }

  std::vector<NewArchiveEntry> Entries() {
    std::vector<NewArchiveEntry> entries;
    entries.reserve(3 * topics_.size() + 5);
    const auto add = [&](const std::string& inName, auto inMake, bool inIsCompressed = true) {
      entries.push_back({inName, inMake, inIsCompressed});
    };
    add("bcf.version", [this] { return VersionFile(); });
    add("project.bcfp", [this] { return ProjectFile(); });
    add(is30_ ? "extensions.xml" : "extensions.xsd", [this] { return ExtensionsFile(); });
    if (is30_) add("documents.xml", [this] { return DocumentsFile(); });
    add(is30_ ? "documents/" + documentGuid_ : kAttachedResult,
        [this] { return options_.resultBytes; });
    for (std::size_t i = 0; i < topics_.size(); ++i) {
      const std::string folder = topics_[i].guid + "/";
      add(folder + "markup.bcf", [this, i] { return MarkupFile(topics_[i]); });
      add(folder + kFirstViewpoint, [this, i] { return ViewpointFile(topics_[i], snapshots_[i]); });
      // A PNG file is compressed already.
      add(
          folder + kFirstSnapshot, [this, i] { return PictureFile(snapshots_[i]); }, false);
    }
    return entries;
  }

  /// An existing picture, unchanged where BCF allows it as it is.
  static std::string PictureFile(Snapshot& ioSnapshot) {
    if (ioSnapshot.picture.empty()) return WhitePng();
    const std::string bytes = ZORFoundation::ReadWholeFile(ioSnapshot.picture).bytes;
    const std::optional<PictureSize> size = SizeOfPng(ioSnapshot.picture);
    if (size && std::max(size->width, size->height) <= kMaxSnapshotSize) return bytes;
    std::string png;
    ioSnapshot.showsProducts = FindExchangeFunction<PngFromPictureFunction>(kPngFromPictureName)(
        bytes, kMaxSnapshotSize, png);
    return ioSnapshot.showsProducts ? png : WhitePng();
  }

  // Files of the project

  std::string VersionFile() const {
    XmlText xml;
    if (is30_) return xml.Empty("Version", {{"VersionId", "3.0"}}).Take();
    return xml.Open("Version", {{"VersionId", "2.1"}})
        .Leaf("DetailedVersion", "2.1")
        .Close()
        .Take();
  }

  std::string ProjectFile() const {
    XmlText xml;
    xml.Open(is30_ ? "ProjectInfo" : "ProjectExtension");
    xml.Open("Project", {{"ProjectId", GuidNamed("project " + about_.reference)}});
    if (!about_.reference.empty()) xml.Leaf("Name", about_.reference);
    xml.Close();
    if (!is30_) xml.Leaf("ExtensionSchema", "extensions.xsd");
    return xml.Close().Take();
  }

  std::string DocumentsFile() const {
    XmlText xml;
    xml.Open("DocumentInfo").Open("Documents").Open("Document", {{"Guid", documentGuid_}});
    xml.Leaf("Filename", kAttachedResult).Leaf("Description", kAttachedDescription);
    return xml.Close().Close().Close().Take();
  }

  std::string ExtensionsFile() const {
    std::set<std::string> labels;
    for (const PlannedTopic& topic : topics_)
      labels.insert(topic.labels.begin(), topic.labels.end());
    const std::vector<std::string> users = {author_};
    XmlText xml;
    if (is30_) {
      xml.Open("Extensions");
      WriteWords("TopicTypes", "TopicType", kTopicTypes, xml);
      WriteWords("TopicStatuses", "TopicStatus", kTopicStatuses, xml);
      WriteWords("TopicLabels", "TopicLabel", labels, xml);
      WriteWords("Users", "User", users, xml);
      return xml.Close().Take();
    }
    xml.Open("xs:schema", {{"xmlns:xs", "http://www.w3.org/2001/XMLSchema"}});
    xml.Open("xs:redefine", {{"schemaLocation", "markup.xsd"}});
    WriteEnumeration("TopicType", kTopicTypes, xml);
    WriteEnumeration("TopicStatus", kTopicStatuses, xml);
    if (!labels.empty()) WriteEnumeration("TopicLabel", labels, xml);
    WriteEnumeration("UserIdType", users, xml);
    return xml.Close().Close().Take();
  }

  template <class Words>
  static void WriteWords(const char* inList, const char* inName, const Words& inWords,
                         XmlText& ioXml) {
    ioXml.Open(inList);
    for (const auto& word : inWords) ioXml.Leaf(inName, word);
    ioXml.Close();
  }
  template <class Words>
  static void WriteEnumeration(const char* inName, const Words& inWords, XmlText& ioXml) {
    ioXml.Open("xs:simpleType", {{"name", inName}});
    ioXml.Open("xs:restriction", {{"base", inName}});
    for (const auto& word : inWords) ioXml.Empty("xs:enumeration", {{"value", word}});
    ioXml.Close().Close();
  }

  // Files of a topic

  std::string TitleOf(const PlannedTopic& inTopic) const {
    if (!inTopic.groupLabel.empty())
      return inTopic.groupLabel + " (" + std::to_string(inTopic.members.size()) +
             (inTopic.members.size() == 1 ? " interference)" : " interferences)");
    const InterferenceRecord& record = Record(inTopic.representative);
    const std::string pair = PairOf(record);
    return TypeOf(record) + " " + std::to_string(record.index) + (pair.empty() ? "" : ": " + pair);
  }

  std::string DescriptionOf(const PlannedTopic& inTopic) const {
    constexpr std::size_t kMaxDescribed = 20;
    std::string text;
    for (std::size_t i = 0; i < std::min(inTopic.members.size(), kMaxDescribed); ++i)
      text += (i == 0 ? "" : "\n\n") + ZORToolkit::DescriptionOf(Record(inTopic.members[i]));
    if (inTopic.members.size() > kMaxDescribed)
      text += "\n\nand " + std::to_string(inTopic.members.size() - kMaxDescribed) +
              " more, in the attached result";
    return text;
  }

  std::string MarkupFile(const PlannedTopic& inTopic) const {
    XmlText xml;
    xml.Open("Markup");
    xml.Open("Topic", {{"Guid", inTopic.guid},
                       {"TopicType", TypeOf(Record(inTopic.representative))},
                       {"TopicStatus", inTopic.status}});
    xml.Leaf("Title", TitleOf(inTopic));
    WriteLabels(inTopic, xml);
    xml.Leaf("CreationDate", time_).Leaf("CreationAuthor", author_);
    xml.Leaf("Description", DescriptionOf(inTopic));
    WriteDocumentReference(inTopic, xml);
    if (!is30_) xml.Close();
    if (is30_ && !inTopic.comments.empty()) xml.Open("Comments");
    for (const PlannedComment& comment : inTopic.comments) {
      xml.Open("Comment", {{"Guid", comment.guid}}).Leaf("Date", time_).Leaf("Author", author_);
      xml.Leaf("Comment", comment.text).Close();
    }
    if (is30_ && !inTopic.comments.empty()) xml.Close();
    if (is30_) xml.Open("Viewpoints");
    xml.Open(is30_ ? "ViewPoint" : "Viewpoints", {{"Guid", ViewpointGuid(inTopic)}});
    xml.Leaf("Viewpoint", kFirstViewpoint).Leaf("Snapshot", kFirstSnapshot).Close();
    if (is30_) xml.Close().Close();
    return xml.Close().Take();
  }

  static std::string ViewpointGuid(const PlannedTopic& inTopic) {
    return GuidNamed("viewpoint " + inTopic.id);
  }

  void WriteLabels(const PlannedTopic& inTopic, XmlText& ioXml) const {
    if (inTopic.labels.empty()) return;
    if (is30_) ioXml.Open("Labels");
    for (const std::string& label : inTopic.labels) ioXml.Leaf(is30_ ? "Label" : "Labels", label);
    if (is30_) ioXml.Close();
  }

  void WriteDocumentReference(const PlannedTopic& inTopic, XmlText& ioXml) const {
    const std::string guid = GuidNamed("reference " + inTopic.id);
    if (is30_) {
      ioXml.Open("DocumentReferences").Open("DocumentReference", {{"Guid", guid}});
      ioXml.Leaf("DocumentGuid", documentGuid_).Leaf("Description", kAttachedDescription);
      ioXml.Close().Close();
      return;
    }
    ioXml.Open("DocumentReference", {{"Guid", guid}, {"isExternal", "false"}});
    ioXml.Leaf("ReferencedDocument", std::string("../").append(kAttachedResult));
    ioXml.Leaf("Description", kAttachedDescription).Close();
  }

  /// The products of all members, each once: one that is the first of some member has the first's
  /// colour.
  std::vector<ShownComponent> ComponentsOf(const PlannedTopic& inTopic) const {
    std::vector<ShownComponent> components;
    std::set<std::string> known;
    for (std::size_t which = 0; which < 2; ++which)
      for (const int member : inTopic.members) {
        const ProductRecord& product = Record(member).products[which];
        const std::string identity = IdentityOf(product);
        if (!product.exists || !known.insert(identity).second) continue;
        components.push_back({IfcGuidOf(identity), NameOf(product), which});
      }
    return components;
  }

  static void WriteComponent(const ShownComponent& inComponent, XmlText& ioXml) {
    ioXml.Open("Component", {{"IfcGuid", inComponent.guid}});
    ioXml.Leaf("OriginatingSystem", kSystem);
    if (!inComponent.tool.empty()) ioXml.Leaf("AuthoringToolId", inComponent.tool);
    ioXml.Close();
  }

  std::string ViewpointFile(const PlannedTopic& inTopic, const Snapshot& inSnapshot) const {
    XmlText xml;
    xml.Open("VisualizationInfo", {{"Guid", ViewpointGuid(inTopic)}});
    const std::vector<ShownComponent> components = ComponentsOf(inTopic);
    xml.Open("Components");
    if (!components.empty()) {
      xml.Open("Selection");
      for (const ShownComponent& component : components) WriteComponent(component, xml);
      xml.Close();
    }
    xml.Empty("Visibility", {{"DefaultVisibility", "true"}});
    if (!components.empty()) WriteColouring(components, inSnapshot, xml);
    xml.Close();
    WriteCamera(inSnapshot, xml);
    return xml.Close().Take();
  }

  void WriteColouring(const std::vector<ShownComponent>& inComponents, const Snapshot& inSnapshot,
                      XmlText& ioXml) const {
    ioXml.Open("Coloring");
    for (std::size_t i = 0; i < 2; ++i) {
      const auto hasColour = [&](const ShownComponent& inComponent) {
        return inComponent.colour == i;
      };
      if (std::ranges::none_of(inComponents, hasColour)) continue;
      ioXml.Open("Color", {{"Color", inSnapshot.colours[i]}});
      if (is30_) ioXml.Open("Components");
      for (const ShownComponent& component : inComponents)
        if (hasColour(component)) WriteComponent(component, ioXml);
      if (is30_) ioXml.Close();
      ioXml.Close();
    }
    ioXml.Close();
  }

  /// Version 2.1 has angles of 45 to 60 degrees only: from nearer, as much is seen around the
  /// focus.
  void WriteCamera(const Snapshot& inSnapshot, XmlText& ioXml) const {
    SnapshotCamera camera = inSnapshot.camera;
    constexpr double kLeast = 45 * kPi / 180, kMost = 60 * kPi / 180;
    if (camera.isPerspective && !is30_) {
      const double angle = std::clamp(camera.viewAngle, kLeast, kMost);
      const double distance =
          camera.focusDistance * std::tan(camera.viewAngle / 2) / std::tan(angle / 2);
      camera.eye = camera.eye + (camera.focusDistance - distance) * camera.sight;
      camera.viewAngle = angle;
    }
    ioXml.Open(camera.isPerspective ? "PerspectiveCamera" : "OrthogonalCamera");
    WriteTriple("CameraViewPoint", camera.eye, kMetresOfMillimetres, ioXml);
    WriteTriple("CameraDirection", camera.sight, 1, ioXml);
    WriteTriple("CameraUpVector", camera.up, 1, ioXml);
    // Rounded, since 45 degrees are to be no less.
    if (camera.isPerspective)
      ioXml.Leaf("FieldOfView", std::round(camera.viewAngle * 180 / kPi * 1e6) / 1e6);
    else
      ioXml.Leaf("ViewToWorldScale", kMetresOfMillimetres * camera.viewHeight);
    if (is30_) ioXml.Leaf("AspectRatio", inSnapshot.aspectRatio);
    ioXml.Close();
  }

  static constexpr char kAttachedDescription[] = "The clash result, with all that BCF cannot carry";

  const BcfOptions& options_;
  bool is30_;
  DocumentRecord about_;
  ReviewedResult result_;
  std::vector<std::string> ids_;
  std::string time_, author_, documentGuid_;
  std::vector<InterferenceRecord> records_;
  std::vector<PlannedTopic> topics_;
  std::vector<Snapshot> snapshots_;
};

}  // namespace

BcfWritten WriteBcf(ClashDocument& ioResult, const BcfOptions& inOptions,
                    const std::function<ZORIProduct_var()>& inOpenModel,
                    const std::string& inPath) {
  ioResult.RequireInterferences();
  return BcfFileWriter(ioResult, inOptions).Write(inOpenModel, inPath);
}

}  // namespace ZORToolkit
