// A clash-result document that was given to the command.
#ifndef ZOR_TOOLS_LYRA_CLASH_RESULT_FILE_H
#define ZOR_TOOLS_LYRA_CLASH_RESULT_FILE_H

#include <initializer_list>
#include <memory>
#include <string>

#include "ZORClashParsing.h"

namespace lyra {

enum class DocumentKind { kClash, kInterference, kFederator, kComponents, kErrors };

/// @return the name of the root element of such a document.
const char* RootName(DocumentKind inKind);
/// @return what to call it in a sentence, such as "a clash document".
const char* Description(DocumentKind inKind);

/// A loaded document and its reader. Whatever keeps it from being read raises InputError with the
/// place, as far as there is one, and the reason: after construction it is a document of a known
/// kind.
class ClashResultFile {
 public:
  /// @param inPath path of a regular file, or "-" for standard input.
  explicit ClashResultFile(const std::string& inPath);
  /// A document in memory. @param inName what errors call it.
  ClashResultFile(const std::string& inName, std::string inBytes);
  ClashResultFile(const ClashResultFile&) = delete;
  ClashResultFile& operator=(const ClashResultFile&) = delete;
  ~ClashResultFile();

  const std::string& Name() const { return name_; }
  DocumentKind Kind() const { return kind_; }
  /// The root's "Version", "1.1" when a document that has versions does not say; else empty.
  std::string Version() const;
  DOM_Element Root() const { return document_.getDocumentElement(); }
  DOM_Document& Document() { return document_; }
  ZORClashParsing& Reader() { return *reader_; }

  /// Raises InputError unless the document is of one of the kinds.
  /// @param inContent what other documents do not have, such as "interferences".
  void Require(std::initializer_list<DocumentKind> inKinds, const char* inContent) const;

 private:
  void Load();

  std::string name_;
  std::string bytes_;  // the document while it is parsed, when it comes from memory
  std::unique_ptr<ZORClashParsing> reader_;
  DOM_Document document_;
  DocumentKind kind_ = DocumentKind::kClash;
};

}  // namespace lyra

#endif
