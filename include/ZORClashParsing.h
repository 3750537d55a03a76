// The reader of clash-result documents.
#ifndef ZOR_CLASH_PARSING_H
#define ZOR_CLASH_PARSING_H

#include "ZORLyraExport.h"
#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/system/ZORListValZORUnicodeString.h"
#include "platform/system/ZORResult.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Document.h"
#include "platform/xml/DOM_Element.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "platform/xml/DOM_NodeList.h"

/// Reads a clash-result document from a file or from memory and answers questions about it.
///
/// Typical use: construct, LoadSequence once, then query. Before a successful load, and after one
/// that found no root element, every query answers as for a missing root. Outputs are filled in
/// place; unless stated otherwise, an output whose source is missing is left untouched. A missing
/// attribute reads as the empty string. Names are compared exactly and case-sensitively. What the
/// platform raises (on the default platform ZORXMLParseError for a malformed document) reaches the
/// caller.
///
/// Interferences are numbered from 1 in document order over all result sets. Component positions
/// count every child node of the root from 0, texts and comments included.
///
/// The document is shared with the caller: after a change by the caller the next answer is that of
/// the changed document. One thread at a time.
class ZOR_LYRA_EXPORT ZORClashParsing {
 public:
  // Building
  /// A reader on a file. The path is neither copied nor freed: it must stay valid and unchanged
  /// until LoadSequence has returned.
  explicit ZORClashParsing(char* inPath);
  /// A reader on inLength bytes in memory, neither copied nor freed, as with a path.
  ZORClashParsing(char* inBuffer, int inLength);
  /// A reader on nothing: neither source nor document is copied.
  ZORClashParsing(ZORClashParsing& inOther);
  /// Copies nothing. @return this reader, unchanged.
  ZORClashParsing& operator=(ZORClashParsing& inOther);
  virtual ~ZORClashParsing();

  // Loading
  /// Parses the source and recognises the kind of document. May be called again: the source is
  /// parsed once more.
  /// @param outKind      "ClashElement", "InterferenceElement", "FederatorClashElement",
  ///                     "Components", "Errors", or "Unknown" for another root element or none.
  /// @param outReference emptied first, then the root's "ZORDocument" for the first three kinds.
  /// @param ioVersion    for the first three kinds the root's "Version", "1.1" when that is empty;
  ///                     else untouched.
  /// @return S_OK (also for "Unknown" with a root); E_FAIL for a file that cannot be read (kind
  ///         untouched) or a document without root (kind "Unknown"); the platform's negative code
  ///         when it refuses the buffer.
  HRESULT LoadSequence(ZORUnicodeString& outKind, ZORUnicodeString& outReference,
                       ZORUnicodeString& ioVersion);
  /// Parses the source and hands the document out; no kind is recognised.
  /// @param outDocument the parsed document; untouched when nothing could be parsed.
  /// @param outKind     the root's name, whatever it is; untouched without root.
  /// @return S_OK with a root. Without root E_FAIL for a file, but for a buffer the code of the
  ///         platform's buffer source, normally S_OK: a caller that loads from memory must test the
  ///         document for a root itself.
  HRESULT LoadSequence(DOM_Document& outDocument, ZORUnicodeString& outKind);

  // Structure
  /// The root's children, of all node types; an empty list unless the kind is "ClashElement" or
  /// "FederatorClashElement".
  DOM_NodeList GetNodeList();
  /// The first element "Elements" of a "FederatorClashElement" document; else a null node.
  DOM_Node GetElementsNode();
  /// Finds the inIndex-th (from 1) child element of a name. The index must also be less than the
  /// number of all child nodes: a parent whose only child is the wanted element, with no space
  /// around it, does not deliver it.
  /// @return S_OK, or E_FAIL with outNode untouched. Nothing of the reader is used.
  HRESULT GetValideNode(DOM_Node inParent, int inIndex, ZORUnicodeString inName, DOM_Node& outNode);
  /// @param inPosition component position, not negative.
  /// @return 1 when that child of the root is an element of this name, else 0.
  int IsValideNode(int inPosition, ZORUnicodeString inName);
  /// @return 1 when that child of the root has a "ComponentShapes" with a "ComponentShape", else 0.
  /// The other two arguments are ignored.
  int IsValideNode(int inPosition, int inIgnored, ZORUnicodeString inAlsoIgnored);

