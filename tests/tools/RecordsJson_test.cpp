#include "lyra/commands/RecordsJson.h"

#include <gtest/gtest.h>

#include <limits>

#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/JsonFields.h"

namespace {

using ZORToolkit::IdentifiedRecord;
using ZORToolkit::InterferenceRecord;
using ZORToolkit::Number;
using ZORToolkit::ProductRecord;

std::string TextByTree(const IdentifiedRecord& inRecord) {
  return lyra::JsonLine(lyra::JsonOf(inRecord));
}

// The tree's own writer is the measure: of numbers on both sides of each of its forms, and of texts
// that it escapes, replaces or leaves.
TEST(JsonText, IsThatOfTheTreeOfValues) {
  InterferenceRecord record;
  const std::string id = "0123456789abcdef";
  EXPECT_EQ(lyra::JsonText(IdentifiedRecord{record, id}), TextByTree({record, id}));

  record.index = -7;
  record.value = Number(std::string("-0,5"));
  record.name = "quote \" backslash \\ slash / tab \t bell \a delete \x7F";
  record.result = "Tr\u00E4ger \u30B1 \U0001F600 turned \u202E tag \U000E0041 next line \u0085";
  record.status = "no text \xFF\xC3";
  record.comment = std::string("zero\0inside", 11);
  record.points.push_back({Number(1.5), Number(std::string("x")), Number()});
  ProductRecord& product = record.products[0];
  product.exists = true;
  product.placement = {0.0,  -0.0,       1,       -1,    999'999'999'999'999, -1e15, 1e16, 0.1,
                       1e-7, -12345.678, 2.5e300, 5e-324};
  record.products[1] = product;
  using Limits = std::numeric_limits<double>;
  record.products[1].placement = {Limits::quiet_NaN(), Limits::infinity(), -Limits::infinity(),
                                  Limits::max(),       123456789.0,        9007199254740993.0};
  EXPECT_EQ(lyra::JsonText(IdentifiedRecord{record, id}), TextByTree({record, id}));
}

}  // namespace
