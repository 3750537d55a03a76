#include <algorithm>
#include <map>
#include <set>

#include "foundation/PluginLoader.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/exchange/ExchangeLibrary.h"
#include "toolkit/exchange/ExchangeXml.h"
#include "toolkit/exchange/bcf/BcfFile.h"
#include "toolkit/exchange/bcf/BcfNames.h"
#include "toolkit/records/InterferenceRecord.h"

namespace ZORToolkit {

void* ExchangeFunction(const char* inName) {
  std::string reason;
  void* const function = ZORFoundation::FindPluginFunction("ZORExchange", inName, reason);
  if (function == nullptr)
    throw Error("the library of foreign formats cannot be loaded: " + reason);
  return function;
}

namespace {

std::string FileName(std::string_view inName) {
  return std::string(inName.substr(inName.rfind('/') + 1));
}

std::string FolderOf(const std::string& inName) {
  const std::size_t slash = inName.rfind('/');
  return slash == std::string::npos ? "" : inName.substr(0, slash);
}

/// Trimmed: white space around names, words and numbers means nothing.
std::string WordOf(const DOM_Node& inElement) {
  const std::string text = TextOf(inElement);
  const std::size_t begin = text.find_first_not_of(" \t\r\n");
  if (begin == std::string::npos) return {};
  return text.substr(begin, text.find_last_not_of(" \t\r\n") - begin + 1);
}

std::string ChildWord(const DOM_Node& inParent, const char* inName) {
  return WordOf(Child(inParent, inName));
}

double ChildNumber(const DOM_Node& inParent, const char* inName) {
  return Number(ChildWord(inParent, inName)).value.value_or(0);
}

std::array<double, 3> ChildTriple(const DOM_Node& inParent, const char* inName) {
  const DOM_Node triple = Child(inParent, inName);
  return {ChildNumber(triple, "X"), ChildNumber(triple, "Y"), ChildNumber(triple, "Z")};
}

/// The elements of a name, directly below or, as later versions have them, within a list.
template <class Visit>
void ForEachListed(const DOM_Node& inParent, const char* inList, const char* inName,
                   const Visit& inVisit) {
  ForEachLocal(inParent, inList,
               [&](const DOM_Node& inOuter) { ForEachLocal(inOuter, inName, inVisit); });
  if (std::string_view(inList) != inName) ForEachLocal(inParent, inName, inVisit);
}

// Viewpoints

BcfComponent ComponentIn(const DOM_Node& inElement) {
  return {AttributeText(inElement, "IfcGuid"), ChildWord(inElement, "OriginatingSystem"),
          ChildWord(inElement, "AuthoringToolId")};
}

std::vector<BcfComponent> ComponentsIn(const DOM_Node& inParent) {
  std::vector<BcfComponent> components;
  ForEachListed(inParent, "Components", "Component",
                [&](const DOM_Node& inElement) { components.push_back(ComponentIn(inElement)); });
  return components;
}

bool IsTrue(const std::string& inText) { return inText == "true" || inText == "1"; }

/// Version 2.0 says everything at the component itself.
void ReadOldComponent(const DOM_Node& inElement, BcfView& ioView) {
  const BcfComponent component = ComponentIn(inElement);
  if (IsTrue(AttributeText(inElement, "Selected"))) ioView.selection.push_back(component);
  const std::string visible = AttributeText(inElement, "Visible");
  if (visible.empty() || IsTrue(visible)) ioView.exceptions.push_back(component);
  const std::string colour = AttributeText(inElement, "Color");
  if (!colour.empty()) ioView.colouring.push_back({colour, {component}});
}

void ReadComponents(const DOM_Node& inComponents, BcfView& ioView) {
  ForEachLocal(inComponents, "Component",
               [&](const DOM_Node& inElement) { ReadOldComponent(inElement, ioView); });
  const std::vector<BcfComponent> selected = ComponentsIn(Child(inComponents, "Selection"));
  ioView.selection.insert(ioView.selection.end(), selected.begin(), selected.end());
  const DOM_Node visibility = Child(inComponents, "Visibility");
  if (!visibility.isNull()) {
    ioView.isVisibleByDefault = IsTrue(AttributeText(visibility, "DefaultVisibility"));
    ioView.exceptions = ComponentsIn(Child(visibility, "Exceptions"));
  }
  ForEachLocal(Child(inComponents, "Coloring"), "Color", [&](const DOM_Node& inColour) {
    ioView.colouring.push_back({AttributeText(inColour, "Color"), ComponentsIn(inColour)});
  });
}

BcfView ViewIn(const DOM_Node& inRoot) {
  BcfView view;
  ReadComponents(Child(inRoot, "Components"), view);
  for (const char* const name : {"PerspectiveCamera", "OrthogonalCamera"}) {
    const DOM_Node element = Child(inRoot, name);
    if (element.isNull()) continue;
    BcfCamera& camera = view.camera.emplace();
    camera.isPerspective = name[0] == 'P';
    camera.point = ChildTriple(element, "CameraViewPoint");
    camera.direction = ChildTriple(element, "CameraDirection");
    camera.up = ChildTriple(element, "CameraUpVector");
    camera.fieldOfView = ChildNumber(element, "FieldOfView");
    camera.viewToWorld = ChildNumber(element, "ViewToWorldScale");
    camera.aspectRatio = ChildNumber(element, "AspectRatio");
    break;
  }
  const auto count = [&](const char* inList, const char* inName, int& outCount) {
    ForEachLocal(Child(inRoot, inList), inName, [&](const DOM_Node&) { ++outCount; });
  };
  count("Lines", "Line", view.lines);
  count("ClippingPlanes", "ClippingPlane", view.clippingPlanes);
  count("Bitmaps", "Bitmap", view.bitmaps);
  ForEachLocal(inRoot, "Bitmap", [&](const DOM_Node&) { ++view.bitmaps; });
  return view;
}

// Topics

BcfComment CommentIn(const DOM_Node& inElement) {
  BcfComment comment;
  comment.guid = AttributeText(inElement, "Guid");
  comment.date = ChildWord(inElement, "Date");
  comment.author = ChildWord(inElement, "Author");
  comment.text = TextOf(Child(inElement, "Comment"));
  comment.viewpoint = AttributeText(Child(inElement, "Viewpoint"), "Guid");
  comment.modifiedDate = ChildWord(inElement, "ModifiedDate");
  comment.modifiedAuthor = ChildWord(inElement, "ModifiedAuthor");
  return comment;
}

BcfDocumentReference DocumentIn(const DOM_Node& inElement) {
  BcfDocumentReference reference;
  reference.guid = AttributeText(inElement, "Guid");
  for (const char* const name : {"ReferencedDocument", "DocumentGuid", "Url"})
    if (reference.document.empty()) reference.document = ChildWord(inElement, name);
  reference.description = ChildWord(inElement, "Description");
  return reference;
}

void ReadTopicTexts(const DOM_Node& inElement, BcfTopic& ioTopic) {
  ioTopic.guid = AttributeText(inElement, "Guid");
  ioTopic.type = AttributeText(inElement, "TopicType");
  ioTopic.status = AttributeText(inElement, "TopicStatus");
  ioTopic.title = ChildWord(inElement, "Title");
  ioTopic.priority = ChildWord(inElement, "Priority");
  ioTopic.description = TextOf(Child(inElement, "Description"));
  ioTopic.stage = ChildWord(inElement, "Stage");
  ioTopic.assignedTo = ChildWord(inElement, "AssignedTo");
  ioTopic.creationDate = ChildWord(inElement, "CreationDate");
  ioTopic.creationAuthor = ChildWord(inElement, "CreationAuthor");
  ioTopic.modifiedDate = ChildWord(inElement, "ModifiedDate");
  ioTopic.modifiedAuthor = ChildWord(inElement, "ModifiedAuthor");
  ioTopic.dueDate = ChildWord(inElement, "DueDate");
  // A label of version 2 is an element "Labels"; in version 3 that holds them.
  ForEachLocal(inElement, "Labels", [&](const DOM_Node& inLabels) {
    if (const std::string label = WordOf(inLabels); !label.empty()) ioTopic.labels.push_back(label);
    ForEachLocal(inLabels, "Label",
                 [&](const DOM_Node& inLabel) { ioTopic.labels.push_back(WordOf(inLabel)); });
  });
  ForEachListed(inElement, "ReferenceLinks", "ReferenceLink",
                [&](const DOM_Node& inLink) { ioTopic.referenceLinks.push_back(WordOf(inLink)); });
  ForEachListed(inElement, "RelatedTopics", "RelatedTopic", [&](const DOM_Node& inRelated) {
    ioTopic.relatedTopics.push_back(AttributeText(inRelated, "Guid"));
  });
  ForEachListed(
      inElement, "DocumentReferences", "DocumentReference",
      [&](const DOM_Node& inReference) { ioTopic.documents.push_back(DocumentIn(inReference)); });
}

void ReadViewpoint(const DOM_Node& inElement, BcfTopic& ioTopic) {
  BcfViewpoint& viewpoint = ioTopic.viewpoints.emplace_back();
  viewpoint.guid = AttributeText(inElement, "Guid");
  viewpoint.file = ChildWord(inElement, "Viewpoint");
  viewpoint.snapshot = ChildWord(inElement, "Snapshot");
}

BcfTopic TopicIn(const DOM_Node& inMarkup, const std::string& inFolder) {
  BcfTopic topic;
  topic.folder = inFolder;
  const DOM_Node element = Child(inMarkup, "Topic");
  ReadTopicTexts(element, topic);
  if (topic.guid.empty()) topic.guid = FileName(inFolder);
  const auto readComment = [&](const DOM_Node& inComment) {
    topic.comments.push_back(CommentIn(inComment));
  };
  ForEachLocal(inMarkup, "Comment", readComment);
  ForEachLocal(Child(element, "Comments"), "Comment", readComment);
  ForEachLocal(inMarkup, "Viewpoints",
               [&](const DOM_Node& inViewpoint) { ReadViewpoint(inViewpoint, topic); });
  ForEachLocal(Child(element, "Viewpoints"), "ViewPoint",
               [&](const DOM_Node& inViewpoint) { ReadViewpoint(inViewpoint, topic); });
  return topic;
}

bool IsOfVersion3(const DOM_Node& inMarkup) {
  const DOM_Node topic = Child(inMarkup, "Topic");
  return !Child(topic, "Comments").isNull() || !Child(topic, "Viewpoints").isNull() ||
         !Child(topic, "DocumentReferences").isNull();
}

/// Takes the entries as they come; what refers to others is looked up at the end.
class BcfCollector {
 public:
  explicit BcfCollector(std::string inPath) : path_(std::move(inPath)) {}

