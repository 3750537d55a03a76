// The hash of a document that pugixml holds.
#ifndef ZOR_BENCH_PUGIXML_TREE_H
#define ZOR_BENCH_PUGIXML_TREE_H

#include <pugixml.hpp>
#include <string_view>

#include "ResultHash.h"

/// With the texts between elements, which the other parsers keep too.
constexpr unsigned int kPugixmlOptions = pugi::parse_default | pugi::parse_ws_pcdata;

inline void HashTree(const pugi::xml_node& inNode, std::size_t inDepth, TreeHash& ioHash) {
  if (inNode.type() == pugi::node_pcdata) {
    ioHash.AddText(inDepth, std::string_view(inNode.value()));
    return;
  }
  if (inNode.type() == pugi::node_element) {
    ioHash.AddElement(inDepth, std::string_view(inNode.name()));
    for (const pugi::xml_attribute attribute : inNode.attributes())
      ioHash.AddAttribute(std::string_view(attribute.name()), std::string_view(attribute.value()));
  }
  for (const pugi::xml_node child : inNode.children()) HashTree(child, inDepth + 1, ioHash);
}

#endif
