// What the XML library's own tree builder makes of a text, beside what ours makes of it.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_XML_XERCESPEER_H
#define ZOR_TESTS_DEFAULT_PLATFORM_XML_XERCESPEER_H

#include <gtest/gtest.h>

#include <string>

namespace peer {

/// How often texts were met with which outcome.
struct Tally {
  int read = 0;       // by both, as the same tree
  int refused = 0;    // by both, at the same place and for the same reason
  int outside = 0;    // by ours alone, since they ask for something outside of themselves
  int otherwise = 0;  // by the library's tree alone, which knows two versions of XML only
};

/// Both read it as the same tree, or both refuse it with the same line, column and reason.
testing::AssertionResult ReadAlike(const std::string& inText, Tally& ioTally);

/// As ReadAlike, for a text that must be read.
testing::AssertionResult ReadByBoth(const std::string& inText);
/// As ReadAlike, for a text that must be refused.
testing::AssertionResult RefusedByBoth(const std::string& inText);

}  // namespace peer

#endif
