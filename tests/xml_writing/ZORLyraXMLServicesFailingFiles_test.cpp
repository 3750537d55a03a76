// What becomes of failures that no file here has, such as one of closing: this program takes the
// place of the platform's file operations and notes their calls.
#include <gtest/gtest.h>

#include <cstring>
#include <new>
#include <stdexcept>
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
HRESULT makePathResult = S_OK;
bool hasMemory = true;
std::string raising;  // the call that raises an error with its name
std::string calls;

void Raise(const char* inCall) {
  if (raising.find(inCall) != std::string::npos) throw std::runtime_error(inCall);
}
}  // namespace

HRESULT ZORUnicodeString::ConvertToUTF8(char* outBytes, std::size_t* outCount) const {
  if (!hasMemory) throw std::bad_alloc();
  *outCount = static_cast<std::size_t>(GetLengthInChar());
  for (std::size_t i = 0; i < *outCount; ++i)
    outBytes[i] = static_cast<char>(ConvertToUCChar()[i]);  // the texts here are ASCII
  return S_OK;
}

HRESULT ZORMakePath(const char* inDirectory, const char* inFileName, char* outPath) {
  std::strcpy(outPath, (std::string(inDirectory) + "+" + inFileName).c_str());
  return makePathResult;
}

HRESULT ZORFCopy(const wchar_t* inSource, const wchar_t* inTarget, int inFlags) {
  const std::wstring source(inSource), target(inTarget);
  calls += "copy " + std::string(source.begin(), source.end()) + " " +
           std::string(target.begin(), target.end()) + " " + std::to_string(inFlags) + ";";
  return S_OK;
}

HRESULT ZORFOpen(const wchar_t*, const char* inMode, int* outDescriptor) {
  calls += std::string("open ") + inMode + ";";
  if (openResult == S_OK) *outDescriptor = 41;
  return openResult;
}

HRESULT ZORFWrite(int inDescriptor, const void* inBytes, std::size_t inCount,
                  std::size_t* outWritten) {
  calls += "write " + std::to_string(inDescriptor) + " " +
           std::string(static_cast<const char*>(inBytes), inCount) + ";";
  Raise("write");
  *outWritten = writeResult == S_OK ? inCount : 0;
  return writeResult;
}

HRESULT ZORFClose(int inDescriptor) {
  calls += "close " + std::to_string(inDescriptor) + ";";
  Raise("close");
  return closeResult;
}

namespace {
class FailingFiles : public testing::Test {
 protected:
  void SetUp() override {
    openResult = writeResult = closeResult = S_OK;
    makePathResult = S_OK;
    hasMemory = true;
    raising.clear();
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

TEST_F(FailingFiles, TreeIsWrittenAtOnceHoweverLongItIs) {
  const std::string name(300'000, 'a');
  document_.getDocumentElement().setAttribute(name.c_str(), "x");
  EXPECT_EQ(DumpTree(), S_OK);
  EXPECT_EQ(calls, "open wb;write 41 <Root " + name + "=\"x\"/>;close 41;");
}

TEST_F(FailingFiles, TreeIsConvertedBeforeTheFileIsOpened) {
  hasMemory = false;
  EXPECT_THROW(DumpTree(), std::bad_alloc);
  EXPECT_EQ(calls, "");
}

TEST_F(FailingFiles, TextIsConvertedAfterTheFileIsOpened) {
  hasMemory = false;
  EXPECT_THROW(DumpText(), std::bad_alloc);
  EXPECT_EQ(calls, "open wb;close 41;");
}

TEST_F(FailingFiles, ErrorRaisedByClosingReachesTheCaller) {
  raising = "close";
  EXPECT_THROW(DumpText(), std::runtime_error);
  EXPECT_THROW(DumpTree(), std::runtime_error);
  EXPECT_EQ(calls, "open wb;write 41 text;close 41;open wb;write 41 <Root/>;close 41;");
}

TEST_F(FailingFiles, ErrorRaisedByWritingArrivesThoughClosingRaisesOneToo) {
  raising = "write close";
  for (const bool isTree : {false, true}) {
    try {
      isTree ? DumpTree() : DumpText();
      ADD_FAILURE() << isTree;
    } catch (const std::runtime_error& error) {
      EXPECT_STREQ("write", error.what());
    }
  }
  EXPECT_EQ(calls, "open wb;write 41 text;close 41;open wb;write 41 <Root/>;close 41;");
}

TEST_F(FailingFiles, CopyGoesByThePathsAndNotByTheCodeOfTheirJoining) {
  makePathResult = E_INVALIDARG;
  EXPECT_EQ(writer_.CopyFile("a", "from", "to"), S_OK);
  EXPECT_EQ(calls, "copy from+a to+a 0;");
}
