// Loading a document as a host does.
#ifndef ZOR_BENCH_ZORDOCUMENT_H
#define ZOR_BENCH_ZORDOCUMENT_H

#include <stdexcept>
#include <string>

#include "ZORClashParsing.h"

inline DOM_Document LoadDocument(std::string inPath) {
  ZORClashParsing reader(inPath.data());
  DOM_Document document;
  ZORUnicodeString kind;
  if (FAILED(reader.LoadSequence(document, kind)))
    throw std::runtime_error("cannot load " + inPath);
  return document;
}

#endif
