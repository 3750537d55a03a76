// All answers about a document, so that two ways of working them out can be compared.
#ifndef ZOR_TESTS_CLASH_READING_ANSWERS_H
#define ZOR_TESTS_CLASH_READING_ANSWERS_H

#include <pugixml.hpp>
#include <string>
#include <utility>
#include <vector>

class DOM_Node;
class ZORClashParsing;

namespace clash_reading_test {

/// A question in words and its answer as text, all in one order.
using Answers = std::vector<std::pair<std::string, std::string>>;

/// How far the numbered questions go; each also asks a little below and beyond.
struct Ranges {
  int interferences = 0;
  int positions = 0;
  int specifications = 0;
  int partsOfAComponent = 0;  // attributes and shapes
};

/// What outputs hold before each question.
inline constexpr const char* kBefore = "before";

/// The number of everything in a document, counted by walking through all of it.
Ranges RangesOf(const pugi::xml_node& inRoot);

/// The answers as they follow from the document alone: each question walks through all of it.
/// @param inKind     the root's name where that is a kind, else "Unknown".
/// @param inLanguage "en" or "fr".
Answers NaiveAnswers(const pugi::xml_node& inRoot, const std::string& inKind,
                     const Ranges& inRanges, const std::string& inLanguage);

/// The answers of a reader that has loaded a document of this root.
Answers ReaderAnswers(ZORClashParsing& ioReader, const DOM_Node& inRoot, const Ranges& inRanges);

/// A number of a placement as text.
std::string NumberText(double inNumber);

/// Texts as one, with marks between them.
std::string Joined(const std::vector<std::string>& inTexts);

/// Parses a text with all its nodes: space, comments and processing instructions too.
pugi::xml_document Parsed(const std::string& inXml);

/// Reports every question whose two answers differ.
/// @return the number of questions.
int ExpectSameAnswers(const Answers& inExpected, const Answers& inActual,
                      const std::string& inWhere);

}  // namespace clash_reading_test

#endif
