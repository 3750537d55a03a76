// Xerces-C's own document: parsing it and its hash.
#ifndef ZOR_BENCH_XERCES_TREE_H
#define ZOR_BENCH_XERCES_TREE_H

#include <memory>
#include <string>
#include <xercesc/dom/DOM.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>

#include "ResultHash.h"

/// Prepares Xerces-C; to be called before a XercesParser is made.
void InitializeXerces();

/// A parser that neither validates nor opens anything else; it owns the document.
using XercesParser = std::unique_ptr<xercesc::XercesDOMParser>;
XercesParser ParseWithXerces(const std::string& inPath);

void HashTree(const xercesc::DOMNode& inNode, std::size_t inDepth, TreeHash& ioHash);

#endif