  // Attributes of the root, and errors
  /// The first "Error" under the root: its "Message" and its "ErrorId". Without one the message is
  /// untouched and the id -1, which is also what an id that is no number gives.
  void GetErrorId(ZORUnicodeString& outMessage, int& outErrorId);
  ZORUnicodeString GetServerMarker();  ///< the root's "ServerMarker"; empty without it
  ZORUnicodeString GetTransaction();   ///< the root's "Transaction"; empty without it
  ZORUnicodeString GetPRCName();       ///< the root's "PRCName"; empty without it

  // General information
  /// The root's "Version" (as it stands), "ZORDocument" and "Responsible", its last "Date" and
  /// "ClashSpec" elements (the document's own), and the last "NbInterf" of a "ClashResult" that is
  /// a number. Nothing changes without root; what is not found stays as it was.
  void GetClashGeneralInfos(ZORUnicodeString& outVersion, ZORUnicodeString& outReference,
                            DOM_Node& outDate, DOM_Node& outSpecification, int& outCount,
                            ZORUnicodeString& outResponsible);
  /// The "Name" and the "NbInterf" of the first "ClashResult". The count is read as a floating
  /// number and truncated: 0 when it is missing or no number. Untouched without "ClashResult".
  void GetClashGeneralInfos(ZORUnicodeString& outResultName, int& outCount);
  /// The "Name" and "ComputationCase" of the first "ClashResult" in a list of nodes.
  /// @return that element's children; an empty list when there is none (outputs untouched).
  DOM_NodeList GetClashResultGeneralInfo(DOM_NodeList inNodes, ZORUnicodeString& outResultName,
                                         ZORUnicodeString& outComputationCase);

