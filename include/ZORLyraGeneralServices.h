// Conversions between documents and texts, lengths, logical names, and products.
#ifndef ZOR_LYRA_GENERAL_SERVICES_H
#define ZOR_LYRA_GENERAL_SERVICES_H

#include "ZORLyraExport.h"
#include "platform/mathematics/ZORMathPointf.h"
#include "platform/mathematics/ZORMathVectorf.h"
#include "platform/product_structure/ZORDocument.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/system/ZORListValZORBaseUnknown_var.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Document.h"

/// Static, stateless services that every reader and writer uses. None raises an error of its own;
/// result codes are listed where there are any.
class ZOR_LYRA_EXPORT ZORLyraGeneralServices {
 public:
  ZORLyraGeneralServices() = delete;

  // From a document
  /// The value of an attribute; empty when the attribute is missing or the node is null or has no
  /// attributes.
  static ZORUnicodeString GetAttrOnNode(DOM_Node inNode, const char* inName);
  /// The text of a DOM string; empty for a null one.
  static ZORUnicodeString GetDOMName(DOMString inText);
  /// The tag name of an element; empty for a null one.
  static ZORUnicodeString GetDOMName(DOM_Element inElement);
  /// The name of a node of any kind; empty for a null one.
  static ZORUnicodeString GetDOMName(DOM_Node inNode);

  // Towards a document
  /// The number as decimal text ("%i").
  static DOMString GetDOMString(int inNumber);
  /// The number in fixed notation with six decimals ("%f"), however large it is.
  static DOMString GetDOMString(double inNumber);
  /// The narrow form of a text: what the narrow character set cannot carry is carried as that
  /// conversion gives it.
  static DOMString GetDOMString(ZORUnicodeString inText);
  /// A new element of the document, not attached, with the attributes "Ux", "Uy" and "Uz" in this
  /// order, each with six decimals. Raises what the document raises for a name that is none or a
  /// null document.
  static DOM_Element GetDOMVector(ZORUnicodeString inName, DOM_Document inDocument,
                                  ZORMathPointf inPoint);
  /// The same for a vector, with the same attribute names.
  static DOM_Element GetDOMVector(ZORUnicodeString inName, DOM_Document inDocument,
                                  ZORMathVectorf inVector);

  // Lengths
  /// A length such as "0.5m" or "25 mm" in millimetres; a bare number is in millimetres already.
  /// @return the length; -1.0 when the platform knows no magnitude "LENGTH" or no unit for it; -0.1
  ///         when the text cannot be read. Indistinguishable from a negative length.
  static double ConvertValueInMM(ZORUnicodeString inValue);

  // Logical names
  /// The directory of a logical name of a document location.
  /// A name that holds "ZORDLN://" is looked up without its first nine characters, and one that
  /// does not begin with an ASCII character above 0x01 without its first three; then a failed
  /// look-up gives the empty string. Any other name that is not in the table comes back unchanged.
  /// An expansion that fails gives the empty string.
  static ZORUnicodeString TransformFromDLName(ZORUnicodeString inName);
  /// The path that a reference such as "ZORDLN://NAME\folder\file" stands for.
  /// @return the reference itself when it holds no "ZORDLN://" (text before it is dropped); the
  ///         empty string for an unknown name; "error" when the directory cannot be expanded.
  static ZORUnicodeString TransformPathnameFromDLName(ZORUnicodeString inReference);

  // Identifiers under which products are stored
  /// The PDM identifier, followed by "<uuiddv>" and the version where that is not empty. The PDM
  /// identifier is not checked.
  static ZORUnicodeString BuildStorageProdIdFromPDMIdDV(
      const ZORUnicodeString& inPDMId, const ZORUnicodeString& inDocumentVersionId);
  /// Splits such an identifier at its first "<uuiddv>"; without one all of it is the PDM
  /// identifier. Both outputs are emptied first, so neither may be the input.
  /// @return S_OK; E_FAIL, both outputs empty, for an empty identifier.
  static HRESULT GetPDMIdDVFromStorageProdId(const ZORUnicodeString& inStorageId,
                                             ZORUnicodeString& outPDMId,
                                             ZORUnicodeString& outDocumentVersionId);

  // Product trees
  /// Appends the products that carry geometry, a product before those below it, children in their
  /// order: all without children, and those with children that have a representation of their own
  /// (in the old visualisation mode one with a name). Children that are no products end their
  /// branch. A product that is reached twice is listed twice; what the list holds already stays.
  /// @param inProduct null lists nothing.
  static void Expand(ZORIProduct* inProduct, ZORListValZORBaseUnknown_var& ioList);
  /// The aliases from below the root down to the product, joined by " --++-- "; empty for a root
  /// and for what has no alias. Raises ZORNullVarError when a product on the way has an alias but
  /// does not offer ZORISpecObject, which knows its parent.
  static ZORUnicodeString GetPathRoot(ZORIProduct_var inProduct);
  /// Adds a provider for an interface to a document, which keeps a reference.
  /// @param inDocument null: the document that holds the provider.
  /// @return what the document's list of providers answers; E_FAIL when the provider is null or
  ///         lacks the interface, or there is no document or it takes no providers.
  static HRESULT RegisterProvider(const IID& inInterface, ZORBaseUnknown_var& inProvider,
                                  ZORDocument* inDocument);
};

#endif
