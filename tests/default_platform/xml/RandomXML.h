// Documents by chance.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_XML_RANDOMXML_H
#define ZOR_TESTS_DEFAULT_PLATFORM_XML_RANDOMXML_H

#include <random>
#include <string>

/// A small well-formed document that may use anything XML 1.0 offers, in UTF-8, UTF-16 or Latin-1.
/// It asks for nothing outside of itself. The same random numbers give the same document.
std::string RandomDocument(std::mt19937& ioRandom);

/// The same text with one to three places changed: bytes that mean something to XML, or nothing at
/// all, put in, taken out, repeated or moved, or the end cut off.
std::string Damaged(const std::string& inText, std::mt19937& ioRandom);

#endif