  // Interferences
  /// Finds an interference by number.
  /// @param outInterference a deep copy, of the same document but without parent.
  /// @param ioFirstLabel    "instance -- shape". Must be empty on entry: if it is not, the first
  ///                        product counts as read, and each product goes to the second outputs.
  /// @return S_OK, or E_FAIL with all outputs untouched.
  HRESULT GetithInterference(int inIndex, DOM_Node& outInterference, ZORUnicodeString& ioFirstLabel,
                             ZORUnicodeString& outSecondLabel, ZORUnicodeString& outFirstPreview,
                             ZORUnicodeString& outSecondPreview);
  /// The picture reference ("Picture"/"HRef") of an interference. In a single-interference
  /// document, or with the index -1, of the first "Interference" directly under the root, with ".."
  /// replaced by the setting "PublishDefDir" of "ClashPublish". Otherwise the index counts within
  /// each result set anew, and the last result set that has such an interference with a picture
  /// wins. To be called on a loaded reader only.
  void GetClashPreviewURL(int inIndex, ZORUnicodeString& outPicture);
  /// Value, result type (as written), rule name and aliases of an interference. The aliases are
  /// emptied first; while the first alias is empty, a product counts as the first.
  void GetClashInfos(int inIndex, ZORUnicodeString& outValue, ZORUnicodeString& outResultType,
                     ZORUnicodeString& outRuleName, ZORUnicodeString& outFirstAlias,
                     ZORUnicodeString& outSecondAlias);
  /// Everything about an interference: the outputs of GetInterferenceDataV12, of which both
  /// DescriptionIDs and both Alien flags are emptied first.
  /// In a "ClashElement" document the interference is read only when inVersion is "1.2", and
  /// whatever the index, outResultName and outComputationType end as the "Name" and
  /// "ComputationCase" of the document's last result set (a violated rule of an interference in
  /// that last set replaces the latter). In a document of any other kind outResultName is emptied
  /// and the first "Interference" directly under the root is read, whatever index and version.
  /// A rule's clearance that is not empty replaces outClearance.
  void GetClashInfos(ZORUnicodeString inVersion, int inIndex, ZORUnicodeString& outResultName,
                     ZORUnicodeString& outResultType, ZORUnicodeString& outClearance,
                     ZORUnicodeString& outStatus, ZORUnicodeString& outComputationType,
                     ZORUnicodeString& outRetrieve, ZORUnicodeString& outRuleName,
                     ZORUnicodeString& outRuleClearance, ZORUnicodeString& outFirstDescriptionId,
                     ZORUnicodeString& outSecondDescriptionId,
                     ZORUnicodeString& outFirstProcessMode, ZORUnicodeString& outSecondProcessMode,
                     ZORUnicodeString& outComment, ZORUnicodeString& outFirstAlien,
                     ZORUnicodeString& outSecondAlien, ZORUnicodeString& outFirstDescriptionIdAgain,
                     ZORUnicodeString& outSecondDescriptionIdAgain,
                     ZORUnicodeString& outFirstInstance, ZORUnicodeString& outSecondInstance,
                     ZORUnicodeString& outFirstShapeName, ZORUnicodeString& outSecondShapeName,
                     ZORUnicodeString& outFirstShapeSource, ZORUnicodeString& outSecondShapeSource,
                     ZORUnicodeString& outSeverity, ZORUnicodeString& outPenetrationCandidate,
                     ZORUnicodeString& outCurveLength, ZORUnicodeString& outDistance,
                     ZORUnicodeString& outReserved, ZORUnicodeString& outPoints,
                     ZORUnicodeString& outFocusDistance, ZORUnicodeString& outNearPlane,
                     ZORUnicodeString& outFarPlane, ZORUnicodeString& outProjection,
                     ZORUnicodeString& outViewpointX, ZORUnicodeString& outViewpointY,
                     ZORUnicodeString& outViewpointZ, ZORUnicodeString& outSightX,
                     ZORUnicodeString& outSightY, ZORUnicodeString& outSightZ,
                     ZORUnicodeString& outSecondVectorX, ZORUnicodeString& outSecondVectorY,
                     ZORUnicodeString& outSecondVectorZ);
  /// Reads one "Interference" element that is already in hand. Distances are in millimetres. In
  /// numbers, which stay texts, the first comma has become a point.
  /// @param outResultType    "Clash", "Contact", "Clearance" or "error"; a "ResultTypeNoNLS" as it
  ///                         stands.
  /// @param outStatus        "Relevant", "Irrelevant", "Not inspected" or "error".
  /// @param outComputationType, outRuleName, outRuleClearance, outSeverity,
  ///                         outPenetrationCandidate of the violated rule; untouched without one.
  /// @param outRetrieve      "Old", "New", or the text as written.
  /// @param ioFirstAlien     "YES" when empty in the document. Must be empty on entry: if it is
  ///                         not, the first product counts as read, and each product goes to the
  ///                         second outputs.
  /// @param outFirstInstance the alias of a product that the PDM system manages, else the last
  ///                         segment of the description identifier.
  /// @param outReserved      emptied when there is a "GeometricAspect", never filled.
  /// @param outPoints        emptied, then "x/y/z/x/y/z..." of the contact geometry.
  /// @param outFocusDistance as written, comma included.
  /// @param outProjection    "NOVIEWPOINT" without viewpoint.
  /// @param outSecondVectorX, outSecondVectorY, outSecondVectorZ never touched.
  void GetInterferenceDataV12(
      DOM_Node inInterference, ZORUnicodeString& outResultType, ZORUnicodeString& outClearance,
      ZORUnicodeString& outStatus, ZORUnicodeString& outComputationType,
      ZORUnicodeString& outRetrieve, ZORUnicodeString& outRuleName,
      ZORUnicodeString& outRuleClearance, ZORUnicodeString& outFirstDescriptionId,
      ZORUnicodeString& outSecondDescriptionId, ZORUnicodeString& outFirstProcessMode,
      ZORUnicodeString& outSecondProcessMode, ZORUnicodeString& outComment,
      ZORUnicodeString& ioFirstAlien, ZORUnicodeString& outSecondAlien,
      ZORUnicodeString& outFirstDescriptionIdAgain, ZORUnicodeString& outSecondDescriptionIdAgain,
      ZORUnicodeString& outFirstInstance, ZORUnicodeString& outSecondInstance,
      ZORUnicodeString& outFirstShapeName, ZORUnicodeString& outSecondShapeName,
      ZORUnicodeString& outFirstShapeSource, ZORUnicodeString& outSecondShapeSource,
      ZORUnicodeString& outSeverity, ZORUnicodeString& outPenetrationCandidate,
      ZORUnicodeString& outCurveLength, ZORUnicodeString& outDistance,
      ZORUnicodeString& outReserved, ZORUnicodeString& outPoints,
      ZORUnicodeString& outFocusDistance, ZORUnicodeString& outNearPlane,
      ZORUnicodeString& outFarPlane, ZORUnicodeString& outProjection,
      ZORUnicodeString& outViewpointX, ZORUnicodeString& outViewpointY,
      ZORUnicodeString& outViewpointZ, ZORUnicodeString& outSightX, ZORUnicodeString& outSightY,
      ZORUnicodeString& outSightZ, ZORUnicodeString& outSecondVectorX,
      ZORUnicodeString& outSecondVectorY, ZORUnicodeString& outSecondVectorZ);

