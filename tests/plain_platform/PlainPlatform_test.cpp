// What is declared without the additions, and which library a program of these tests runs on. This
// file is compiled without them.
#include <dlfcn.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "BuildPath.h"
#include "PlatformAdapter.h"
#include "PrintPictures.h"
#include "ZORClashParsing.h"
#include "ZORLyraGeneralServices.h"
#include "ZORLyraXMLServices.h"
#include "platform/system/ZORSettingRepository.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORSupport.h"

namespace {

template <class Type>
constexpr bool HasAdditions = requires(Type inObject) {
  inObject.AppendUTF16(u"", 0);
}
|| requires(Type inObject) { inObject.Reserve(1); }
|| requires(Type inObject) { inObject.getChangeCount(); }
|| requires(Type inObject) { inObject.equals("text"); }
|| requires(Type inObject, std::size_t& outCount) { inObject.rawUTF8(outCount); }
|| requires(Type inObject) { inObject.SignedValue(); }
|| requires(Type inObject) { inObject.ConvertToUC2Bytes(); }
|| requires(Type inObject) { inObject.GetInterface(); }
|| requires(Type inObject) { inObject.GetChildren(); }
|| requires(Type inObject) { inObject.HasBackgroundColor(); };
template <class Type>
constexpr bool IsComparable = requires(Type inObject) {
  inObject == inObject;  // NOLINT(misc-redundant-expression)
};
template <class Settings>
constexpr bool ReadsNumbers = requires(Settings& inSettings, double* outValue) {
  inSettings.ReadSetting("Name", outValue);
};

static_assert(!HasAdditions<ZORUnicodeString> && !HasAdditions<ZORChar>);
static_assert(!HasAdditions<ZORUnicodeChar> && !HasAdditions<ZORBaseUnknown_var>);
static_assert(!HasAdditions<DOM_Node> && !HasAdditions<DOMString>);
static_assert(!HasAdditions<ZORSupport> && !HasAdditions<ZOR3DBagRep>);
static_assert(!IsComparable<DOM_Node> && !IsComparable<ZORBaseUnknown_var> && !IsComparable<GUID>);
static_assert(!ReadsNumbers<ZORSettingRepository>);

std::string Text(const ZORUnicodeString& inText) { return inText.ConvertToChar(); }

// The adapter's plain ways, which this file's declarations select.

TEST(PlainPlatform, AppendsUnits) {
  ZORUnicodeString text("a");
  adapter::AppendUnits(text, u"b\u65E5");
  adapter::AppendUnits(text, u"");
  EXPECT_EQ("ab\u65E5", Text(text));
}

TEST(PlainPlatform, ComparesDocumentTexts) {
  EXPECT_TRUE(adapter::IsText(DOMString("Name"), "Name"));
  EXPECT_FALSE(adapter::IsText(DOMString("Name"), "Names"));
  EXPECT_FALSE(adapter::IsText(DOMString("Names"), "Name"));
  EXPECT_TRUE(adapter::IsText(DOMString(), ""));
}

TEST(PlainPlatform, KeepsNothingOfADocument) {
  EXPECT_FALSE(adapter::ChangeCount(DOM_Node()).has_value());
}

TEST(PlainPlatform, IsWhatTheProgramRunsOn) {
  const char* const expected = std::getenv("ZOR_EXPECTED_LIBRARY");
  if (!expected) GTEST_SKIP() << "not run on a given library";
  Dl_info info{};
  ASSERT_NE(0, dladdr(reinterpret_cast<const void*>(&BuildPath::ConvToStr), &info));
  EXPECT_NE(std::string::npos, std::string(info.dli_fname).find(expected)) << info.dli_fname;
}

}  // namespace
