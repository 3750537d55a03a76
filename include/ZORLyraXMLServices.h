// XML written tag by tag, federator documents, documents dumped to files, pictures.
#ifndef ZOR_LYRA_XML_SERVICES_H
#define ZOR_LYRA_XML_SERVICES_H

#include "ZORLyraExport.h"
#include "platform/system/ZORBaseUnknown.h"
#include "platform/system/ZORResult.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Node.h"

class ZOR3DViewpoint;
class ZORRep;

/// Writes XML text marker by marker into a text of its own, which DumpDocument then puts into a
/// file.
///
/// Typical use: construct; WriteXMLHeaderTag; for each element InitXMLMarkerWithAttr, AddAttr as
/// often as needed and CloseXMLAttrMarkerWithElem (or CloseXMLAttrMarkerWithoutElem for an empty
/// element), or InitXMLMarkerWithoutAttr; content through AddPCData; CloseXMLMarker; at the end
/// DumpDocument(path).
///
/// Nothing is escaped or checked: texts are appended as given (see BuildPath::CheckXMLString), and
/// balanced markers are the caller's responsibility.
///
/// Whether markup is laid out (with line feeds and spaces) or compact is shared by all writers of
/// the process, earlier ones included. It is compact until the first default construction; each
/// default construction selects the laid out form, CreateNewFederatorDocument and the DumpDocument
/// of a node select by their last argument. One thread at a time in the process.
class ZOR_LYRA_EXPORT ZORLyraXMLServices : public ZORBaseUnknown {
 public:
  // Building
  /// A writer without text. Selects the laid out form for all writers.
  ZORLyraXMLServices();
  /// A writer with a copy of the other's text. The shared form does not change.
  ZORLyraXMLServices(const ZORLyraXMLServices& inOther);
  ZORLyraXMLServices& operator=(const ZORLyraXMLServices& inOther);
  ~ZORLyraXMLServices() override;

  // Component
  static ZORMetaClass* MetaObject();
  static const char* ClassName();  ///< "ZORLyraXMLServices"
  static const CLSID& ClassId();
  /// @return null: no factory makes writers, they are constructed directly.
  static ZORBaseUnknown* CreateItself();
  ZORMetaClass* GetMetaObject() const override;
  const char* IsA() const override;  ///< "ZORLyraXMLServices"
  int IsAKindOf(const char* inClassName) const override;

  // Markers; the text that each appends, laid out form first where there are two
  /// <NAME and a space; the start tag stays open for attributes.
  void InitXMLMarkerWithAttr(ZORUnicodeString inName);
  /// <NAME> and a space, in both forms.
  void InitXMLMarkerWithoutAttr(ZORUnicodeString inName);
  /// NAME="VALUE" and a space, the value as it stands.
  void AddAttr(ZORUnicodeString inName, ZORUnicodeString inValue);
  void AddAttr(ZORUnicodeString inName, int inValue);  ///< in decimal
  /// @param inValue narrow text; null is the empty text.
  void AddAttr(ZORUnicodeString inName, char* inValue);
  /// Ends the start tag of an element with content: "> " and a line feed, or ">".
  void CloseXMLAttrMarkerWithElem();
  /// Ends the start tag of an empty element: "/> " and two line feeds, or "/>".
  void CloseXMLAttrMarkerWithoutElem();
  /// The text as it stands.
  void AddPCData(ZORUnicodeString inText);
  /// The end tag: a line feed, </NAME>, a space and a line feed; or just </NAME>.
  void CloseXMLMarker(ZORUnicodeString inName);
  /// The document's first lines: the XML declaration of the message catalogue (nothing without that
  /// catalogue), a document type (always, with an empty identifier too) and, when it is not empty,
  /// the style-sheet reference. What writers share is neither used, but for the form, nor changed.
  void WriteXMLHeaderTag(ZORUnicodeString inTypeName, ZORUnicodeString inDTDIdentifier,
                         ZORUnicodeString inStyleSheet);
  /// The style sheet that reports refer to: the setting "XslTemplate" of "ClashPublish", or without
  /// it "Ressources", a backslash and the message catalogue's file name.
  /// @return that path, logical names replaced as BuildPath::TransformPathnameFromDLName does.
  ZORUnicodeString getStyleSheetFromSetting();

  // Files
  /// Writes a federator document that links nothing yet, on one line: the XML declaration, a
  /// document type and a style-sheet reference where these are not empty, the root. The bytes are
  /// those of the narrow forms. Selects the form of all writers.
  /// @param inPath   its narrow form names the file, which is made or emptied.
  /// @param inIndent 1 selects the laid out form, any other value the compact one.
  /// @return S_OK, also when writing failed after the opening; E_FAIL when the file cannot be
  ///         opened.
  HRESULT CreateNewFederatorDocument(ZORUnicodeString inPath, ZORUnicodeString inDTDIdentifier,
                                     ZORUnicodeString inStyleSheet, int inIndent);
  /// Writes this writer's text into a file, as UTF-8. The text is kept.
  /// @return S_OK, or the platform's first negative code of opening, writing or closing. A file
  ///         that could not be written whole is left as it is.
  int DumpDocument(ZORUnicodeString inPath);
  /// Writes a node and all below it into a file, as UTF-8. The style-sheet reference and then the
  /// document type, where not empty and each after a line feed, are inserted after the first ">" of
  /// the text (at its start when there is none). Selects the form of all writers, on which the file
  /// does not depend.
  /// @param inTypeName name in the document type.
  /// @param inPrologue 1 puts the XML declaration of the message catalogue and a line feed in
  ///                   front; any other value puts nothing.
  /// @param inIndent   1 selects the laid out form of markers, any other value the compact one.
  /// @return S_OK, or the platform's negative code of serialising (no file is touched), opening or
  ///         writing.
  HRESULT DumpDocument(DOM_Node inNode, ZORUnicodeString inPath, ZORUnicodeString inDTDIdentifier,
                       ZORUnicodeString inStyleSheet, ZORUnicodeString inTypeName, int inPrologue,
                       int inIndent);
  /// Copies a file from one directory to another under the same name; an existing target is
  /// replaced.
  /// @return S_OK, or the platform's negative code of the copy. A path of 260 bytes or more does not
  ///         fit: nothing is copied then.
  HRESULT CopyFile(const char* inFileName, ZORUnicodeString inSourceDirectory,
                   ZORUnicodeString inTargetDirectory);

  // Pictures; nothing is reported
  /// Renders a representation, framed as a whole, in 756 by 506 pixels, surfaces shaded and hidden
  /// edges off, into a JPEG file, whatever the path's extension. A null representation, or one that
  /// cannot be rendered, writes no file; in the latter case the print image is not released.
  /// @param inRep            a ZOR3DRep.
  /// @param inPath           its narrow form names the file.
  /// @param inKeepBackground 0: white; any other value: the platform's own background.
  static void TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath, int inKeepBackground);
  /// The same in any size; the print image is always released.
  /// @param inWidth, inHeight in pixels, within the platform's limits.
  /// @param inViewMode       1: surfaces shaded and hidden edges off; any other value: the
  ///                         platform's defaults.
  static void TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath, int inWidth, int inHeight,
                           int inViewMode, int inKeepBackground);
  /// The same as the first, through a viewpoint instead of framed.
  /// @param inViewpoint never null; copied.
  static void TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath, ZOR3DViewpoint* inViewpoint,
                           int inKeepBackground);

 private:
  static ZORMetaClass* meta_object;  // null until first asked for

  ZORUnicodeString text_;
};

#endif
