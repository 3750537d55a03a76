#include "platform/system/ZORListVal.h"

#include <gtest/gtest.h>

#include "platform/system/ZORListValZORBaseUnknown_var.h"
#include "platform/system/ZORListValZORUnicodeString.h"

namespace {

// The message of the error that reading a position raises; empty when it raises none.
template <class List>
std::string ErrorAt(const List& inList, int inPosition) {
  try {
    inList[inPosition];
  } catch (const ZORFatalError& error) {
    return error.what();
  }
  return "";
}

}  // namespace

TEST(ZORListVal, PositionsRunFromOneToSize) {
  ZORListValZORUnicodeString list;
  list.Append("first");
  list.Append("second");
  EXPECT_EQ(list.Size(), 2);
  EXPECT_TRUE(list[1] == "first");
  EXPECT_TRUE(list[2] == "second");
  list[2] = "changed";
  EXPECT_TRUE(list[2] == "changed");
}

TEST(ZORListVal, PositionOutsideIsFatal) {
  ZORListValZORUnicodeString list;
  list.Append("only");
  const std::string message = "AssertionFailed:iPos > 0 && iPos <= _Size";
  EXPECT_EQ(ErrorAt(list, 0), message);
  EXPECT_EQ(ErrorAt(list, -1), message);
  EXPECT_EQ(ErrorAt(list, 2), message);
  EXPECT_EQ(ErrorAt(list, 1), "");
}

TEST(ZORListVal, EmptyListHasNoPosition) {
  ZORListValZORBaseUnknown_var list;
  EXPECT_EQ(list.Size(), 0);
  EXPECT_THROW(list[1], ZORFatalError);
}

TEST(ZORListVal, RemoveAllReleasesHandles) {
  auto* const component = new ZORBaseUnknown();
  ZORListValZORBaseUnknown_var list;
  list.Append(component);
  EXPECT_EQ(component->AddRef(), 3u);
  component->Release();
  list.RemoveAll();
  EXPECT_EQ(list.Size(), 0);
  EXPECT_EQ(component->Release(), 0u);
}
