#include "platform/system/ZORMsg.h"

#include <gtest/gtest.h>

namespace {

ZORUnicodeString Message(const char* inText) {
  return ZORMsg(ZORUnicodeString(inText)).BuildMessage();
}

const ZORUnicodeString kTwo[] = {"one", "two"};

}  // namespace

TEST(ZORMsg, DefaultIsEmpty) { EXPECT_TRUE(ZORMsg().BuildMessage() == ""); }

TEST(ZORMsg, PlainTextStays) {
  EXPECT_TRUE(Message("Non inspect\xC3\xA9") == "Non inspect\xC3\xA9");
}

TEST(ZORMsg, PlacesTakeTheirParameters) {
  EXPECT_TRUE(ZORMsg("/p2 before /p1, /p2").BuildMessage(kTwo, 2) == "two before one, two");
}

TEST(ZORMsg, PlacesWithoutParameterStayEmpty) {
  EXPECT_TRUE(Message("[/p1]") == "[]");
  EXPECT_TRUE(ZORMsg("/p1 /p3").BuildMessage(kTwo, 2) == "one ");
  EXPECT_TRUE(ZORMsg("[/p1]").BuildMessage(nullptr, 2) == "[]");
  EXPECT_TRUE(ZORMsg("[/p1]").BuildMessage(kTwo, 0) == "[]");
}

TEST(ZORMsg, ParametersAreNotReadAgain) {
  const ZORUnicodeString parameter[] = {"/p1//"};
  EXPECT_TRUE(ZORMsg("/p1").BuildMessage(parameter, 1) == "/p1//");
}

TEST(ZORMsg, TwoSlashesAreOne) {
  EXPECT_TRUE(Message("a//b") == "a/b");
  EXPECT_TRUE(ZORMsg("//p1").BuildMessage(kTwo, 2) == "/p1");
}

TEST(ZORMsg, OtherSlashesStay) {
  EXPECT_TRUE(Message("a/b /p0 /q /p") == "a/b /p0 /q /p");
  EXPECT_TRUE(Message("a/") == "a/");
}