  static bool Wants(std::string_view inName) {
    const std::string name = LowerCase(FileName(inName));
    return name == "markup.bcf" || name.ends_with(".bcfv") || name == "bcf.version" ||
           name == "project.bcfp" || IsAttachedResult(inName);
  }

  void Add(ArchiveEntry&& inEntry) {
    const std::string file = LowerCase(FileName(inEntry.name));
    const std::string name = path_ + ": " + inEntry.name;
    names_.insert(LowerCase(inEntry.name));
    if (IsAttachedResult(inEntry.name)) {
      project_.attachedResult = std::move(inEntry.bytes);
    } else if (file == "bcf.version") {
      hasVersion_ = true;
      const DOM_Node root = ParseXml(name, inEntry.bytes);
      project_.version = AttributeText(root, "VersionId");
      if (project_.version.empty()) project_.version = ChildWord(root, "DetailedVersion");
    } else if (file == "project.bcfp") {
      const DOM_Node element = Child(ParseXml(name, inEntry.bytes), "Project");
      project_.guid = AttributeText(element, "ProjectId");
      project_.name = ChildWord(element, "Name");
    } else if (file == "markup.bcf") {
      AddTopic(ParseXml(name, inEntry.bytes), FolderOf(inEntry.name));
    } else if (file.ends_with(".bcfv")) {
      views_[LowerCase(inEntry.name)] = ViewIn(ParseXml(name, inEntry.bytes));
    }
  }

