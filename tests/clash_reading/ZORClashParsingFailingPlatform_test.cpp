// The reader on a platform that has no catalogue or cannot prepare its XML library. This program
// takes the place of these operations of the platform.
#include <gtest/gtest.h>

#include <stdexcept>

#include "platform/system/ZORMsgCatalog.h"
#include "platform/xml/ZORXMLParser.h"
#include "support/LoadedReader.h"
#include "support/OriginalFunction.h"

namespace {
bool canInitialize = true;
}  // namespace

int ZORMsgCatalog::LoadMsgCatalog(const char*) { return 0; }

ZORMsg ZORMsgCatalog::GetCatalogMsg(const char* inKey) const {
  ADD_FAILURE() << "asked for " << inKey;
  return ZORMsg();
}

HRESULT ZORXMLParser::Initialize() {
  if (!canInitialize) throw std::runtime_error("not prepared");
  return support::CallOriginal<HRESULT>("_ZN12ZORXMLParser10InitializeEv");
}

namespace {

using support::ClashInfos;
using support::kUntouched;
using support::SharedReader;
using support::Text;

TEST(ReaderOnAFailingPlatform, DoesNotAskACatalogueThatDidNotLoad) {
  SharedReader reader("<Interference ResultType='Clash' Status='Relevant' RetrieveInf=' Old '/>");
  ClashInfos infos;
  infos.Set(13, "");
  infos.ReadElement(*reader, reader.root);
  EXPECT_EQ("error", infos[1]);
  EXPECT_EQ("error", infos[3]);
  EXPECT_EQ("Old", infos[5]);
}

TEST(ReaderOnAFailingPlatform, ComparesWithEmptyTextsThen) {
  SharedReader reader("<Interference/>");
  ClashInfos infos;
  infos.Set(13, "");
  infos.ReadElement(*reader, reader.root);
  EXPECT_EQ("Clash", infos[1]);
  EXPECT_EQ("Relevant", infos[3]);
}

TEST(ReaderOnAFailingPlatform, PreparesTheXMLLibraryBeforeItTouchesAnything) {
  char path[] = "any";
  ZORClashParsing reader(path);
  ZORUnicodeString kind = kUntouched, reference = kUntouched, version = kUntouched;
  canInitialize = false;
  EXPECT_THROW(reader.LoadSequence(kind, reference, version), std::runtime_error);
  canInitialize = true;
  EXPECT_EQ(kUntouched, Text(reference));
}

}  // namespace
