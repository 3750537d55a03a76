// Changes of a clash-result document, and writing it.
#ifndef ZOR_TOOLKIT_RECORDS_CLASH_DOCUMENT_EDIT_H
#define ZOR_TOOLKIT_RECORDS_CLASH_DOCUMENT_EDIT_H

#include <array>
#include <memory>
#include <string>
#include <vector>

#include "platform/system/ZORResult.h"
#include "toolkit/records/DocumentRecords.h"

namespace ZORToolkit {

/// What stands before the root of a written document: the identifier of its document type, the
/// reference of its style sheet, the name in the document type; empty for none.
struct Prologue {
  std::string dtd, styleSheet;
  std::string typeName;  ///< empty: that of the root
  bool hasDeclaration = true;
};

/// Whether a text can be the name of an element.
ZOR_TOOLKIT_EXPORT bool IsXmlName(const std::string& inText);

/// Edits a loaded document through the handles of its records; records that were read before do not
/// change. Texts are UTF-8. A handle must be of the edited document and not empty.
class ZOR_TOOLKIT_EXPORT ClashDocumentEdit {
 public:
  /// @param ioDocument lives as long as this.
  explicit ClashDocumentEdit(ClashDocument& ioDocument) : document_(ioDocument) {}

  // Of an interference
  /// @param inStatus "Relevant", "Irrelevant" or "Not inspected", written in the current language of
  ///                 the message catalogues; another text as it stands.
  void SetStatus(const ElementHandle& inInterference, const std::string& inStatus);
  /// @param inRetrieve "Old" or "New", likewise.
  void SetRetrieve(const ElementHandle& inInterference, const std::string& inRetrieve);
  /// The words of an interference as they are to stand, in whatever language.
  void SetStatusAsWritten(const ElementHandle& inInterference, const std::string& inText);
  void SetRetrieveAsWritten(const ElementHandle& inInterference, const std::string& inText);
  /// An empty comment takes the "Comment" elements out.
  void SetComment(const ElementHandle& inInterference, const std::string& inComment);
  /// The one "Picture"; an empty reference takes all out.
  void SetPicture(const ElementHandle& inInterference, const std::string& inReference);
  /// Takes out the previews of all its products.
  void RemovePreviews(const ElementHandle& inInterference);
  /// The preview of a product; an empty reference takes it out.
  void SetPreview(const ElementHandle& inProduct, const std::string& inReference);
  /// Takes an interference out. Its handle stays valid, but for no other edit.
  void Remove(const ElementHandle& inInterference);

  // Of the document
  /// Declares in each result set as many interferences as it has.
  void RecountInterferences();
  /// Takes in the interferences and specifications of another clash document.
  /// @param ioTrace a line for each step is appended.
  /// Raises Error when there is no result set to take them.
  void TakeIn(ClashDocument& inOther, std::string& ioTrace);
  /// Appends a link to a federator document.
  void AddLink(const LinkRecord& inLink);

  /// Writes the document. Document types and style sheets of its own that the prologue replaces are
  /// taken out first.
  /// @param inPath UTF-8.
  /// @return a negative code when the file cannot be written.
  HRESULT Dump(const Prologue& inPrologue, const std::string& inPath);

 private:
  void SetWord(const ElementHandle& inInterference, const char* inAttribute,
               const std::string& inWord);
  void SetOnlyChild(const ElementHandle& inParent, const char* inName, const char* inAttribute,
                    const std::string& inValue);
  void RemoveReplaced(const Prologue& inPrologue);
  const DOMString& WordText(const std::string& inText);

  ClashDocument& document_;
  // The same few words are set again and again; by their lengths.
  struct KnownWord {
    std::string word;
    DOMString text;
  };
  std::array<KnownWord, 16> words_;
};

/// Folds clash documents into one: the first takes in the others. Raises Error for a document of
/// another kind.
/// @param inSumsCounts declares the interferences that are there, not the sum of what was declared.
/// @param ioTrace a line for each step is appended.
ZOR_TOOLKIT_EXPORT std::unique_ptr<ClashDocument> MergeClashes(
    const std::vector<std::string>& inPaths, bool inSumsCounts, std::string& ioTrace);

/// Writes a federator document without links. @return as ClashDocumentEdit::Dump.
ZOR_TOOLKIT_EXPORT HRESULT CreateFederator(const Prologue& inPrologue, const std::string& inPath);

}  // namespace ZORToolkit

#endif