  BcfProject Finish() {
    if (!hasVersion_ && project_.topics.empty())
      throw Error(path_, "is no BCF file: it has neither bcf.version nor a topic");
    if (project_.version.empty()) project_.version = isOfVersion3_ ? "3.0" : "2.1";
    for (BcfTopic& topic : project_.topics) FindFiles(topic);
    return std::move(project_);
  }

 private:
  void AddTopic(const DOM_Node& inMarkup, const std::string& inFolder) {
    isOfVersion3_ = isOfVersion3_ || IsOfVersion3(inMarkup);
    project_.topics.push_back(TopicIn(inMarkup, inFolder));
  }

  /// The first versions need not list files that have the usual names.
  void FindFiles(BcfTopic& ioTopic) {
    const std::string folder = ioTopic.folder.empty() ? "" : LowerCase(ioTopic.folder) + "/";
    if (ioTopic.viewpoints.empty() && names_.contains(folder + kFirstViewpoint)) {
      BcfViewpoint& usual = ioTopic.viewpoints.emplace_back();
      usual.file = kFirstViewpoint;
      if (names_.contains(folder + kFirstSnapshot)) usual.snapshot = kFirstSnapshot;
    }
    for (BcfViewpoint& viewpoint : ioTopic.viewpoints) {
      const auto view = views_.find(folder + LowerCase(viewpoint.file));
      viewpoint.hasFile = !viewpoint.file.empty() && view != views_.end();
      if (viewpoint.hasFile) viewpoint.view = view->second;
      viewpoint.hasSnapshot =
          !viewpoint.snapshot.empty() && names_.contains(folder + LowerCase(viewpoint.snapshot));
    }
  }

