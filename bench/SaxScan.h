// Xerces-C's own scan of a document, without a tree.
#ifndef ZOR_BENCH_SAX_SCAN_H
#define ZOR_BENCH_SAX_SCAN_H

#include <cstdint>
#include <string>

/// Scans a document with nothing listening, set as our parser sets the scanner.
void ScanWithSax(const std::string& inPath);
/// The hash of the tree that a scan of the document tells of.
std::uint64_t HashOfSaxScan(const std::string& inPath);

#endif
