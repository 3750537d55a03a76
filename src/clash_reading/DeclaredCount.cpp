#include "clash_reading/DeclaredCount.h"

#include <limits>

#include "ZORLyraGeneralServices.h"

int TruncatedDeclaredCount(const DOM_Node& inResultSet) {
  double declared = 0.0;
  ZORLyraGeneralServices::GetAttrOnNode(inResultSet, "NbInterf").ConvertToNum(&declared, "%le");
  if (!(declared >= std::numeric_limits<int>::min()))  // also what is not a number
    return declared < 0 ? std::numeric_limits<int>::min() : 0;
  if (declared > std::numeric_limits<int>::max()) return std::numeric_limits<int>::max();
  return static_cast<int>(declared);
}
