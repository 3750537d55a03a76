#include <gtest/gtest.h>

#include "lyra/terminal/Table.h"

using lyra::CsvCell;
using lyra::CsvRow;

TEST(CsvCell, PlainTextStaysBare) {
  EXPECT_EQ(CsvCell("a b"), "a b");
  EXPECT_EQ(CsvCell(""), "");
}

TEST(CsvCell, CommaQuoteAndLineEndAreQuoted) {
  EXPECT_EQ(CsvCell("a,b"), "\"a,b\"");
  EXPECT_EQ(CsvCell("a\"b"), "\"a\"\"b\"");
  EXPECT_EQ(CsvCell("a\nb"), "\"a\nb\"");
}

TEST(CsvCell, FormulaGetsAnApostrophe) {
  EXPECT_EQ(CsvCell("=1+1"), "'=1+1");
  EXPECT_EQ(CsvCell("+cmd"), "'+cmd");
  EXPECT_EQ(CsvCell("-cmd"), "'-cmd");
  EXPECT_EQ(CsvCell("@a"), "'@a");
  EXPECT_EQ(CsvCell("\ta"), "'\ta");
  EXPECT_EQ(CsvCell("\ra"), "\"'\ra\"");
  EXPECT_EQ(CsvCell("=\"a\""), "\"'=\"\"a\"\"\"");
}

TEST(CsvCell, SignedNumberStaysANumber) {
  EXPECT_EQ(CsvCell("-2"), "-2");
  EXPECT_EQ(CsvCell("+0.5"), "+0.5");
  EXPECT_EQ(CsvCell("-1e-3"), "-1e-3");
  EXPECT_EQ(CsvCell("-1,25"), "\"-1,25\"");
}

TEST(CsvCell, WhatOnlyBeginsLikeANumberIsAFormula) {
  EXPECT_EQ(CsvCell("-2+3"), "'-2+3");
  EXPECT_EQ(CsvCell("-"), "'-");
  EXPECT_EQ(CsvCell("+-2"), "'+-2");
  EXPECT_EQ(CsvCell("-inf"), "'-inf");
  EXPECT_EQ(CsvCell("-1,2,3"), "\"'-1,2,3\"");
}

TEST(CsvRow, JoinsCellsAndEndsTheLine) { EXPECT_EQ(CsvRow({"a", "", "b,c"}), "a,,\"b,c\"\r\n"); }
