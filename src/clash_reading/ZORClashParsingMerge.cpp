// Merging two documents.
#include <algorithm>
#include <limits>

#include "ZORClashParsing.h"
#include "ZORLyraGeneralServices.h"
#include "clash_reading/ClashElements.h"

namespace {
void Trace(ZORUnicodeString& ioTrace, const char* inMessage) {
  ioTrace.Append(inMessage);
  ioTrace.Append("\n");
}

// Calls inVisit for the child elements of a name, but not for those that a visit appends, so that
// merging a document with itself ends.
template <class Visit>
void ForEachPresentElement(const DOM_Node& inParent, const char* inName, const Visit& inVisit) {
  unsigned int left = inParent.getChildNodes().getLength();
  for (DOM_Node child = inParent.getFirstChild(); left > 0; child = child.getNextSibling(), --left)
    if (IsElementNamed(child, inName)) inVisit(child);
}

// The first result set, or else the root's last child, whatever that is: hosts rely on it.
DOM_Node FindResultSet(const DOM_Element& inRoot, int& outCount) {
  const DOM_Node resultSet = FirstElement(inRoot, "ClashResult");
  if (resultSet.isNull()) return inRoot.getLastChild();
  outCount = TruncatedDeclaredCount(resultSet);
  return resultSet;
}

// Returns the declared number of the last result set: the numbers of several are not summed.
int AppendInterferences(const DOM_Element& inRoot, DOM_Document& ioTarget, DOM_Node& ioResultSet) {
  int count = 0;
  ForEachPresentElement(inRoot, "ClashResult", [&](const DOM_Node& inSource) {
    count = TruncatedDeclaredCount(inSource);
    if (ioResultSet.isNull()) return;
    ForEachPresentElement(inSource, "Interference", [&](const DOM_Node& inInterference) {
      ioResultSet.appendChild(ioTarget.importNode(inInterference, true));
    });
  });
  return count;
}

void AppendSpecifications(const DOM_Element& inRoot, DOM_Document& ioTarget,
                          DOM_Element& ioTargetRoot, DOM_Node& ioProducts) {
  ForEachPresentElement(inRoot, "ProductsInSpec", [&](const DOM_Node& inProducts) {
    ForEachPresentElement(inProducts, "Specification", [&](const DOM_Node& inSpecification) {
      if (ioProducts.isNull()) {
        ioProducts = ioTarget.importNode(inProducts, false);
        if (!ioTargetRoot.isNull()) ioTargetRoot.appendChild(ioProducts);
      }
      ioProducts.appendChild(ioTarget.importNode(inSpecification, true));
    });
  });
}

// A sum beyond the range of int becomes the nearest int, as a declared number does.
int SumOfCounts(int inFirst, int inSecond) {
  const long long sum = static_cast<long long>(inFirst) + inSecond;
  return static_cast<int>(
      std::clamp<long long>(sum, std::numeric_limits<int>::min(), std::numeric_limits<int>::max()));
}

void RewriteCount(const DOM_Element& inRoot, int inCount) {
  DOM_Node declared = FirstElement(inRoot, "ClashResult").getAttributes().getNamedItem("NbInterf");
  if (declared.isNull()) return;
  ZORUnicodeString text;
  text.BuildFromNum(inCount, "%d");
  declared.setNodeValue(DOMString(text.ConvertToChar()));
}
}  // namespace

HRESULT ZORClashParsing::MergeDocuments(DOM_Document& ioFirst, DOM_Document& inSecond,
                                        ZORUnicodeString& ioTrace) {
  if (ioFirst.isNull() && inSecond.isNull()) {
    Trace(ioTrace, "!!!ERROR, Both documents are corrupted ");
    return E_FAIL;
  }
  if (ioFirst.isNull()) {
    ioFirst = inSecond;
    return S_OK;
  }

  DOM_Element firstRoot = ioFirst.getDocumentElement();
  Trace(ioTrace, "About to get Root Node of First Document");
  int firstCount = 0;
  DOM_Node resultSet = FindResultSet(firstRoot, firstCount);
  Trace(ioTrace, "About to get productsInSpec Node of First Document");
  DOM_Node products = FirstElement(firstRoot, "ProductsInSpec");
  // The nodes found so far remain those of the original first document.
  if (resultSet.isNull() && !inSecond.isNull()) ioFirst = inSecond;

  Trace(ioTrace, "About to append interferences of Second Document to first Document");
  if (inSecond.isNull()) {
    Trace(ioTrace, "Nothing to add to first Document");
    return S_OK;
  }
  const DOM_Element secondRoot = inSecond.getDocumentElement();
  const int secondCount = AppendInterferences(secondRoot, ioFirst, resultSet);
  Trace(ioTrace, "About to append productsInSpec of Second Document to first Document");
  AppendSpecifications(secondRoot, ioFirst, firstRoot, products);

  Trace(ioTrace, "About to set Number of Interference in XML");
  RewriteCount(firstRoot, SumOfCounts(firstCount, secondCount));
  return S_OK;
}