  // Components
  /// Number of child nodes of the root; 0 without root.
  int GetNbProd();
  /// The component's "Alias"; empty past the end. Both names are one operation.
  ZORUnicodeString GetPrdId(int inPosition);
  ZORUnicodeString GetPrdName(int inPosition);
  /// The component's "ComponentType"; empty past the end.
  ZORUnicodeString GetPrdType(int inPosition);
  /// The value of one "ComponentAttribute" by its "Name" (the first match); empty when not found.
  ZORUnicodeString GetAttrValue(int inPosition, ZORUnicodeString inName);
  /// An attribute of the component element itself; empty when missing or past the end.
  ZORUnicodeString GetCompoAttr(int inPosition, ZORUnicodeString inName);
  /// Number of "ComponentAttribute" elements that are no features; 0 past the end.
  int GetNbRealAttr(int inPosition);
  /// The inNumber-th (from 1) of those; outputs untouched when there is none.
  void GetSetOfRealAttr(int inPosition, int inNumber, ZORUnicodeString& outName,
                        ZORUnicodeString& outType, ZORUnicodeString& outValue);
  /// Number of "ComponentShape" elements; 0 past the end.
  int GetNbShapes(int inPosition);
  /// An attribute of the inShape-th (from 0) shape; empty when not found.
  ZORUnicodeString GetShapeAttrValue(int inPosition, int inShape, ZORUnicodeString inName);
  /// The component's placement: the columns Rx, Ry, Rz of its rotation, then its translation T, in
  /// millimetres.
  /// @param outPosition always a new array of 12 doubles, which the caller deletes (delete[]).
  ///                    Elements whose source is missing are not set; a number that does not
  ///                    convert is 0.
  void GetPosition(int inPosition, double*& outPosition);