  std::string path_;
  BcfProject project_;
  bool hasVersion_ = false, isOfVersion3_ = false;
  std::set<std::string> names_;  // in lower case, as views_
  std::map<std::string, BcfView> views_;
};

}  // namespace

int BcfTopic::Snapshots() const {
  return static_cast<int>(std::ranges::count_if(
      viewpoints, [](const BcfViewpoint& inViewpoint) { return !inViewpoint.snapshot.empty(); }));
}

bool LooksLikeBcf(const std::string& inPath) {
  const std::string name = LowerCase(inPath);
  if (inPath == "-") return false;
  if (name.ends_with(".bcf") || name.ends_with(".bcfzip")) return true;
  try {
    const ZORFoundation::Descriptor file = ZORFoundation::OpenForReading(inPath);
    char begin[4] = {};
    return ZORFoundation::ReadSome(file.Get(), begin, sizeof begin, inPath) == sizeof begin &&
           std::string_view(begin, 2) == "PK" && begin[2] < 8;
  } catch (const ZORFoundation::FileError&) {
    return false;  // whoever reads it next says why
  }
}

BcfProject ReadBcf(const std::string& inPath) {
  try {
    ZORFoundation::OpenForReading(inPath);
  } catch (const ZORFoundation::FileError& error) {
    throw Error(error.Path(), error.Reason());
  }
  BcfCollector collector(inPath);
  std::string reason;
  if (!FindExchangeFunction<ReadArchiveFunction>(kReadArchiveName)(
          inPath, &BcfCollector::Wants,
          [&](ArchiveEntry&& inEntry) { collector.Add(std::move(inEntry)); }, reason))
    throw Error(inPath, reason);
  return collector.Finish();
}

}  // namespace ZORToolkit
