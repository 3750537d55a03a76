// Which code a dump returns when closing fails, which no file here does: this program takes the
// place of the platform's file operations and notes their calls.
#include <gtest/gtest.h>

#include <string>

#include "ZORLyraXMLServices.h"
#include "platform/system/ZORFile.h"
#include "platform/xml/DOM_Document.h"

namespace {
constexpr HRESULT kOpenCode = static_cast<HRESULT>(0x80070101);
constexpr HRESULT kWriteCode = static_cast<HRESULT>(0x80070102);
constexpr HRESULT kCloseCode = static_cast<HRESULT>(0x80070103);

HRESULT openResult = S_OK;
HRESULT writeResult = S_OK;
HRESULT closeResult = S_OK;
std::string calls;
}  // namespace

HRESULT ZORFOpen(const wchar_t*, const char* inMode, int* outDescriptor) {
  calls += std::string("open ") + inMode + ";";
  if (openResult == S_OK) *outDescriptor = 41;
  return openResult;
}

HRESULT ZORFWrite(int inDescriptor, const void* inBytes, std::size_t inCount,
                  std::size_t* outWritten) {
  calls += "write " + std::to_string(inDescriptor) + " " +
           std::string(static_cast<const char*>(inBytes), inCount) + ";";
  *outWritten = writeResult == S_OK ? inCount : 0;
  return writeResult;
}

HRESULT ZORFClose(int inDescriptor) {
  calls += "close " + std::to_string(inDescriptor) + ";";
  return closeResult;
}

namespace {
class FailingFiles : public testing::Test {
 protected:
  void SetUp() override {
    openResult = writeResult = closeResult = S_OK;
    calls.clear();
    writer_.AddPCData("text");
    document_.appendChild(document_.createElement("Root"));
  }
  int DumpText() { return writer_.DumpDocument("any"); }
  HRESULT DumpTree() { return writer_.DumpDocument(document_, "any", "", "", "", 0, 0); }

  ZORLyraXMLServices writer_;
  DOM_Document document_ = DOM_Document::createDocument();
};
}  // namespace

TEST_F(FailingFiles, TextIsOpenedWrittenAndClosedOnce) {
  EXPECT_EQ(DumpText(), S_OK);
  EXPECT_EQ(calls, "open wb;write 41 text;close 41;");
}

TEST_F(FailingFiles, TextThatCannotBeOpenedIsNotWritten) {
  openResult = kOpenCode;
  EXPECT_EQ(DumpText(), kOpenCode);
  EXPECT_EQ(calls, "open wb;");
}

TEST_F(FailingFiles, TextThatCannotBeWrittenIsClosed) {
  writeResult = kWriteCode;
  EXPECT_EQ(DumpText(), kWriteCode);
  EXPECT_EQ(calls, "open wb;write 41 text;close 41;");
}

TEST_F(FailingFiles, TextThatCannotBeClosedGivesTheCloseCode) {
  closeResult = kCloseCode;
  EXPECT_EQ(DumpText(), kCloseCode);
}

TEST_F(FailingFiles, TextGivesTheWriteCodeBeforeTheCloseCode) {
  writeResult = kWriteCode;
  closeResult = kCloseCode;
  EXPECT_EQ(DumpText(), kWriteCode);
}

TEST_F(FailingFiles, TreeIsOpenedWrittenAndClosedOnce) {
  EXPECT_EQ(DumpTree(), S_OK);
  EXPECT_EQ(calls, "open wb;write 41 <Root/>;close 41;");
}

TEST_F(FailingFiles, TreeThatCannotBeOpenedIsNotWritten) {
  openResult = kOpenCode;
  EXPECT_EQ(DumpTree(), kOpenCode);
  EXPECT_EQ(calls, "open wb;");
}

TEST_F(FailingFiles, TreeThatCannotBeWrittenIsClosed) {
  writeResult = kWriteCode;
  closeResult = kCloseCode;
  EXPECT_EQ(DumpTree(), kWriteCode);
  EXPECT_EQ(calls, "open wb;write 41 <Root/>;close 41;");
}

TEST_F(FailingFiles, TreeIgnoresTheCloseCode) {
  closeResult = kCloseCode;
  EXPECT_EQ(DumpTree(), S_OK);
}