  // Specification
  /// Number of "Specification" elements; 0 without any.
  void GetSpecInfos(int& outCount);
  /// The two product sets of the inNumber-th (from 1) specification. Outputs of a set that is
  /// missing, and all outputs for a number out of range, stay untouched.
  void GetProductsInSpec(int inNumber, ZORUnicodeString& outFirstAlias,
                         ZORUnicodeString& outSecondAlias, ZORUnicodeString& outFirstId,
                         ZORUnicodeString& outSecondId, ZORUnicodeString& outFirstVersion,
                         ZORUnicodeString& outSecondVersion, ZORUnicodeString& outFirstAlien,
                         ZORUnicodeString& outSecondAlien, ZORUnicodeString& outFirstShapeName,
                         ZORUnicodeString& outSecondShapeName);

  // Linked documents
  /// The children of "Elements" in a "FederatorClashElement" document; else an empty list.
  DOM_NodeList GetListOfLinkedElements();
  /// The attributes of one linked element; empty where missing.
  void GetAttOfLinkedElement(DOM_Node inElement, ZORUnicodeString& outLink,
                             ZORUnicodeString& outFirstName, ZORUnicodeString& outSecondName,
                             ZORUnicodeString& outFirstId, ZORUnicodeString& outSecondId,
                             ZORUnicodeString& outFirstURL, ZORUnicodeString& outSecondURL);

  // Rebuilding a session
  /// The products of all interferences and their placements.
  /// @param ioAliases, ioDescriptionIds two texts an interference are appended.
  /// @param outPositions for each "ClashResult" that declares interferences, a new array of two
  ///                     transformations a declared interference; the pointer ends on the last such
  ///                     array and earlier ones are abandoned. The caller deletes it (delete[]).
  /// Interferences beyond the declared number are not read. To be called on a loaded reader only.
  void GetReBuildSessionInfos(ZORListValZORUnicodeString& ioAliases,
                              ZORListValZORUnicodeString& ioDescriptionIds,
                              ZORMathTransformation*& outPositions);

  // Merging
  /// Appends copies of a second document's interferences to the first document's result set, and of
  /// its specifications to the first document's "ProductsInSpec". Uses nothing of the reader.
  /// The first "ClashResult" of the first document receives them all; without one, the root's last
  /// child node does. Its "NbInterf", if present, becomes the sum of its declared number and that of
  /// the second document's last result set, however many interferences there are.
  /// @param ioFirst  when null, or without a node to take interferences, becomes the second.
  /// @param inSecond left as it is.
  /// @param ioTrace  a line for each step is appended.
  /// @return S_OK; E_FAIL when both documents are null. What the document raises passes through;
  ///         the first document then keeps what was appended before.
  HRESULT MergeDocuments(DOM_Document& ioFirst, DOM_Document& inSecond, ZORUnicodeString& ioTrace);

 private:
  void GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& outValue,
                           ZORUnicodeString& outResultType, ZORUnicodeString& outRuleName,
                           ZORUnicodeString& ioFirstAlias, ZORUnicodeString& outSecondAlias);
  void GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& ioFirstLabel,
                           ZORUnicodeString& outSecondLabel, ZORUnicodeString& outFirstPreview,
                           ZORUnicodeString& outSecondPreview);
  void GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& outFirstAlias,
                           ZORUnicodeString& outSecondAlias, ZORUnicodeString& ioFirstDescriptionId,
                           ZORUnicodeString& outSecondDescriptionId,
                           ZORMathTransformation& outFirstPosition,
                           ZORMathTransformation& outSecondPosition);
  void GetInterferenceData(DOM_Node inInterference, ZORUnicodeString& outPicture);
  ZORUnicodeString GetInstanceNameFromDID(ZORUnicodeString inDescriptionId);
  ZORUnicodeString GetAttrOnNode(DOM_Node inNode, const char* inName);
  double GetAttrDoubleOnNode(DOM_Node inNode, const char* inName);
  double TransDouble(DOM_NamedNodeMap inAttributes, char* inName);

  char* path_;
  char* buffer_;
  int bufferLength_;
  ZORUnicodeString documentKind_;
  DOM_Element root_;
};

#endif
