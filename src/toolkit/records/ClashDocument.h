// A clash-result document and its reader.
#ifndef ZOR_TOOLKIT_RECORDS_CLASH_DOCUMENT_H
#define ZOR_TOOLKIT_RECORDS_CLASH_DOCUMENT_H

#include <initializer_list>
#include <memory>
#include <string>

#include "ZORClashParsing.h"
#include "toolkit/Error.h"

namespace ZORToolkit {

enum class DocumentKind { kClash, kInterference, kFederator, kComponents, kErrors };

/// @return the name of the root element of such a document.
ZOR_TOOLKIT_EXPORT const char* RootName(DocumentKind inKind);
/// @return what to call it in a sentence, such as "a clash document".
ZOR_TOOLKIT_EXPORT const char* Description(DocumentKind inKind);

/// A loaded document, held with its reader. Whatever keeps it from being read raises Error with the
/// place, as far as there is one, and the reason: after construction it is a document of a known
/// kind.
class ZOR_TOOLKIT_EXPORT ClashDocument {
 public:
  /// @param inPath path of a regular file, or "-" for standard input.
  explicit ClashDocument(const std::string& inPath);
  /// A document in memory. @param inName what errors call it.
  ClashDocument(const std::string& inName, std::string inBytes);
  ClashDocument(const ClashDocument&) = delete;
  ClashDocument& operator=(const ClashDocument&) = delete;
  ~ClashDocument();

  const std::string& Name() const { return name_; }
  DocumentKind Kind() const { return kind_; }
  /// A clash document or a single-interference document.
  bool HasInterferences() const;
  /// The root's "Version", "1.1" when a document that has versions does not say; else empty.
  std::string Version() const;
  /// Raises Error unless the document is of one of the kinds.
  /// @param inContent what other documents do not have, such as "interferences".
  void Require(std::initializer_list<DocumentKind> inKinds, const char* inContent) const;
  void RequireInterferences() const;

  // For what the toolkit's records do not hold
  DOM_Element Root() const { return document_.getDocumentElement(); }
  DOM_Document& Document() { return document_; }
  ZORClashParsing& Reader() { return *reader_; }

 private:
  void Load();

  std::string name_;
  std::string bytes_;  // the document while it is parsed, when it comes from memory
  std::unique_ptr<ZORClashParsing> reader_;
  DOM_Document document_;
  DocumentKind kind_ = DocumentKind::kClash;
};

}  // namespace ZORToolkit

#endif
