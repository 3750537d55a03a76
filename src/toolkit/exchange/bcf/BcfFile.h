// BCF files, by which coordination tools hand issues to each other: versions 2.0 to 3.0.
#ifndef ZOR_TOOLKIT_EXCHANGE_BCF_BCF_FILE_H
#define ZOR_TOOLKIT_EXCHANGE_BCF_BCF_FILE_H

#include <array>
#include <optional>
#include <string>
#include <vector>

#include "ZORToolkitExport.h"

namespace ZORToolkit {

// Texts are UTF-8 as the file has them, empty where it has none. Lengths are metres.

/// An object of the model, by its GUID and by the names that tools have for it.
struct BcfComponent {
  std::string ifcGuid, originatingSystem, authoringToolId;
};

/// Components that are shown in a colour.
struct BcfColouring {
  std::string colour;  ///< hexadecimal RRGGBB or AARRGGBB
  std::vector<BcfComponent> components;
};

/// The camera of a viewpoint. Directions need not be unit vectors.
struct BcfCamera {
  bool isPerspective = true;
  std::array<double, 3> point{}, direction{}, up{};
  double fieldOfView = 0;  ///< of perspective: vertical, degrees
  double viewToWorld = 0;  ///< else: what the picture's height shows, metres
  double aspectRatio = 0;  ///< width by height; 0 where the file does not say
};

/// What a file of a viewpoint holds.
struct BcfView {
  std::optional<BcfCamera> camera;
  std::vector<BcfComponent> selection, exceptions;
  bool isVisibleByDefault = false;
  std::vector<BcfColouring> colouring;
  int lines = 0, clippingPlanes = 0, bitmaps = 0;
};

/// A viewpoint of a topic, with its snapshot.
struct BcfViewpoint {
  std::string guid;
  std::string file, snapshot;  ///< names in the topic's folder
  bool hasFile = false;        ///< whether they are in the archive
  bool hasSnapshot = false;
  BcfView view;
};

/// A comment on a topic. Dates are as the file has them, in the form of XML.
struct BcfComment {
  std::string guid, date, author, text, viewpoint, modifiedDate, modifiedAuthor;
};

/// A document that a topic refers to.
struct BcfDocumentReference {
  std::string guid, document, description;  ///< document: a name, a URL or a document's GUID
};

/// An issue, with its comments and viewpoints.
struct BcfTopic {
  std::string folder;  ///< in the archive
  std::string guid, type, status, title, priority, description, stage, assignedTo;
  std::string creationDate, creationAuthor, modifiedDate, modifiedAuthor, dueDate;
  std::vector<std::string> labels, referenceLinks, relatedTopics;
  std::vector<BcfDocumentReference> documents;
  std::vector<BcfComment> comments;
  std::vector<BcfViewpoint> viewpoints;

  /// @return the number of viewpoints with a snapshot.
  ZOR_TOOLKIT_EXPORT int Snapshots() const;
};

/// All that a BCF file holds.
struct BcfProject {
  std::string version;  ///< "2.0", "2.1", "3.0"; where no file says, what its structure is of
  std::string guid, name;
  std::vector<BcfTopic> topics;  ///< in the order of the archive
  /// The clash result that a BCF file of ours carries; empty in others.
  std::string attachedResult;
};

/// Whether a file is to be taken for BCF: it begins like a zip archive, or its name ends in .bcf or
/// .bcfzip.
ZOR_TOOLKIT_EXPORT bool LooksLikeBcf(const std::string& inPath);

/// Reads the BCF file of any tool. Versions may be missing, names may have backslashes, letter case
/// and folders of their own, texts any encoding of XML. Raises Error, in one line, for what is no
/// BCF file, an archive that is encrypted, damaged or a threat (see ExchangeLibrary.h), XML that is
/// not well-formed or has a document type.
ZOR_TOOLKIT_EXPORT BcfProject ReadBcf(const std::string& inPath);

}  // namespace ZORToolkit

#endif
